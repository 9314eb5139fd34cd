#pragma once

#include <string>

// What the system does to make a name that no other file has. `TemporaryDirectory` cares for the removal of a directory.

/// Creates an empty file in a directory.
/// @param beginning of its name
/// @return its path
/// @throw std::system_error if it cannot be created
[[nodiscard]] std::string createTemporaryFile(const std::string& directory, const std::string& beginning);

/// Creates an empty directory among the temporary files of the user.
/// @return its path
/// @throw std::system_error if it cannot be created
[[nodiscard]] std::string createTemporaryDirectory();
