#include "DatabaseFixtures.h"

// Where each piece of a value was written.

using std::nullopt;
using testing::ElementsAre;
using namespace std::string_view_literals;

namespace {

[[nodiscard]] std::string shown(const AcdStore::SourceSpan& fragment) {
    return std::to_string(fragment.offset) + ' ' + std::string(fragment.file) + ':' +
           std::to_string(fragment.line) + ':' + std::to_string(fragment.column);
}

/// The spans of a value, as "offset file:line:column".
[[nodiscard]] std::vector<std::string> originsOf(const char* name, const char* key) {
    std::vector<std::string> origins;
    const std::optional<AcdStore::Value> value = AcdStore::value(name, key);
    if (value) {
        for (const AcdStore::SourceSpan& fragment : value->spans) {
            origins.push_back(shown(fragment));
        }
    }
    return origins;
}

} // namespace

class Origins : public DatabaseTest {
protected:
    void read(std::string_view text) { useFiles({{"k.acd", std::string(text)}}); }
};

TEST_F(Origins, AreTheFirstByteOfTheValue) {
    read("\n  KEY  =  a b\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:2:11"));
}

TEST_F(Origins, OfAnEmptyValueAreBehindTheEqualsSign) {
    read("KEY = \nOTHER=\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:6"));
    EXPECT_THAT(originsOf("k", "OTHER"), ElementsAre("0 k.acd:2:7"));
}

TEST_F(Origins, OfAnEmptyContinuedValueAreBehindTheEqualsSign) {
    read("KEY = \\\n\\\n  \\\n\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:6"));
}

TEST_F(Origins, OfAContinuedValueAreThoseOfItsLines) {
    read("KEY = ab \\\r\n\tcd\\\r\n  ef\r\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:7", "2 k.acd:2:2", "4 k.acd:3:3"));
}

TEST_F(Origins, LeaveOutEmptyPieces) {
    read("KEY = ab\\\n\\\n  \\\n cd\\\n\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:7", "2 k.acd:4:2"));
}

TEST_F(Origins, OfAValueThatStartsOnTheNextLineAreThere) {
    read("KEY = \\\n  ab\\\ncd\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:2:3", "2 k.acd:3:1"));
}

TEST_F(Origins, OfAValueWhoseKeyWasSplitAreRight) {
    read("K\\\n EY = ab\\\n cd\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:2:7", "2 k.acd:3:2"));
}

TEST_F(Origins, BehindAContinuedLineCountOn) {
    read("A = a\\\nb\nKEY = c\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:3:7"));
}

TEST_F(Origins, BehindAByteOrderMarkCountFromBehindIt) {
    read("\xEF\xBB\xBFKEY = a\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:7"));
}

TEST_F(Origins, OfAnAppendedValueAreThoseOfItsParts) {
    read("KEY = ab\nX = x\nKEY += cd\\\n e\nKEY+=f\n");
    EXPECT_THAT(originsOf("k", "KEY"),
                ElementsAre("0 k.acd:1:7", "2 k.acd:3:8", "4 k.acd:4:2", "5 k.acd:5:6"));
}

TEST_F(Origins, KeepAnEmptyAppend) {
    read("KEY = ab\nKEY +=\nKEY += c\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:1:7", "2 k.acd:2:7", "2 k.acd:3:8"));
}

TEST_F(Origins, OfAReplacedValueAreThoseOfTheLast) {
    read("KEY = a\nKEY += b\nKEY = c\n");
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 k.acd:3:7"));
}

TEST_F(Origins, NameTheLayer) {
    const TemporaryDirectory directory;
    directory.write("low/k.acd", "A = a\nKEY = b\n");
    directory.write("top/k.acd", "KEY += c\n");
    useDirectories({directory.path("top"), directory.path("low") + "/"});
    const std::string low = directory.path("low/k.acd");
    const std::string top = directory.path("top/k.acd");
    EXPECT_THAT(originsOf("k", "A"), ElementsAre("0 " + low + ":1:5"));
    EXPECT_THAT(originsOf("k", "KEY"), ElementsAre("0 " + low + ":2:7", "1 " + top + ":1:8"));
}

TEST_F(Origins, TellTheSectionsValuesFromTheFamilys) {
    read("KEY = f\nOWN = f\n[A]\nKEY = a\n");
    EXPECT_TRUE(AcdStore::value("A", "KEY")->fromSection);
    EXPECT_FALSE(AcdStore::value("A", "OWN")->fromSection);
    EXPECT_FALSE(AcdStore::value("k", "KEY")->fromSection);
    EXPECT_THAT(originsOf("A", "OWN"), ElementsAre("0 k.acd:2:7"));
}

TEST_F(Origins, OfAnEmptySectionAreTheFamilys) {
    read("OWN = f\n[A]\n[B]\nKEY = b\n");
    EXPECT_FALSE(AcdStore::value("A", "OWN")->fromSection);
    EXPECT_FALSE(AcdStore::value("B", "OWN")->fromSection);
    EXPECT_EQ(AcdStore::value("A", "KEY"), nullopt);
}

TEST_F(Origins, OfAnySingleByteCanBeAsked) {
    read("KEY = ab\\\n  cd\nKEY +=\nKEY += ef\n");
    const AcdStore::Value value = *AcdStore::value("k", "KEY");
    EXPECT_EQ(value.text, "abcdef");
    std::vector<std::string> places;
    for (std::size_t offset = 0; offset != value.text.size(); ++offset) {
        const AcdStore::SourceSpan place = value.at(offset);
        places.push_back(std::to_string(place.line) + ":" + std::to_string(place.column));
    }
    EXPECT_THAT(places, ElementsAre("1:7", "1:8", "2:3", "2:4", "4:8", "4:9"));
}

TEST_F(Origins, OfTheEndOfAValueIsBehindItsLastByte) {
    read("KEY = ab\n");
    EXPECT_EQ(shown(AcdStore::value("k", "KEY")->at(2)), "0 k.acd:1:9");
}

TEST_F(Origins, ThatDoNotExistAreNone) {
    read("KEY = a\n");
    EXPECT_FALSE(AcdStore::value("k", "NONE"));
    EXPECT_FALSE(AcdStore::value("nothing", "KEY"));
    EXPECT_FALSE(AcdStore::value(nullptr, "KEY"));
    EXPECT_FALSE(AcdStore::value("k", nullptr));
    EXPECT_FALSE(AcdStore::value("k", ""));
}

TEST_F(Origins, OfAnEmptyValueExist) {
    read("KEY =\n");
    ASSERT_TRUE(AcdStore::value("k", "KEY"));
    EXPECT_EQ(AcdStore::value("k", "KEY")->text, "");
}
