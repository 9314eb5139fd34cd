// The reference's reader of database files.
#include "ReferenceReader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace {

using namespace reference;
using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

TEST(ReferenceReader, SplitsAtTheFirstEqualsSignAndDropsBlanksAround) {
    EXPECT_THAT(parse(" \tKEY \t=  a = b \t\n").own, ElementsAre(Pair("KEY", "a = b")));
}

TEST(ReferenceReader, TakesEitherLineEndAndALastLineWithoutOne) {
    EXPECT_THAT(parse("A = 1\r\nB = 2\nC = 3").own,
                ElementsAre(Pair("A", "1"), Pair("B", "2"), Pair("C", "3")));
}

TEST(ReferenceReader, ACarriageReturnThatEndsNoLineIsText) {
    EXPECT_THAT(parse("A = 1\r2\r\r\nB = 3\r").own, ElementsAre(Pair("A", "1\r2\r"), Pair("B", "3\r")));
}

TEST(ReferenceReader, SkipsAByteOrderMark) {
    EXPECT_THAT(parse("\xEF\xBB\xBF"
                      "A = 1\n")
                    .own,
                ElementsAre(Pair("A", "1")));
}

TEST(ReferenceReader, CommentsAndBlankLinesAreNothing) {
    const ParsedFile file = parse("# A = 1\n\n  \t\n  # B = 2 \\\nC = 3 # no comment\n");
    EXPECT_THAT(file.own, ElementsAre(Pair("C", "3 # no comment")));
    EXPECT_EQ(file.faults, 0U);
}

TEST(ReferenceReader, ALineGoesOnBehindABackslash) {
    EXPECT_THAT(parse("A = a, \\\n   b,\\\r\n\tc\nB = 2\n").own,
                ElementsAre(Pair("A", "a,b,c"), Pair("B", "2")));
}

TEST(ReferenceReader, ABackslashThatIsTextDoesNotLetALineGoOn) {
    EXPECT_THAT(parse("A = a\\\\\n\nB = 2\n").own, ElementsAre(Pair("A", "a\\"), Pair("B", "2")));
}

TEST(ReferenceReader, NothingIsACommentOrAHeaderInsideAContinuation) {
    EXPECT_THAT(parse("A = a\\\n#b\\\n[c]\nB = 2\n").own, ElementsAre(Pair("A", "a#b[c]"), Pair("B", "2")));
}

TEST(ReferenceReader, ABackslashAtTheEndOfTheFileCostsTheLine) {
    const ParsedFile file = parse("A = 1\nB = 2\\");
    EXPECT_THAT(file.own, ElementsAre(Pair("A", "1")));
    EXPECT_EQ(file.faults, 1U);
}

TEST(ReferenceReader, AMalformedLineCostsThatLineAlone) {
    const ParsedFile file = parse("no assignment\n= x\ntwo words = x\nNUL = \0\n+= x\nA = 1\n"s);
    EXPECT_THAT(file.own, ElementsAre(Pair("A", "1")));
    EXPECT_EQ(file.faults, 5U);
}

TEST(ReferenceReader, TheLastOfTwoValuesStands) {
    EXPECT_THAT(parse("A = 1\nA = 2\n").own, ElementsAre(Pair("A", "2")));
}

TEST(ReferenceReader, APlusBeforeTheEqualsSignAppendsTheTextAsItStands) {
    EXPECT_THAT(parse("A = 1\nA += ,2\nA+= ,3\nB += x\n").own,
                ElementsAre(Pair("A", "1,2,3"), Pair("B", "x")));
}

TEST(ReferenceReader, SectionsAreOneWhateverTheirCase) {
    const ParsedFile file = parse("A = 0\n[Dev]\nA = 1\n[other]\nA = 2\n[DEV]\nB = 3\n");
    EXPECT_THAT(file.own, ElementsAre(Pair("A", "0")));
    ASSERT_EQ(file.sections.size(), 2U);
    EXPECT_EQ(file.sections[0].name, "Dev");
    EXPECT_THAT(file.sections[0].keys, ElementsAre(Pair("A", "1"), Pair("B", "3")));
    EXPECT_THAT(file.sections[1].keys, ElementsAre(Pair("A", "2")));
}

TEST(ReferenceReader, ANameMayHoldAnOpeningBracket) {
    const ParsedFile file = parse("[a[b]\nA = 1\n");
    EXPECT_EQ(file.faults, 0U);
    ASSERT_EQ(file.sections.size(), 1U);
    EXPECT_EQ(file.sections[0].name, "a[b");
}

TEST(ReferenceReader, AMalformedHeaderDropsTheKeysUpToTheNextOne) {
    for (const std::string header : {"[", "[]", "[dev", "[dev] x"}) {
        const ParsedFile file = parse("[first]\nA = 1\n" + header + "\nA = 2\n[last]\nA = 3\n");
        EXPECT_THAT(file.own, IsEmpty());
        ASSERT_EQ(file.sections.size(), 2U) << header;
        EXPECT_THAT(file.sections[0].keys, ElementsAre(Pair("A", "1"))) << header;
        EXPECT_THAT(file.sections[1].keys, ElementsAre(Pair("A", "3"))) << header;
        EXPECT_EQ(file.faults, 1U) << header;
    }
}

