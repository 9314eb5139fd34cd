// Operations on NUL-terminated texts: order with and without case, numbers, upper case.
#include <UT_STR.h>

#include <gtest/gtest.h>

#include <string>

namespace {

int sign(int number) { return (number > 0) - (number < 0); }

TEST(TextOrder, IsThatOfUnsignedBytes) {
    EXPECT_EQ(UT_STR::Compare("abc", "abc"), 0);
    EXPECT_LT(UT_STR::Compare("B", "a"), 0);
    EXPECT_GT(UT_STR::Compare("a", "B"), 0);
    EXPECT_LT(UT_STR::Compare("z", "\x80"), 0);
    EXPECT_GT(UT_STR::Compare("\xFF", "\x80"), 0);
}

TEST(TextOrder, PutsTheShorterFirstOnATie) {
    EXPECT_LT(UT_STR::Compare("ab", "abc"), 0);
    EXPECT_GT(UT_STR::Compare("abc", "ab"), 0);
    EXPECT_LT(UT_STR::Compare("", "a"), 0);
}

TEST(TextOrder, TakesNullForTheEmptyText) {
    EXPECT_EQ(UT_STR::Compare(nullptr, nullptr), 0);
    EXPECT_EQ(UT_STR::Compare(nullptr, ""), 0);
    EXPECT_EQ(UT_STR::Compare("", nullptr), 0);
    EXPECT_LT(UT_STR::Compare(nullptr, "a"), 0);
    EXPECT_GT(UT_STR::Compare("a", nullptr), 0);
}

TEST(TextOrder, StopsAtTheNul) {
    EXPECT_EQ(UT_STR::Compare("a\0b", "a\0c"), 0);
    EXPECT_EQ(UT_STR::ICompare("a\0b", "A\0c"), 0);
}

TEST(TextOrderIgnoringCase, HasNoCase) {
    EXPECT_EQ(UT_STR::ICompare("Kestrel", "kESTREL"), 0);
    EXPECT_GT(UT_STR::ICompare("B", "a"), 0);
    EXPECT_LT(UT_STR::ICompare("a", "B"), 0);
    EXPECT_NE(UT_STR::ICompare("[", "{"), 0);
    EXPECT_NE(UT_STR::ICompare("@", "`"), 0);
}

TEST(TextOrderIgnoringCase, IsThatOfTheLowerCasedBytes) {
    EXPECT_LT(UT_STR::ICompare("_", "A"), 0);
    EXPECT_LT(UT_STR::ICompare("_", "a"), 0);
    EXPECT_LT(UT_STR::ICompare("z", "\x80"), 0);
    EXPECT_GT(UT_STR::ICompare("\xE4", "\xC4"), 0);
}

TEST(TextOrderIgnoringCase, PutsTheShorterFirstOnATie) {
    EXPECT_LT(UT_STR::ICompare("AB", "abc"), 0);
    EXPECT_GT(UT_STR::ICompare("abc", "AB"), 0);
}

TEST(TextOrderIgnoringCase, TakesNullForTheEmptyText) {
    EXPECT_EQ(UT_STR::ICompare(nullptr, nullptr), 0);
    EXPECT_EQ(UT_STR::ICompare(nullptr, ""), 0);
    EXPECT_LT(UT_STR::ICompare(nullptr, "a"), 0);
    EXPECT_GT(UT_STR::ICompare("a", nullptr), 0);
}

TEST(TextOrderIgnoringCase, OfSingleBytesIsThatOfStringBase) {
    for (int left = 1; left < 256; ++left) {
        for (int right = 1; right < 256; ++right) {
            const char first[] = {static_cast<char>(left), '\0'};
            const char second[] = {static_cast<char>(right), '\0'};
            ASSERT_EQ(sign(UT_STR::ICompare(first, second)), sign(StringBase(first).ICompare(second)))
                << left << ' ' << right;
        }
    }
}

TEST(DecimalNumber, IsReadWithItsSign) {
    EXPECT_EQ(UT_STR::AToL("0"), 0);
    EXPECT_EQ(UT_STR::AToL("42"), 42);
    EXPECT_EQ(UT_STR::AToL("+42"), 42);
    EXPECT_EQ(UT_STR::AToL("-42"), -42);
    EXPECT_EQ(UT_STR::AToL("-0"), 0);
}

TEST(DecimalNumber, MayStandBehindBlanks) {
    EXPECT_EQ(UT_STR::AToL(" \t\n\v\f\r42"), 42);
    EXPECT_EQ(UT_STR::AToL("  -7"), -7);
}

TEST(DecimalNumber, StandsBehindNothingElse) {
    EXPECT_EQ(UT_STR::AToL("x42"), 0);
    EXPECT_EQ(UT_STR::AToL("\xA0"
                           "42"),
              0);
    EXPECT_EQ(UT_STR::AToL("\x08"
                           "42"),
              0);
    EXPECT_EQ(UT_STR::AToL("\x0E"
                           "42"),
              0);
    EXPECT_EQ(UT_STR::AToL("- 42"), 0);
    EXPECT_EQ(UT_STR::AToL("--42"), 0);
    EXPECT_EQ(UT_STR::AToL("+-42"), 0);
}

TEST(DecimalNumber, EndsAtTheFirstOtherByte) {
    EXPECT_EQ(UT_STR::AToL("12ab"), 12);
    EXPECT_EQ(UT_STR::AToL("12 34"), 12);
    EXPECT_EQ(UT_STR::AToL("0x10"), 0);
    EXPECT_EQ(UT_STR::AToL("1.9"), 1);
    EXPECT_EQ(UT_STR::AToL("1/2"), 1);
    EXPECT_EQ(UT_STR::AToL("1:2"), 1);
    EXPECT_EQ(UT_STR::AToL("7\xB2"), 7);
}

TEST(DecimalNumber, IsNeverOctal) {
    EXPECT_EQ(UT_STR::AToL("010"), 10);
    EXPECT_EQ(UT_STR::AToL("-0000000000000000000012"), -12);
}

TEST(DecimalNumber, IsZeroWithoutDigits) {
    EXPECT_EQ(UT_STR::AToL(nullptr), 0);
    EXPECT_EQ(UT_STR::AToL(""), 0);
    EXPECT_EQ(UT_STR::AToL("-"), 0);
    EXPECT_EQ(UT_STR::AToL("+"), 0);
    EXPECT_EQ(UT_STR::AToL(" \t"), 0);
    EXPECT_EQ(UT_STR::AToL("TRUE"), 0);
}

TEST(DecimalNumber, ReachesTheEndsOfItsRange) {
    EXPECT_EQ(UT_STR::AToL("2147483646"), 2147483646);
    EXPECT_EQ(UT_STR::AToL("2147483647"), 2147483647);
    EXPECT_EQ(UT_STR::AToL("-2147483647"), -2147483647);
    EXPECT_EQ(UT_STR::AToL("-2147483648"), -2147483648);
}

TEST(DecimalNumber, SaturatesBeyondItsRange) {
    EXPECT_EQ(UT_STR::AToL("2147483648"), 2147483647);
    EXPECT_EQ(UT_STR::AToL("2147483649"), 2147483647);
    EXPECT_EQ(UT_STR::AToL("4294967296"), 2147483647);
    EXPECT_EQ(UT_STR::AToL("18446744073709551617"), 2147483647);
    EXPECT_EQ(UT_STR::AToL("-2147483649"), -2147483648);
    EXPECT_EQ(UT_STR::AToL("-21474836480"), -2147483648);
    EXPECT_EQ(UT_STR::AToL("-18446744073709551617"), -2147483648);
}

TEST(DecimalNumber, SaturatesHoweverLongItIs) {
    const std::string digits(1'000'000, '9');
    EXPECT_EQ(UT_STR::AToL(digits.c_str()), 2147483647);
    EXPECT_EQ(UT_STR::AToL(("-" + digits).c_str()), -2147483648);
    EXPECT_EQ(UT_STR::AToL((std::string(1'000'000, '0') + "5").c_str()), 5);
}

TEST(UpperCase, IsThatOfTheAsciiLettersAlone) {
    EXPECT_STREQ(UT_STR::Upper("flash9_aZ{\xE4").c_str(), "FLASH9_AZ{\xE4");
    EXPECT_STREQ(UT_STR::Upper("").c_str(), "");
}

TEST(UpperCase, OfNullIsEmpty) { EXPECT_EQ(UT_STR::Upper(nullptr).GetLength(), 0U); }

TEST(UpperCase, LeavesItsArgumentAlone) {
    const std::string text = "flash";
    EXPECT_STREQ(UT_STR::Upper(text.c_str()).c_str(), "FLASH");
    EXPECT_EQ(text, "flash");
}

} // namespace
