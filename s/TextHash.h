#pragma once

#include <tarvik/ltptstr.h>

#include <cstddef>
#include <functional>
#include <string_view>

/// Hashes texts for containers whose look-ups take a `std::string_view` without copying it. Not `noexcept` on
/// purpose: the standard library then stores each entry's hash instead of computing it again while it searches.
struct TextHash {
    using is_transparent = void; ///< takes any kind of text

    /// @param text of any kind that `ltptstr` compares
    /// @return its hash
    template <typename Text>
    [[nodiscard]] std::size_t operator()(const Text& text) const {
        return std::hash<std::string_view>()(ltptstr::view(text));
    }
};

/// Same length and same bytes.
struct TextEqual {
    using is_transparent = void; ///< takes any kind of text

    /// @param left of any kind that `ltptstr` compares
    /// @param right likewise
    /// @return whether they are equal
    template <typename Left, typename Right>
    [[nodiscard]] bool operator()(const Left& left, const Right& right) const noexcept {
        return ltptstr::view(left) == ltptstr::view(right);
    }
};
