// Texts of a database never become markup, nor break the data in the page.
#include "report/HtmlEscape.h"

#include <gtest/gtest.h>

namespace {

using report::displayable;
using report::escaped;
using report::jsonString;
using report::urlFragment;

using namespace std::string_literals;

TEST(ReportText, PlainTextStays) {
    EXPECT_EQ(displayable("KS50 100% ~"), "KS50 100% ~");
    EXPECT_EQ(displayable("a\tb"), "a\tb");
    EXPECT_EQ(displayable(""), "");
}

TEST(ReportText, WholeCharactersStay) {
    EXPECT_EQ(displayable("é – 漢 😀"), "é – 漢 😀");
    EXPECT_EQ(displayable("\xC2\xA0"), "\xC2\xA0");
    EXPECT_EQ(displayable("\xF4\x8F\xBF\xBF"), "\xF4\x8F\xBF\xBF");
}

TEST(ReportText, BytesThatAreNoCharacterShowAsReplacements) {
    EXPECT_EQ(displayable("a\xFFz"), "a\uFFFDz");
    EXPECT_EQ(displayable("\x80\x80"), "\uFFFD\uFFFD");
    EXPECT_EQ(displayable("\xC0\xAF"), "\uFFFD\uFFFD");
    EXPECT_EQ(displayable("\xED\xA0\x80"), "\uFFFD\uFFFD\uFFFD");
    EXPECT_EQ(displayable("\xF4\x90\x80\x80"), "\uFFFD\uFFFD\uFFFD\uFFFD");
    EXPECT_EQ(displayable("\xF5"), "\uFFFD");
}

TEST(ReportText, ABrokenBeginningShowsAsOneReplacement) {
    EXPECT_EQ(displayable("\xE2\x82z"), "\uFFFDz");
    EXPECT_EQ(displayable("\xF0\x9F\x98"), "\uFFFD");
    EXPECT_EQ(displayable("\xC3"), "\uFFFD");
}

TEST(ReportText, ControlCharactersShowAsReplacements) {
    EXPECT_EQ(displayable("\x01\x1B\x7F\r"), "\uFFFD\uFFFD\uFFFD\uFFFD");
    EXPECT_EQ(displayable("\0"s), "\uFFFD");
    EXPECT_EQ(displayable("\xC2\x85"), "\uFFFD");
}

TEST(ReportText, MarkupIsEscaped) {
    EXPECT_EQ(escaped("<script>alert('1')</script>"), "&lt;script&gt;alert(&#39;1&#39;)&lt;/script&gt;");
    EXPECT_EQ(escaped(R"(" onload="x)"), "&quot; onload=&quot;x");
    EXPECT_EQ(escaped("&lt;"), "&amp;lt;");
    EXPECT_EQ(escaped("\xFF<"), "\uFFFD&lt;");
}

TEST(ReportText, DataCantLeaveItsString) {
    EXPECT_EQ(jsonString(R"(a"b\c)"), R"("a\"b\\c")");
    EXPECT_EQ(jsonString("\t"), R"("\t")");
    EXPECT_EQ(jsonString("\x01"), "\"\uFFFD\"");
}

TEST(ReportText, DataCantEndItsScript) {
    EXPECT_EQ(jsonString("</script><!--"), R"("\u003c/script>\u003c!--")");
}

TEST(ReportText, FragmentsTakeAnyName) {
    EXPECT_EQ(urlFragment("KS50-x_1.5"), "KS50-x_1.5");
    EXPECT_EQ(urlFragment("a b%\"<é"), "a%20b%25%22%3C%C3%A9");
}

} // namespace
