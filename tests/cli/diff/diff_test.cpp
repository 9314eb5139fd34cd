// How two databases differ, by their answers.
#include "cli/lint/LintFixtures.h"

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

ProcessResult diff(const Files& before, const Files& after, std::vector<std::string> arguments = {}) {
    const DatabaseDirectory oldDatabase(before);
    const DatabaseDirectory newDatabase(after);
    arguments.insert(arguments.begin(), {"diff", oldDatabase.path(), newDatabase.path()});
    return runTool({std::move(arguments), {}, {}, {}});
}

/// The text of the difference that a change makes.
std::string difference(const std::string& file, const std::string& from, const std::string& to) {
    const ProcessResult outcome = diff(database(), changed(file, from, to));
    EXPECT_EQ(outcome.status, 1) << outcome;
    EXPECT_EQ(outcome.error, "");
    return outcome.output;
}

} // namespace

TEST(Diff, IsSilentWhenAllAnswersAreTheSame) {
    const ProcessResult outcome = diff(database(), database());
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
    EXPECT_EQ(difference("osprey.acd", "OS150", "OS250"), "only in the old database\n  osprey\n    OS150\n"
                                                          "only in the new database\n  osprey\n    OS250\n");
}

TEST(Diff, TellsFlashesOfOneDatabaseOnly) {
    EXPECT_EQ(difference("spi.acd", ",TMF2M", ",TMF4M"),
              "only in the old database\n  spi (flashes)\n    TMF2M\n"
              "only in the new database\n  spi (flashes)\n    TMF4M\n");
}

TEST(Diff, TellsFamiliesOfOneDatabaseOnly) {
    Files after = database();
    after["sparrow.acd"] = "[SW10]\n";
    EXPECT_EQ(diff(database(), after).output, "only in the new database\n  sparrow\n    SW10\n"
                                              "for all devices\n  families: +sparrow\n");
    after["sparrow.acd"] = "PROPERTY = KIND,FPGA\n";
    EXPECT_EQ(diff(database(), after).output, "for all devices\n  families: +sparrow\n");
}

TEST(Diff, TellsFamiliesOfFlashesOfOneDatabaseOnly) {
    EXPECT_EQ(difference("spi.acd", "DEVICE_FAMILY = ST1", "DEVICE_FAMILY = ST1,NV1"),
              "for all devices\n  families of flashes: +NV1\n");
}

TEST(Diff, TellsDevicesThatMovedToAnotherFamily) {
    Files after = changed("kestrel.acd", "[KS150]\n", "");
    after["osprey.acd"] += "[KS150]\n";
    EXPECT_EQ(diff(database(), after).output, "KS150 (osprey)\n"
                                              "  boundary-scan operations through USB2: -BYPASS\n"
                                              "  family: -kestrel +osprey\n"
                                              "  operations in BS through USB2: -PROGRAM -VERIFY\n"
                                              "  options in BS through USB2: -VERIFY\n"
                                              "  property VENDOR: -Korvel\n");
}

TEST(Diff, TellsADeviceThatBecomesAFlash) {
    const std::string told = difference("spi.acd", "TMF2M\n", "TMF2M,OS150\n");
    EXPECT_THAT(told, HasSubstr("OS150 (spi)\n"));
    EXPECT_THAT(told, HasSubstr("  family: -osprey +spi\n"));
    EXPECT_THAT(told, HasSubstr("  flash property VENDOR: +Tamsel\n"));
}

TEST(Diff, TellsAChangeOfAFamilyOnceForTheFamily) {
    EXPECT_EQ(difference("kestrel.acd", ":VERIFY,Bscan,USB2\nBSDL", "\nBSDL"),
              "kestrel (all 3 devices)\n  operations in BS through USB2: -VERIFY\n");
}

TEST(Diff, TellsAChangeInSeveralCellsInOneLine) {
    EXPECT_EQ(difference("kestrel.acd", "OPERATION = PROGRAM",
                         "OPERATION = ERASE,Bscan,SVF,USB2:ERASE,SSerial,USB2,SVF:ERASE,Smap,ZORVA:PROGRAM"),
              "kestrel (all 3 devices)\n"
              "  operations in BS, SS through USB2, SVF; in SM through ZORVA: +ERASE\n");
}

