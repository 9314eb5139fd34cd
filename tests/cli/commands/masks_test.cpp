// The commands that spell masks out: operations, options, bsdl; and operation-options.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;
using testing::StartsWith;

TEST(Operations, KeysStandWithTheirDisplayNames) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operations", "FN10", "--mode", "BS", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "PROGRAM  Program\n");
    EXPECT_EQ(outcome.error, "");
}

TEST(Operations, MaskAndKeysStandInJson) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"operations", "FN10", "--mode", "SS", "--output", "PARALLEL"}),
              json::parse(R"({"version": 1, "device": "FN10", "mode": "SS", "output": "PARALLEL", "mask": 8,
                              "operations": ["VERIFY"], "messages": []})"));
}

TEST(Operations, SpiModeAnswersForTheFlashes) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operations", "FN10", "--mode", "SPI", "--output", "USB2"});
    EXPECT_EQ(outcome.output, "ERASE  Erase\n");
    EXPECT_EQ(outcome.error, "tarvik: SPI mode treats every device as \"spi\"\n");
}

TEST(Operations, NoneIsAnAnswerWithANote) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operations", "FN10", "--mode", "SM", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "tarvik: FN10 allows no operations in mode SM through USB2\n");
}

TEST(Operations, UnknownDeviceIsANoWithASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operations", "FN1", "--mode", "BS", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.error, "tarvik: the database has no device \"FN1\"; did you mean \"FN10\"?\n");
    EXPECT_EQ(database.json({"operations", "FN1", "--mode", "BS", "--output", "USB2"})["error"],
              "the database has no device \"FN1\"; did you mean \"FN10\"?");
}

TEST(Operations, ModesHaveManyTextsInAnyCase) {
    const SmallDatabase database;
    for (const char* const mode : {"BS", "bs", "bscan", "BSCAN"}) {
        EXPECT_EQ(database.json({"operations", "FN10", "--mode", mode, "--output", "USB2"})["mode"], "BS");
    }
    EXPECT_EQ(database.json({"operations", "FN10", "-m", "compactflash", "-o", "USB2"})["mode"], "KITECF");
}

TEST(Operations, UnknownModeIsAFaultThatSaysWhatIsAccepted) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operations", "FN10", "--mode", "BSCN", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.error, StartsWith("tarvik: unknown mode \"BSCN\"; did you mean \"Bscan\"?\n"));
    EXPECT_THAT(outcome.error, HasSubstr("modes, in any case:\n  BS, SS, SM"));
}

TEST(Operations, WordsAreReadByDisplayName) {
    const SmallDatabase database;
    for (const char* const mode : {"Slave Serial", "slave serial mode", "SSerial"}) {
        EXPECT_EQ(database.json({"options", "FN10", "--mode", mode, "--output", "usb2"})["mode"], "SS");
    }
    EXPECT_EQ(database.json({"options", "FN10", "-m", "kite mpm mode", "-o", "Parallel cable"})["mode"],
              "KITEMPM");
    EXPECT_EQ(database.json({"options", "FN10", "-m", "BS", "-o", "Express SVF"})["output"], "EXPRESSSVF");
    EXPECT_EQ(database.json({"operation-options", "FN10", "program fpga only", "-m", "BS"})["operation"],
              "PROGRAMFPGAONLY");
}

TEST(Operations, EmptyModeIsUnknown) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"operations", "FN10", "--mode", "", "--output", "USB2"}).status, 2);
}

TEST(Operations, OutputsAreReadInAnyCase) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"operations", "FN10", "--mode", "BS", "--output", "usb2"})["output"], "USB2");
    const ProcessResult outcome = database.run({"operations", "FN10", "--mode", "BS", "--output", "usb3"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, StartsWith("tarvik: unknown output \"usb3\"; did you mean \"USB2\"?\n"));
}

TEST(Operations, OutputsThatOnlyHaveANumberHaveAKeyToo) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"operations", "FN10", "--mode", "BS", "--output", "QSVF"})["mask"], 0);
}

TEST(Operations, ModeAndOutputAreRequired) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"operations", "FN10", "--mode", "BS"}).status, 2);
    EXPECT_EQ(database.run({"operations", "FN10", "--output", "USB2"}).status, 2);
}

TEST(Operations, DebugMessagesShowOnlyWhenAskedFor) {
    const SmallDatabase database;
    const std::vector<std::string> question{"options", "FN10", "--mode", "PFF", "--output", "USB2"};
    EXPECT_THAT(database.run(question).error, testing::Not(HasSubstr("out of range")));
    std::vector<std::string> verbose = question;
    verbose.emplace_back("--verbose");
    EXPECT_THAT(database.run(verbose).error, HasSubstr("Mode is out of range -- 8.\n"));
    EXPECT_EQ(database.json(verbose)["messages"],
              json::parse(R"([{"channel": "debug", "line": 0, "text": "Mode is out of range -- 8.\n"}])"));
}

TEST(Options, FamilyAnswersForADeviceWithoutItsOwn) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"options", "FN20", "--mode", "BS", "--output", "USB2"}).output, "ERASE\n");
}

TEST(Options, PackageMayHaveItsOwn) {
    const SmallDatabase database;
    const json answer =
        database.json({"options", "FN10", "--mode", "BS", "--output", "PARALLEL", "--package", "P48"});
    EXPECT_EQ(answer["package"], "P48");
    EXPECT_EQ(answer["mask"], 2);
    EXPECT_EQ(answer["options"], json::parse(R"(["VERIFY"])"));
    EXPECT_TRUE(database.json({"options", "FN10", "--mode", "BS", "--output", "USB2"})["package"].is_null());
}

TEST(Bsdl, OperationsOfAnOutput) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"bsdl", "FN10", "--output", "SVF"}).output, "HIGHZ  Highz\n");
    EXPECT_EQ(database.json({"bsdl", "FN10", "--output", "SVF"})["mask"], 1 << 20);
}

TEST(OperationOptions, OptionsOfAnOperation) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"operation-options", "FN10", "PROGRAM", "--mode", "SS"}).output,
              "ERASE\nVERIFY\n");
}

TEST(OperationOptions, OperationIsReadByKeyOrDisplayNameInAnyCase) {
    const SmallDatabase database;
    const json expected = json::parse(R"(["ERASE", "VERIFY"])");
    for (const char* const operation : {"PROGRAM", "program", "Program"}) {
        const json answer = database.json({"operation-options", "FN10", operation, "--mode", "BS"});
        EXPECT_EQ(answer["operation"], "PROGRAM");
        EXPECT_EQ(answer["options"], expected);
    }
    EXPECT_EQ(database.json({"operation-options", "FN10", "get device id", "--mode", "BS"})["operation"],
              "READIDCODE");
}

TEST(OperationOptions, NoneIsAnAnswerWithANote) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operation-options", "FN10", "PROGRAM", "--mode", "SM"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.error, HasSubstr("PROGRAM of FN10 has no options in mode SM"));
}

TEST(OperationOptions, UnknownOperationIsAFaultWithASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"operation-options", "FN10", "PROGAM", "--mode", "BS"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error,
                StartsWith("tarvik: unknown operation \"PROGAM\"; did you mean \"PROGRAM\"?\n"));
    // Not all 32.
    EXPECT_THAT(outcome.error, testing::Not(HasSubstr("CONLD")));
}

} // namespace
