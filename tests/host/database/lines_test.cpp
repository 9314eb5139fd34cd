// The lines of a file as the host layer shows them to tools.
#include "DatabaseFixtures.h"

#include <AcdLines.h>

#include "cli/support/DatabaseDirectory.h"

#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

using Kind = AcdLines::Kind;

TEST(AcdLines, GiveHeadersAssignmentsAppendsAndFaultsInOrder) {
    const AcdLines lines("A = 1\n[KS50]\nB += 2\nno sense\n");
    ASSERT_EQ(lines.lines().size(), 4U);
    EXPECT_EQ(lines.lines()[0].kind, Kind::ASSIGNMENT);
    EXPECT_EQ(lines.lines()[1].kind, Kind::HEADER);
    EXPECT_EQ(lines.lines()[1].name, "KS50");
    EXPECT_EQ(lines.lines()[2].kind, Kind::APPEND);
    EXPECT_EQ(lines.lines()[2].value, "2");
    EXPECT_EQ(lines.lines()[3].error, AcdLines::ParseError::NO_EQUALS_SIGN);
    EXPECT_EQ(lines.lines()[3].line, 4U);
    EXPECT_EQ(lines.lines()[3].text, "no '=' in 'no sense'");
}

TEST(AcdLines, KnowWhichLinesOfTheFileALineIs) {
    const AcdLines lines("\n# comment\nA = a,\\\n  b\n\nB = 1\n");
    ASSERT_EQ(lines.lines().size(), 2U);
    EXPECT_EQ(lines.lines()[0].firstLine, 3U);
    EXPECT_EQ(lines.lines()[0].lastLine, 4U);
    ASSERT_EQ(lines.lines()[0].spans.size(), 2U);
    EXPECT_EQ(lines.lines()[0].spans[1].offset, 2U);
    EXPECT_EQ(lines.lines()[0].spans[1].line, 4U);
    EXPECT_EQ(lines.lines()[0].spans[1].column, 3U);
    EXPECT_EQ(lines.lines()[1].firstLine, 6U);
}

TEST(AcdLines, CountALineThatGoesOnBeforeItHoldsAnything) {
    const AcdLines lines("\\\n# A = 1\nB = 2\n");
    ASSERT_EQ(lines.lines().size(), 2U);
    EXPECT_EQ(lines.lines()[0].firstLine, 1U);
    EXPECT_EQ(lines.lines()[0].lastLine, 2U);
    EXPECT_TRUE(lines.comments().empty());
}

TEST(AcdLines, KnowWhereTheirNamesStand) {
    const AcdLines lines("  A = 1\n [KS50]\nB\\\n  = 2\n[\\\n   KS75]\n\tC\\\n D = 3\n");
    std::vector<std::pair<unsigned, unsigned>> places;
    for (const AcdLines::Line& line : lines.lines()) {
        places.emplace_back(line.line, line.column);
    }
    using testing::Pair;
    EXPECT_THAT(places, testing::ElementsAre(Pair(1, 3), Pair(2, 3), Pair(3, 1), Pair(6, 4), Pair(7, 2)));
}

TEST(AcdLines, HaveNoFragmentsWithoutText) {
    const AcdLines lines("A = 1\\\n  \\\n\\\n\nB = \\\n\\\n  2\n");
    ASSERT_EQ(lines.lines().size(), 2U);
    ASSERT_EQ(lines.lines()[0].spans.size(), 1U);
    EXPECT_EQ(lines.lines()[0].spans[0].line, 1U);
    ASSERT_EQ(lines.lines()[1].spans.size(), 1U);
    EXPECT_EQ(lines.lines()[1].spans[0].line, 7U);
}

TEST(AcdLines, KeepComments) {
    const AcdLines lines("A = 1\n  # one\r\n# two");
    ASSERT_EQ(lines.comments().size(), 2U);
    EXPECT_EQ(lines.comments()[0].line, 2U);
    EXPECT_EQ(lines.comments()[0].column, 3U);
    EXPECT_EQ(lines.comments()[0].text, "# one");
    EXPECT_EQ(lines.comments()[1].text, "# two");
}

TEST(AcdLines, TakeNothingButBlanksBeforeAComment) {
    using namespace std::string_view_literals;
    for (int byte = 0; byte < 256; ++byte) {
        const std::string text = static_cast<char>(byte) + std::string("# one");
        EXPECT_EQ(AcdLines(text).comments().size(),
                  " \t\n#"sv.find(text[0]) == std::string_view::npos ? 0U : 1U)
            << byte;
    }
}

TEST(AcdLines, ShowTheSourceAsItStands) {
    const AcdLines lines("\xEF\xBB\xBF"
                         "A = a, \\\r\n   b\n\n");
    EXPECT_EQ(lines.source(1), "A = a, \\");
    EXPECT_EQ(lines.source(2), "   b");
    EXPECT_EQ(lines.source(3), "");
    EXPECT_EQ(lines.source(0), "");
    EXPECT_EQ(lines.source(4), "");
}

TEST(AcdLines, OfAnEmptyTextAreNone) {
    const AcdLines lines("");
    EXPECT_TRUE(lines.lines().empty());
    EXPECT_TRUE(lines.comments().empty());
}

TEST(AcdLines, KeepTheirTextsWhenTheyAreMoved) {
    AcdLines first("A = 1\n");
    const AcdLines second(std::move(first));
    EXPECT_EQ(second.lines()[0].name, "A");
    EXPECT_EQ(second.source(1), "A = 1");
}

