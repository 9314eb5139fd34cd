// The commands that answer yes or no: check and multiboot.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;

TEST(Check, ModeAndOutput) {
    const SmallDatabase database;
    const ProcessResult yes = database.run({"check", "--mode", "BS", "--output", "USB2"});
    EXPECT_EQ(yes.status, 0);
    EXPECT_EQ(yes.output, "yes: mode BS through USB2\n");
    EXPECT_EQ(yes.error, "");
    const ProcessResult no = database.run({"check", "--mode", "BS", "--output", "ZORVA"});
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.output, "no: mode BS through ZORVA\n");
    EXPECT_EQ(no.error, "ZORVA cable is not supported in Boundary Scan mode\n");
}

TEST(Check, DeviceInMode) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "SS"}).output, "yes: FN10 in mode SS\n");
    const ProcessResult no = database.run({"check", "FN10", "--mode", "SM"});
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.error, "FN10 is not supported in Select Map mode\n");
}

TEST(Check, PackageInMode) {
    const SmallDatabase database;
    const ProcessResult no = database.run({"check", "FN10", "--mode", "SS", "--package", "P48"});
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.output, "no: FN10 in package P48 in mode SS\n");
    EXPECT_EQ(no.error, "FN10_P48 is not supported in Slave Serial mode\n");
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "SS", "--package", "P64"}).status, 0);
}

TEST(Check, DeviceInModeThroughOutput) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS", "--output", "USB2"}).output,
              "yes: FN10 in mode BS through USB2\n");
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS", "--output", "SVF"}).status, 1);
}

// Without an output the mode takes every device; with one the family must be listed for the mode.
TEST(Check, WhatIsGivenPicksTheCheck) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "PFF"}).status, 0);
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "PFF", "--output", "SVF"}).status, 1);
}

TEST(Check, PackageInModeThroughOutput) {
    const SmallDatabase database;
    const std::vector<std::string> question{"check",    "FN10",     "--mode",    "SS",
                                            "--output", "PARALLEL", "--package", "P48"};
    const ProcessResult no = database.run(question);
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.error, "FN10_P48 is not supported in Slave Serial mode\n");
}

TEST(Check, OperationInModeThroughOutput) {
    const SmallDatabase database;
    EXPECT_EQ(
        database.run({"check", "FN10", "--mode", "BS", "--output", "USB2", "--operation", "program"}).output,
        "yes: PROGRAM of FN10 in mode BS through USB2\n");
    EXPECT_EQ(
        database.run({"check", "FN10", "--mode", "SS", "--output", "PARALLEL", "--operation", "PROGRAM"})
            .status,
        1);
}

// The same operation and mode: this check reads the device's property, not the table of operations.
TEST(Check, OperationInMode) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "SS", "--operation", "PROGRAM"}).output,
              "yes: PROGRAM of FN10 in mode SS\n");
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "SS", "--operation", "VERIFY"}).status, 1);
}

TEST(Check, JsonHoldsTheQuestionAndTheRefusal) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"check", "FN10", "--mode", "SS", "--package", "P48"}), json::parse(R"({
        "version": 1, "allowed": false, "device": "FN10", "mode": "SS", "output": null, "package": "P48",
        "operation": null, "skipped": [],
        "messages": [{"channel": "info", "line": 229,
                      "text": "FN10_P48 is not supported in Slave Serial mode\n"}]})"));
}

// The manager itself accepts every name in this mode.
TEST(Check, UnknownDeviceIsNotFound) {
    const SmallDatabase database;
    for (const char* const mode : {"BS", "PFF"}) {
        const ProcessResult no = database.run({"check", "FN11", "--mode", mode});
        EXPECT_EQ(no.status, 1);
        EXPECT_EQ(no.output, "");
        EXPECT_EQ(no.error, "tarvik: the database has no device \"FN11\"; did you mean \"FN10\"?\n");
    }
    EXPECT_EQ(database.json({"check", "FN11", "--mode", "SPI", "--operation", "ERASE"}), json::parse(R"({
        "version": 1, "error": "the database has no device \"FN11\"; did you mean \"FN10\"?",
        "messages": []})"));
}

