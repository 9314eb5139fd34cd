// The checksum of texts, against known values and against the plain definition, bit by bit.
#include <StringBase.h>

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <string>

namespace {

std::uint32_t checksum(const std::string& bytes) { return StringBase::CRC32(bytes.data(), bytes.size()); }

/// The division of the bytes, lowest bit first, by the reversed polynomial.
std::uint32_t checksumBitByBit(const std::string& bytes) {
    std::uint32_t remainder = 0xFFFFFFFF;
    for (const char byte : bytes) {
        remainder ^= static_cast<unsigned char>(byte);
        for (int bit = 0; bit < 8; ++bit) {
            remainder = (remainder & 1) != 0 ? (remainder >> 1) ^ 0xEDB88320 : remainder >> 1;
        }
    }
    return ~remainder;
}

/// Bytes without a pattern, each value among them.
std::string mixedBytes(std::size_t count) {
    std::string bytes;
    std::uint32_t state = 2463534242;
    while (bytes.size() < count) {
        state ^= state << 13;
        state ^= state >> 17;
        state ^= state << 5;
        bytes += static_cast<char>(state >> 24);
    }
    return bytes;
}

TEST(Checksum, OfKnownTexts) {
    EXPECT_EQ(checksum("123456789"), 0xCBF43926);
    EXPECT_EQ(checksum("a"), 0xE8B7BE43);
    EXPECT_EQ(checksum("The quick brown fox jumps over the lazy dog"), 0x414FA339);
}

TEST(Checksum, OfNothingIsZero) {
    EXPECT_EQ(StringBase().CRC32(), 0U);
    EXPECT_EQ(StringBase::CRC32(nullptr, 0), 0U);
}

TEST(Checksum, OfBytesOver127) { EXPECT_EQ(checksum(std::string(32, '\xFF')), 0xFF6CAB0B); }

TEST(Checksum, CountsNuls) {
    EXPECT_EQ(checksum(std::string(32, '\0')), 0x190A55AD);
    EXPECT_NE(StringBase("a\0b", 3).CRC32(), StringBase("a\0c", 3).CRC32());
}

TEST(Checksum, OfATextIsThatOfItsBytes) {
    EXPECT_EQ(StringBase("kestrel_FLASH").CRC32(), checksum("kestrel_FLASH"));
}

TEST(Checksum, IsThePlainDivisionAtEachLengthAndAlignment) {
    const std::string bytes = mixedBytes(1000);
    for (std::size_t start = 0; start < 16; ++start) {
        for (std::size_t length = 0; length <= 80; ++length) {
            const std::string piece = bytes.substr(start, length);
            ASSERT_EQ(StringBase::CRC32(bytes.data() + start, length), checksumBitByBit(piece))
                << "start " << start << ", length " << length;
        }
    }
    EXPECT_EQ(checksum(bytes), checksumBitByBit(bytes));
}

TEST(Checksum, TakenPieceByPieceIsThatOfTheWhole) {
    const std::string bytes = mixedBytes(40);
    for (std::size_t cut = 0; cut <= bytes.size(); ++cut) {
        const std::uint32_t former = StringBase::CRC32(bytes.data(), cut);
        EXPECT_EQ(StringBase::CRC32(bytes.data() + cut, bytes.size() - cut, former), checksum(bytes)) << cut;
    }
}

TEST(Checksum, StaysWhenNothingIsAdded) { EXPECT_EQ(StringBase::CRC32(nullptr, 0, 0xCBF43926), 0xCBF43926); }

} // namespace
