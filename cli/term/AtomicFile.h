#pragma once

#include <string>
#include <string_view>
#include <system_error>

/// Begins the names of the files that `writeFile` writes next to others; a run that is killed may leave one.
inline constexpr const char* TEMPORARY_FILE = ".tarvik.";

/// Writes a file whole or not at all: under another name next to it, which then takes its place. Mode and owner stay.
/// Links are followed, also to files that do not exist yet.
///
/// What is not a regular file, such as a pipe, is written to as it is; and so is a file that has several names, whose
/// owner cannot be kept or whose directory takes no new file.
/// @throw CommandError (FAULT) if it cannot be written
void writeFile(const std::string& path, std::string_view text);

/// Why a file cannot be written to, or why no file can be created in a directory.
/// @return no error if it can
[[nodiscard]] std::error_code accessFailure(const std::string& path);

/// Is it the file that standard output leads to, such as `/dev/stdout`?
[[nodiscard]] bool isStandardOutput(const std::string& path);
