// The description of the database's keys.
#include "model/Schema.h"

#include <gmock/gmock.h>

using schema::File;
using schema::Shape;
using testing::ElementsAre;

TEST(Schema, KnowsTheShapeOfEachKeyByItsFile) {
    EXPECT_EQ(schema::shapeOf(File::BASE, "DEVICE_SUPPORTED"), Shape::LIST);
    EXPECT_EQ(schema::shapeOf(File::BASE, "PFF"), Shape::RECORDS);
    EXPECT_EQ(schema::shapeOf(File::BASE, "IDCODE"), Shape::RECORDS);
    EXPECT_EQ(schema::shapeOf(File::BASE, "DEVICE_FAMILY"), Shape::NONE);
    EXPECT_EQ(schema::shapeOf(File::SPI, "NV1_DEVICES"), Shape::LIST);
    EXPECT_EQ(schema::shapeOf(File::SPI, "TYPE_MB_QPRM_NONE_LEAD"), Shape::LIST);
    EXPECT_EQ(schema::shapeOf(File::SPI, "TYPE_BPI_NONE_LEAD"), Shape::NONE);
    EXPECT_EQ(schema::shapeOf(File::SPI, "OVD1_PROPERTY"), Shape::RECORDS);
    EXPECT_EQ(schema::shapeOf(File::FAMILY, "PROPERTIES"), Shape::RECORDS);
    EXPECT_EQ(schema::shapeOf(File::FAMILY, "BS"), Shape::NONE);
    EXPECT_EQ(schema::shapeInSection("IDCODE"), Shape::NONE);
}

TEST(Schema, KnowsTheClassOfAFileInAnyCase) {
    EXPECT_EQ(schema::fileOf("Base"), File::BASE);
    EXPECT_EQ(schema::fileOf("SPI"), File::SPI);
    EXPECT_EQ(schema::fileOf("kestrel"), File::FAMILY);
}

TEST(Schema, KnowsWhereTheListOfARecordBegins) {
    EXPECT_EQ(schema::firstListed(File::BASE, "DEVICE_SUPPORTED"), 0U);
    EXPECT_EQ(schema::firstListed(File::BASE, "SM"), 1U);
    EXPECT_EQ(schema::firstListed(File::FAMILY, "PROPERTIES"), 2U);
    EXPECT_EQ(schema::firstListed(File::FAMILY, "OPERATION"), std::string::npos);
}

TEST(Schema, JoinsKeysAsTheManagerDoes) {
    EXPECT_EQ(schema::devicesKey("Nv1"), "Nv1_DEVICES");
    EXPECT_EQ(schema::propertyKey("ovd1"), "OVD1_PROPERTY");
}

TEST(Schema, ListsTheWordsThatADatabaseCanGive) {
    EXPECT_THAT(schema::tableOutputs(), ElementsAre("PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"));
    EXPECT_EQ(schema::modeOutputs().size(), 7U);
    EXPECT_EQ(schema::tableOptions().back(), "SECTOR_LOCKDOWN");
}
