#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// The standard streams of the process, as the system sees them: bytes, unbuffered. Failures are in `errno`.
namespace streams {

inline constexpr int INPUT = 0;
inline constexpr int OUTPUT = 1;
inline constexpr int ERRORS = 2;

/// Prepares the streams at the start of the program: they are of bytes, and a write that nobody reads any more fails with
/// `EPIPE` rather than ending the process.
/// @return the arguments of the command line, without the program's name
[[nodiscard]] std::vector<std::string> prepare(int argc, char** argv);

[[nodiscard]] bool isTerminal(int stream);

/// Whether a terminal shows colours.
[[nodiscard]] bool hasColours(int stream);

/// The columns of a terminal; 0 if they are unknown.
[[nodiscard]] std::size_t columns(int stream);

/// Writes all of the text, waiting while the stream accepts none.
/// @return whether that worked
[[nodiscard]] bool write(int stream, std::string_view text);

/// Whether the input has nothing to read yet, and has not ended.
[[nodiscard]] bool isInputWaiting();

/// Reads what there is, waiting for it.
/// @return the number of bytes, 0 at the end; negative for a failure
[[nodiscard]] std::ptrdiff_t readInput(char* buffer, std::size_t size);

} // namespace streams
