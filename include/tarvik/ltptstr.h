#pragma once

#include <StringBase.h>

#include <string_view>

/// The order of every set and map that is keyed by text: byte order, the shorter text first if one is the start of the
/// other. Case-sensitive. Look-ups take any kind of text without copying it.
struct ltptstr {
    /// Look-ups take the texts that `view` takes.
    using is_transparent = void;

    /// The bytes of a text.
    /// @param text must outlive the result
    /// @return all of them, NULs included
    [[nodiscard]] static std::string_view view(const StringBase& text) noexcept {
        return {text.c_str(), text.GetLength()};
    }

    /// The bytes of a NUL-terminated text.
    /// @param text null is the empty text; must outlive the result
    /// @return its bytes
    [[nodiscard]] static std::string_view view(const char* text) noexcept {
        return text == nullptr ? std::string_view() : std::string_view(text);
    }

    /// As above, of a text that is one already.
    /// @param text any text
    /// @return the same
    [[nodiscard]] static std::string_view view(std::string_view text) noexcept { return text; }

    /// Is one text before another?
    /// @param left any text
    /// @param right any text
    /// @return whether `left` comes first
    template <typename Left, typename Right>
    [[nodiscard]] bool operator()(const Left& left, const Right& right) const noexcept {
        return view(left) < view(right);
    }
};
