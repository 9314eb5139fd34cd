#pragma once

// Texts as views, so that look-ups need no copy; and the cut that takes the package off a device name.

#include <StringBase.h>

#include <string_view>

/// A null text is the empty text.
[[nodiscard]] inline std::string_view view(const char* text) noexcept {
    return text == nullptr ? std::string_view() : std::string_view(text);
}

[[nodiscard]] inline std::string_view view(const StringBase& text) noexcept {
    return {text.c_str(), text.GetLength()};
}

[[nodiscard]] inline StringBase toStringBase(std::string_view text) { return {text.data(), text.size()}; }

/// The part before the first "_": the device without its package.
[[nodiscard]] inline std::string_view baseName(std::string_view device) noexcept {
    return device.substr(0, device.find('_'));
}
