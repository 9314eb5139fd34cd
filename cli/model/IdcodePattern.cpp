// Reads and compares identification codes with digits that do not matter.
#include "model/IdcodePattern.h"

#include <bit>
#include <cstddef>

namespace {

/// The value of a hexadecimal digit; 16 and more for any other character.
std::uint32_t valueOf(char digit) {
    const auto offset = [digit](char first) { return static_cast<unsigned char>(digit - first); };
    if (offset('0') < 10) {
        return offset('0');
    }
    return offset('A') < 6 ? offset('A') + 10U : offset('a') < 6 ? offset('a') + 10U : 16U;
}

/// Appends a digit of so many bits.
/// @return false if it is not a digit
bool append(IdcodePattern& pattern, char digit, unsigned width) {
    const std::uint32_t all = (1U << width) - 1;
    const bool isAny = digit == 'X' || digit == 'x';
    const std::uint32_t value = isAny ? 0 : valueOf(digit);
    pattern.bits = pattern.bits << width | value;
    pattern.mask = pattern.mask << width | (isAny ? 0 : all);
    return value <= all;
}

} // namespace

int IdcodePattern::distance(const IdcodePattern& other) const noexcept {
    return std::popcount((bits ^ other.bits) & mask & other.mask);
}

std::string IdcodePattern::manufacturer() const {
    std::string text = "0x";
    for (const unsigned shift : {9U, 5U, 1U}) {
        const std::uint32_t all = shift == 9 ? 0x7 : 0xF;
        text += (mask >> shift & all) == all ? "0123456789ABCDEF"[bits >> shift & all] : 'X';
    }
    return text;
}

std::optional<IdcodePattern> readIdcode(std::string_view text) {
    constexpr std::size_t HEXADECIMAL_DIGITS = 8;
    constexpr std::size_t BINARY_DIGITS = 32;
    // 32 binary digits may begin with "0x", too.
    const bool isBinary = text.size() == BINARY_DIGITS;
    const bool isHexadecimal = text.size() > 2 && text.size() <= 2 + HEXADECIMAL_DIGITS && text[0] == '0' &&
                               (text[1] == 'x' || text[1] == 'X');
    if (!isBinary && !isHexadecimal) {
        return std::nullopt;
    }
    // Digits that are left out in front are 0, so their bits matter.
    IdcodePattern pattern{0, ~0U};
    for (const char digit : text.substr(isBinary ? 0 : 2)) {
        if (!append(pattern, digit, isBinary ? 1 : 4)) {
            return std::nullopt;
        }
    }
    return pattern;
}
