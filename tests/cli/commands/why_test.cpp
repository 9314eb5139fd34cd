// `why` and `which` as their users start them; what the explanations say is tested by area.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

TEST(Why, NamesTheRecordThatAllows) {
    const SmallDatabase database;
    const ProcessResult outcome =
        database.run({"why", "FN10", "--mode", "BS", "--output", "USB2", "--operation", "PROGRAM"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.error, IsEmpty());
    EXPECT_THAT(outcome.output, StartsWith("yes: PROGRAM of FN10 in mode BS through USB2\n"));
    EXPECT_THAT(outcome.output, HasSubstr("\n  record    PROGRAM is allowed in mode BS through USB2\n"));
    EXPECT_THAT(outcome.output, HasSubstr("finch.acd:2:13:"));
}

TEST(Why, TellsWhatWouldBeAllowedInstead) {
    const SmallDatabase database;
    const ProcessResult outcome =
        database.run({"why", "FN10", "--mode", "SS", "--output", "PARALLEL", "--operation", "PROGRAM"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.output, StartsWith("no: PROGRAM of FN10 in mode SS through PARALLEL\n"));
    EXPECT_THAT(outcome.output, HasSubstr("\n  instead   "));
}

TEST(Why, TellsThePlacesInJson) {
    const SmallDatabase database;
    const json answer =
        database.json({"why", "FN10", "--mode", "BS", "--output", "USB2", "--operation", "PROGRAM"});
    EXPECT_EQ(answer["version"], 1);
    EXPECT_EQ(answer["allowed"], true);
    EXPECT_EQ(answer["agrees"], true);
    EXPECT_EQ(answer["device"], "FN10");
    EXPECT_EQ(answer["operation"], "PROGRAM");
    const json& last = answer["steps"].back();
    EXPECT_EQ(last["topic"], "record");
    EXPECT_EQ(last["file"], database.path("finch.acd"));
    EXPECT_EQ(last["line"], 2);
    EXPECT_EQ(last["column"], 13);
    EXPECT_EQ(last["fragment"], "PROGRAM,Bscan,PARALLEL,USB2");
}

TEST(Why, AnswersEachFormOfQuestion) {
    const SmallDatabase database;
    const std::vector<std::vector<std::string>> questions{
        {"--mode", "BS", "--output", "USB2"},
        {"FN10", "--mode", "BS"},
        {"FN10", "--mode", "BS", "--output", "PARALLEL"},
        {"FN10", "--mode", "BS", "--operation", "PROGRAM"},
        {"FN20", "--mode", "BS", "--output", "USB2", "--option", "ERASE"},
        {"FN10", "--output", "SVF", "--bsdl", "HIGHZ"},
        {"FN10", "--property", "VENDOR", "--value", "Korvel"},
        {"FN10", "--mode", "BS", "--operation-options", "PROGRAM", "--value", "ERASE"},
        {"FN10", "--multiboot", "MB_SPI", "--width", "NONE", "--lead"},
        {"FN10", "--mode", "BS", "--output", "USB2", "--package", "P48", "--operation", "PROGRAM"},
    };
    for (std::vector<std::string> question : questions) {
        question.insert(question.begin(), "why");
        const ProcessResult outcome = database.run(question);
        EXPECT_EQ(outcome.status, 0) << outcome;
        EXPECT_THAT(outcome.output, StartsWith("yes: "));
    }
}

TEST(Why, SuggestsNamesThatAreNear) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"why", "FN11", "--mode", "BS"}).error, HasSubstr("did you mean \"FN10\"?"));
    EXPECT_THAT(database.run({"why", "FN10", "--mode", "BS", "--output", "USB2", "--option", "ERASEE"}).error,
                StartsWith("tarvik: unknown option \"ERASEE\"; did you mean \"ERASE\"?\n"));
}

