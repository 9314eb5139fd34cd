// `show`: everything about one device.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <algorithm>

namespace {

using nlohmann::json;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

TEST(Show, WholeSheetOfADevice) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"show", "FN10"});
    const std::string family = database.path("finch.acd");
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "");
    EXPECT_EQ(outcome.output, "Device  FN10\n"
                              "Family  finch\n"
                              "IDCODE  0x0010  " +
                                  database.path("base.acd") +
                                  ":7:10\n"
                                  "Modes   BS SS SPI\n"
                                  "\n"
                                  "Properties\n"
                                  "  PROPERTY    VALUE          FROM    WHERE\n"
                                  "  CORE        1.8            device  " +
                                  family +
                                  ":9:20\n"
                                  "  OP_PROGRAM  ERASE, VERIFY  family  " +
                                  family +
                                  ":6:30\n"
                                  "  PINS        44             device  " +
                                  family +
                                  ":9:12\n"
                                  "  PROGRAM     BS, SS         family  " +
                                  family +
                                  ":6:14\n"
                                  "  VENDOR      Korvel         family  " +
                                  family +
                                  ":5:12\n"
                                  "\n"
                                  "Packages\n"
                                  "  PACKAGE  NOT IN MODE  WHERE\n"
                                  "  P48      SS           " +
                                  database.path("base.acd") +
                                  ":6:30\n"
                                  "\n"
                                  "Multiboot\n"
                                  "  TYPE_MB_SPI  NONE  lead\n"
                                  "\n"
                                  "Operations\n"
                                  "  through  P PARALLEL  Z ZORVA  U USB2  S SVF  T STAPL\n"
                                  "  (spi)    SPI mode treats every device as \"spi\"\n"
                                  "               BS     SS     SM  BSFILE  DP770  SPI    BSDL\n"
                                  "  PROGRAM      P-U--  -      -   -       -      -      -\n"
                                  "  VERIFY       -      P----  -   -       -      -      -\n"
                                  "  ERASE (spi)  -      -      -   -       -      --U--  -\n"
                                  "  HIGHZ        -      -      -   -       -      -      --US-\n"
                                  "\n"
                                  "Programming options\n"
                                  "  through  P PARALLEL  Z ZORVA  U USB2  S SVF  T STAPL\n"
                                  "         BS     SS  SM  BSFILE  DP770  SPI\n"
                                  "  ERASE  --U--  -   -   -       -      -\n"
                                  "\n"
                                  "Programming options in package P48\n"
                                  "  through  P PARALLEL  Z ZORVA  U USB2  S SVF  T STAPL\n"
                                  "          BS     SS  SM  BSFILE  DP770  SPI\n"
                                  "  VERIFY  P----  -   -   -       -      -\n");
}

TEST(Show, WholeSheetInJson) {
    const SmallDatabase database;
    const json answer = database.json({"show", "FN10"});
    EXPECT_EQ(answer["version"], 1);
    EXPECT_EQ(answer["device"], "FN10");
    EXPECT_EQ(answer["spelling"], "FN10");
    EXPECT_EQ(answer["family"], "finch");
    EXPECT_EQ(answer["idcode"],
              json({{"value", "0x0010"}, {"file", database.path("base.acd")}, {"line", 7}, {"column", 10}}));
    EXPECT_EQ(answer["modes"], json::parse(R"(["BS", "SS", "SPI"])"));
    EXPECT_EQ(answer["properties"].size(), 5U);
    EXPECT_EQ(answer["properties"][1], json({{"key", "OP_PROGRAM"},
                                             {"values", {"ERASE", "VERIFY"}},
                                             {"from", "family"},
                                             {"file", database.path("finch.acd")},
                                             {"line", 6},
                                             {"column", 30}}));
    EXPECT_EQ(answer["flash"], false);
    EXPECT_EQ(answer["flashProperties"], json::array());
    EXPECT_EQ(answer["multiboot"],
              json::parse(R"([{"type": "TYPE_MB_SPI", "width": "NONE", "position": "lead"}])"));
    EXPECT_EQ(answer["operations"], json::parse(R"({"PROGRAM": {"BS": ["PARALLEL", "USB2"]},
                                                    "VERIFY": {"SS": ["PARALLEL"]},
                                                    "ERASE": {"SPI": ["USB2"]}})"));
    EXPECT_EQ(answer["bsdl"], json::parse(R"({"HIGHZ": ["USB2", "SVF"]})"));
    EXPECT_EQ(answer["options"], json::parse(R"({"ERASE": {"BS": ["USB2"]}})"));
    EXPECT_EQ(
        answer["packages"],
        (json::array({{{"name", "P48"},
                       {"excluded",
                        {{{"mode", "SS"}, {"file", database.path("base.acd")}, {"line", 6}, {"column", 30}}}},
                       {"options", {{"VERIFY", {{"BS", {"PARALLEL"}}}}}}}})));
    EXPECT_EQ(answer["flashClass"], nullptr);
    EXPECT_EQ(answer["messages"], json::array());
}

