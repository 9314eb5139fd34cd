#include "StringBase.h"

#include "text/Formatting.h"

#include <AcdText.h>

#include <algorithm>
#include <array>
#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>

// The parts of the text type that are more than a line: formatting, case, and the checksum.

namespace {

/// The CRC-32 of each byte, and (row n) of each byte followed by n zero bytes, so that several bytes can be
/// taken at once.
using ChecksumTables = std::array<std::array<std::uint32_t, 256>, 8>;

consteval ChecksumTables makeChecksumTables() {
    constexpr std::uint32_t POLYNOMIAL = 0xEDB88320;
    ChecksumTables tables{};
    for (std::uint32_t byte = 0; byte < 256; ++byte) {
        std::uint32_t checksum = byte;
        for (int bit = 0; bit < 8; ++bit) {
            checksum = (checksum >> 1) ^ ((checksum & 1) != 0 ? POLYNOMIAL : 0);
        }
        tables[0][byte] = checksum;
    }
    for (std::size_t row = 1; row < tables.size(); ++row) {
        for (std::size_t byte = 0; byte < 256; ++byte) {
            const std::uint32_t former = tables[row - 1][byte];
            tables[row][byte] = (former >> 8) ^ tables[0][former & 0xFF];
        }
    }
    return tables;
}

constexpr ChecksumTables CHECKSUMS = makeChecksumTables();

std::uint32_t loadLe32(const char* bytes) noexcept {
    const auto byte = [bytes](int index) { return std::uint32_t{static_cast<unsigned char>(bytes[index])}; };
    return byte(0) | byte(1) << 8 | byte(2) << 16 | byte(3) << 24;
}

/// What four bytes add to the checksum of a text in which `behind` more bytes follow.
std::uint32_t crcStep(std::uint32_t word, std::size_t behind) noexcept {
    return CHECKSUMS[behind + 3][word & 0xFF] ^ CHECKSUMS[behind + 2][word >> 8 & 0xFF] ^
           CHECKSUMS[behind + 1][word >> 16 & 0xFF] ^ CHECKSUMS[behind][word >> 24];
}

} // namespace

void StringBase::Format(const char* text) { m_text = formatting::unescapePercent(text); }

template <typename Formatted>
void StringBase::Format(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    // Into a text of its own first: an argument may be this very text.
    std::string result = formatting::vformat(format, arguments);
    va_end(arguments);
    m_text = std::move(result);
}
template TARVIK_HOST_API void StringBase::Format<void>(const char* format, ...);

void StringBase::MakeUpper() noexcept {
    std::transform(m_text.begin(), m_text.end(), m_text.begin(), AcdText::toUpper);
}

void StringBase::MakeLower() noexcept {
    std::transform(m_text.begin(), m_text.end(), m_text.begin(), AcdText::toLower);
}

void StringBase::Truncate(std::size_t length) noexcept { m_text.resize(std::min(length, m_text.size())); }

int StringBase::ICompare(const StringBase& other) const noexcept {
    return AcdText::compareIgnoreCase(m_text, other.m_text);
}

std::uint32_t StringBase::CRC32(const char* bytes, std::size_t length, std::uint32_t former) noexcept {
    std::uint32_t checksum = ~former;
    for (; length >= 8; length -= 8, bytes += 8) {
        checksum = crcStep(checksum ^ loadLe32(bytes), 4) ^ crcStep(loadLe32(bytes + 4), 0);
    }
    // Keys are short: much of them may be the rest that fills no eight bytes.
    if (length >= 4) {
        checksum = crcStep(checksum ^ loadLe32(bytes), 0);
        length -= 4;
        bytes += 4;
    }
    for (; length > 0; --length, ++bytes) {
        checksum = (checksum >> 8) ^ CHECKSUMS[0][(checksum ^ static_cast<unsigned char>(*bytes)) & 0xFF];
    }
    return ~checksum;
}