TEST(AcdLines, OfTheDatabaseComeByFamily) {
    AcdStore::setMemoryFiles(
        {{"kestrel.acd", "[KS50]\n"}, {"base.acd", "A = 1\n"}, {"readme.txt", "no sense"}});
    const std::vector<AcdLines> files = AcdLines::ofDatabase();
    ASSERT_EQ(files.size(), 2U);
    EXPECT_EQ(files[0].family(), "base");
    EXPECT_EQ(files[0].path(), "base.acd");
    EXPECT_EQ(files[1].lines()[0].name, "KS50");
}

TEST(AcdLines, TellWhatIsWrongWithALine) {
    using Fault = AcdLines::ParseError;
    using namespace std::string_literals;
    const std::pair<std::string, Fault> faults[] = {{"no sense"s, Fault::NO_EQUALS_SIGN},
                                                    {" = 1"s, Fault::EMPTY_KEY},
                                                    {"A B = 1"s, Fault::BLANK_IN_KEY},
                                                    {"A = \0"s, Fault::NUL_BYTE},
                                                    {"A = 1\\"s, Fault::CONTINUED_AT_END},
                                                    {"[KS50"s, Fault::UNCLOSED_HEADER},
                                                    {"[]"s, Fault::EMPTY_NAME},
                                                    {"[KS 50]"s, Fault::BLANK_IN_NAME},
                                                    {"[KS50] FPGA"s, Fault::TEXT_BEHIND_HEADER}};
    for (const auto& [text, fault] : faults) {
        const AcdLines lines(text);
        ASSERT_EQ(lines.lines().size(), 1U) << text;
        EXPECT_EQ(lines.lines()[0].kind, Kind::INVALID) << text;
        EXPECT_EQ(lines.lines()[0].error, fault) << text;
        EXPECT_EQ(lines.lines()[0].closesSection, text.starts_with('[')) << text;
    }
}

TEST(AcdLines, TellOfALineThatIsTooLong) {
    const AcdLines lines("A = " + std::string(std::size_t{16} << 20, 'x') + "\nB = 1\n");
    ASSERT_EQ(lines.lines().size(), 2U);
    EXPECT_EQ(lines.lines()[0].error, AcdLines::ParseError::LINE_TOO_LONG);
    EXPECT_EQ(lines.lines()[1].name, "B");
}

TEST(AcdLines, OfTheDatabaseAreReadFromDisk) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{{"kestrel.acd", "[KS50]\n"}});
    useDirectories({directory.path()});
    const std::vector<AcdLines> all = AcdLines::ofDatabase();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].path(), directory.path("kestrel.acd"));
    EXPECT_EQ(all[0].family(), "kestrel");
}

TEST(AcdLines, OfAFileThatCantBeReadAreNoneAndHideNoOthers) {
    const DatabaseDirectory directory(
        DatabaseDirectory::Files{{"kestrel.acd", "A = 1\n"}, {"osprey.acd", "B = 1\n"}});
    useDirectories({directory.path()});
    EXPECT_EQ(AcdStore::families().size(), 2U);
    std::filesystem::remove(directory.path("kestrel.acd"));
    MessageRecorder messages;
    const std::vector<AcdLines> files = AcdLines::ofDatabase();
    ASSERT_EQ(files.size(), 2U);
    EXPECT_EQ(files[0].path(), directory.path("kestrel.acd"));
    EXPECT_EQ(files[0].readError(), "No such file or directory");
    EXPECT_THAT(files[0].lines(), testing::IsEmpty());
    EXPECT_EQ(files[1].readError(), "");
    ASSERT_EQ(files[1].lines().size(), 1U);
    EXPECT_EQ(files[1].lines()[0].name, "B");
    const std::vector<IssuedMessage> issued = messages.take();
    ASSERT_EQ(issued.size(), 1U);
    EXPECT_EQ(issued[0].text, directory.path("kestrel.acd") + ": can't be read: No such file or directory\n");
}

TEST(AcdLines, AreFoundWhereTheSearchPathWasListed) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{{"kestrel.acd", "[KS50]\n"}});
    const DatabaseDirectory elsewhere;
    const std::filesystem::path path = directory.path();
    std::filesystem::current_path(path.parent_path());
    useDirectories({path.filename().string()});
    ASSERT_EQ(AcdStore::families().size(), 1U);
    // Hosts change their directory as they like.
    std::filesystem::current_path(elsewhere.path());
    ASSERT_EQ(AcdLines::ofDatabase().size(), 1U);
    EXPECT_EQ(AcdLines::ofDatabase().front().lines().size(), 1U);
}

TEST(AcdLines, KnowWhichFilesDoNotCount) {
    const DatabaseDirectory directory(
        DatabaseDirectory::Files{{"kestrel.ACD", "[KS50]\n"}, {"kestrel.acd", "[KS75]\n"}});
    if (std::filesystem::equivalent(directory.path("kestrel.ACD"), directory.path("kestrel.acd"))) {
        GTEST_SKIP() << "names in any case are the same here";
    }
    useDirectories({directory.path()});
    const std::vector<AcdLines> files = AcdLines::ofDatabase();
    ASSERT_EQ(files.size(), 1U);
    EXPECT_EQ(files.front().lines().front().name, "KS50");
    EXPECT_THAT(files.front().caseCollisions(), testing::ElementsAre(directory.path("kestrel.acd")));
}
