#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

/// The times, inode numbers and devices of real files, made up: a clock that ticks when a test says so, and can be set
/// back. The linker puts these functions in front of the system calls (--wrap), so that the readers and writers of
/// indexes see the same, and so that calls can fail, or have something else happen before them.
namespace virtualTime {

/// How much a clock advances at once, in nanoseconds: within a tick, all changes have the same time.
inline constexpr std::int64_t TICK = 4'000'000;

/// Forgets all files and starts the clocks.
void reset();

/// Lets the clocks advance.
/// @param nanoseconds negative: they are set back. A clock that was set back never gives a time that it gave before:
///        its ticks are at other nanoseconds, as those of a real clock are
void advance(std::int64_t nanoseconds);

/// Writes a file, as programs do in place.
/// @param onOtherDevice on a device with a slower clock
void write(const std::string& path, std::string_view text, bool onOtherDevice = false);

/// Sets the time of modification, which changes the time of change as well.
void setModified(const std::string& path, std::int64_t nanoseconds);
[[nodiscard]] std::int64_t modified(const std::string& path);

/// Records that a file was changed otherwise: linked, renamed.
void touch(const std::string& path);

/// What happens at a system call of readers and writers.
/// @return 0 to make the call, otherwise the error with which it fails
using Event = std::function<int()>;

/// Makes an event happen at a call from now on, counted from 1. Only once, and not at calls within the event.
void interrupt(int call, Event event);

/// @return whether the event has not happened, and will not any more
bool stopInterrupting();

} // namespace virtualTime
