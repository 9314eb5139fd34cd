#pragma once

#include "platform/Platform.h"

#include <string>
#include <string_view>

// Texts of this program are UTF-8, those of the system are UTF-16.

[[nodiscard]] inline std::wstring toWide(std::string_view text) { return acd::toPath(text).native(); }

[[nodiscard]] inline std::string toUtf8(std::wstring_view text) {
    const std::u8string bytes = std::filesystem::path(text).u8string();
    return {bytes.begin(), bytes.end()};
}