TEST(ReferenceReader, SeparatorsMakeOnePieceMoreThanThereAreOfThem) {
    EXPECT_THAT(split("a,,b,", ','), ElementsAre("a", "", "b", ""));
}

TEST(ReferenceReader, ItemsAreTakenAsTheyStand) {
    const Keys keys{{"A", " x,,y "}, {"EMPTY", ""}};
    const Accessor accessor(&keys, nullptr);
    EXPECT_THAT(accessor.items("A"), ElementsAre(" x", "", "y "));
    EXPECT_THAT(accessor.items("a"), IsEmpty());
    EXPECT_THAT(accessor.items("EMPTY"), IsEmpty());
}

TEST(ReferenceReader, AnEmptyRecordHasOneEmptyField) {
    const Keys keys{{"A", ":x,y"}, {"EMPTY", ""}};
    const Accessor accessor(&keys, nullptr);
    EXPECT_THAT(accessor.records("A"), ElementsAre(ElementsAre(""), ElementsAre("x", "y")));
    EXPECT_THAT(accessor.records("EMPTY"), IsEmpty());
    EXPECT_EQ(fieldOf(accessor.records("A")[1], 1), "y");
    EXPECT_EQ(fieldOf(accessor.records("A")[1], 2), std::nullopt);
}

TEST(ReferenceReader, ItemsBehindTheLastShortIndexDoNotExist) {
    const Keys keys{{"ITEMS", std::string(40000, ',')}, {"RECORDS", std::string(40000, ':')}};
    const Accessor accessor(&keys, nullptr);
    EXPECT_THAT(accessor.items("ITEMS"), SizeIs(32768));
    EXPECT_THAT(accessor.records("RECORDS"), SizeIs(32768));
    EXPECT_THAT(accessor.records("ITEMS"), ElementsAre(SizeIs(32768)));
}

TEST(ReferenceReader, ADeviceIsAnsweredByItsFamilyForTheKeysThatItLacks) {
    const Databases databases(
        std::map<std::string, std::string>{{"Kes.acd", "A = 1\nB = 2\nC = 3\n[dev]\nA = 4\nC =\n"}});
    const Opened device = databases.open("DEV");
    EXPECT_EQ(device.module, "Kes");
    EXPECT_THAT(device.accessor.items("A"), ElementsAre("4"));
    EXPECT_THAT(device.accessor.items("B"), ElementsAre("2"));
    EXPECT_THAT(device.accessor.items("C"), IsEmpty());
    EXPECT_THAT(databases.open("kes").accessor.items("A"), ElementsAre("1"));
}

TEST(ReferenceReader, NamesAreFilesThenFamiliesThenDevices) {
    const Databases databases({{"a.acd", "[b]\n[c]\n"}, {"b.acd", "[c]\n[d]\n"}});
    EXPECT_EQ(databases.open("B.ACD").module, "b");
    EXPECT_EQ(databases.open("b").module, "b");
    EXPECT_EQ(databases.open("c").module, "a");
    EXPECT_EQ(databases.open("D").module, "b");
    EXPECT_EQ(databases.open("e").module, std::nullopt);
    EXPECT_EQ(databases.open("").module, std::nullopt);
}

TEST(ReferenceReader, OfTwoFilesThatDifferInCaseOnlyTheFirstCounts) {
    const Databases databases({{"KES.acd", "[a]\n"}, {"kes.acd", "[b]\n"}});
    EXPECT_EQ(databases.open("kes").module, "KES");
    EXPECT_EQ(databases.open("a").module, "KES");
    EXPECT_EQ(databases.open("b").module, std::nullopt);
}

TEST(ReferenceReader, ANameIsCutOnlyWhenItIsNothingAsAWhole) {
    const Databases databases({{"a.acd", "[dev]\n[dev_x]\nA = 1\n"}, {"fam_x.acd", ""}});
    EXPECT_THAT(databases.open("dev_x").accessor.items("A"), ElementsAre("1"));
    EXPECT_EQ(databases.open("dev_y").module, "a");
    EXPECT_EQ(databases.open("fam_x").module, "fam_x");
    EXPECT_EQ(databases.open("fam").module, std::nullopt);
}

TEST(ReferenceDatabases, FilesAreFoundInAnyCase) {
    const Databases databases(std::map<std::string, std::string>{{"Spi.acd", "A = 1\n"}});
    EXPECT_TRUE(databases.has("spi.acd"));
    EXPECT_THAT(databases.file("spi.acd").items("A"), ElementsAre("1"));
    EXPECT_FALSE(databases.has("spi"));
}

} // namespace