TEST(Check, CompleteQuestionShowsTheVerdictOfEachPart) {
    const SmallDatabase database;
    const std::vector<std::string> question{"check",    "FN10",      "--mode", "SS",          "--output",
                                            "PARALLEL", "--package", "P48",    "--operation", "VERIFY"};
    const ProcessResult no = database.run(question);
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.output, "no: VERIFY of FN10 in package P48 in mode SS through PARALLEL\n"
                         "  yes: mode SS through PARALLEL\n"
                         "  no: FN10 in package P48 in mode SS\n"
                         "  yes: VERIFY of FN10 in mode SS through PARALLEL\n");
    EXPECT_EQ(no.error, "FN10_P48 is not supported in Slave Serial mode\n");
    EXPECT_EQ(database.json(question)["parts"], json::parse(R"([
        {"allowed": true, "mode": "SS", "output": "PARALLEL"},
        {"allowed": false, "device": "FN10", "mode": "SS", "package": "P48"},
        {"allowed": true, "device": "FN10", "mode": "SS", "output": "PARALLEL", "operation": "VERIFY"}])"));
    const ProcessResult yes = database.run({"check", "FN10", "--mode", "SS", "--output", "PARALLEL",
                                            "--package", "P64", "--operation", "VERIFY"});
    EXPECT_EQ(yes.status, 0);
    EXPECT_EQ(yes.error, "");
}

// In these modes the check of a device without an output would say yes to everything.
TEST(Check, CompleteQuestionAsksModesThatAcceptAllThroughAnOutput) {
    const SmallDatabase database;
    EXPECT_THAT(database
                    .run({"check", "FN10", "--mode", "PFF", "--output", "SVF", "--package", "P48",
                          "--operation", "VERIFY"})
                    .output,
                HasSubstr("  yes: mode PFF through SVF\n  no: FN10 in package P48 in mode PFF\n"));
    EXPECT_THAT(database
                    .run({"check", "FN10", "--mode", "SPI", "--output", "PARALLEL", "--package", "P48",
                          "--operation", "ERASE"})
                    .output,
                HasSubstr("  no: mode SPI through PARALLEL\n  yes: FN10 in package P48 in mode SPI\n"));
}

TEST(Check, PackageAndOperationWithoutAnOutput) {
    const SmallDatabase database;
    EXPECT_EQ(
        database.run({"check", "FN10", "--mode", "SS", "--package", "P48", "--operation", "PROGRAM"}).output,
        "no: PROGRAM of FN10 in package P48 in mode SS\n"
        "  no: FN10 in package P48 in mode SS\n"
        "  yes: PROGRAM of FN10 in mode SS\n");
}

TEST(Check, SaysWhatTheFormSkips) {
    const SmallDatabase database;
    const std::vector<std::pair<std::vector<std::string>, std::string>> skipped{
        {{"FN10", "--mode", "SPI"}, "without --output, SPI mode accepts every device"},
        {{"FN10", "--mode", "PFF"}, "without --output, PFF mode accepts every device"},
        {{"FN10", "--mode", "SPI", "--output", "USB2"}, "SPI mode treats every device as \"spi\""},
        {{"--mode", "PFF", "--output", "SVF"}, "PFF mode accepts every output"},
        {{"FN10", "--mode", "SS"}, "without --package, it is not checked that SS mode excludes FN10 in P48"},
        {{"FN10", "--mode", "BS", "--output", "USB2", "--operation", "PROGRAM"},
         "without --package, it is not checked whether BS mode accepts the device and the output"},
        {{"FN10", "--mode", "BS", "--operation", "PROGRAM"},
         "without --output, only the property PROGRAM is checked, not the operations of the device"},
    };
    for (const auto& [question, check] : skipped) {
        std::vector<std::string> words{"check"};
        words.insert(words.end(), question.begin(), question.end());
        EXPECT_EQ(database.run(words).error, "tarvik: " + check + "\n");
        EXPECT_EQ(database.json(words)["skipped"], json{check});
        words.front() = "why";
        EXPECT_THAT(database.run(words).output, HasSubstr(check.substr(0, 40)));
        EXPECT_EQ(database.json(words)["skipped"], json{check});
    }
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS"}).error, "");
}

