// How two databases differ, by their answers.
#include "lint/LintFixtures.h"

#include <gmock/gmock.h>

using testing::HasSubstr;

namespace {

/// Two families, one with three devices, and a flash.
Files database() {
    return {{"base.acd", "DEVICE_SUPPORTED = base,kestrel,osprey,spi\n"
                         "PROGRAM_OPTION_PACKAGE = KS50,base,kestrel,osprey,spi\n"
                         "BS = outputs,PARALLEL,USB2:families,kestrel,osprey\n"
                         "NOT_SUPPORTED_PART_IN_MODE = BS_KS50_TQ144\n"
                         "IDCODE = KS50,0xX4104FB7:KS100,0xX4108FB7:KS150,0xX410CFB7:OS150,0xX4404FB7\n"},
            {"kestrel.acd", "OPERATION = PROGRAM,Bscan,USB2:VERIFY,Bscan,USB2\n"
                            "BSDL_OPERATION = BYPASS,USB2\n"
                            "PROGRAM_OPTION = VERIFY,Bscan,USB2\n"
                            "PROPERTY = VENDOR,Korvel\n"
                            "[KS50]\n"
                            "PROGRAM_OPTION = VERIFY,Bscan,USB2\n"
                            "PROPERTIES = PACKAGES,2,TQ100,TQ144\n"
                            "[KS100]\n"
                            "[KS150]\n"},
            {"osprey.acd", "[OS150]\n"},
            {"spi.acd", "DEVICE_FAMILY = ST1\n"
                        "ST1_DEVICES = TMF1M,TMF2M\n"
                        "ST1_PROPERTY = VENDOR,Tamsel\n"
                        "TYPE_MB_SPI_NONE_LEAD = TMF1M\n"}};
}

void replace(std::string& text, const std::string& from, const std::string& to) {
    text.replace(text.find(from), from.size(), to);
}

/// The database with one text of a file replaced by another.
Files changed(const std::string& file, const std::string& from, const std::string& to) {
    Files files = database();
    replace(files.at(file), from, to);
    return files;
}

Outcome diff(const Files& before, const Files& after, std::vector<std::string> arguments = {}) {
    const DatabaseDirectory oldDatabase(before);
    const DatabaseDirectory newDatabase(after);
    arguments.insert(arguments.begin(), {"diff", oldDatabase.path(), newDatabase.path()});
    return runTool({std::move(arguments), {}, {}, {}});
}

/// The text of the difference that a change makes.
std::string difference(const std::string& file, const std::string& from, const std::string& to) {
    const Outcome outcome = diff(database(), changed(file, from, to));
    EXPECT_EQ(outcome.status, 1) << outcome;
    EXPECT_EQ(outcome.error, "");
    return outcome.output;
}

} // namespace

TEST(Diff, IsSilentWhenAllAnswersAreTheSame) {
    const Outcome outcome = diff(database(), database());
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "");
}

TEST(Diff, DoesNotTellWhatIsWrittenInAnotherWay) {
    EXPECT_EQ(diff(database(), changed("kestrel.acd", "PROGRAM,Bscan,USB2:VERIFY,Bscan,USB2",
                                       "verify,BSCAN,USB2: \\\n  PROGRAM,Bscan,USB2"))
                  .status,
              0);
}

TEST(Diff, TellsDevicesOfOneDatabaseOnly) {
    EXPECT_EQ(difference("osprey.acd", "OS150", "OS250"), "only in the old database\n  OS150\n"
                                                          "only in the new database\n  OS250\n");
}

TEST(Diff, TellsAChangeOfAFamilyOnceForTheFamily) {
    EXPECT_EQ(difference("kestrel.acd", ":VERIFY,Bscan,USB2\nBSDL", "\nBSDL"),
              "kestrel (all 3 devices)\n  operations in BS through USB2: -VERIFY\n");
}

TEST(Diff, TellsAChangeOfOneDeviceForTheDevice) {
    EXPECT_EQ(difference("base.acd", "KS100,0xX4108FB7", "KS100,0xX4148FB7"),
              "KS100 (kestrel)\n  IDCODE: -0xX4108FB7 +0xX4148FB7\n");
}

TEST(Diff, TellsBoundaryScanOperations) {
    EXPECT_EQ(difference("kestrel.acd", "BYPASS,USB2", "HIGHZ,USB2"),
              "kestrel (all 3 devices)\n  boundary-scan operations through USB2: -BYPASS +HIGHZ\n");
}

TEST(Diff, TellsOptionsWithoutRepeatingThemForEachPackage) {
    EXPECT_EQ(difference("kestrel.acd", "[KS50]\nPROGRAM_OPTION = VERIFY", "[KS50]\nPROGRAM_OPTION = ERASE"),
              "KS50 (kestrel)\n  options in BS through USB2: -VERIFY +ERASE\n");
}

