// How the commands read the device that is typed: its case, a package in its name, names that do not exist.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

using Words = std::vector<std::string>;

/// Every command about a device, with arguments that the demonstration answers.
const std::vector<Words>& deviceCommands() {
    static const std::vector<Words> commands{
        {"show"},
        {"operations", "--mode", "BS", "--output", "USB2"},
        {"options", "--mode", "BS", "--output", "USB2"},
        {"bsdl", "--output", "SVF"},
        {"operation-options", "PROGRAM", "--mode", "BS"},
        {"check", "--mode", "BS"},
        {"check", "--mode", "BS", "--output", "USB2"},
        {"check", "--mode", "BS", "--operation", "PROGRAM"},
        {"check", "--mode", "BS", "--output", "USB2", "--operation", "PROGRAM"},
        {"why", "--mode", "BS"},
        {"why", "--mode", "BS", "--output", "USB2", "--option", "VERIFY"},
        {"why", "--output", "SVF", "--bsdl", "HIGHZ"},
        {"why", "--property", "VENDOR"},
        {"why", "--mode", "BS", "--operation-options", "PROGRAM"},
        {"property", "VENDOR"},
    };
    return commands;
}

/// The command with a device in its place.
Words about(Words command, const std::string& device) {
    command.insert(command.begin() + 1, device);
    return command;
}

json answer(Words words) {
    words.insert(words.begin(), "--json");
    return json::parse(runTool(words).output);
}

/// The answer without what differs between two spellings of one question.
json withoutSpelling(json answer) {
    answer.erase("asked");
    if (answer.contains("steps") && answer["steps"][0]["text"].get<std::string>().starts_with("\"")) {
        answer["steps"].erase(0);
    }
    return answer;
}

TEST(AskedDevice, CaseDoesNotMatter) {
    for (const Words& command : deviceCommands()) {
        const json typed = answer(about(command, "ks50"));
        EXPECT_EQ(withoutSpelling(typed), withoutSpelling(answer(about(command, "KS50")))) << typed;
        EXPECT_EQ(typed["asked"], (json{{"typed", "ks50"}, {"device", "KS50"}, {"package", nullptr}}));
    }
}

TEST(AskedDevice, PackageInTheNameIsSplitOff) {
    for (const Words& command : deviceCommands()) {
        const json typed = answer(about(command, "ks50_pq208"));
        EXPECT_EQ(typed["device"], "KS50") << typed;
        EXPECT_EQ(typed["asked"], (json{{"typed", "ks50_pq208"}, {"device", "KS50"}, {"package", "PQ208"}}));
    }
}

TEST(AskedDevice, PackageInTheNameIsAskedAbout) {
    EXPECT_EQ(runTool({"check", "KS50_TQ144", "--mode", "SM"}).status, 1);
    EXPECT_EQ(runTool({"check", "ks50", "--mode", "SM", "--package", "tq144"}).status, 1);
    EXPECT_EQ(runTool({"options", "KS50_TQ144", "--mode", "BS", "--output", "USB2"}).output, "VERIFY\n");
    EXPECT_EQ(
        answer({"check", "KS50_TQ144", "--mode", "SM", "--output", "USB2", "--operation", "VERIFY"})["parts"]
            .size(),
        3U);
}

// HR4 has tables of its own; under another spelling the manager would answer with those of its family.
TEST(AskedDevice, DeviceWithTablesOfItsOwn) {
    const Words question{"operations", "hr4", "--mode", "BS", "--output", "USB2"};
    const ProcessResult typed = runTool(question);
    EXPECT_EQ(typed.output, runTool({"operations", "HR4", "--mode", "BS", "--output", "USB2"}).output);
    Words literal = question;
    literal.insert(literal.begin(), "--literal");
    EXPECT_NE(typed.output, runTool(literal).output);
    EXPECT_EQ(typed.error, "tarvik: no database given: answering from the built-in demonstration\n"
                           "tarvik: \"hr4\" is device HR4; use --literal to ask about the name as typed\n");
}

TEST(AskedDevice, NoteNamesWhatIsAskedAbout) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"options", "fn10_p48", "--mode", "BS", "--output", "USB2"}).error,
                StartsWith("tarvik: \"fn10_p48\" is device FN10 in package p48; use --literal"));
    EXPECT_THAT(database.run({"check", "FN10", "--mode", "BS", "--package", "P48"}).error, IsEmpty());
    EXPECT_THAT(database.run({"operations", "FN10_P48", "--mode", "BS", "--output", "USB2"}).error,
                HasSubstr("in package P48, and the package makes no difference here; use"));
    EXPECT_FALSE(database.json({"check", "FN10", "--mode", "BS"}).contains("asked"));
}

TEST(AskedDevice, WhySaysHowTheNameWasRead) {
    const json steps = answer({"why", "ks50_tq144", "--mode", "SM"})["steps"];
    EXPECT_EQ(steps[0],
              (json{{"topic", "name"}, {"text", "\"ks50_tq144\" is device KS50 in package TQ144"}}));
}

