#pragma once

#include <string>
#include <string_view>

/// Writes a file whole or not at all: under another name beside it, which then takes its place. What is no
/// regular file, such as a device or a pipe, is written to as it is. Mode and owner stay, the owner as far as the system
/// permits.
/// @throw CommandError (FAULT) when it can't be written; nothing is left behind then
void writeFile(const std::string& path, std::string_view text);