TEST(Check, OtherCombinationsAreFaultsThatSayWhatIsPossible) {
    const SmallDatabase database;
    const std::vector<std::vector<std::string>> combinations{
        {"check", "--mode", "BS"},
        {"check", "--mode", "BS", "--package", "P48"},
        {"check", "--mode", "BS", "--operation", "ERASE"},
        {"check", "--mode", "BS", "--output", "USB2", "--package", "P48"},
        {"check", "--mode", "BS", "--output", "USB2", "--operation", "ERASE"},
    };
    for (const std::vector<std::string>& combination : combinations) {
        const ProcessResult outcome = database.run(combination);
        EXPECT_EQ(outcome.status, 2) << testing::PrintToString(combination);
        EXPECT_EQ(outcome.output, "");
        EXPECT_THAT(outcome.error, HasSubstr("DEVICE --mode M --output O [--package P]\n"));
    }
}

TEST(Check, ModeIsRequired) { EXPECT_EQ(SmallDatabase().run({"check", "FN10"}).status, 2); }

TEST(Check, UnknownWordsAreFaults) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "XX"}).status, 2);
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS", "--output", "XX"}).status, 2);
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS", "--operation", "XX"}).status, 2);
}

TEST(Check, UsageFaultsNeedNoDatabase) {
    const ProcessResult outcome = runTool({"--database", "/nowhere", "check", "--mode", "BS"});
    EXPECT_THAT(outcome.error, testing::StartsWith("tarvik: check takes one of these:\n"));
}

TEST(Multiboot, TypeIsReadWithAndWithoutItsPrefixInAnyCase) {
    const SmallDatabase database;
    for (const char* const type : {"MB_SPI", "mb_spi", "TYPE_MB_SPI", "type_mb_spi"}) {
        const ProcessResult yes =
            database.run({"multiboot", "fla", "--type", type, "--width", "none", "--lead"});
        EXPECT_EQ(yes.status, 0);
        EXPECT_EQ(yes.output, "yes: FLA as lead device of TYPE_MB_SPI NONE\n");
    }
}

TEST(Multiboot, PositionCounts) {
    const SmallDatabase database;
    const ProcessResult no =
        database.run({"multiboot", "FLA", "--type", "MB_SPI", "--width", "NONE", "--chain"});
    EXPECT_EQ(no.status, 1);
    EXPECT_EQ(no.output, "no: FLA as chain device of TYPE_MB_SPI NONE\n");
}

TEST(Multiboot, PositionIsGivenOnce) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"multiboot", "FLA", "--type", "BPI", "--width", "SERIAL"}).status, 2);
    EXPECT_EQ(
        database.run({"multiboot", "FLA", "--type", "BPI", "--width", "SERIAL", "--lead", "--chain"}).status,
        2);
}

TEST(Multiboot, CombinationThatNoTypeHasIsANo) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"multiboot", "FLA", "--type", "BPI", "--width", "NONE", "--lead"}).status, 1);
}

TEST(Multiboot, UnknownWordsAreFaults) {
    const SmallDatabase database;
    const ProcessResult type =
        database.run({"multiboot", "FLA", "--type", "MB", "--width", "NONE", "--lead"});
    EXPECT_EQ(type.status, 2);
    EXPECT_THAT(type.error, HasSubstr("unknown multiboot type \"MB\"; did you mean \"MB_SPI\"?\n"));
    EXPECT_THAT(type.error, HasSubstr("TYPE_BPI, TYPE_MB_SPI, TYPE_MB_BPI, TYPE_MB_QPRM"));
    const ProcessResult width =
        database.run({"multiboot", "FLA", "--type", "BPI", "--width", "WIDE", "--lead"});
    EXPECT_EQ(width.status, 2);
    EXPECT_THAT(width.error, HasSubstr("SERIAL, PARALLEL, NONE"));
}

TEST(Multiboot, JsonHoldsTheQuestion) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"multiboot", "FLA", "--type", "MB_SPI", "--width", "NONE", "--lead"}),
              json::parse(R"({"version": 1, "allowed": true, "device": "FLA", "type": "TYPE_MB_SPI",
                              "width": "NONE", "position": "lead", "messages": []})"));
}

TEST(Multiboot, UnknownDeviceIsNoted) {
    const SmallDatabase database;
    const ProcessResult no =
        database.run({"multiboot", "FLX", "--type", "MB_SPI", "--width", "NONE", "--lead"});
    EXPECT_EQ(no.status, 1);
    EXPECT_THAT(no.error, HasSubstr("the database has no device \"FLX\"; did you mean \"FLA\"?"));
}

} // namespace