TEST(Diff, TellsTheExceptionsOfAFamily) {
    const Files before = changed("kestrel.acd", "[KS100]\n", "[KS100]\nPROPERTY = VENDOR,Other\n");
    Files after = before;
    replace(after.at("kestrel.acd"), "VENDOR,Korvel", "VENDOR,Orveth");
    EXPECT_EQ(diff(before, after).output, "kestrel (all but KS100)\n  property VENDOR: -Korvel +Orveth\n");
}

TEST(Diff, TellsWhatOneDeviceLosesBesideItsFamilyByItself) {
    Files before = changed("base.acd", "DEVICE_SUPPORTED = ", "DEVICE_SUPPORTED = KS50,");
    replace(before.at("kestrel.acd"), "[KS50]\n",
            "[KS50]\nOPERATION = PROGRAM,Bscan,USB2:VERIFY,Bscan,USB2:ERASE,Bscan,USB2\n");
    Files after = before;
    replace(after.at("kestrel.acd"), ":VERIFY,Bscan,USB2\nBSDL", "\nBSDL");
    replace(after.at("kestrel.acd"), ":VERIFY,Bscan,USB2:ERASE,Bscan,USB2", "");
    EXPECT_EQ(diff(before, after).output,
              "kestrel (all 3 devices)\n  operations in BS through USB2: -VERIFY\n"
              "KS50 (kestrel)\n  operations in BS through USB2: -ERASE\n");
}