TEST(Diff, TellsOptionsOfAPackageThatIsListed) {
    Files before = changed("kestrel.acd", "[KS50]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\n", "[KS50]\n");
    replace(before.at("base.acd"), "PROGRAM_OPTION_PACKAGE = KS50,", "PROGRAM_OPTION_PACKAGE = ");
    Files after = before;
    // A table of its own for a device of DEVICE_SUPPORTED stays empty.
    replace(after.at("base.acd"), "DEVICE_SUPPORTED = ", "DEVICE_SUPPORTED = KS50,");
    replace(after.at("base.acd"), "PROGRAM_OPTION_PACKAGE = ", "PROGRAM_OPTION_PACKAGE = KS50,KS50TQ100,");
    EXPECT_EQ(diff(before, after).output,
              "KS50 (kestrel)\n  package TQ100: options in BS through USB2: -VERIFY\n");
}

TEST(Diff, TellsProperties) {
    EXPECT_EQ(difference("kestrel.acd", "VENDOR,Korvel", "VENDOR,Korvel:KIND,FPGA"),
              "kestrel (all 3 devices)\n  property KIND: +FPGA\n");
}

TEST(Diff, TellsPropertiesOfFlashes) {
    EXPECT_EQ(difference("spi.acd", "VENDOR,Tamsel", "VENDOR,Orveth"),
              "spi (all 2 devices)\n  flash property VENDOR: -Tamsel +Orveth\n");
}

TEST(Diff, TellsMultibootArrangements) {
    EXPECT_EQ(difference("spi.acd", "LEAD = TMF1M", "LEAD = TMF1M,KS50"),
              "KS50 (kestrel)\n  multiboot: +TYPE_MB_SPI_NONE_LEAD\n");
}

TEST(Diff, TellsOutputsAndFamiliesOfModes) {
    EXPECT_EQ(difference("base.acd", "outputs,PARALLEL,USB2", "outputs,ZORVA,USB2"),
              "for all devices\n  outputs of mode BS: -PARALLEL +ZORVA\n");
    EXPECT_EQ(difference("base.acd", "families,kestrel,osprey", "families,kestrel"),
              "OS150 (osprey)\n  modes: -BS\n");
}

TEST(Diff, TellsExcludedParts) {
    EXPECT_EQ(difference("base.acd", "BS_KS50_TQ144", "BS_KS50_TQ100"),
              "KS50 (kestrel)\n  package TQ100: modes: -BS\n  package TQ144: modes: +BS\n");
}

TEST(Diff, TakesLayersWithColonsBetween) {
    const DatabaseDirectory below(database());
    const DatabaseDirectory above(Files{{"kestrel.acd", "PROPERTY += :KIND,FPGA\n"}});
    const Outcome outcome =
        runTool(std::vector<std::string>{"diff", below.path(), above.path() + ':' + below.path()});
    EXPECT_EQ(outcome.output, "kestrel (all 3 devices)\n  property KIND: +FPGA\n");
}

TEST(Diff, TellsTheSameInJson) {
    const Outcome outcome = diff(database(), changed("kestrel.acd", "BYPASS,USB2", "HIGHZ,USB2"), {"--json"});
    EXPECT_EQ(outcome.status, 1);
    const nlohmann::json answer = nlohmann::json::parse(outcome.output);
    EXPECT_EQ(answer.at("version"), 1);
    EXPECT_EQ(answer.at("same"), false);
    const nlohmann::json& group = answer.at("groups").at(0);
    EXPECT_EQ(group.at("family"), "kestrel");
    EXPECT_EQ(group.at("devices"), nlohmann::json({"KS100", "KS150", "KS50"}));
    EXPECT_EQ(group.at("whole"), true);
    EXPECT_EQ(group.at("changes").at(0).at("lost"), nlohmann::json({"BYPASS"}));
}

TEST(Diff, EndsWithTwoWhenADatabaseCantBeRead) {
    const DatabaseDirectory readable(database());
    const Outcome outcome = runTool(std::vector<std::string>{"diff", readable.path(), "/nowhere/at/all"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("/nowhere/at/all"));
    EXPECT_EQ(runTool(std::vector<std::string>{"diff", readable.path(), ":"}).status, 2);
}

TEST(Diff, OfTheDemonstrationWithItselfIsNothing) {
    const std::string path = TARVIK_SOURCE_DIRECTORY "/database";
    EXPECT_EQ(runTool(std::vector<std::string>{"diff", path, path}).status, 0);
}