TEST(Show, LiteralNameInAnotherCaseIsShownInBoth) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"--literal", "show", "Fn20"});
    EXPECT_THAT(outcome.output,
                StartsWith("Device  Fn20 (in the database: FN20)\nFamily  finch\nIDCODE  0x0020"));
    EXPECT_EQ(database.json({"--literal", "show", "Fn20"})["spelling"], "FN20");
}

TEST(Show, FamilyIsSpeltAsItsFile) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"show", "FINCH"}).output, HasSubstr("Family  finch\n"));
}

TEST(Show, PackageDoesNotChangeTheIdcode) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"show", "FN10_P48"}).output, HasSubstr("IDCODE  0x0010"));
}

TEST(Show, FlashHasFlashProperties) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"show", "FLB"});
    EXPECT_THAT(outcome.output, StartsWith("Device  FLB\nFamily  spi (a flash)\nClass   ST1\nModes   SPI\n"));
    EXPECT_THAT(outcome.output,
                HasSubstr("\nFlash properties\n  PROPERTY  VALUE  FROM  WHERE\n  BUS       SPI    ST1 "));
    EXPECT_THAT(outcome.output, Not(HasSubstr("IDCODE")));
    EXPECT_THAT(outcome.output, HasSubstr("\n  ERASE  -   -   -   -       -      --U--  -\n"));
}

// The properties that `show`, `spi` and completion list are those that `property` and `which` find.
TEST(Show, PropertiesOfFlashesAreThoseThatPropertyFinds) {
    for (const char* const flash : {"OVD16", "BNP16M"}) {
        const json answer = json::parse(runTool({"show", flash, "--json"}).output);
        EXPECT_EQ(answer["properties"], json::array());
        std::vector<std::string> shown;
        for (const json& property : answer["flashProperties"]) {
            const std::string key = property["key"];
            const std::string value = property["values"][0];
            EXPECT_EQ(runTool({"property", flash, key}).output, value + "\n");
            EXPECT_THAT(runTool({"which", "--property", key + '=' + value}).output, HasSubstr(flash));
            shown.push_back(key);
        }
        std::sort(shown.begin(), shown.end());
        std::string listed;
        for (const std::string& key : shown) {
            listed += key + '\n';
        }
        EXPECT_EQ(runTool({"complete", "property", flash, ""}).output, listed);
    }
}

TEST(Show, EmptyPropertyOfAFlashIsLeftOut) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = spi\n"},
         {"spi.acd", "DEVICE_FAMILY = ST1\nST1_DEVICES = FLA\nFLA_PROPERTY = PAGE,:BUS,SPI\n"}});
    const json answer =
        json::parse(runTool({"--database", directory.path(), "show", "FLA", "--json"}).output);
    ASSERT_EQ(answer["flashProperties"].size(), 1U);
    EXPECT_EQ(answer["flashProperties"][0]["key"], "BUS");
    EXPECT_EQ(runTool({"--database", directory.path(), "property", "FLA", "PAGE"}).status, 1);
}

TEST(Show, PackagesOfTheDevice) {
    const ProcessResult outcome = runTool({"show", "KS50"});
    EXPECT_THAT(outcome.output, HasSubstr("\nPackages\n"
                                          "  PACKAGE  NOT IN MODE  WHERE\n"
                                          "  PQ208    -\n"
                                          "  TQ100    SM           base.acd:"));
    const json answer = json::parse(runTool({"show", "KS50", "--json"}).output);
    for (const json& package : answer["packages"]) {
        for (const char* const mode : {"BS", "SS", "SM", "BSFILE", "KITECF", "KITEMPM"}) {
            const bool isExcluded =
                std::any_of(package["excluded"].begin(), package["excluded"].end(),
                            [&](const json& exclusion) { return exclusion["mode"] == mode; });
            EXPECT_EQ(runTool({"check", "KS50", "--mode", mode, "--package", package["name"]}).status,
                      isExcluded ? 1 : 0);
        }
    }
}

TEST(Show, PropertyWithoutValuesSaysSo) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"finch.acd", "[FN10]\nPROPERTIES = VOID,0\n"}});
    EXPECT_THAT(runTool({"--database", directory.path(), "show", "FN10"}).output,
                HasSubstr("  VOID      (none)  device"));
}

TEST(Show, LongListsOfValuesAreBroken) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"},
         {"finch.acd", "[FN10]\nPROPERTIES = LONG,4,AAAAAAAAAA,BBBBBBBBBB,CCCCCCCCCC,DDDDDDDDDD\n"}});
    EXPECT_THAT(
        runTool({{"--database", directory.path(), "show", "FN10"}, {}, {{"COLUMNS", "80"}}, {}, 0}).output,
        testing::ContainsRegex("LONG      AAAAAAAAAA, BBBBBBBBBB,  device  .*:2:14\n"
                               "            CCCCCCCCCC, DDDDDDDDDD\n"));
}

