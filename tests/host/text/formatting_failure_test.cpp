// A format that the C library refuses. That of MinGW follows it until the stack is used up.
#include <StringBase.h>

#include <gtest/gtest.h>

#include <string>

TEST(FormattedText, ThatCannotBePrintedIsTheFormat) {
    const std::string tooWide = "a %99999999999d b"; // which the compiler would refuse as a literal
    StringBase text;
    text.Format(tooWide.c_str(), 1);
    EXPECT_EQ(text.c_str(), tooWide);
}
