// The commands that print values: property, and spi with a device.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;

TEST(Property, DeviceOutranksItsFamily) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"property", "FN10", "CORE"}).output, "1.8\n");
    EXPECT_EQ(database.run({"property", "FN20", "CORE"}).output, "2.5\n");
    EXPECT_EQ(database.run({"property", "finch", "CORE"}).output, "2.5\n");
}

TEST(Property, SeveralValuesStandOneALineInByteOrder) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"property", "FN10", "PROGRAM"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "BS\nSS\n");
    EXPECT_EQ(database.json({"property", "FN10", "PROGRAM"}),
              json::parse(R"({"version": 1, "device": "FN10", "property": "PROGRAM", "values": ["BS", "SS"],
                              "messages": []})"));
}

TEST(Property, UnknownKeyIsANoWithTheManagersMessageAndASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"property", "FN10", "vendor"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "ACD entry  vendor not found for device family FN10.\n"
                             "tarvik: \"FN10\" has no property \"vendor\"; did you mean \"VENDOR\"?\n");
}

TEST(Property, UnknownDeviceIsANo) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"property", "FN99", "VENDOR"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.error, HasSubstr("tarvik: the database has no device \"FN99\""));
}

TEST(Property, FlashAnswersWithItsFlashProperties) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"property", "FLB", "PAGE"}).output, "256\n");
    EXPECT_EQ(database.run({"property", "FLB", "DENSITY"}).status, 1);
}

TEST(Spi, PropertyOfTheFlashOutranksItsClass) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"spi", "FLA", "PAGE"}).output, "512\n");
    EXPECT_EQ(database.run({"spi", "FLB", "PAGE"}).output, "256\n");
    EXPECT_EQ(database.run({"spi", "flb", "page"}).output, "256\n");
}

TEST(Spi, AllPropertiesTellWhereTheyComeFrom) {
    const SmallDatabase database;
    const std::string file = database.path("spi.acd");
    const ProcessResult outcome = database.run({"spi", "FLA"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "PROPERTY  VALUE  FROM    WHERE\n"
                              "DENSITY   1024   device  " +
                                  file +
                                  ":5:16\n"
                                  "PAGE      512    device  " +
                                  file +
                                  ":5:29\n"
                                  "BUS       SPI    ST1     " +
                                  file + ":4:16\n");
    EXPECT_EQ(database.json({"spi", "FLA"})["properties"][2], json({{"key", "BUS"},
                                                                    {"values", {"SPI"}},
                                                                    {"from", "ST1"},
                                                                    {"file", file},
                                                                    {"line", 4},
                                                                    {"column", 16}}));
}

TEST(Spi, FamilyHasItsOwnProperties) {
    const SmallDatabase database;
    EXPECT_EQ(database.json({"spi", "ST1"})["properties"].size(), 2U);
}

TEST(Spi, UnknownPropertyIsANoWithASuggestion) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"spi", "FLA", "DENSITIES"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.error, "tarvik: \"FLA\" has no property \"DENSITIES\"; did you mean \"DENSITY\"?\n");
}

TEST(Spi, UnknownFlashIsANo) {
    const SmallDatabase database;
    const ProcessResult all = database.run({"spi", "ZZ1"});
    EXPECT_EQ(all.status, 1);
    const ProcessResult one = database.run({"spi", "ZZ1", "DENSITY"});
    EXPECT_EQ(one.status, 1);
    EXPECT_EQ(one.output, "");
    EXPECT_EQ(one.error, all.error);
    EXPECT_EQ(database.run({"--literal", "spi", "ZZ1"}).status, 1);
    EXPECT_EQ(database.run({"--literal", "spi", "ZZ1", "DENSITY"}).status, 1);
}

TEST(Spi, DeviceThatIsNoFlashIsANo) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"spi", "FN10"}).error, "tarvik: the database has no flash \"FN10\"\n");
    const ProcessResult outcome = database.run({"spi", "FLD", "PAGE"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.error, "tarvik: the database has no device \"FLD\"; did you mean \"FLA\"?\n");
}

} // namespace
