#include "DatabaseFixtures.h"

// The form of a database file: what stands for a value, a comment, a header, and where a line goes on.

using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_view_literals;

class Grammar : public DatabaseTest {};

TEST_F(Grammar, SplitsAtTheFirstEqualsSign) {
    EXPECT_THAT(valueIn("KEY = a=b = c\n", "KEY"), Optional("a=b = c"sv));
}

TEST_F(Grammar, DropsBlanksAroundKeyAndValue) {
    EXPECT_THAT(valueIn(" \tKEY\t =\t  a b\t c \t \n", "KEY"), Optional("a b\t c"sv));
}

TEST_F(Grammar, NeedsNoBlanks) { EXPECT_THAT(valueIn("KEY=a", "KEY"), Optional("a"sv)); }

TEST_F(Grammar, KeysAreCaseSensitive) {
    EXPECT_EQ(valueIn("KEY = a\n", "key"), nullopt);
    EXPECT_THAT(valueIn("KEY = a\nkey = b\n", "key"), Optional("b"sv));
}

TEST_F(Grammar, AKeyHoldsAnyBytesButBlanks) {
    EXPECT_THAT(valueIn("a[b]#\\\"\xFF+- = v\n", "a[b]#\\\"\xFF+-"), Optional("v"sv));
}

TEST_F(Grammar, TheLastOfTwoAssignmentsStands) {
    EXPECT_THAT(valueIn("KEY = a\nOTHER = b\nKEY = c\n", "KEY"), Optional("c"sv));
}

TEST_F(Grammar, TheLastAssignmentMayBeEmpty) { EXPECT_EQ(valueIn("KEY = a\nKEY =\n", "KEY"), nullopt); }