TEST(Why, FlashInLowerCaseIsUnknown) {
    // The manager asks for flashes in upper case, so it never finds this one.
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = spi\nBS = outputs,USB2:families,spi\n"},
         {"spi.acd", "DEVICE_FAMILY = ST1\nST1_DEVICES = fla\n"}});
    const ProcessResult outcome = runTool({"--database", database.path(), "why", "fla", "--mode", "BS"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.error,
                HasSubstr("the database has \"fla\", but the manager looks for flashes in upper case\n"));
}

TEST(Why, ListsTheFormsOfQuestionsWhenNoneFits) {
    const ProcessResult outcome = SmallDatabase().run({"why", "FN10"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, StartsWith("tarvik: why takes one of these:\n  --mode M --output O\n"));
}

TEST(Which, ListsTheDevicesThatAllowAnOperation) {
    const SmallDatabase database;
    const ProcessResult outcome =
        database.run({"which", "--operation", "ERASE", "--mode", "SPI", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "tarvik: SPI mode treats every device as \"spi\"\n");
    // In SPI mode the answer is about the flash that is connected to the device.
    EXPECT_EQ(outcome.output, "DEVICE  FAMILY\n"
                              "FN10    finch\n"
                              "FN20    finch\n"
                              "FLA     spi\n"
                              "FLB     spi\n"
                              "FLC     spi\n");
}

TEST(Which, CountsTheDevicesThatAllowItInSpiModeOnly) {
    const SmallDatabase database;
    const ProcessResult erase = database.run({"which", "--operation", "ERASE"});
    EXPECT_EQ(erase.status, 0);
    EXPECT_EQ(erase.error,
              "tarvik: 2 of these 5 devices allow it in SPI mode only, and SPI mode treats every device "
              "as \"spi\"\n");
    EXPECT_THAT(database.run({"which", "--operation", "PROGRAM"}).error, IsEmpty());
}

TEST(Which, ListsTheDevicesThatHaveAProperty) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"which", "--property", "CORE=1.8"}).output, "DEVICE  FAMILY\nFN10    finch\n");
}

TEST(Which, SaysWhenThereIsNone) {
    const ProcessResult outcome = SmallDatabase().run({"which", "--property", "CORE=9"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_EQ(outcome.error, "tarvik: no device matches\n");
}

TEST(Which, AnswersInJson) {
    const SmallDatabase database;
    EXPECT_EQ(
        database.json({"which", "--operation", "PROGRAM", "--mode", "BS", "--output", "USB2"}),
        (json{{"version", 1},
              {"mode", "BS"},
              {"output", "USB2"},
              {"operation", "PROGRAM"},
              {"devices", {{{"name", "FN10"}, {"family", "finch"}}, {{"name", "FN20"}, {"family", "finch"}}}},
              {"faults", json::array()},
              {"messages", json::array()}}));
    const json none = database.json({"which", "--property", "CORE=9"});
    EXPECT_EQ(none["devices"], json::array());
    EXPECT_EQ(none["value"], "9");
}

TEST(Which, NamesTheDevicesThatHaveNoAnswer) {
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nBS = outputs,USB2:families,finch\n"},
         {"finch.acd", "PROGRAM_OPTION = NONSENSE,Bscan,USB2\n[FN10]\n[FN20]\n"},
         {"spi.acd", "DEVICE_FAMILY = ST1\n"}});
    const ProcessResult outcome =
        runTool({"--database", database.path(), "which", "--property", "VENDOR=Korvel"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("no answer for 2 devices, the first FN10: see tarvik show FN10"));
    EXPECT_THAT(
        runTool({"--database", database.path(), "--json", "which", "--property", "VENDOR=Korvel"}).output,
        HasSubstr("\"faults\":[\"FN10\",\"FN20\"]"));
    const ProcessResult why = runTool({"--database", database.path(), "why", "FN10", "--property", "VENDOR"});
    EXPECT_EQ(why.status, 2);
    EXPECT_THAT(why.output, StartsWith("no answer: "));
}

} // namespace
