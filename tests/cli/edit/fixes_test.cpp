// What `lint --fix` writes, shows and leaves alone; fixes.py has the fix of each rule.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include <sstream>

using testing::HasSubstr;
using testing::Not;

namespace {

DatabaseDirectory::Files withFamily(const std::string& text) {
    return {{"base.acd", "DEVICE_SUPPORTED       = base,kestrel\n"
                         "PROGRAM_OPTION_PACKAGE = base,kestrel\n"
                         "IDCODE                 = KS50,0xX4104FB7\n"},
            {"kestrel.acd", text}};
}

std::string read(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
}

ProcessResult lint(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "lint");
    return runTool(arguments);
}

/// What `lint` with these arguments makes of the family's file.
std::string fixed(const std::string& text, std::vector<std::string> arguments = {"--fix"}) {
    const DatabaseDirectory directory(withFamily(text));
    arguments.push_back(directory.path());
    static_cast<void>(lint(arguments));
    return read(directory.path("kestrel.acd"));
}

} // namespace

TEST(Fixes, SayWhatTheyChangeAndReportWhatIsLeft) {
    const DatabaseDirectory directory(withFamily("NONSENSE = 1\nPROPERTY = FLASH,true\n[KS50]\n"));
    const ProcessResult outcome = lint({"--fix", directory.path()});
    EXPECT_EQ(read(directory.path("kestrel.acd")), "NONSENSE = 1\nPROPERTY = FLASH,TRUE\n[KS50]\n");
    EXPECT_THAT(outcome.error, HasSubstr("fixed 1 finding in 1 file; answers that change:"));
    EXPECT_THAT(outcome.error, HasSubstr("property FLASH: `true` becomes `TRUE`"));
    EXPECT_THAT(outcome.output, HasSubstr("[K102]"));
    EXPECT_THAT(outcome.output, Not(HasSubstr("[P107]")));
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(lint({"--fix", directory.path()}).error, "tarvik: 0 errors, 1 warning\nK102: 1\n");
}

TEST(Fixes, AreAnnounced) {
    const DatabaseDirectory directory(withFamily("PROPERTY = FLASH,true\n[KS50]\n"));
    EXPECT_EQ(lint({directory.path()}).error,
              "tarvik: 0 errors, 1 warning\nP107: 1\n1 can be fixed by --fix\n");
    EXPECT_EQ(lint({TARVIK_SOURCE_DIRECTORY "/tests/data/bad/T101"}).error,
              "tarvik: 1 error, 0 warnings\nT101: 1\n");
}

TEST(Fixes, ShowTheirDifferenceWithoutWriting) {
    const std::string text = "PROPERTY = FLASH,true\n[KS50]\n";
    const DatabaseDirectory directory(withFamily(text));
    const ProcessResult outcome = lint({"--diff", directory.path()});
    EXPECT_THAT(outcome.output, HasSubstr("-PROPERTY = FLASH,true\n+PROPERTY = FLASH,TRUE\n"));
    EXPECT_EQ(read(directory.path("kestrel.acd")), text);
}

TEST(Fixes, OfGuessesAreMadeOnRequestOnly) {
    const std::string text = "OPERATION = VERFIY,Bscan,USB2\n[KS50]\n";
    EXPECT_EQ(fixed(text), text);
    EXPECT_EQ(fixed(text, {"--unsafe-fixes"}), "OPERATION = VERIFY,Bscan,USB2\n[KS50]\n");
}

TEST(Fixes, ThatBringOtherFindingsAreLeftOut) {
    // KS75 has no IDCODE, which only a section of that name shows.
    const std::string text = "[KS50]\nPROPERTY = FLASH,true\n[KS75\n";
    EXPECT_EQ(fixed(text), "[KS50]\nPROPERTY = FLASH,TRUE\n[KS75\n");
}

TEST(Fixes, OfOneLineFollowEachOther) {
    EXPECT_EQ(fixed("OPERATION = PROGRAM,BS,usb2, SVF,\n[KS50]\n"),
              "OPERATION = PROGRAM,Bscan,USB2,SVF\n[KS50]\n");
}

TEST(Fixes, KeepLineEndsAndMarks) {
    EXPECT_EQ(fixed("\xEF\xBB\xBFPROPERTY = FLASH,true\r\n[KS50] # last\r\n"),
              "\xEF\xBB\xBFPROPERTY = FLASH,TRUE\r\n# last\r\n[KS50]\r\n");
}

TEST(Fixes, ConcernTheSelectedRulesAndFilesOnly) {
    const std::string text = "PROPERTY = FLASH,true:A,1:\n[KS50]\n";
    EXPECT_EQ(fixed(text, {"--fix", "--select", "P107"}), "PROPERTY = FLASH,TRUE:A,1:\n[KS50]\n");
    EXPECT_EQ(fixed(text, {"--fix", "--ignore", "P107"}), "PROPERTY = FLASH,true:A,1\n[KS50]\n");
    const DatabaseDirectory directory(withFamily(text));
    static_cast<void>(lint({"--fix", directory.path("base.acd")}));
    EXPECT_EQ(read(directory.path("kestrel.acd")), text);
    const std::string ignored = "# lint: ignore P107\nPROPERTY = FLASH,true\n[KS50]\n";
    EXPECT_EQ(fixed(ignored), ignored);
}

