#pragma once

#include <string>
#include <string_view>

namespace edit {

/// The path of a side that has no file.
inline constexpr const char* NO_FILE = "/dev/null";

/// The difference of two texts as `diff -u` shows it; empty if they are the same.
/// @param path of the file, for the heading
[[nodiscard]] std::string unifiedDiff(const std::string& path, std::string_view before,
                                      std::string_view after);

/// Likewise, for a file that is created or removed: one of the paths is `NO_FILE`.
[[nodiscard]] std::string unifiedDiff(const std::string& path, const std::string& newPath,
                                      std::string_view before, std::string_view after);

} // namespace edit
