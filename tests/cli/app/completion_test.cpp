// What the completions of all shells are made from.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <sstream>

namespace {

using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;
using testing::Not;

using Words = std::vector<std::string>;

class Completion : public testing::Test {
protected:
    [[nodiscard]] ProcessResult run(Words words) const {
        words.insert(words.begin(), "complete");
        return runTool({words, {}, {{"TARVIK_DATABASE", m_database.path()}}, {}});
    }

    /// The candidates without their descriptions.
    [[nodiscard]] Words offered(const Words& words) const {
        const ProcessResult outcome = run(words);
        EXPECT_EQ(outcome.status, 0);
        EXPECT_THAT(outcome.error, IsEmpty());
        Words offered;
        std::istringstream lines(outcome.output);
        for (std::string line; std::getline(lines, line);) {
            offered.push_back(line.substr(0, line.find('\t')));
        }
        return offered;
    }

    SmallDatabase m_database;
};

TEST_F(Completion, OffersCommandsWithTheirSummaries) {
    EXPECT_THAT(offered({"d"}), ElementsAre("devices", "diff", "dump"));
    EXPECT_EQ(run({"fam"}).output, "families\tList the part families and their modes\n");
    EXPECT_THAT(offered({""}), Not(Contains("complete")));
    EXPECT_THAT(offered({"help", "fa"}), ElementsAre("families"));
    EXPECT_THAT(offered({"--json", "vo"}), ElementsAre("vocabulary"));
}

TEST_F(Completion, OffersTheOptionsOfTheCommandAndOfTheTool) {
    EXPECT_THAT(offered({"check", "--"}),
                AllOf(Contains("--mode"), Contains("--operation"), Contains("--json"), Contains("--help"),
                      Not(Contains("--family"))));
    EXPECT_THAT(offered({"devices", "--fa"}), ElementsAre("--family"));
    EXPECT_THAT(offered({"--ver"}), ElementsAre("--version", "--verbose"));
}

TEST_F(Completion, OffersNamesOfTheDatabase) {
    EXPECT_THAT(offered({"show", ""}), ElementsAre("finch", "FN10", "FN20", "FLA", "FLB", "FLC"));
    EXPECT_THAT(offered({"show", "fn1"}), ElementsAre("FN10"));
    EXPECT_THAT(offered({"spi", "F"}), ElementsAre("FLA", "FLB", "FLC"));
    EXPECT_THAT(offered({"devices", "--family", ""}), ElementsAre("finch"));
    EXPECT_THAT(offered({"dump", "operations", "FN10", "FN2"}), ElementsAre("FN20"));
    EXPECT_THAT(offered({"rename", "f"}), ElementsAre("finch", "FN10", "FN20", "FLA", "FLB", "FLC"));
    EXPECT_THAT(offered({"remove", "FL"}), ElementsAre("FLA", "FLB", "FLC"));
    EXPECT_THAT(offered({"new", "d"}), ElementsAre("device"));
    EXPECT_THAT(offered({"new", "device", "FN30", "--like", "FN1"}), ElementsAre("FN10"));
}

TEST_F(Completion, OffersTheVocabulary) {
    EXPECT_THAT(offered({"check", "FN10", "--mode", "BS"}), ElementsAre("BS", "BSFILE", "Bscan"));
    EXPECT_THAT(offered({"check", "FN10", "-m", "SP"}), ElementsAre("SPI"));
    EXPECT_THAT(offered({"bsdl", "FN10", "--output", "S"}), ElementsAre("SVF", "STAPL"));
    EXPECT_THAT(offered({"operation-options", "FN10", "PROG"}), Contains("PROGRAM"));
    EXPECT_THAT(offered({"why", "FN10", "--option", "ERA"}), ElementsAre("ERASE"));
    EXPECT_THAT(offered({"--color", ""}), ElementsAre("auto", "always", "never"));
}

TEST_F(Completion, OffersWhatTheDeviceHas) {
    EXPECT_THAT(offered({"property", "FN10", ""}),
                ElementsAre("CORE", "OP_PROGRAM", "PINS", "PROGRAM", "VENDOR"));
    EXPECT_THAT(offered({"property", "FLA", ""}), ElementsAre("BUS", "DENSITY", "PAGE"));
    EXPECT_THAT(offered({"property", "fn10_p48", "P"}), ElementsAre("PINS", "PROGRAM"));
    EXPECT_THAT(offered({"property", "ZZ", ""}), IsEmpty());
    EXPECT_THAT(offered({"why", "FN10", "--property", "V"}), ElementsAre("VENDOR"));
    EXPECT_THAT(offered({"which", "--property", ""}), ElementsAre("BUS=", "CORE=", "DENSITY=", "OP_PROGRAM=",
                                                                  "PAGE=", "PINS=", "PROGRAM=", "VENDOR="));
    EXPECT_THAT(offered({"which", "--property", "VENDOR="}), ElementsAre("VENDOR=Korvel"));
    EXPECT_THAT(offered({"which", "--property=VENDOR=k"}), ElementsAre("--property=VENDOR=Korvel"));
    EXPECT_THAT(offered({"which", "--property", "NO="}), IsEmpty());
    const DatabaseDirectory packages({{"base.acd", "DEVICE_SUPPORTED = finch\n"},
                                      {"finch.acd", "PROPERTIES = PACKAGES,2,P48,TQ100\n[FN10]\n"},
                                      {"spi.acd", ""}});
    EXPECT_THAT(offered({"--database", packages.path(), "check", "FN10", "--package", ""}),
                ElementsAre("P48", "TQ100"));
}

TEST_F(Completion, GoesOnBehindAnEqualsSign) {
    EXPECT_THAT(offered({"check", "FN10", "--mode=SP"}), ElementsAre("--mode=SPI"));
    EXPECT_THAT(offered({"check", "--mode=SPI", "FN1"}), ElementsAre("FN10"));
    EXPECT_THAT(offered({"--database=" + m_database.path(), "show", "FN1"}), ElementsAre("FN10"));
}

TEST_F(Completion, LeavesFilesToTheShell) {
    for (const Words& words : {Words{"--database", ""}, {"lint", ""}, {"diff", "a", "b"}, {"--database=d"}}) {
        const ProcessResult outcome = run(words);
        EXPECT_EQ(outcome.status, 1);
        EXPECT_THAT(outcome.output, IsEmpty());
    }
}

TEST_F(Completion, OffersNothingWhereNothingCanStand) {
    EXPECT_THAT(offered({"show", "FN10", ""}), IsEmpty());
    EXPECT_THAT(offered({"vocabulary", ""}), IsEmpty());
    EXPECT_THAT(offered({"frobnicate", ""}), Not(Contains("FN10")));
    EXPECT_THAT(offered({"show", "ZZ"}), IsEmpty());
    EXPECT_THAT(offered({"why", "FN10", "--value", ""}), IsEmpty());
}

TEST_F(Completion, IsQuietAboutADatabaseThatIsNotThere) {
    const ProcessResult outcome = run({"--database", "/nowhere", "show", ""});
    EXPECT_NE(outcome.status, 1);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.error, IsEmpty());
    EXPECT_EQ(runTool({"complete"}).status, 0);
}

