#pragma once

#include <StringBase.h>

#include <string_view>

/// The ordering of every set and map that is keyed by text: the common prefix compared as unsigned bytes, on
/// a tie the shorter text first. Case-sensitive. Look-ups take
/// texts of any kind (`const char*`, `std::string`, `std::string_view`) without copying them.
struct ltptstr {
    /// Look-ups take whatever `view` takes.
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

    /// Does one text stand before another?
    /// @param left any text
    /// @param right any text
    /// @return whether `left` is the first
    template <typename Left, typename Right>
    [[nodiscard]] bool operator()(const Left& left, const Right& right) const noexcept {
        return view(left) < view(right);
    }
};
