#pragma once

#include "Reference.h"

#include <Port_MsgManData.h>
#include <StringBase.h>
#include <TarvikException.h>

#include <cstddef>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <type_traits>
#include <vector>

class ConstraintsManager;

namespace reference {

/// What came of a call: its result, or its exception, in print, and what was issued.
struct Outcome {
    std::string result;
    std::vector<Message> messages;
};

// Values of the manager and of the reference print alike.

[[nodiscard]] std::string show(bool value);
[[nodiscard]] std::string show(long value);
[[nodiscard]] std::string show(const std::string& text);
[[nodiscard]] std::string show(const char* text);
[[nodiscard]] std::string show(const StringBase& text);
[[nodiscard]] std::string show(const std::optional<std::string>& text);

template <typename Number>
requires std::is_same_v<Number, int> || std::is_enum_v<Number>
[[nodiscard]] std::string show(Number value) { return show(static_cast<long>(value)); }

template <typename Collection>
requires requires(const Collection& collection) { collection.begin() == collection.end(); }
[[nodiscard]] std::string show(const Collection& collection);

template <typename Key, typename Value>
[[nodiscard]] std::string show(const std::pair<Key, Value>& entry) {
    return show(entry.first) + ": " + show(entry.second);
}

template <typename Collection>
requires requires(const Collection& collection) { collection.begin() == collection.end(); }
[[nodiscard]] std::string show(const Collection& collection) {
    std::string shown = "{";
    for (const auto& element : collection) {
        shown += (shown.size() > 1 ? ", " : "") + show(element);
    }
    return shown + "}";
}

[[nodiscard]] std::string showRaised(const std::string& type, int line);
[[nodiscard]] std::string showRaised(const TarvikException& exception);

/// Tells where two outcomes differ; empty when they don't.
[[nodiscard]] std::string compare(const std::string& what, const Outcome& expected, const Outcome& actual);

/// What the manager issues. Messages of the database layer are only counted: when a file is read is its affair.
class ManagerMessages {
public:
    /// Takes all messages from now on.
    void listen();

    /// Takes one message.
    void add(const Port_MsgManData::Message& message);

    /// What the manager issued since the last call.
    [[nodiscard]] std::vector<Message> take();

    /// How many messages the database layer has issued so far.
    [[nodiscard]] std::size_t ofDatabase() const { return m_ofDatabase; }

private:
    std::vector<Message> m_messages;
    std::size_t m_ofDatabase = 0;
};

struct Member {
    std::string name;
    std::string value;
};

/// The members that both have, in one order.
[[nodiscard]] std::vector<Member> members(const Reference& reference);
[[nodiscard]] std::vector<Member> members(ConstraintsManager& manager);

} // namespace reference