TEST_F(Completion, IsQuietAboutAFaultyDatabase) {
    const DatabaseDirectory faulty(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", "PROGRAM_OPTION = NONSENSE,Bscan,USB2\n[FN10]\nPROPERTY = PINS,44\n"}});
    const ProcessResult outcome = run({"--database", faulty.path(), "property", "FN10", ""});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.error, IsEmpty());
}

TEST_F(Completion, KnowsTheDemonstration) {
    const ProcessResult outcome = runTool({"complete", "show", "KS5"});
    EXPECT_THAT(outcome.output, testing::HasSubstr("KS50\n"));
    EXPECT_THAT(outcome.error, IsEmpty());
}

TEST_F(Completion, OffersOnlyWhatTheToolTakes) {
    for (const std::string& table : offered({"dump", ""})) {
        EXPECT_EQ(m_database.run({"dump", table}).status, 0) << table;
    }
    for (const std::string& format : offered({"lint", "--format", ""})) {
        EXPECT_NE(m_database.run({"lint", "--format", format}).status, 2) << format;
    }
    for (const std::string& code : offered({"lint", "--explain", ""})) {
        EXPECT_EQ(runTool({"lint", "--explain", code}).status, 0) << code;
    }
    for (const std::string& when : offered({"--color", ""})) {
        EXPECT_EQ(runTool({"vocabulary", "--color", when}).status, 0) << when;
    }
    for (const std::string& mode : offered({"check", "--mode", ""})) {
        for (const std::string& output : offered({"check", "--output", ""})) {
            EXPECT_NE(m_database.run({"check", "--mode", mode, "--output", output}).status, 2) << mode;
        }
    }
    for (const std::string& type : offered({"multiboot", "--type", ""})) {
        for (const std::string& width : offered({"multiboot", "--width", ""})) {
            EXPECT_NE(m_database.run({"multiboot", "FLA", "--lead", "--type", type, "--width", width}).status,
                      2);
        }
    }
}

} // namespace
