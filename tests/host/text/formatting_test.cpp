// Formats and arguments to texts: lengths around the buffer, nulls, formats that fail, texts without arguments.
#include "text/Formatting.h"

#include <gtest/gtest.h>

#include <cstdarg>
#include <cstddef>
#include <string>

namespace {

// Volatile, so that no compiler knows it for a null that it would warn of.
const char* volatile noText = nullptr;

std::string formatted(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    std::string text = formatting::vformat(format, arguments);
    va_end(arguments);
    return text;
}

TEST(FormattedText, IsWhatPrintfPrints) {
    EXPECT_EQ(formatted("%s is not supported in %s\n", "KS50", "SPI mode"),
              "KS50 is not supported in SPI mode\n");
    EXPECT_EQ(formatted("%d %u %x %c%%", -7, 7U, 255, 'z'), "-7 7 ff z%");
    EXPECT_EQ(formatted("%-15.15s|", "abc100"), "abc100         |");
    EXPECT_EQ(formatted("%-10.6s|", "PROGRAMFLASH"), "PROGRA    |");
}

TEST(FormattedText, MayBeEmpty) { EXPECT_EQ(formatted("%s", ""), ""); }

TEST(FormattedText, OfEachLengthIsWhole) {
    for (std::size_t length = 0; length < 1100; ++length) {
        const std::string text(length, 'x');
        ASSERT_EQ(formatted("%s", text.c_str()), text) << length;
    }
}

TEST(FormattedText, MayBeLong) {
    const std::string text(3'000'000, 'x');
    EXPECT_EQ(formatted("<%s %d %s>", text.c_str(), 42, text.c_str()), "<" + text + " 42 " + text + ">");
}

TEST(FormattedText, MayHoldNuls) {
    EXPECT_EQ(formatted("a%cb", '\0'), std::string("a\0b", 3));
    EXPECT_EQ(formatted("%400d%c", 1, '\0').size(), 401U);
}

TEST(FormattedText, MayHoldBytesOver127) {
    EXPECT_EQ(formatted("%s|%.2s", "\xFF\x80\xC3", "\xC3\xA4\xC3"), "\xFF\x80\xC3|\xC3\xA4");
}

TEST(FormattedText, DoesNotInterpretItsArguments) { EXPECT_EQ(formatted("%s", "%n%s%%"), "%n%s%%"); }

TEST(FormattedText, OfANullTextShowsIt) {
    EXPECT_EQ(formatted("<%s>", noText), "<(null)>");
    EXPECT_EQ(formatted("<%-15.15s>", noText), "<(null)         >");
    EXPECT_EQ(formatted("<%10s>", noText), "<    (null)>");
}

TEST(FormattedText, OfANullTextIsSafeWhereThePrecisionIsTooShortToShowIt) {
    const std::string text = formatted("<%.3s>", noText);
    EXPECT_TRUE(text == "<>" || text == "<(nu>") << text;
}

TEST(FormattedText, OfANullFormatIsEmpty) { EXPECT_EQ(formatted(noText, 1), ""); }

TEST(FinishedText, WithoutPercentSignsStays) {
    EXPECT_EQ(formatting::unescapePercent(""), "");
    EXPECT_EQ(formatting::unescapePercent("Device KS50 belongs to kestrel\n"),
              "Device KS50 belongs to kestrel\n");
    EXPECT_EQ(formatting::unescapePercent("\xFF\x80\n"), "\xFF\x80\n");
}

TEST(FinishedText, TakesTwoPercentSignsForOne) {
    EXPECT_EQ(formatting::unescapePercent("100%%"), "100%");
    EXPECT_EQ(formatting::unescapePercent("%%"), "%");
    EXPECT_EQ(formatting::unescapePercent("%%d"), "%d");
    EXPECT_EQ(formatting::unescapePercent("%%%%"), "%%");
}

TEST(FinishedText, KeepsAnyOtherPercentSign) {
    EXPECT_EQ(formatting::unescapePercent("%"), "%");
    EXPECT_EQ(formatting::unescapePercent("50%"), "50%");
    EXPECT_EQ(formatting::unescapePercent("%s %d %n %*d %99999s"), "%s %d %n %*d %99999s");
    EXPECT_EQ(formatting::unescapePercent("% %"), "% %");
    EXPECT_EQ(formatting::unescapePercent("%%%"), "%%");
    EXPECT_EQ(formatting::unescapePercent("%%%s"), "%%s");
}

TEST(FinishedText, OfNullIsEmpty) { EXPECT_EQ(formatting::unescapePercent(nullptr), ""); }

} // namespace
