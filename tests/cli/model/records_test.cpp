// Records with the place of each field.
#include "cli/support/DatabaseDirectory.h"
#include "model/RecordSplitter.h"
#include "model/Records.h"

#include <gmock/gmock.h>

using catalogue::readList;
using catalogue::readRecords;
using catalogue::Record;
using catalogue::Records;
using catalogue::SourceText;
using testing::ElementsAre;

namespace {

void useFiles(std::map<std::string, std::string> files) {
    files.emplace("base.acd", "");
    AcdStore::setMemoryFiles(std::move(files));
}

std::string shown(const SourceText& text) { return text.text + '@' + catalogue::asText(text.origin); }

std::vector<std::string> shown(const std::vector<SourceText>& texts) {
    std::vector<std::string> all;
    for (const SourceText& text : texts) {
        all.push_back(shown(text));
    }
    return all;
}

std::vector<std::string> items(std::string_view text) {
    std::vector<std::string> all;
    splitter::forEachItem(text, ',', [&](std::string_view item, std::size_t) { all.emplace_back(item); });
    return all;
}

} // namespace

TEST(Splitter, GivesOneItemMoreThanThereAreSeparators) {
    EXPECT_THAT(items("a,,b"), ElementsAre("a", "", "b"));
    EXPECT_THAT(items(","), ElementsAre("", ""));
    EXPECT_THAT(items(" a "), ElementsAre(" a "));
    EXPECT_THAT(items(""), ElementsAre());
}

TEST(Splitter, EndsWhereTheReadersDo) {
    const auto ignore = [](std::string_view, std::size_t) {};
    const std::string commas(AcdText::MAX_PARTS - 1, ',');
    EXPECT_EQ(splitter::forEachItem(commas, ',', ignore), std::string_view::npos);
    EXPECT_EQ(splitter::forEachItem(commas + ",x", ',', ignore), AcdText::MAX_PARTS);
}

TEST(Records, HaveThePlaceOfEachField) {
    useFiles({{"kestrel.acd", "OPERATION = PROGRAM,Bscan: \\\n  VERIFY,,SVF:\n"}});
    const Records records = readRecords("kestrel", "OPERATION");
    EXPECT_TRUE(records.isSet);
    EXPECT_FALSE(records.ofDevice);
    ASSERT_EQ(records.all.size(), 3U);
    EXPECT_EQ(shown(records.all[0].whole), "PROGRAM,Bscan@kestrel.acd:1:13");
    EXPECT_THAT(shown(records.all[1].fields),
                ElementsAre("VERIFY@kestrel.acd:2:3", "@kestrel.acd:2:10", "SVF@kestrel.acd:2:11"));
    EXPECT_THAT(shown(records.all[2].fields), ElementsAre("@kestrel.acd:2:15"));
    EXPECT_EQ(records.all[0].field(1)->text, "Bscan");
    EXPECT_EQ(records.all[0].field(2), nullptr);
}

TEST(Records, SayWhetherTheyAreOfTheDevice) {
    useFiles({{"kestrel.acd", "PROPERTY = A,1\nPROPERTIES = B,0\n[KS50]\nPROPERTY = C,2\n"}});
    EXPECT_TRUE(readRecords("KS50", "PROPERTY").ofDevice);
    EXPECT_FALSE(readRecords("KS50", "PROPERTIES").ofDevice);
    EXPECT_FALSE(readRecords("KS50", "OPERATION").isSet);
}

TEST(Records, ShowWhatTheyShadow) {
    const DatabaseDirectory below(
        DatabaseDirectory::Files{{"base.acd", ""}, {"kestrel.acd", "PROPERTY = A,1:B,2\n"}});
    const DatabaseDirectory above(DatabaseDirectory::Files{{"kestrel.acd", "PROPERTY = A,3\n"}});
    AcdStore::setSearchPath({above.path(), below.path()});
    const Records records = readRecords("kestrel", "PROPERTY");
    ASSERT_EQ(records.all.size(), 1U);
    ASSERT_EQ(records.shadowed.size(), 2U);
    EXPECT_EQ(shown(records.shadowed[1].whole), "B,2@" + below.path("kestrel.acd") + ":1:16");
    ASSERT_EQ(records.shadows.size(), 1U);
    EXPECT_EQ(records.shadows[0].text, "A,1:B,2");
}

TEST(Lists, HaveThePlaceOfEachItem) {
    useFiles({{"spi.acd", "DEVICE_FAMILY = AT1,ST1\n"}});
    EXPECT_THAT(shown(readList("spi.acd", "DEVICE_FAMILY")),
                ElementsAre("AT1@spi.acd:1:17", "ST1@spi.acd:1:21"));
    EXPECT_THAT(readList("spi.acd", "AT1_DEVICES"), ElementsAre());
}