TEST_F(Grammar, AnEmptyFileHoldsNothing) {
    EXPECT_EQ(valueIn("", "KEY"), nullopt);
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, BlankLinesAreNothing) {
    EXPECT_THAT(valueIn("\n \n\t\n\r\n  \r\nKEY = a\n\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, CommentsAreNothing) {
    EXPECT_THAT(valueIn("# = x\n \t# [A]\n#\nKEY = a\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(AcdStore::devices("kestrel"), IsEmpty());
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, ACommentMayHoldANul) {
    EXPECT_THAT(valueIn("# a\0b\nKEY = a\n"sv, "KEY"), Optional("a"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, NoCommentStandsBehindAValue) {
    EXPECT_THAT(valueIn("KEY = a # b\n", "KEY"), Optional("a # b"sv));
}

TEST_F(Grammar, TheLastLineNeedsNoEnd) {
    EXPECT_THAT(valueIn("KEY = a\nOTHER = b", "OTHER"), Optional("b"sv));
}

TEST_F(Grammar, TheLastHeaderNeedsNoEnd) { EXPECT_THAT(devicesIn("[A]\n[B]"), ElementsAre("A", "B")); }

TEST_F(Grammar, LinesMayEndInCrLf) {
    EXPECT_THAT(valueIn("KEY = a\r\n[A]\r\nKEY = b\r\n", "KEY", "A"), Optional("b"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, ACrElsewhereIsAByteOfTheValue) {
    EXPECT_THAT(valueIn("KEY = a\rb\r\r\n", "KEY"), Optional("a\rb\r"sv));
    EXPECT_THAT(valueIn("KEY = a\r", "KEY"), Optional("a\r"sv));
}

TEST_F(Grammar, AByteOrderMarkIsSkippedAtTheStart) {
    EXPECT_THAT(valueIn("\xEF\xBB\xBFKEY = a\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(devicesIn("\xEF\xBB\xBF[A]\n"), ElementsAre("A"));
    EXPECT_THAT(valueIn("\xEF\xBB\xBF# KEY = a\n", "KEY"), nullopt);
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Grammar, AByteOrderMarkElsewhereIsPartOfAKey) {
    EXPECT_THAT(valueIn("\n\xEF\xBB\xBFKEY = a\n", "KEY"), nullopt);
    EXPECT_THAT(valueIn("\n\xEF\xBB\xBFKEY = a\n", "\xEF\xBB\xBFKEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("\xEF\xBB\xBF\xEF\xBB\xBFKEY = a\n", "KEY"), nullopt);
}

TEST_F(Grammar, PartOfAByteOrderMarkIsNone) {
    EXPECT_THAT(valueIn("\xEF\xBBKEY = a\n", "\xEF\xBBKEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("\xEF\xBB", "KEY"), nullopt);
}

TEST_F(Grammar, OnlySpaceAndTabAreBlanks) {
    EXPECT_THAT(valueIn("\vKEY\f = \va\f\n", "\vKEY\f"), Optional("\va\f"sv));
    EXPECT_THAT(valueIn("KEY = \xC2\xA0\n", "KEY"), Optional("\xC2\xA0"sv));
}

TEST_F(Grammar, AKeyMayEndInPlus) { EXPECT_THAT(valueIn("KEY+ = a\n", "KEY+"), Optional("a"sv)); }

TEST_F(Grammar, AKeyMayBePlusAlone) { EXPECT_THAT(valueIn("+ = a\n", "+"), Optional("a"sv)); }

// Continuation

class Continuation : public DatabaseTest {};

TEST_F(Continuation, PutsNothingBetween) {
    EXPECT_THAT(valueIn("KEY = a \t\\\n \t b\\\nc\n", "KEY"), Optional("abc"sv));
}

TEST_F(Continuation, KeepsBlanksWithinAPiece) {
    EXPECT_THAT(valueIn("KEY = a b \\\n c  d \\\n e f\n", "KEY"), Optional("a bc  de f"sv));
}

TEST_F(Continuation, GoesOnOverCrLf) { EXPECT_THAT(valueIn("KEY = a\\\r\n b\r\n", "KEY"), Optional("ab"sv)); }

TEST_F(Continuation, NeedsTheBackslashInTheLastPlace) {
    EXPECT_THAT(valueIn("KEY = a\\ \nOTHER = b\n", "KEY"), Optional("a\\"sv));
    EXPECT_THAT(valueIn("KEY = a\\\r\r\nOTHER = b\n", "KEY"), Optional("a\\\r"sv));
}

TEST_F(Continuation, TakesOneBackslashOnly) {
    EXPECT_THAT(valueIn("KEY = a\\\\\nb\n", "KEY"), Optional("a\\b"sv));
    EXPECT_THAT(valueIn("KEY = a \\ \\\nb\n", "KEY"), Optional("a \\b"sv));
}

TEST_F(Continuation, HoldsNoCommentAndNoHeader) {
    EXPECT_THAT(valueIn("KEY = a\\\n# b\\\n[C]\n", "KEY"), Optional("a# b[C]"sv));
    EXPECT_THAT(AcdStore::devices("kestrel"), IsEmpty());
}

TEST_F(Continuation, IsNotBroughtAboutByABackslashThatIsText) {
    EXPECT_THAT(valueIn("KEY = a\\\\\n\nOTHER = b\n", "KEY"), Optional("a\\"sv));
    EXPECT_THAT(valueOf("kestrel", "OTHER"), Optional("b"sv));
}

TEST_F(Continuation, EndsWithABlankLine) {
    EXPECT_THAT(valueIn("KEY = a\\\n\nOTHER = b\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "OTHER"), Optional("b"sv));
    EXPECT_THAT(valueIn("KEY = a\\\n \t", "KEY"), Optional("a"sv));
}

TEST_F(Continuation, PassesALineOfTheBackslashAlone) {
    EXPECT_THAT(valueIn("KEY = a\\\n\\\n \\\nb\n", "KEY"), Optional("ab"sv));
}

TEST_F(Continuation, CanSplitAKey) { EXPECT_THAT(valueIn("KE\\\n  Y\\\n = a\n", "KEY"), Optional("a"sv)); }

TEST_F(Continuation, CanStandBehindTheEqualsSign) {
    EXPECT_THAT(valueIn("KEY =\\\n a\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("KEY = \\\n\\\n a\n", "KEY"), Optional("a"sv));
}

TEST_F(Continuation, CanSplitAnAppend) {
    EXPECT_THAT(valueIn("KEY = a\nKEY +\\\n= b\n", "KEY"), Optional("ab"sv));
}

TEST_F(Continuation, CanSplitAHeader) {
    EXPECT_THAT(devicesIn("[A\\\n B]\n [\\\nC]\\\n\nKEY = v\n"), ElementsAre("AB", "C"));
    EXPECT_THAT(valueOf("C", "KEY"), Optional("v"sv));
}

TEST_F(Continuation, OfAHeaderIsNoAssignment) {
    EXPECT_THAT(devicesIn("[A]\\\nKEY = v\n"), IsEmpty());
    EXPECT_THAT(valueOf("kestrel", "KEY"), nullopt);
}

TEST_F(Continuation, IsNotForComments) {
    EXPECT_THAT(valueIn("# comment \\\nKEY = a\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(devicesIn("# comment \\\n[A]\n"), ElementsAre("A"));
}

TEST_F(Continuation, OfABackslashAloneIsAnAssignment) {
    EXPECT_THAT(valueIn("\\\n  KEY = a\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("\\\n#KEY = a\n", "#KEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("\\\n[A] = a\n", "[A]"), Optional("a"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Continuation, OfValuesLeavesTheirNeighboursAlone) {
    const auto text = "A = 1\\\n2\nB = 3\nC = 4\\\n\\\n5\\\n6\n[X]\nD = 7\\\n8\nE = 9\n"sv;
    EXPECT_THAT(valueIn(text, "A"), Optional("12"sv));
    EXPECT_THAT(valueOf("kestrel", "B"), Optional("3"sv));
    EXPECT_THAT(valueOf("kestrel", "C"), Optional("456"sv));
    EXPECT_THAT(valueOf("X", "D"), Optional("78"sv));
    EXPECT_THAT(valueOf("X", "E"), Optional("9"sv));
}

TEST_F(Continuation, ReachesUpToSixteenMebibytes) {
    const std::string half(std::size_t{8} << 20, 'a');
    const std::string value = half + half.substr(6); // with "KEY = " exactly 16 MiB
    useFiles({{"kestrel.acd", "KEY = " + half + " \\\n " + half.substr(6) + "\n"}});
    EXPECT_TRUE(valueOf("kestrel", "KEY") == value);
    EXPECT_THAT(messages.take(), IsEmpty());
}

// Sections

class Sections : public DatabaseTest {};

TEST_F(Sections, KeepTheirKeys) {
    EXPECT_THAT(valueIn("[A]\nKEY = a\n[B]\nKEY = b\n", "KEY", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("B", "KEY"), Optional("b"sv));
    EXPECT_EQ(valueOf("kestrel", "KEY"), nullopt);
}

TEST_F(Sections, SeeTheFamilysKeysBehindTheirOwn) {
    EXPECT_THAT(valueIn("KEY = f\nOWN = f\n[A]\nKEY = a\n", "KEY", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("A", "OWN"), Optional("f"sv));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("f"sv));
}

TEST_F(Sections, DoNotSeeEachOther) { EXPECT_EQ(valueIn("[A]\nKEY = a\n[B]\n", "KEY", "B"), nullopt); }

TEST_F(Sections, AnEmptyValueHidesTheFamilys) {
    EXPECT_EQ(valueIn("KEY = f\n[A]\nKEY =\n", "KEY", "A"), nullopt);
}

TEST_F(Sections, ThatOpenAgainGoOn) {
    EXPECT_THAT(valueIn("[A]\nKEY = a\n[B]\n[A]\nOTHER = b\n", "KEY", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("A", "OTHER"), Optional("b"sv));
}

TEST_F(Sections, AreComparedWithoutCase) {
    EXPECT_THAT(devicesIn("[Ks50]\nKEY = a\n[B]\n[kS50]\nOTHER = b\n"), ElementsAre("Ks50", "B"));
    EXPECT_THAT(valueOf("KS50", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("ks50", "OTHER"), Optional("b"sv));
}

TEST_F(Sections, BytesOverAsciiHaveNoCase) {
    EXPECT_THAT(devicesIn("[\xC4]\n[\xE4]\n"), ElementsAre("\xC4", "\xE4"));
}

TEST_F(Sections, HeadersMayHaveBlanksAround) { EXPECT_THAT(devicesIn(" \t[A]\t \n"), ElementsAre("A")); }

TEST_F(Sections, NamesHoldAnyBytesButBlanksAndBrackets) {
    EXPECT_THAT(devicesIn("[a[#=\\+/\xFF]\n"), ElementsAre("a[#=\\+/\xFF"));
}

TEST_F(Sections, WithoutKeysAreDevices) { EXPECT_THAT(devicesIn("[A]\n[B]\n"), ElementsAre("A", "B")); }

TEST_F(Sections, StandInTheOrderOfTheirFirstOpening) {
    EXPECT_THAT(devicesIn("[C]\n[A]\n[B]\n[A]\n[C]\n"), ElementsAre("C", "A", "B"));
}

TEST_F(Sections, HoldManyKeys) {
    std::string text;
    for (int key = 0; key < 5000; ++key) {
        text += "K" + std::to_string(key * 7919 % 5000) + " = " + std::to_string(key) + "\n";
    }
    useFiles({{"kestrel.acd", text}});
    for (int key = 0; key < 5000; ++key) {
        const std::string name = "K" + std::to_string(key * 7919 % 5000);
        EXPECT_EQ(valueOf("kestrel", name.c_str()), std::to_string(key));
    }
}

// Appending

class Appending : public DatabaseTest {};

TEST_F(Appending, AddsTheTextAsItStands) {
    EXPECT_THAT(valueIn("KEY = a\nKEY += ,b\nKEY+=  c  \n", "KEY"), Optional("a,bc"sv));
}

TEST_F(Appending, ToNothingAssigns) { EXPECT_THAT(valueIn("KEY += a\nKEY += b\n", "KEY"), Optional("ab"sv)); }

TEST_F(Appending, ToAnEmptyValueAssigns) {
    EXPECT_THAT(valueIn("KEY =\nKEY += a\n", "KEY"), Optional("a"sv));
}

TEST_F(Appending, NothingChangesNothing) {
    EXPECT_THAT(valueIn("KEY = a\nKEY +=\n", "KEY"), Optional("a"sv));
}

TEST_F(Appending, IsUndoneByAnAssignment) {
    EXPECT_THAT(valueIn("KEY = a\nKEY += b\nKEY = c\nKEY += d\n", "KEY"), Optional("cd"sv));
}

TEST_F(Appending, GoesOverOtherKeysAndReopenedSections) {
    EXPECT_THAT(valueIn("[A]\nKEY = a\nX = x\n[B]\nKEY = b\n[A]\nKEY += c\n", "KEY", "A"), Optional("ac"sv));
    EXPECT_THAT(valueOf("B", "KEY"), Optional("b"sv));
}

TEST_F(Appending, DoesNotSeeTheFamilysKey) {
    EXPECT_THAT(valueIn("KEY = f\n[A]\nKEY += a\n", "KEY", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("f"sv));
}

TEST_F(Appending, TakesThePlusRightBeforeTheSignOnly) {
    EXPECT_THAT(valueIn("KEY = a\nKEY+ = b\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueIn("KEY+ = a\nKEY++= b\n", "KEY+"), Optional("ab"sv));
}
