// The commands that list what there is: devices, families, vocabulary, spi.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;

TEST(Devices, NameFamilyAndIdcodeStandInColumns) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"devices"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "DEVICE  FAMILY  IDCODE\n"
                              "FN10    finch   0x0010\n"
                              "FN20    finch   0x0020\n");
}

TEST(Devices, GlobMatchesWholeNamesWithoutCase) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"devices", "fn2*"})["devices"],
              json::parse(R"([{"name": "FN20", "family": "finch", "idcode": "0x0020"}])"));
    EXPECT_EQ(database.json({"devices", "[fx]N10"})["devices"].size(), 1U);
    EXPECT_EQ(database.json({"devices", "FN?0"})["devices"].size(), 2U);
    EXPECT_EQ(database.run({"devices", "N10"}).status, 1);
}

TEST(Devices, NothingThatMatchesIsANo) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"devices", "zz*"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "tarvik: no device matches \"zz*\"\n");
}

TEST(Devices, FamilyIsNamedInAnyCase) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"devices", "--family", "Finch"})["devices"].size(), 2U);
}

TEST(Devices, UnknownFamilyIsANoWithASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"devices", "--family", "finsh"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.error, HasSubstr("did you mean \"finch\"?"));
}

TEST(Devices, WithoutAnIdcodeThereIsNone) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"finch.acd", "[FN10]\n"}});
    const ProcessResult text = runTool({"--database", directory.path(), "devices"});
    EXPECT_THAT(text.output, HasSubstr("FN10    finch   -\n"));
    const ProcessResult object = runTool({"--database", directory.path(), "devices", "--json"});
    EXPECT_TRUE(json::parse(object.output)["devices"][0]["idcode"].is_null());
}

TEST(Devices, DeviceOfSeveralFamiliesIsListedWhereItIsAnsweredFrom) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = a,b\n"}, {"a.acd", "[TWICE]\n"}, {"b.acd", "[twice]\n[ONCE]\n"}});
    const auto names = [&](const std::string& family) {
        const ProcessResult outcome =
            runTool({"--database", directory.path(), "devices", "--json", "--family", family});
        return json::parse(outcome.output)["devices"];
    };
    EXPECT_EQ(names("a").size(), 1U);
    ASSERT_EQ(names("b").size(), 1U);
    EXPECT_EQ(names("b")[0]["name"], "ONCE");
}

TEST(Devices, BytesThatAreNoTextShowAsReplacedInJson) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"finch.acd", "[FN\xFF]\n"}});
    const ProcessResult outcome = runTool({"--database", directory.path(), "devices", "--json"});
    EXPECT_EQ(json::parse(outcome.output)["devices"][0]["name"], "FN\xEF\xBF\xBD");
}

TEST(Families, DevicesAreCountedAndModesNamed) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"families"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "");
    EXPECT_EQ(outcome.output, "FAMILY  DEVICES  MODES\n"
                              "finch   2        BS SS SPI\n"
                              "spi     3        SPI\n");
}

TEST(Families, SameInJson) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"families"})["families"][0],
              json::parse(R"({"name": "finch", "devices": 2, "modes": ["BS", "SS", "SPI"]})"));
}

TEST(Vocabulary, ModesComeWithTheirOtherTexts) {
    const ProcessResult outcome = runTool({"vocabulary"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("0  BS       Bscan            Boundary Scan mode\n"));
    EXPECT_THAT(outcome.output, HasSubstr("6  KITECF   CF CompactFlash  Kite Compact Flash  mode\n"));
}

TEST(Vocabulary, AllValuesStandInTheirOrder) {
    const json answer = json::parse(runTool({"vocabulary", "--json"}).output);
    EXPECT_EQ(answer["version"], 1);
    EXPECT_EQ(answer["modes"].size(), 9U);
    EXPECT_EQ(answer["outputs"].size(), 10U);
    EXPECT_EQ(answer["operations"].size(), 32U);
    EXPECT_EQ(answer["options"].size(), 24U);
    EXPECT_EQ(
        answer["modes"][4],
        json::parse(
            R"({"value": 4, "key": "DP770", "also": ["DTCONFIG"], "name": "Destop Programming mode"})"));
    EXPECT_EQ(answer["operations"][2],
              json::parse(R"({"value": 2, "key": "PROGRAMFPGAONLY", "name": "Program FPGA Only "})"));
}

TEST(Devices, NamesOnlyAreWithoutHeader) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"devices", "--names"}).output, "FN10\nFN20\n");
}

TEST(Vocabulary, WordsThatDatabasesCannotUseAreMarked) {
    const json answer = json::parse(runTool({"vocabulary", "--json"}).output);
    EXPECT_EQ(answer["outputs"][5],
              json::parse(R"({"value": 5, "key": "QSVF", "inDatabases": false, "name": "QSVF"})"));
    EXPECT_EQ(answer["outputs"][6]["inDatabases"], true);
    EXPECT_EQ(answer["options"][16]["inDatabases"], true);
    EXPECT_EQ(answer["options"][17]["inDatabases"], false);
}

TEST(Spi, FlashesAreListedWithTheirFamilies) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"spi"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "FLASH  FAMILY\nFLA    ST1\nFLB    ST1\nFLC    NV\n");
    EXPECT_EQ(database.json({"spi"})["flashes"][2], json::parse(R"({"name": "FLC", "family": "NV"})"));
}

} // namespace