TEST(Fixes, OfTheBuiltInDemonstrationAreRefused) { EXPECT_EQ(lint({"--fix"}).status, 2); }

TEST(Fixes, AreInTheReport) {
    const DatabaseDirectory directory(withFamily("PROPERTY = FLASH,true\n[KS50]\n"));
    const nlohmann::json finding =
        nlohmann::json::parse(lint({directory.path(), "--format", "json"}).output).at("findings").at(0);
    EXPECT_EQ(finding.at("fix").at("safe"), true);
    EXPECT_EQ(finding.at("fix").at("edits").at(0).at("column"), 18);
    EXPECT_EQ(finding.at("fix").at("edits").at(0).at("length"), 4);
    EXPECT_EQ(finding.at("fix").at("edits").at(0).at("text"), "TRUE");
}

TEST(Fixes, ThatChangeOtherAnswersAreMadeOnRequestOnly) {
    // "AB" with "CD" and "ABC" with "D" are the same property, so that of ABC hides the one of its class.
    const std::string text =
        "DEVICE_FAMILY = ST1\nST1_DEVICES = AB,ABC\nST1_PROPERTY = D,2\nAB_PROPERTY = Cd,1\n";
    const DatabaseDirectory directory({{"base.acd", "DEVICE_SUPPORTED       = base,spi\n"
                                                    "PROGRAM_OPTION_PACKAGE = base,spi\n"},
                                       {"spi.acd", text}});
    const ProcessResult outcome = lint({"--fix", directory.path()});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.error, HasSubstr("not fixed: "));
    EXPECT_THAT(outcome.error,
                HasSubstr("its fix would change answers about ABC, too, and needs --unsafe-fixes"));
    EXPECT_EQ(read(directory.path("spi.acd")), text);
    EXPECT_EQ(lint({"--unsafe-fixes", directory.path()}).status, 0);
    EXPECT_THAT(read(directory.path("spi.acd")), HasSubstr("AB_PROPERTY = CD,1"));
}

TEST(Fixes, ThatAreLeftOutSayWhy) {
    const std::string text = "[KS50] # the first\nPROPERTIES = PACKAGES,3,TQ100\n";
    const DatabaseDirectory directory(withFamily(text));
    const ProcessResult outcome = lint({"--fix", directory.path()});
    EXPECT_THAT(outcome.error, HasSubstr("not fixed: " + directory.path("kestrel.acd") + ":1:7: "));
    EXPECT_THAT(outcome.error,
                HasSubstr("its fix would leave the finding: \"PACKAGES\" says 3 values and has 1 [P101]"));
    EXPECT_EQ(read(directory.path("kestrel.acd")), text);
}

TEST(Fixes, ThatListANameAreGuesses) {
    const DatabaseDirectory directory({{"base.acd", "DEVICE_SUPPORTED = base\n"
                                                    "BS = outputs,USB2:families\n"
                                                    "IDCODE = WR1,0x00000011\n"},
                                       {"wren.acd", "OPERATION = PROGRAM,Bscan,USB2\n"
                                                    "PROPERTIES = PROGRAM,1,BS\n"
                                                    "[WR1]\n"
                                                    "PROGRAM_OPTION = ERASE,Bscan,USB2\n"}});
    const std::string before = read(directory.path("base.acd"));
    EXPECT_EQ(lint({"--fix", directory.path()}).status, 1);
    EXPECT_EQ(read(directory.path("base.acd")), before);
    EXPECT_EQ(lint({"--unsafe-fixes", directory.path()}).output, "");
    EXPECT_EQ(read(directory.path("base.acd")), "PROGRAM_OPTION_PACKAGE = base,wren,WR1\n"
                                                "DEVICE_SUPPORTED = base,wren\n"
                                                "BS = outputs,USB2:families,wren\n"
                                                "IDCODE = WR1,0x00000011\n");
}

TEST(Fixes, ListAFamilyUnderAMode) {
    const std::string lists = "DEVICE_SUPPORTED = base,wren\nPROGRAM_OPTION_PACKAGE = base,wren\n";
    const DatabaseDirectory directory(
        {{"base.acd", lists + "BS = outputs,USB2:families\nPFF = outputs,USB2:families\n"},
         {"wren.acd", "OPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PROGRAM,2,BS,PFF\n"}});
    EXPECT_THAT(lint({directory.path()}).output, AllOf(HasSubstr("[T112]"), HasSubstr("[P205]")));
    EXPECT_EQ(lint({"--unsafe-fixes", directory.path()}).output, "");
    EXPECT_EQ(read(directory.path("base.acd")),
              lists + "BS = outputs,USB2:families,wren\nPFF = outputs,USB2:families,wren\n");
    // A mode without families is another mistake, which hides this one.
    const DatabaseDirectory without(
        {{"base.acd", lists + "BS = outputs,USB2\n"}, {"wren.acd", "OPERATION = PROGRAM,Bscan,USB2\n"}});
    EXPECT_THAT(lint({"--unsafe-fixes", without.path()}).output, HasSubstr("[M104]"));
    EXPECT_EQ(read(without.path("base.acd")), lists + "BS = outputs,USB2\n");
}