TEST(Diff, TellsAChangeOfHalfAFamilyWithTheDevices) {
    Files before = database();
    std::string sections;
    for (const char* const device : {"DV1", "DV2", "DV3", "DV4", "DV5", "DV6", "DV7", "DV8"}) {
        sections += std::string("[") + device + "]\nPROPERTY = PINS,8\n";
    }
    before["dove.acd"] = sections;
    Files after = before;
    for (int change = 0; change < 4; ++change) {
        std::string& text = after["dove.acd"];
        text.replace(text.find("PINS,8"), 6, "PINS,9");
    }
    EXPECT_EQ(diff(before, after).output, "dove (4 of 8 devices)\n"
                                          "    DV1, DV2, DV3, DV4\n"
                                          "  property PINS: -8 +9\n");
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

TEST(Diff, TellsPropertiesOfASectionThatHideThoseOfTheFamily) {
    EXPECT_EQ(difference("kestrel.acd", "[KS100]\n", "[KS100]\nPROPERTIES = VENDOR,0\n"),
              "KS100 (kestrel)\n  property VENDOR: -Korvel\n");
}

TEST(Diff, TellsPropertiesOfAFamilyOfFlashesThatIsNoClass) {
    Files before = database();
    before["spi.acd"] += "DEVICE_FAMILY += ,NV1\nNV1_DEVICES = MRS1M\nNV1_PROPERTY = VENDOR,Marso\n";
    Files after = before;
    replace(after.at("spi.acd"), "Marso", "Merso");
    EXPECT_EQ(diff(before, after).output, "NV1 (spi)\n  flash property VENDOR: -Marso +Merso\n");
}

TEST(Diff, TellsWhatUnknownDevicesAreOffered) {
    EXPECT_EQ(difference("base.acd", "IDCODE", "OPERATION = ERASE,Bscan,USB2\nIDCODE"),
              "base\n  operations in BS through USB2: +ERASE\n");
}

TEST(Diff, IsNotMisledByOptionsThatLeakWhenADeviceIsAskedForFirst) {
    Files before = changed("base.acd", "PROGRAM_OPTION_PACKAGE = KS50,", "PROGRAM_OPTION_PACKAGE = ");
    Files after = before;
    replace(after.at("kestrel.acd"), "[KS50]\nPROGRAM_OPTION = VERIFY", "[KS50]\nPROGRAM_OPTION = ERASE");
    EXPECT_EQ(diff(before, after).output, "");
}

TEST(Diff, TellsFaultsForAnswers) {
    EXPECT_THAT(difference("kestrel.acd", "[KS100]\n", "[KS100]\nPROGRAM_OPTION = NONSENSE,Bscan,USB2\n"),
                HasSubstr("KS100 (kestrel)\n  faults: +"));
}

TEST(Diff, KeepsBytesApartThatAreNoText) {
    EXPECT_EQ(diff(changed("kestrel.acd", "Korvel", "\xFE"), changed("kestrel.acd", "Korvel", "\xFF")).status,
              1);
}

TEST(Diff, WritesReleaseNotesInMarkdown) {
    Files after = changed("kestrel.acd", "[KS50]\nPROGRAM_OPTION = VERIFY", "[KS50]\nPROGRAM_OPTION = ERASE");
    replace(after.at("kestrel.acd"), "BYPASS,USB2", "BYPASS,USB2,SVF");
    replace(after.at("osprey.acd"), "OS150", "OS`250");
    replace(after.at("base.acd"), "KS100,0xX4108FB7", "KS100,0xX4148FB7");
    replace(after.at("base.acd"), "outputs,PARALLEL", "outputs,ZORVA");
    replace(after.at("spi.acd"), ",TMF2M", "");
    const ProcessResult outcome = diff(database(), after, {"--format", "markdown"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "### New devices\n\n"
                              "- osprey: `` OS`250 ``\n\n"
                              "### Devices no longer supported\n\n"
                              "- osprey: `OS150`\n"
                              "- flashes: `TMF2M`\n\n"
                              "### For all devices\n\n"
                              "- outputs of mode BS: lost `PARALLEL`; gained `ZORVA`\n\n"
                              "### kestrel\n\n"
                              "All 3 devices:\n\n"
                              "- boundary-scan operations through SVF: gained `BYPASS`\n\n"
                              "`KS50`:\n\n"
                              "- options in BS through USB2: lost `VERIFY`; gained `ERASE`\n\n"
                              "`KS100`:\n\n"
                              "- IDCODE: `0xX4108FB7` becomes `0xX4148FB7`\n");
    EXPECT_EQ(diff(database(), database(), {"--format", "markdown"}).output, "");
}

TEST(Diff, TakesLayersWithColonsBetween) {
    const DatabaseDirectory below(database());
    const DatabaseDirectory above(Files{{"kestrel.acd", "PROPERTY += :KIND,FPGA\n"}});
    const ProcessResult outcome =
        runTool(std::vector<std::string>{"diff", below.path(), above.path() + ':' + below.path()});
    EXPECT_EQ(outcome.output, "kestrel (all 3 devices)\n  property KIND: +FPGA\n");
}

TEST(Diff, TellsTheSameInJson) {
    const ProcessResult outcome =
        diff(database(), changed("kestrel.acd", "BYPASS,USB2", "HIGHZ,USB2"), {"--json"});
    EXPECT_EQ(outcome.status, 1);
    const nlohmann::json answer = nlohmann::json::parse(outcome.output);
    EXPECT_EQ(answer.at("version"), 1);
    EXPECT_EQ(answer.at("same"), false);
    EXPECT_EQ(answer.at("lost"), nlohmann::json::array());
    const nlohmann::json& group = answer.at("groups").at(0);
    EXPECT_EQ(group.at("family"), "kestrel");
    EXPECT_EQ(group.at("devices"), nlohmann::json({"KS50", "KS100", "KS150"}));
    EXPECT_EQ(group.at("whole"), true);
    EXPECT_EQ(group.at("changes").at(0).at("lost"), nlohmann::json({"BYPASS"}));
    EXPECT_EQ(diff(database(), changed("kestrel.acd", "BYPASS,USB2", "HIGHZ,USB2"),
                   {"--json", "--format", "markdown"})
                  .output,
              outcome.output);
}

namespace {

/// The database with further lines in one file.
Files with(const std::string& file, const std::string& lines) {
    Files files = database();
    files.at(file) += lines;
    return files;
}

} // namespace

TEST(Diff, ListsModesThatAreCheckedOnlyIfAnOutputIsGiven) {
    EXPECT_EQ(diff(with("base.acd", "PFF = outputs,SVF:families,kestrel\n"),
                   with("base.acd", "PFF = outputs,SVF:families,osprey\n"))
                  .output,
              "kestrel (all 3 devices)\n  modes: -PFF\nOS150 (osprey)\n  modes: +PFF\n");
    EXPECT_EQ(diff(with("base.acd", "SPI = outputs,USB2:families,spi\n"),
                   with("base.acd", "SPI = outputs,USB2:families\n"))
                  .output,
              "for all devices\n  modes of every device: -SPI\n");
}

TEST(Diff, ListsModesThatHaveNoOutput) {
    EXPECT_EQ(diff(database(), with("base.acd", "SS = outputs:families,kestrel\n")).output,
              "kestrel (all 3 devices)\n  modes (if no output is given): +SS\n");
}

TEST(Diff, ListsPartsExcludedFromModesThatAreCheckedOnlyIfAnOutputIsGiven) {
    const Files before =
        with("base.acd", "PFF = outputs,SVF:families,kestrel\nSPI = outputs,USB2:families,spi\n");
    Files after = before;
    replace(after.at("base.acd"), "BS_KS50_TQ144", "BS_KS50_TQ144,PFF_KS100_CB48,SPI_spi_SO8");
    EXPECT_EQ(diff(before, after).output, "for all devices\n  package SO8: modes of every device: -SPI\n"
                                          "KS100 (kestrel)\n  package CB48: modes: -PFF\n");
}

TEST(Diff, ListsOptionsOfAPackageThatBeginsWithADigit) {
    Files before = changed("base.acd", "DEVICE_SUPPORTED = ", "DEVICE_SUPPORTED = KS50,");
    Files after = before;
    replace(after.at("base.acd"), "PROGRAM_OPTION_PACKAGE = ", "PROGRAM_OPTION_PACKAGE = KS5048,");
    EXPECT_EQ(diff(before, after).output,
              "KS50 (kestrel)\n  package 48: options in BS through USB2: -VERIFY\n");
}

TEST(Diff, ListsARecordOfSpiModeOnce) {
    EXPECT_EQ(diff(database(), with("spi.acd", "OPERATION = ERASE,SPI,USB2\n")).output,
              "for all devices\n  operations in SPI through USB2: +ERASE\n");
}

TEST(Diff, ListsAChangeOfSeveralFamiliesOnce) {
    Files after = database();
    for (const char* const file : {"kestrel.acd", "osprey.acd"}) {
        after.at(file) = "PROPERTIES = KIND,1,FPGA\n" + after.at(file);
    }
    EXPECT_EQ(diff(database(), after).output,
              "2 families\n    kestrel, OS150 (osprey)\n  property KIND: +FPGA\n");
    EXPECT_EQ(diff(database(), after, {"--format", "markdown"}).output,
              "### 2 families\n\n`kestrel`, `OS150 (osprey)`:\n\n- property KIND: gained `FPGA`\n");
}

TEST(Diff, ListsWhatOnlyTheNameOfAFamilyShows) {
    // All devices of the family have tables of their own.
    Files before = changed("base.acd", "DEVICE_SUPPORTED = ", "DEVICE_SUPPORTED = OS150,");
    before.at("osprey.acd") = "OPERATION = ERASE,Bscan,USB2\n[OS150]\nOPERATION = VERIFY,Bscan,USB2\n";
    Files after = before;
    replace(after.at("osprey.acd"), "ERASE", "BYPASS");
    EXPECT_EQ(diff(before, after).output, "osprey\n  operations in BS through USB2: -ERASE +BYPASS\n");
}

TEST(Diff, ComparesWhatCanBeComparedAndCountsTheRest) {
    // The second record can't be read, in either database.
    const Files before = changed("kestrel.acd", "PROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTY",
                                 "PROGRAM_OPTION = VERIFY,Bscan,USB2:NONSENSE,Bscan,USB2\nPROPERTY");
    Files after = before;
    replace(after.at("base.acd"), "KS100,0xX4108FB7", "KS100,0xX4148FB7");
    const ProcessResult outcome = diff(before, after);
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "KS100 (kestrel)\n  IDCODE: -0xX4108FB7 +0xX4148FB7\n");
    EXPECT_THAT(outcome.error, HasSubstr("are missing in both databases, the first \"KS"));
    const nlohmann::json answer = nlohmann::json::parse(diff(before, before, {"--json"}).output);
    EXPECT_EQ(answer.at("same"), true);
    EXPECT_THAT(answer.at("unanswered").get<std::vector<std::string>>(), testing::Contains("KS100"));
}

TEST(Diff, RefusesAnUnknownFormat) { EXPECT_EQ(diff(database(), database(), {"--format", "pdf"}).status, 2); }

TEST(Diff, EndsWithTwoWhenADatabaseCantBeRead) {
    const DatabaseDirectory readable(database());
    const ProcessResult outcome =
        runTool(std::vector<std::string>{"diff", readable.path(), "/nowhere/at/all"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("/nowhere/at/all"));
    EXPECT_EQ(runTool(std::vector<std::string>{"diff", readable.path(), ":"}).status, 2);
}

TEST(Diff, OfTheDemonstrationWithItselfIsNothing) {
    const std::string path = TARVIK_SOURCE_DIRECTORY "/database";
    EXPECT_EQ(runTool(std::vector<std::string>{"diff", path, path}).status, 0);
}
