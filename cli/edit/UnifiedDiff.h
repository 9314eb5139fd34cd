#pragma once

#include <string>
#include <string_view>

namespace edit {

/// The difference of two texts as `diff -u` shows it; empty if they are the same.
/// @param path of the file, for the heading
[[nodiscard]] std::string unifiedDiff(const std::string& path, std::string_view before,
                                      std::string_view after);

} // namespace edit
