// What the manager relies on in the texts of whichever host it is built against.
#include <StringBase.h>
#include <UT_STR.h>

#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <string_view>
#include <utility>

namespace {

std::string_view view(const StringBase& text) { return {text.c_str(), text.GetLength()}; }

} // namespace

TEST(StringConformance, ANullTextIsEmpty) {
    const char* const null = nullptr;
    StringBase text(null);
    EXPECT_EQ(view(text), "");
    text = "x";
    text += null;
    EXPECT_EQ(view(text), "x");
    text = null;
    EXPECT_EQ(view(text), "");
    EXPECT_STREQ(StringBase().c_str(), "");
    EXPECT_EQ(view(StringBase(nullptr, 0)), "");
}

TEST(StringConformance, AnyByteMayStandInIt) {
    const StringBase text("a\0b\xff", 4);
    EXPECT_EQ(view(text), std::string_view("a\0b\xff", 4));
    EXPECT_EQ(text.c_str()[4], '\0');
}

TEST(StringConformance, CopiesAreIndependent) {
    StringBase first("a text that is longer than any short text");
    StringBase second = first;
    second += " and another";
    first = second;
    second = "x";
    EXPECT_EQ(view(first), "a text that is longer than any short text and another");
    const StringBase third = std::move(first);
    EXPECT_EQ(view(third), "a text that is longer than any short text and another");
}

TEST(StringConformance, ATextMayBeAppendedToItself) {
    StringBase text("ab");
    text += text;
    EXPECT_EQ(view(text), "abab");
}

TEST(StringConformance, OnlyAsciiHasCase) {
    StringBase text("aZ_9\xe4\xc4");
    text.MakeUpper();
    EXPECT_EQ(view(text), "AZ_9\xe4\xc4");
    text.MakeLower();
    EXPECT_EQ(view(text), "az_9\xe4\xc4");
}

TEST(StringConformance, FindsAndCuts) {
    StringBase text("a_b_c");
    EXPECT_EQ(text.GetIndexOfFirstChar('_', 0), 1U);
    EXPECT_EQ(text.GetIndexOfFirstChar('_', 2), 3U);
    EXPECT_EQ(text.GetIndexOfFirstChar('x', 0), StringBase::NOT_FOUND);
    EXPECT_EQ(text.GetIndexOfFirstChar('a', 99), StringBase::NOT_FOUND);
    EXPECT_EQ(StringBase::NOT_FOUND, static_cast<std::size_t>(-1));
    text.Truncate(99);
    EXPECT_EQ(view(text), "a_b_c");
    text.Truncate(1);
    EXPECT_EQ(view(text), "a");
    text.Truncate(0);
    EXPECT_EQ(view(text), "");
}

TEST(StringConformance, ComparesUnsignedBytesTheShorterFirst) {
    EXPECT_LT(StringBase("ab").Compare("abc"), 0);
    EXPECT_LT(StringBase("B").Compare("a"), 0);
    EXPECT_LT(StringBase("z").Compare("\x80"), 0);
    EXPECT_GT(StringBase("b").Compare("abc"), 0);
    EXPECT_EQ(StringBase("ab").Compare("ab"), 0);
    EXPECT_TRUE(StringBase("ab") == StringBase("ab"));
    EXPECT_TRUE(StringBase("ab") != StringBase("abc"));
    EXPECT_TRUE(StringBase("a\0b", 3) != StringBase("a"));
    EXPECT_EQ(StringBase("aB").ICompare("Ab"), 0);
    EXPECT_LT(StringBase("a").ICompare("B"), 0);
}

TEST(StringConformance, Formats) {
    StringBase text;
    text.Format("%-10.6s|%d ", "PROGRAMKEY", 1);
    EXPECT_EQ(view(text), "PROGRA    |1 ");
    text.Format("%s", std::string(5000, 'x').c_str());
    EXPECT_EQ(text.GetLength(), 5000U);
}

TEST(StringConformance, ChecksumsCanBeTakenPieceByPiece) {
    EXPECT_EQ(StringBase("123456789").CRC32(), 0xCBF43926U);
    EXPECT_EQ(StringBase("").CRC32(), 0U);
    EXPECT_EQ(StringBase::CRC32("123456789", 9), 0xCBF43926U);
    EXPECT_EQ(StringBase::CRC32("56789", 5, StringBase::CRC32("1234", 4)), 0xCBF43926U);
}

TEST(TextConformance, ComparesNullAsEmpty) {
    EXPECT_EQ(UT_STR::Compare(nullptr, ""), 0);
    EXPECT_LT(UT_STR::Compare(nullptr, "a"), 0);
    EXPECT_LT(UT_STR::Compare("A", "a"), 0);
    EXPECT_LT(UT_STR::Compare("z", "\x80"), 0);
    EXPECT_EQ(UT_STR::ICompare(nullptr, nullptr), 0);
    EXPECT_EQ(UT_STR::ICompare("sPi", "SpI"), 0);
    EXPECT_NE(UT_STR::ICompare("spi", "spi "), 0);
    EXPECT_NE(UT_STR::ICompare("\xe4", "\xc4"), 0);
}

TEST(TextConformance, ReadsDecimalNumbers) {
    EXPECT_EQ(UT_STR::AToL("42"), 42);
    EXPECT_EQ(UT_STR::AToL("  -7x9"), -7);
    EXPECT_EQ(UT_STR::AToL("+3"), 3);
    EXPECT_EQ(UT_STR::AToL("0x10"), 0);
    for (const char* text : {"", "x", "-", "+-1", " "}) {
        EXPECT_EQ(UT_STR::AToL(text), 0) << text;
    }
    EXPECT_EQ(UT_STR::AToL(nullptr), 0);
    EXPECT_EQ(UT_STR::AToL("99999999999999999999"), INT_MAX);
    EXPECT_EQ(UT_STR::AToL("-99999999999999999999"), INT_MIN);
    EXPECT_EQ(UT_STR::AToL("2147483647"), INT_MAX);
    EXPECT_EQ(UT_STR::AToL("-2147483648"), INT_MIN);
}

TEST(TextConformance, TurnsToUpperCase) {
    EXPECT_EQ(view(UT_STR::Upper("aZ_\xe4")), "AZ_\xe4");
    EXPECT_EQ(view(UT_STR::Upper(nullptr)), "");
}
