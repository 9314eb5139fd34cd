// Identification codes: how they are read, and which match.
#include "model/IdcodePattern.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <random>
#include <string>
#include <string_view>

namespace {

/// The binary digits of a code, from the last one; 'x' where any value is possible.
using Digits = std::array<char, 32>;

/// Nothing in common with what is tested but the text.
Digits binaryDigits(std::string_view code) {
    Digits digits;
    digits.fill('0');
    std::size_t place = 0;
    const bool isBinary = code.size() == digits.size();
    for (std::size_t i = code.size(); i > (isBinary ? 0U : 2U); --i) {
        const char digit = code[i - 1];
        if (isBinary) {
            digits[place++] = digit;
            continue;
        }
        const int value = digit <= '9' ? digit - '0' : digit - 'A' + 10;
        for (int bit = 1; bit <= 8; bit *= 2) {
            digits[place++] = digit == 'x' ? 'x' : (value & bit) != 0 ? '1' : '0';
        }
    }
    return digits;
}

int bruteForceDistance(const Digits& left, const Digits& right) {
    int differing = 0;
    for (std::size_t i = 0; i < left.size(); ++i) {
        differing += left[i] != 'x' && right[i] != 'x' && left[i] != right[i] ? 1 : 0;
    }
    return differing;
}

class RandomCodes {
public:
    /// One in four codes is binary.
    std::string any() { return (m_random() & 3U) == 0 ? binary() : hexadecimal(); }

    /// "0x" and up to eight digits, some of them x. Few different digits, so that many codes match.
    std::string hexadecimal() {
        std::uint64_t bits = m_random();
        const std::uint64_t kinds = bits & 15U;
        bits >>= 4U;
        std::string code("0x00000000", 3 + (bits & 7U));
        bits >>= 3U;
        for (std::size_t i = 2; i < code.size(); ++i, bits >>= 7U) {
            code[i] = (bits & 7U) == 0 ? 'x' : "0123456789ABCDEF"[bits >> 3U & kinds];
        }
        return code;
    }

    std::string binary() {
        std::uint64_t bits = m_random();
        std::string code(32, '0');
        for (char& digit : code) {
            digit = "01xx"[bits & 3U];
            bits >>= 2U;
        }
        return code;
    }

private:
    std::mt19937_64 m_random{20240229}; // NOLINT: the same codes in every run
};

TEST(IdcodePattern, MillionRandomCodesMatchAsTheirDigitsDo) {
    RandomCodes codes;
    int matching = 0;
    for (int i = 0; i < 1'000'000; ++i) {
        const std::string pattern = codes.hexadecimal();
        const std::string code = codes.any();
        const int expected = bruteForceDistance(binaryDigits(pattern), binaryDigits(code));
        const auto left = readIdcode(pattern);
        const auto right = readIdcode(code);
        // One comparison, as a million assertions take their time.
        if (!left || !right || left->distance(*right) != expected ||
            left->matches(*right) != (expected == 0)) {
            FAIL() << pattern << ' ' << code << ": " << expected;
        }
        matching += expected == 0 ? 1 : 0;
    }
    EXPECT_GT(matching, 20'000);
}

TEST(IdcodePattern, CaseDoesNotMatter) {
    EXPECT_EQ(readIdcode("0Xx4104fb7")->bits, 0x04104FB7U);
    EXPECT_EQ(readIdcode("0xX4104FB7")->mask, 0x0FFFFFFFU);
}

TEST(IdcodePattern, MissingDigitsAreZeros) {
    EXPECT_FALSE(readIdcode("0x4104FB7")->matches(*readIdcode("0x14104FB7")));
    EXPECT_TRUE(readIdcode("0x4104FB7")->matches(*readIdcode("0xX4104FB7")));
}

TEST(IdcodePattern, OtherTextsAreNotCodes) {
    for (const char* const text : {"", "0x", "0x123456789", "4104FB7", "0x410G", "KS50", "0b1", "0x 1",
                                   "0000000000000000000000000000000", "000000000000000000000000000000000",
                                   "00000000000000000000000000000002"}) {
        EXPECT_FALSE(readIdcode(text)) << text;
    }
}

TEST(IdcodePattern, Manufacturer) {
    EXPECT_EQ(readIdcode("0x04104FB7")->manufacturer(), "0x7DB");
    EXPECT_EQ(readIdcode("0x00000001")->manufacturer(), "0x000");
    EXPECT_EQ(readIdcode("0xFFFFFFFF")->manufacturer(), "0x7FF");
    EXPECT_EQ(readIdcode("0x04104FX7")->manufacturer(), "0x7XX");
}

} // namespace
