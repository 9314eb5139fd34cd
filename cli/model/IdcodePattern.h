#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

/// An identification code of which some bits may have any value: X digits.
struct IdcodePattern {
    std::uint32_t bits = 0; ///< 0 where any value is possible
    std::uint32_t mask = 0; ///< 1 where the bit matters

    /// Is there a code that both stand for?
    [[nodiscard]] bool matches(const IdcodePattern& other) const noexcept { return distance(other) == 0; }

    /// In how many bits that matter to both the two differ.
    [[nodiscard]] int distance(const IdcodePattern& other) const noexcept;

    /// The manufacturer, bits 1 to 11, as three digits with X for one that is not known whole: "0x7DB".
    [[nodiscard]] std::string manufacturer() const;
};

/// Reads "0x" and up to eight hexadecimal digits, or 32 binary digits; X stands for any digit. Case does not matter.
/// @return nothing for any other text
[[nodiscard]] std::optional<IdcodePattern> readIdcode(std::string_view text);