TEST(AskedDevice, FamiliesAndFlashes) {
    EXPECT_EQ(answer({"show", "KESTREL"})["device"], "kestrel");
    EXPECT_EQ(answer({"spi", "ovd16"})["device"], "OVD16");
    EXPECT_EQ(answer({"multiboot", "ovd16", "--type", "MB_SPI", "--width", "NONE", "--lead"})["device"],
              "OVD16");
    EXPECT_EQ(answer({"check", "ovd16", "--mode", "SPI", "--package", "so8"})["package"], "SO8");
}

TEST(AskedDevice, UnknownDeviceIsNotFound) {
    for (const Words& command : deviceCommands()) {
        for (const auto& [name, text] : std::map<std::string, std::string>{
                 {"NOSUCH", "the database has no device \"NOSUCH\""},
                 {"KS55", "the database has no device \"KS55\"; did you mean \"KS50\"?"},
                 {"KS55_TQ144", "the database has no device \"KS55_TQ144\"; did you mean \"KS50\"?"},
                 {"base", "the database has no device \"base\""},
             }) {
            const ProcessResult no = runTool(about(command, name));
            EXPECT_EQ(no.status, 1) << no;
            EXPECT_EQ(no.output, "");
            EXPECT_THAT(no.error, HasSubstr("tarvik: " + text));
            EXPECT_THAT(answer(about(command, name))["error"].get<std::string>(), StartsWith(text));
        }
    }
}

TEST(AskedDevice, UnknownPackageOfADeviceWithKnownPackages) {
    for (const Words& command : deviceCommands()) {
        const ProcessResult fault = runTool(about(command, "KS50_TQ14"));
        EXPECT_EQ(fault.status, 2) << fault;
        EXPECT_EQ(fault.output, "");
        EXPECT_THAT(fault.error, HasSubstr("tarvik: KS50 has no package \"TQ14\"; did you mean \"TQ144\"?\n"
                                           "packages of KS50, in any case:\n  PQ208, TQ100, TQ144\n"));
    }
    const Words question{"options", "KS50", "--mode", "BS", "--output", "USB2", "--package", "ZZ9"};
    EXPECT_EQ(runTool(question).status, 2);
    EXPECT_THAT(answer(question)["error"].get<std::string>(), StartsWith("KS50 has no package \"ZZ9\""));
}

TEST(AskedDevice, PackagesThatContradict) {
    const ProcessResult fault = runTool({"check", "KS50_TQ144", "--mode", "SM", "--package", "PQ208"});
    EXPECT_EQ(fault.status, 2);
    EXPECT_THAT(fault.error,
                HasSubstr("\"KS50_TQ144\" names the package TQ144, and --package names PQ208\n"));
    EXPECT_EQ(runTool({"check", "KS50_TQ144", "--mode", "SM", "--package", "tq144"}).status, 1);
}

TEST(AskedDevice, LiteralAsksAboutTheTextsAsTheyAre) {
    EXPECT_EQ(runTool({"--literal", "check", "ks50", "--mode", "SM", "--package", "TQ144"}).status, 0);
    const json packaged = answer({"--literal", "check", "KS50_TQ144", "--mode", "SM"});
    EXPECT_EQ(packaged["device"], "KS50_TQ144");
    EXPECT_EQ(packaged["allowed"], true);
    EXPECT_FALSE(packaged.contains("asked"));
    EXPECT_EQ(runTool({"--literal", "check", "NOSUCH", "--mode", "SPI"}).status, 0);
    EXPECT_EQ(runTool({"--literal", "check", "KS50", "--mode", "SM", "--package", "ZZ9"}).status, 0);
    EXPECT_THAT(runTool({"operations", "NOSUCH", "--literal", "--mode", "SPI", "--output", "USB2"}).output,
                HasSubstr("ERASE"));
}

TEST(AskedDevice, SectionWhoseNameHasAPackageSeparator) {
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nBS = outputs,USB2:families,finch\n"},
         {"finch.acd", "[SW_10]\n"}});
    const ProcessResult outcome = runTool({"--database", database.path(), "check", "SW_10", "--mode", "BS"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.error,
                HasSubstr("the database has \"SW_10\", but \"_\" begins a package, so the manager "
                          "looks for the device \"SW\"\n"));
    EXPECT_THAT(outcome.error, Not(HasSubstr("did you mean")));
}

TEST(AskedDevice, FamilyThatCannotBeReadIsAFault) {
    const DatabaseDirectory::Files files{
        {"base.acd", "DEVICE_SUPPORTED = finch\nBS = outputs,USB2:families,finch\n"}};
    const DatabaseDirectory database(files);
    std::filesystem::create_directory(database.path("finch.acd"));
    for (const char* const name : {"FN10", "finch"}) {
        for (const Words& command :
             {Words{"show"}, Words{"check", "--mode", "BS"}, Words{"check", "--mode", "SPI"}}) {
            Words words = about(command, name);
            words.insert(words.begin(), {"--database", database.path()});
            const ProcessResult fault = runTool(words);
            EXPECT_EQ(fault.status, 2) << fault;
            EXPECT_EQ(fault.output, "");
            EXPECT_THAT(fault.error, HasSubstr("finch"));
        }
    }
}

} // namespace
