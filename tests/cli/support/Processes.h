#pragma once

#include "ToolProcess.h"

#include <cstdint>
#include <map>
#include <string>
#include <vector>

// What `ToolProcess` asks of the operating system. `posix/` and `windows/` each implement it in one file.
namespace processes {

/// @throw std::runtime_error for the failure of a call, which is below 0
int check(int result);

void closeOnce(int& descriptor);

/// Two descriptors, for this process alone: what is written to one end comes out of the other.
struct Pipe {
    int reading;
    int writing;
};

[[nodiscard]] Pipe makePipe();

/// A terminal, which hands on what is written to it as it is.
[[nodiscard]] Pipe makeTerminal(unsigned short columns);

[[nodiscard]] int openForWriting(const std::string& path);

/// Has this process survive the writing to a pipe without a reader.
void ignoreClosedPipes();

/// The variables of this process, as "NAME=value".
[[nodiscard]] std::vector<std::string> environment();

/// Starts the tool on the given descriptors.
/// @return the process
[[nodiscard]] std::intptr_t spawn(const std::vector<std::string>& arguments,
                                  const std::vector<std::string>& environment, int input, int output,
                                  int error);

/// Waits for the end. @return the exit status; 128 and more: ended by a signal
[[nodiscard]] int waitFor(std::intptr_t process);

} // namespace processes
