#pragma once

/// A null text is treated as the empty one, wherever the host layer is given a text.
[[nodiscard]] inline const char* nullToEmpty(const char* text) noexcept {
    return text == nullptr ? "" : text;
}
