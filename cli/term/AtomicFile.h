#pragma once

#include <string>
#include <string_view>

/// Writes a file whole or not at all: under another name next to it, which then takes its place. Links are followed, also
/// to files that do not exist yet.
///
/// What is not a regular file, such as a pipe, is written to as it is; and so is a file that has several names or
/// belongs to somebody else, or whose directory takes no new file, because replacing it would change that.
/// @throw CommandError (FAULT) if it cannot be written
void writeFile(const std::string& path, std::string_view text);

/// Is it the file that standard output leads to, such as `/dev/stdout`?
[[nodiscard]] bool isStandardOutput(const std::string& path);
