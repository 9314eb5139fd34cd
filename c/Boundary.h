#pragma once

// What each function of the C interface runs inside: exceptions become statuses, and calls out of order are refused.

#include <tarvik/tarvik.h>

#include <tarvik/ConstraintsManager.h>

#include <new>

namespace boundary {

/// Where the process is in the life of its manager, as far as the C interface has seen it.
struct Session {
    bool started = false;
    bool removed = false;
    bool inCallback = false;     ///< in the middle of a message callback
    bool callbackFailed = false; ///< a callback threw since the current call began
};

inline Session session;

/// Why a call is refused before it reaches the manager.
struct Refusal {
    tarvik_status status;
    const char* text;
};

/// Records the exception that is being handled as the last error.
/// @return its status
tarvik_status recordException() noexcept;

/// The same for an exception that a message callback threw.
void recordCallbackException() noexcept;

/// Runs `action`. No exception leaves it.
template <typename Action>
tarvik_status guard(Action action) noexcept {
    session.callbackFailed = false;
    try {
        action();
        return session.callbackFailed ? TARVIK_CALLBACK_FAILED : TARVIK_OK;
    } catch (...) {
        return recordException();
    }
}

/// @throw Refusal in a message callback
inline void requireOutsideOfCallback() {
    if (session.inCallback) {
        throw Refusal{TARVIK_BUSY, "called from a message callback"};
    }
}

/// The manager, made if there is none yet.
/// @throw Refusal in a message callback, and after the manager was removed
inline ConstraintsManager& manager() {
    requireOutsideOfCallback();
    if (session.removed) {
        throw Refusal{TARVIK_REMOVED, "the manager was removed"};
    }
    session.started = true; // even if the next line throws: it may have read databases
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    if (manager == nullptr) {
        throw std::bad_alloc();
    }
    return *manager;
}

/// @throw Refusal for a null pointer
inline void require(const void* pointer, const char* text = "a pointer for a result is null") {
    if (pointer == nullptr) {
        throw Refusal{TARVIK_INVALID_ARGUMENT, text};
    }
}

/// Runs `question`, and writes what it returns to `*result`.
template <typename Result, typename Question>
tarvik_status answer(Result* result, Question question) noexcept {
    return guard([&] {
        require(result);
        *result = static_cast<Result>(question());
    });
}

/// The same for a question to the manager.
template <typename Result, typename Question>
tarvik_status answerByManager(Result* result, Question question) noexcept {
    return answer(result, [&] { return question(manager()); });
}

/// A copy of a name that lives until the library is unloaded; the same for equal names. For names of which there
/// are few.
const char* intern(const StringBase& name);

// Enumerations may have any value, so these are safe.
inline TARVIKNS::MODE_TYPE mode(int value) { return TARVIKNS::MODE_TYPE{value}; }
inline TARVIKNS::OUTPUT_TYPE output(int value) { return TARVIKNS::OUTPUT_TYPE{value}; }
inline TARVIKNS::OP_TYPE operation(int value) { return TARVIKNS::OP_TYPE{value}; }
inline TARVIKNS::PROGRAM_OPTION option(int value) { return TARVIKNS::PROGRAM_OPTION{value}; }

// The opaque types of the C interface are never defined: they stand for these.
inline const tarvik_text_set* toC(const ConstraintsManager::TextSet& set) {
    return reinterpret_cast<const tarvik_text_set*>(&set);
}
inline const ConstraintsManager::TextSet* fromC(const tarvik_text_set* set) {
    return reinterpret_cast<const ConstraintsManager::TextSet*>(set);
}
inline const tarvik_text_map* toC(const ConstraintsManager::Texts& map) {
    return reinterpret_cast<const tarvik_text_map*>(&map);
}
inline const ConstraintsManager::Texts* fromC(const tarvik_text_map* map) {
    return reinterpret_cast<const ConstraintsManager::Texts*>(map);
}

} // namespace boundary