TEST(Show, LaterEntryOfANameIsTheOneShown) {
    const DatabaseDirectory directory({{"base.acd", "DEVICE_SUPPORTED = finch\n"},
                                       {"finch.acd", "[FN10]\n"
                                                     "PROPERTIES = KEY,1,SEVERAL\n"
                                                     "PROPERTY = KEY,FIRST:KEY,SECOND:OTHER,A:OTHER,B\n"}});
    const json properties =
        json::parse(runTool({"--database", directory.path(), "show", "FN10", "--json"}).output)["properties"];
    EXPECT_EQ(properties[0]["values"], json({"SEVERAL"}));
    EXPECT_EQ(properties[0]["line"], 2);
    EXPECT_EQ(properties[1]["values"], json({"B"}));
    EXPECT_EQ(properties[1]["column"], 41);
}

TEST(Show, UnknownDeviceIsANoWithASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"show", "FN11"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "tarvik: the database has no device \"FN11\"; did you mean \"FN10\"?\n");
}

// The properties alone would make the manager take the device's own options for its family's.
TEST(Show, AnswersDoNotDependOnEachOther) {
    const SmallDatabase database;
    const json sheet = database.json({"show", "FN10"});
    EXPECT_EQ(sheet["options"], json::parse(R"({"ERASE": {"BS": ["USB2"]}})"));
    const json asked = database.json({"options", "FN10", "--mode", "BS", "--output", "USB2"});
    EXPECT_EQ(asked["options"], json({"ERASE"}));
}

TEST(Show, FamilyThatCannotBeReadIsAFaultThatNamesIt) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"spi.acd", "DEVICE_FAMILY = NV\n"}});
    std::filesystem::create_directory(directory.path("finch.acd"));
    const ProcessResult outcome = runTool({"--database", directory.path(), "show", "finch"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("finch.acd"));
}

TEST(Show, BadRecordsRaiseNothing) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"},
         {"finch.acd", "OPERATION = NOTHING,BS,USB2:PROGRAM,BS,XX,USB2\n[FN10]\n"}});
    const ProcessResult outcome = runTool({"--database", directory.path(), "show", "FN10"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("PROGRAM  --U--"));
    EXPECT_EQ(
        outcome.error,
        "tarvik: " + directory.path("finch.acd") +
            ":1:13: \"NOTHING\" is faulty: an application gets OutOfRangeException (location 1631), and "
            "afterwards answers without this record and those after it\n"
            "Operation NOTHING is not defined.\n");
}

TEST(Show, NamesWhatLayersShadow) {
    const SmallDatabase below;
    const DatabaseDirectory above(DatabaseDirectory::Files{{"base.acd", "IDCODE += :FN10,0x0030\n"},
                                                           {"finch.acd", "[FN10]\nPROPERTY = PINS,48\n"}});
    const ProcessResult outcome =
        runTool({{"--database", above.path(), "--database", below.path(), "show", "FN10"}, {}, {}, {}});
    EXPECT_EQ(runTool({"--database", above.path() + ':' + below.path(), "show", "FN10"}).output,
              outcome.output);
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output,
                HasSubstr("IDCODE  0x0030  " + above.path("base.acd") + ":1:12\n        shadows " +
                          below.path("base.acd") + ":7:10: FN10,0x0010\n"));
    EXPECT_THAT(outcome.output,
                testing::ContainsRegex("PINS +48 +device +" + above.path("finch.acd") + ":2:12\n +" +
                                       "PINS,44 +shadowed +" + below.path("finch.acd") + ":9:12\n"));
}

TEST(Show, NamesWhatAnIdcodeShadowsInJson) {
    const SmallDatabase below;
    const DatabaseDirectory above(DatabaseDirectory::Files{{"base.acd", "IDCODE += :FN10,0x0030\n"}});
    const json idcode = json::parse(
        runTool({"--database", above.path(), "--database", below.path(), "show", "FN10", "--json"})
            .output)["idcode"];
    EXPECT_EQ(idcode["value"], "0x0030");
    EXPECT_EQ(idcode["shadows"], json::array({{{"file", below.path("base.acd")},
                                               {"line", 7},
                                               {"column", 10},
                                               {"layer", below.path()},
                                               {"text", "FN10,0x0010"}}}));
}

TEST(Show, NamesLayersInJson) {
    const SmallDatabase below;
    const DatabaseDirectory above(
        DatabaseDirectory::Files{{"finch.acd", "[FN10]\nPROPERTY = PINS,48\nPROPERTY += :PINS,52\n"}});
    const json sheet = json::parse(
        runTool(
            {{"--database", above.path(), "--database", below.path(), "show", "FN10", "--json"}, {}, {}, {}})
            .output);
    EXPECT_EQ(sheet.at("idcode").at("layer"), below.path());
    EXPECT_FALSE(sheet.at("idcode").contains("shadows"));
    for (const json& property : sheet.at("properties")) {
        EXPECT_EQ(property.contains("shadows"), property.at("key") == "PINS");
        if (property.at("key") == "PINS") {
            EXPECT_EQ(property.at("layer"), above.path());
            EXPECT_EQ(property.at("shadows"), json::array({{{"file", below.path("finch.acd")},
                                                            {"line", 9},
                                                            {"column", 12},
                                                            {"layer", below.path()},
                                                            {"text", "PINS,44"}}}));
        }
    }
    EXPECT_FALSE(below.json({"show", "FN10"}).at("idcode").contains("layer"));
}

} // namespace
