#pragma once

#include <AcdStore.h>

#include <string>

class PM_DEVKEY;

namespace acd {

/// The reads of all accessors: the latest one, and the observer who wants to see each.
class ReadLog {
public:
    /// Sets the observer of the process.
    /// @return the former one
    static AcdStore::ReadObserver setObserver(AcdStore::ReadObserver observer);

    /// Records the read that an accessor has just made.
    static void add(const PM_DEVKEY& accessor) {
        s_latest = &accessor;
        if (s_isObserved) [[unlikely]] {
            notify(accessor);
        }
    }

    /// Forgets the latest read.
    static void clear() noexcept { s_latest = nullptr; }

    /// The latest read in one line without a line end: where, what, and the text. Empty if there is none.
    [[nodiscard]] static std::string describeLatest();

    /// Forgets the latest read if it is this accessor's.
    static void forget(const PM_DEVKEY& accessor) noexcept {
        if (s_latest == &accessor) {
            s_latest = nullptr;
        }
    }

private:
    [[nodiscard]] static AcdStore::Read describe(const PM_DEVKEY& accessor);
    static void notify(const PM_DEVKEY& accessor);

    static const PM_DEVKEY* s_latest;
    static bool s_isObserved; ///< whether there is an observer; false during its own call
};

} // namespace acd
