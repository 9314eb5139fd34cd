// The text type: null and NUL, aliasing, case, search, order.
#include <StringBase.h>

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>

namespace {

// Volatile, so that no compiler knows it for a null that it would warn of.
const char* volatile noText = nullptr;

/// Too long for any buffer inside the object.
constexpr const char* LONG_TEXT = "a text that is so long that it stands in memory of its own";

std::string bytesOf(const StringBase& text) { return {text.c_str(), text.GetLength()}; }

/// Each byte value once, in order.
std::string allBytes() {
    std::string bytes;
    for (int byte = 0; byte < 256; ++byte) {
        bytes += static_cast<char>(byte);
    }
    return bytes;
}

int sign(int number) { return (number > 0) - (number < 0); }

TEST(StringBase, StartsEmpty) {
    const StringBase text;
    EXPECT_EQ(text.GetLength(), 0U);
    EXPECT_STREQ(text.c_str(), "");
}

TEST(StringBase, TakesNullForTheEmptyText) {
    const char* const null = nullptr;
    EXPECT_EQ(bytesOf(StringBase(null)), "");
    EXPECT_EQ(bytesOf(StringBase(null, 0)), "");

    StringBase text("former");
    text += null;
    EXPECT_EQ(bytesOf(text), "former");
    text = null;
    EXPECT_EQ(bytesOf(text), "");
}

TEST(StringBase, HoldsAnyByte) {
    const std::string bytes = allBytes();
    const StringBase text(bytes.data(), bytes.size());
    EXPECT_EQ(bytesOf(text), bytes);
    EXPECT_EQ(text.c_str()[text.GetLength()], '\0');
}

TEST(StringBase, OfACStringEndsAtItsNul) { EXPECT_EQ(bytesOf(StringBase("ab\0cd")), "ab"); }

TEST(StringBase, CopiesAreIndependent) {
    StringBase original(LONG_TEXT);
    const StringBase copy = original;
    original.MakeUpper();
    EXPECT_STREQ(copy.c_str(), LONG_TEXT);
}

TEST(StringBase, AppendsWithNuls) {
    StringBase text("a\0b", 3);
    text += StringBase("\0c", 2);
    text += "d";
    EXPECT_EQ(bytesOf(text), std::string("a\0b\0cd", 6));
}

TEST(StringBase, MayBeAssignedAndAppendedToItself) {
    StringBase text(LONG_TEXT);
    const StringBase& same = text;
    text = same;
    EXPECT_STREQ(text.c_str(), LONG_TEXT);
    text += same;
    EXPECT_EQ(bytesOf(text), std::string(LONG_TEXT) + LONG_TEXT);
}

TEST(StringBase, MayBeAssignedAPieceOfItself) {
    StringBase text(LONG_TEXT);
    text = text.c_str();
    EXPECT_STREQ(text.c_str(), LONG_TEXT);
    text = text.c_str() + 10;
    EXPECT_STREQ(text.c_str(), LONG_TEXT + 10);
}

TEST(StringBase, MayBeAppendedAPieceOfItself) {
    StringBase text(LONG_TEXT);
    text += text.c_str() + 10;
    EXPECT_EQ(bytesOf(text), std::string(LONG_TEXT) + (LONG_TEXT + 10));
}

TEST(StringBaseFormat, PrintsLikePrintf) {
    StringBase text("former");
    text.Format("%-15.15s|%d ", "abc100", 1);
    EXPECT_EQ(bytesOf(text), "abc100         |1 ");
}

TEST(StringBaseFormat, TakesItselfForAnArgument) {
    StringBase text("short");
    text.Format("%s, %s", text.c_str(), text.c_str() + 1);
    EXPECT_EQ(bytesOf(text), "short, hort");

    text = LONG_TEXT;
    text.Format("%s|%s", text.c_str(), text.c_str());
    EXPECT_EQ(bytesOf(text), std::string(LONG_TEXT) + "|" + LONG_TEXT);
}

TEST(StringBaseFormat, TakesItselfForTheFormat) {
    StringBase text("a longer format, too long for a small buffer: %d");
    text.Format(text.c_str(), 7);
    EXPECT_EQ(bytesOf(text), "a longer format, too long for a small buffer: 7");
    text = "a longer text, too long for a small buffer: 100%%";
    text.Format(text.c_str());
    EXPECT_EQ(bytesOf(text), "a longer text, too long for a small buffer: 100%");
}

TEST(StringBaseFormat, WithoutArgumentsIsSafe) {
    StringBase text;
    text.Format("%s%n%d 100%% 50%");
    EXPECT_EQ(bytesOf(text), "%s%n%d 100% 50%");
}

TEST(StringBaseFormat, TakesNull) {
    StringBase text("former");
    text.Format("<%s>", noText);
    EXPECT_EQ(bytesOf(text), "<(null)>");
    text.Format(noText);
    EXPECT_EQ(bytesOf(text), "");
    text = "former";
    text.Format(noText, 1);
    EXPECT_EQ(bytesOf(text), "");
}

TEST(StringBaseFormat, KeepsNulsOfItsArguments) {
    StringBase text;
    text.Format("a%cb", '\0');
    EXPECT_EQ(bytesOf(text), std::string("a\0b", 3));
}

TEST(StringBaseCase, IsThatOfTheAsciiLettersAlone) {
    std::string upper = allBytes();
    std::string lower = allBytes();
    for (std::size_t letter = 0; letter < 26; ++letter) {
        upper['a' + letter] = static_cast<char>('A' + letter);
        lower['A' + letter] = static_cast<char>('a' + letter);
    }
    const std::string bytes = allBytes();
    StringBase text(bytes.data(), bytes.size());
    text.MakeUpper();
    EXPECT_EQ(bytesOf(text), upper);
    text = StringBase(bytes.data(), bytes.size());
    text.MakeLower();
    EXPECT_EQ(bytesOf(text), lower);
}

TEST(StringBaseSearch, FindsTheFirstCharacterAtOrBehind) {
    const StringBase text("KS50_TQ144_X");
    EXPECT_EQ(text.GetIndexOfFirstChar('_'), 4U);
    EXPECT_EQ(text.GetIndexOfFirstChar('K'), 0U);
    EXPECT_EQ(text.GetIndexOfFirstChar('_', 4), 4U);
    EXPECT_EQ(text.GetIndexOfFirstChar('_', 5), 10U);
    EXPECT_EQ(text.GetIndexOfFirstChar('K', 0), 0U);
    EXPECT_EQ(text.GetIndexOfFirstChar('X', 11), 11U);
}

TEST(StringBaseSearch, AnswersAllOnesForAnAbsentCharacter) {
    const StringBase text("KS50_TQ144");
    EXPECT_EQ(StringBase::NOT_FOUND, SIZE_MAX);
    EXPECT_EQ(text.GetIndexOfFirstChar('x'), StringBase::NOT_FOUND);
    EXPECT_EQ(text.GetIndexOfFirstChar('_', 5), StringBase::NOT_FOUND);
    EXPECT_EQ(text.GetIndexOfFirstChar('4', 10), StringBase::NOT_FOUND);
    EXPECT_EQ(text.GetIndexOfFirstChar('4', 11), StringBase::NOT_FOUND);
    EXPECT_EQ(text.GetIndexOfFirstChar('4', SIZE_MAX), StringBase::NOT_FOUND);
    EXPECT_EQ(StringBase().GetIndexOfFirstChar('_'), StringBase::NOT_FOUND);
}

TEST(StringBaseSearch, SeesNulsButNotTheTerminator) {
    EXPECT_EQ(StringBase("a\0_", 3).GetIndexOfFirstChar('\0'), 1U);
    EXPECT_EQ(StringBase("a\0_", 3).GetIndexOfFirstChar('_'), 2U);
    EXPECT_EQ(StringBase("a").GetIndexOfFirstChar('\0'), StringBase::NOT_FOUND);
}

TEST(StringBaseTruncate, KeepsTheFirstBytes) {
    StringBase text("KS50_TQ144");
    text.Truncate(4);
    EXPECT_EQ(bytesOf(text), "KS50");
    text.Truncate(0);
    EXPECT_EQ(bytesOf(text), "");
}

TEST(StringBaseTruncate, LeavesATextThatIsNoLonger) {
    StringBase text("KS50");
    text.Truncate(4);
    text.Truncate(5);
    text.Truncate(StringBase::NOT_FOUND);
    EXPECT_EQ(bytesOf(text), "KS50");
}

/// Which of two texts comes first: -1, 0 or 1, seen from both sides.
int order(const StringBase& left, const StringBase& right) {
    EXPECT_EQ(sign(left.Compare(right)), -sign(right.Compare(left)));
    return sign(left.Compare(right));
}
int orderIgnoringCase(const StringBase& left, const StringBase& right) {
    EXPECT_EQ(sign(left.ICompare(right)), -sign(right.ICompare(left)));
    return sign(left.ICompare(right));
}

TEST(StringBaseOrder, IsThatOfUnsignedBytes) {
    EXPECT_EQ(order("B", "a"), -1);
    EXPECT_EQ(order("z", "\x80"), -1);
    EXPECT_EQ(order("\x80", "\xFF"), -1);
    EXPECT_EQ(order("abc", "abc"), 0);
}

TEST(StringBaseOrder, PutsTheShorterFirstOnATie) {
    EXPECT_EQ(order("ab", "abc"), -1);
    EXPECT_EQ(order("", "a"), -1);
    EXPECT_EQ(order("abc", "abd"), -1);
    EXPECT_EQ(order("b", "abc"), 1);
}

TEST(StringBaseOrder, SeesBehindNuls) {
    EXPECT_EQ(order(StringBase("a\0b", 3), StringBase("a\0c", 3)), -1);
    EXPECT_EQ(order("a", StringBase("a\0", 2)), -1);
}

TEST(StringBaseOrderIgnoringCase, HasNoCase) {
    EXPECT_EQ(orderIgnoringCase("Kestrel", "kESTREL"), 0);
    EXPECT_EQ(orderIgnoringCase("B", "a"), 1);
    EXPECT_EQ(orderIgnoringCase("a", "B"), -1);
    EXPECT_EQ(orderIgnoringCase("[", "{"), -1);
    EXPECT_EQ(orderIgnoringCase("@", "`"), -1);
}

TEST(StringBaseOrderIgnoringCase, IsThatOfTheLowerCasedBytes) {
    EXPECT_EQ(orderIgnoringCase("_", "A"), -1);
    EXPECT_EQ(orderIgnoringCase("_", "a"), -1);
    EXPECT_EQ(orderIgnoringCase("Z", "{"), -1);
}

TEST(StringBaseOrderIgnoringCase, KnowsNoCaseOver127) {
    EXPECT_EQ(orderIgnoringCase("\xC4", "\xE4"), -1);
    EXPECT_EQ(orderIgnoringCase("z", "\x80"), -1);
    EXPECT_EQ(orderIgnoringCase("Z", "\xFF"), -1);
}

TEST(StringBaseOrderIgnoringCase, PutsTheShorterFirstOnATie) {
    EXPECT_EQ(orderIgnoringCase("AB", "abc"), -1);
    EXPECT_EQ(orderIgnoringCase("", "a"), -1);
    EXPECT_EQ(orderIgnoringCase("", ""), 0);
}

TEST(StringBaseOrderIgnoringCase, SeesBehindNuls) {
    EXPECT_EQ(orderIgnoringCase(StringBase("A\0b", 3), StringBase("a\0B", 3)), 0);
    EXPECT_EQ(orderIgnoringCase(StringBase("A\0b", 3), StringBase("a\0C", 3)), -1);
    EXPECT_EQ(orderIgnoringCase("a", StringBase("A\0", 2)), -1);
}

TEST(StringBaseEquality, IsSameLengthAndSameBytes) {
    EXPECT_TRUE(StringBase("abc") == StringBase("abc"));
    EXPECT_TRUE(StringBase("abc") == "abc");
    EXPECT_TRUE(StringBase("abc") != StringBase("ABC"));
    EXPECT_TRUE(StringBase("abc") != StringBase("ab"));
    EXPECT_TRUE(StringBase("a\0b", 3) != StringBase("a\0c", 3));
    EXPECT_FALSE(StringBase("a\0b", 3) == StringBase("a"));
}

} // namespace
