#pragma once

/// A null text counts as the empty one, wherever the host layer is handed a text.
[[nodiscard]] inline const char* nullToEmpty(const char* text) noexcept {
    return text == nullptr ? "" : text;
}
