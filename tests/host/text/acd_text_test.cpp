#include <AcdText.h>

#include <gmock/gmock.h>

// Case, characters and parts of texts, as tools share them with the readers.

using testing::ElementsAre;
using namespace std::string_view_literals;

namespace {

[[nodiscard]] std::vector<std::string> shown(const std::vector<AcdText::Part>& parts) {
    std::vector<std::string> all;
    for (const AcdText::Part& part : parts) {
        all.push_back(std::to_string(part.offset) + ":" + std::string(part.text));
    }
    return all;
}

} // namespace

TEST(AcdTextCase, IsThatOfAsciiLetters) {
    EXPECT_EQ(AcdText::lowerCase("aZ[@`{\xC4"), "az[@`{\xC4");
    EXPECT_EQ(AcdText::toUpper('z'), 'Z');
    EXPECT_EQ(AcdText::toUpper('{'), '{');
    EXPECT_TRUE(AcdText::equalsIgnoreCase("Ks50", "kS50"));
    EXPECT_FALSE(AcdText::equalsIgnoreCase("KS50", "KS5"));
    EXPECT_FALSE(AcdText::equalsIgnoreCase("[", "{"));
    EXPECT_LT(AcdText::compareIgnoreCase("B", "ba"), 0);
    EXPECT_GT(AcdText::compareIgnoreCase("\xFF", "a"), 0);
    EXPECT_EQ(AcdText::compareIgnoreCase("", ""), 0);
}

TEST(AcdTextUtf8, CharactersHaveOneToFourBytes) {
    EXPECT_EQ(AcdText::characterLength("a"), 1U);
    EXPECT_EQ(AcdText::characterLength("\0"sv), 1U);
    EXPECT_EQ(AcdText::characterLength("\xC2\x80"), 2U);
    EXPECT_EQ(AcdText::characterLength("\xE0\xA0\x80"), 3U);
    EXPECT_EQ(AcdText::characterLength("\xED\x9F\xBF"), 3U);
    EXPECT_EQ(AcdText::characterLength("\xEE\x80\x80"), 3U);
    EXPECT_EQ(AcdText::characterLength("\xF0\x90\x80\x80"), 4U);
    EXPECT_EQ(AcdText::characterLength("\xF4\x8F\xBF\xBF"), 4U);
}

TEST(AcdTextUtf8, MalformedCharactersHaveNoLength) {
    for (const std::string_view text :
         {""sv, "\x80"sv, "\xC1\xBF"sv, "\xC2"sv, "\xC2g"sv, "\xE0\x9F\xBF"sv, "\xED\xA0\x80"sv, "\xE1\x80"sv,
          "\xE1\x80g"sv, "\xF0\x8F\xBF\xBF"sv, "\xF4\x90\x80\x80"sv, "\xF5\x80\x80\x80"sv, "\xF1\x80\x80"sv,
          "\xF1\x80\x80g"sv, "\xFF"sv}) {
        EXPECT_EQ(AcdText::characterLength(text), 0U) << testing::PrintToString(text);
    }
}

TEST(AcdTextUtf8, EveryCodePointIsWellFormedButSurrogates) {
    for (unsigned code = 0; code <= 0x10FFFF; ++code) {
        std::string text;
        const auto add = [&text](unsigned byte) { text += static_cast<char>(byte); };
        if (code < 0x80) {
            add(code);
        } else if (code < 0x800) {
            add(0xC0 | code >> 6), add(0x80 | (code & 0x3F));
        } else if (code < 0x10000) {
            add(0xE0 | code >> 12), add(0x80 | (code >> 6 & 0x3F)), add(0x80 | (code & 0x3F));
        } else {
            add(0xF0 | code >> 18), add(0x80 | (code >> 12 & 0x3F)), add(0x80 | (code >> 6 & 0x3F)),
                add(0x80 | (code & 0x3F));
        }
        const bool isSurrogate = code >= 0xD800 && code <= 0xDFFF;
        ASSERT_EQ(AcdText::characterLength(text), isSurrogate ? 0 : text.size()) << code;
    }
}

TEST(AcdTextUtf8, TheFirstInvalidByteIsFound) {
    EXPECT_EQ(AcdText::findInvalidUtf8(""), 0U);
    EXPECT_EQ(AcdText::findInvalidUtf8("a\xC3\xA4z"), 4U);
    EXPECT_EQ(AcdText::findInvalidUtf8("a\xC3\xA4\xC3z"), 3U);
}

TEST(AcdTextParts, AreOneMoreThanSeparators) {
    EXPECT_THAT(shown(AcdText::split("a,,b,", ",")), ElementsAre("0:a", "2:", "3:b", "5:"));
    EXPECT_THAT(shown(AcdText::split("", ",")), ElementsAre("0:"));
    EXPECT_THAT(shown(AcdText::split("a::b:c", "::")), ElementsAre("0:a", "3:b:c"));
    EXPECT_THAT(shown(AcdText::split("a,b", "")), ElementsAre("0:a,b"));
}

TEST(AcdTextParts, CanBeLimited) {
    EXPECT_THAT(shown(AcdText::split("a,b,c", ",", 2)), ElementsAre("0:a", "2:b"));
    EXPECT_EQ(AcdText::split(std::string(40000, ','), ",").size(), 32768U);
}

TEST(AcdTextParts, AreReachedInAnyOrder) {
    AcdText::PartCursor cursor;
    cursor.start("a,bb,c", ",");
    EXPECT_TRUE(cursor.moveTo(2, "a,bb,c", ","));
    EXPECT_EQ(cursor.part("a,bb,c"), "c");
    EXPECT_TRUE(cursor.moveTo(1, "a,bb,c", ","));
    EXPECT_EQ(cursor.part("a,bb,c"), "bb");
    EXPECT_EQ(cursor.offset(), 2U);
    EXPECT_FALSE(cursor.moveTo(3, "a,bb,c", ","));
    EXPECT_EQ(cursor.index(), 2U);
}
