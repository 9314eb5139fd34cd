#pragma once

#include <StringBase.h>

#include <string_view>

/// The ordering of every set and map that is keyed by text: the common prefix compared as unsigned bytes, on
/// a tie the shorter text first. Case-sensitive. Look-ups take a `std::string_view` without copying it.
struct ltptstr {
    using is_transparent = void;

    [[nodiscard]] static std::string_view view(const StringBase& text) noexcept {
        return {text.c_str(), text.GetLength()};
    }
    [[nodiscard]] static std::string_view view(std::string_view text) noexcept { return text; }

    template <typename Left, typename Right>
    [[nodiscard]] bool operator()(const Left& left, const Right& right) const noexcept {
        return view(left) < view(right);
    }
};
