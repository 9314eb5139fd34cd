#pragma once

#include <string>
#include <string_view>

namespace acd {

/// The directory that a path leads through; empty for the name of a memory file.
[[nodiscard]] std::string_view directoryOf(std::string_view path) noexcept;

/// What follows the last separator of a path.
[[nodiscard]] std::string_view fileNameOf(std::string_view path) noexcept;

/// The path of a file in a directory.
[[nodiscard]] std::string joinPath(const std::string& directory, const std::string& name);

/// The family whose file has this name; empty if it is not the name of a database file.
[[nodiscard]] std::string_view familyName(std::string_view fileName) noexcept;

} // namespace acd
