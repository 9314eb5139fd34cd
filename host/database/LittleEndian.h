#pragma once

#include <concepts>
#include <cstddef>
#include <string>
#include <type_traits>
#include <utility>

// Numbers as bytes, the lowest one first.

namespace acd {

/// Reads a number, without a loop, so that compilers see that it is one load.
/// @param bytes as many as the number has
template <std::integral Number>
[[nodiscard]] Number loadLittleEndian(const char* bytes) noexcept {
    using Bits = std::make_unsigned_t<Number>;
    return [bytes]<std::size_t... Byte>(std::index_sequence<Byte...>) {
        return static_cast<Number>(
            ((static_cast<Bits>(static_cast<unsigned char>(bytes[Byte])) << (8 * Byte)) | ...));
    }
    (std::make_index_sequence<sizeof(Number)>());
}

/// Appends a number to a text.
template <std::integral Number>
void appendLittleEndian(std::string& text, Number number) {
    const auto bits = static_cast<std::make_unsigned_t<Number>>(number);
    for (std::size_t byte = 0; byte != sizeof bits; ++byte) {
        text += static_cast<char>(bits >> (8 * byte));
    }
}

} // namespace acd
