// `which` with one filter and with several, as its users start it.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using testing::HasSubstr;

constexpr const char* BOTH = "DEVICE  FAMILY\nFN10    finch\nFN20    finch\n";
constexpr const char* FIRST = "DEVICE  FAMILY\nFN10    finch\n";

TEST(Which, FindsAnOperationInAnyModeThroughAnyOutput) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"which", "--operation", "VERIFY"}).output, HasSubstr(BOTH));
    EXPECT_EQ(database.run({"which", "--operation", "BYPASS"}).status, 1);
    EXPECT_EQ(database.json({"which", "--operation", "VERIFY"}).at("operation"), "VERIFY");
}

TEST(Which, CombinesSeveralFilters) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"which", "--property", "VENDOR=Korvel", "--property", "PINS=44"}).output, FIRST);
    EXPECT_EQ(database.run({"which", "--property", "VENDOR=Korvel", "--property", "PINS=45"}).status, 1);
    EXPECT_EQ(
        database.run({"which", "--operation", "PROGRAM", "--mode", "SS", "--property", "CORE=1.8"}).output,
        FIRST);
    EXPECT_EQ(database
                  .run({"which", "--operation", "VERIFY", "--mode", "SS", "--output", "PARALLEL",
                        "--property", "CORE=2.5"})
                  .output,
              "DEVICE  FAMILY\nFN20    finch\n");
    EXPECT_EQ(
        database.json({"which", "--property", "VENDOR=Korvel", "--property", "PINS=44"}).at("properties"),
        nlohmann::json::parse(
            R"([{"property": "VENDOR", "value": "Korvel"}, {"property": "PINS", "value": "44"}])"));
}

TEST(Which, TakesTheValuesOfAFlashFromItsFlashProperties) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"which", "--property", "DENSITY=1024"}).output, "DEVICE  FAMILY\nFLA     spi\n");
    EXPECT_EQ(database.run({"which", "--property", "PAGE=256"}).output, "DEVICE  FAMILY\nFLB     spi\n");
}

TEST(Which, ASectionWithNoValuesHidesThoseOfTheFamily) {
    const DatabaseDirectory database(DatabaseDirectory::Files{
        {"base.acd", "DEVICE_SUPPORTED = finch\n"},
        {"finch.acd", "PROPERTIES = PROGRAM,1,BS\n[FN10]\nPROPERTIES = PROGRAM,0\n[FN20]\n"}});
    const std::string found = "DEVICE  FAMILY\nFN20    finch\n";
    EXPECT_EQ(runTool({"--database", database.path(), "which", "--property", "PROGRAM=BS"}).output, found);
    EXPECT_EQ(
        runTool({"--database", database.path(), "which", "--operation", "PROGRAM", "--mode", "BS"}).output,
        found);
}

TEST(Which, NeedsAFilter) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"which"}).status, 2);
    EXPECT_EQ(database.run({"which", "--mode", "BS"}).status, 2);
    EXPECT_EQ(database.run({"which", "--operation", "ERASE", "--output", "USB2"}).status, 2);
}

TEST(RealModes, AreThoseThatTheCheckAllowsWithSomeOutput) {
    const SmallDatabase database;
    // PFF has no families, and SPI mode has those of flashes.
    EXPECT_EQ(database.json({"show", "FN10"}).at("modes"), nlohmann::json({"BS", "SS", "SPI"}));
}

} // namespace
