#pragma once

#include <ctime>

namespace bench {

/// The time that this thread has had a processor for: what others do on the machine meanwhile doesn't count.
[[nodiscard]] inline double processorNanoseconds() {
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) * 1e9 + static_cast<double>(time.tv_nsec);
}

} // namespace bench
