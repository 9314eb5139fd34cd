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

TEST(Schema, KnowsWhatEachFieldHolds) {
    using schema::Content;
    const auto content = [](File file, const char* key, std::size_t item, std::size_t field,
                            std::string_view name = {}) {
        return schema::contentOf(file, key, {item, field, name});
    };
    EXPECT_EQ(content(File::FAMILY, "OPERATION", 3, 1), Content::TABLE_MODE);
    EXPECT_EQ(content(File::FAMILY, "BSDL_OPERATION", 0, 1), Content::TABLE_OUTPUT);
    EXPECT_EQ(content(File::FAMILY, "PROGRAM_OPTION", 0, 0), Content::OPTION_NAME);
    EXPECT_EQ(content(File::FAMILY, "PROPERTIES", 1, 1, "PACKAGES"), Content::COUNT);
    EXPECT_EQ(content(File::FAMILY, "PROPERTIES", 1, 2, "PACKAGES"), Content::PACKAGE_NAME);
    EXPECT_EQ(content(File::FAMILY, "PROPERTIES", 1, 2, "VERIFY"), Content::MODE_KEY);
    EXPECT_EQ(content(File::FAMILY, "PROPERTY", 1, 1, "OP_VERIFY"), Content::OPTION_NAME);
    EXPECT_EQ(content(File::FAMILY, "PROPERTY", 1, 1, "PINS"), Content::TEXT);
    EXPECT_EQ(content(File::FAMILY, "IDCODE", 0, 0), Content::NONE);
    EXPECT_EQ(content(File::BASE, "IDCODE", 9, 0), Content::DEVICE);
    EXPECT_EQ(content(File::BASE, "IDCODE", 9, 2), Content::NONE);
    EXPECT_EQ(content(File::BASE, "SM", 0, 0), Content::OUTPUT_LABEL);
    EXPECT_EQ(content(File::BASE, "SM", 0, 1), Content::MODE_OUTPUT);
    EXPECT_EQ(content(File::BASE, "SM", 1, 0), Content::FAMILY_LABEL);
    EXPECT_EQ(content(File::BASE, "SM", 1, 1), Content::FAMILY);
    EXPECT_EQ(content(File::BASE, "SM", 2, 1), Content::NONE);
    EXPECT_EQ(content(File::SPI, "NV1_DEVICES", 0, 7), Content::FLASH);
    EXPECT_EQ(content(File::SPI, "TYPE_MB_SPI_NONE_LEAD", 0, 0), Content::FLASH_OR_DEVICE);
}

TEST(Schema, KnowsTheFormOfEachKey) {
    for (const File file : {File::BASE, File::SPI, File::FAMILY}) {
        for (const std::string& key : schema::fixedKeys(file)) {
            EXPECT_TRUE(schema::formOf(file, key).ends_with("...")) << key;
        }
    }
    EXPECT_EQ(schema::formOf(File::BASE, "BSDL_OPERATION"), "operation,output,...:...");
    EXPECT_EQ(schema::formOf(File::FAMILY, "BS"), "");
}
