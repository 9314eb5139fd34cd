#pragma once

#include <string>
#include <string_view>

namespace report {

/// Writes a file whole or not at all: under another name beside it, which then takes its place. What is no
/// regular file, such as a device or a pipe, is written to as it is.
/// @throw CommandError (FAULT) when it can't be written; nothing is left behind then
void writeFile(const std::string& path, std::string_view text);

} // namespace report
