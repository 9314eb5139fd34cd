#pragma once

// Case as the system knows it: that of the ASCII letters, whatever the process's locale. Bytes over 127 have none.

#include <algorithm>
#include <cstddef>
#include <string_view>

namespace ascii {

[[nodiscard]] constexpr char toUpper(char letter) noexcept {
    return letter >= 'a' && letter <= 'z' ? static_cast<char>(letter - 'a' + 'A') : letter;
}

[[nodiscard]] constexpr char toLower(char letter) noexcept {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

/// Byte order of the lower-cased texts, as unsigned bytes, the shorter first on a tie: negative, 0 or positive.
[[nodiscard]] constexpr int compareIgnoringCase(std::string_view left, std::string_view right) noexcept {
    const std::size_t common = std::min(left.size(), right.size());
    for (std::size_t index = 0; index < common; ++index) {
        const int difference = static_cast<unsigned char>(toLower(left[index])) -
                               static_cast<unsigned char>(toLower(right[index]));
        if (difference != 0) {
            return difference;
        }
    }
    return static_cast<int>(left.size() > right.size()) - static_cast<int>(left.size() < right.size());
}

} // namespace ascii
