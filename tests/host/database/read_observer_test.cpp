#include "DatabaseFixtures.h"

// What the observer of reads is given.

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

[[nodiscard]] std::string shown(const AcdStore::SourceLocation& location) {
    return location.file.empty() ? "nowhere"
                                 : std::string(location.file) + ':' + std::to_string(location.line) + ':' +
                                       std::to_string(location.column);
}

/// A read whose texts live on.
struct RecordedRead {
    std::string family, device, key, separator, subSeparator, text, value, itemText, layer;
    std::string location, itemLocation;
    short item = 0;
    short field = 0;
    bool isSplit = false;
    bool isFound = false;
    bool fromSection = false;

    explicit RecordedRead(const AcdStore::Read& read)
        : family(read.family), device(read.device), key(read.key), separator(read.separator),
          value(read.value), itemText(read.itemText), layer(read.location.layer),
          location(shown(read.location)), itemLocation(shown(read.itemLocation)), item(read.item),
          field(read.field), isSplit(read.subSeparator != nullptr), isFound(read.text != nullptr),
          fromSection(read.fromSection) {
        if (isSplit) {
            subSeparator = read.subSeparator;
        }
        if (isFound) {
            text = read.text;
        }
    }
};

class ReadObserver : public DatabaseTest {
protected:
    ReadObserver() {
        AcdStore::setReadObserver([this](const AcdStore::Read& read) { reads.emplace_back(read); });
    }
    ~ReadObserver() override { AcdStore::setReadObserver({}); }

    /// Reads from the family "k" whose file holds `text`, by the name of the family or one of its devices.
    const RecordedRead& read(std::string_view text, const char* name, const char* key, const char* separator,
                             short item, const char* subSeparator = nullptr, short field = 0) {
        useFiles({{"K.acd", std::string(text)}});
        result = AcdReader(name).getDevkey()->getstringbykey(key, separator, item, subSeparator, field);
        EXPECT_EQ(reads.size(), 1U);
        return reads.back();
    }

    std::vector<RecordedRead> reads;
    const char* result = nullptr;
};

} // namespace

TEST_F(ReadObserver, IsGivenFamilyKeyItemFieldTextAndLocation) {
    const RecordedRead& seen = read("A = a\nLIST = x,y:zz,w\n", "k", "LIST", ":", 1, ",", 1);
    EXPECT_STREQ(result, "w");
    EXPECT_EQ(seen.family, "K");
    EXPECT_EQ(seen.device, "");
    EXPECT_EQ(seen.key, "LIST");
    EXPECT_EQ(seen.separator, ":");
    EXPECT_EQ(seen.item, 1);
    EXPECT_EQ(seen.subSeparator, ",");
    EXPECT_EQ(seen.field, 1);
    EXPECT_EQ(seen.text, "w");
    EXPECT_EQ(seen.location, "K.acd:2:15");
    EXPECT_EQ(seen.layer, "");
    EXPECT_EQ(seen.value, "x,y:zz,w");
    EXPECT_EQ(seen.itemText, "zz,w");
    EXPECT_EQ(seen.itemLocation, "K.acd:2:12");
    EXPECT_FALSE(seen.fromSection);
}

TEST_F(ReadObserver, IsGivenAWholeItemWithoutFields) {
    const RecordedRead& seen = read("LIST = x,yy\n", "k", "LIST", ",", 1);
    EXPECT_FALSE(seen.isSplit);
    EXPECT_EQ(seen.text, "yy");
    EXPECT_EQ(seen.location, "K.acd:1:10");
    EXPECT_EQ(seen.itemLocation, "K.acd:1:10");
}

TEST_F(ReadObserver, IsGivenAWholeValueWithoutSeparator) {
    const RecordedRead& seen = read("LIST = x,yy\n", "k", "LIST", nullptr, 0);
    EXPECT_EQ(seen.separator, "");
    EXPECT_EQ(seen.text, "x,yy");
}

TEST_F(ReadObserver, SeesTheFieldOfAnEarlierReadForgottenInAWholeItem) {
    useFiles({{"K.acd", "LIST = a,b:c,d\n"}});
    PM_DEVKEY& accessor = *AcdReader("k").getDevkey();
    ASSERT_STREQ(accessor.getstringbykey("LIST", ":", 1, ",", 1), "d");
    ASSERT_STREQ(accessor.getstringbykey("LIST", ":", 1, nullptr, 0), "c,d");
    EXPECT_EQ(reads.back().location, "K.acd:1:12");
}

TEST_F(ReadObserver, IsGivenTheDeviceAndWhoseKeyItIs) {
    const RecordedRead& own = read("A = a\n[Ks50]\nB = b\n", "KS50", "B", nullptr, 0);
    EXPECT_EQ(own.device, "Ks50");
    EXPECT_TRUE(own.fromSection);
    EXPECT_EQ(own.location, "K.acd:3:5");
    reads.clear();
    const RecordedRead& familys = read("A = a\n[Ks50]\nB = b\n", "KS50", "A", nullptr, 0);
    EXPECT_EQ(familys.device, "Ks50");
    EXPECT_FALSE(familys.fromSection);
    EXPECT_EQ(familys.location, "K.acd:1:5");
}

TEST_F(ReadObserver, SeesAMissingKey) {
    const RecordedRead& seen = read("A = a\n", "k", "B", ",", 0, ":", 2);
    EXPECT_EQ(seen.family, "K");
    EXPECT_EQ(seen.key, "B");
    EXPECT_FALSE(seen.isFound);
    EXPECT_EQ(seen.location, "nowhere");
    EXPECT_EQ(seen.itemLocation, "nowhere");
    EXPECT_EQ(seen.value, "");
}

TEST_F(ReadObserver, SeesAMissingItem) {
    const RecordedRead& seen = read("A = a,b\n", "k", "A", ",", 2);
    EXPECT_FALSE(seen.isFound);
    EXPECT_EQ(seen.item, 2);
    EXPECT_EQ(seen.value, "a,b");
    EXPECT_EQ(seen.location, "nowhere");
    EXPECT_EQ(seen.itemLocation, "nowhere");
}

TEST_F(ReadObserver, SeesAMissingFieldAndWhereItsItemIs) {
    const RecordedRead& seen = read("A = a:b,c\n", "k", "A", ":", 1, ",", 2);
    EXPECT_FALSE(seen.isFound);
    EXPECT_EQ(seen.field, 2);
    EXPECT_EQ(seen.location, "nowhere");
    EXPECT_EQ(seen.itemText, "b,c");
    EXPECT_EQ(seen.itemLocation, "K.acd:1:7");
}

TEST_F(ReadObserver, SeesIndexesThatNoListHas) {
    EXPECT_FALSE(read("A = a\n", "k", "A", ",", -1).isFound);
    EXPECT_EQ(reads.back().item, -1);
    EXPECT_EQ(reads.back().itemLocation, "nowhere");
}

TEST_F(ReadObserver, SeesReadsOfTheEmptyValueAndOfNoKey) {
    EXPECT_FALSE(read("A =\n", "k", "A", ",", 0).isFound);
    EXPECT_EQ(reads.back().itemLocation, "nowhere");
    reads.clear();
    EXPECT_FALSE(read("A = a\n", "k", nullptr, ",", 0).isFound);
    EXPECT_EQ(reads.back().key, "");
}

TEST_F(ReadObserver, SeesReadsOfTheEmptyDatabase) {
    const RecordedRead& seen = read("A = a\n", "unknown", "A", ",", 0);
    EXPECT_EQ(seen.family, "");
    EXPECT_FALSE(seen.isFound);
}

TEST_F(ReadObserver, IsGivenLocationsInContinuedAndAppendedValues) {
    const RecordedRead& seen = read("LIST = a,\\\n  b\nLIST += ,c\n", "k", "LIST", ",", 1);
    EXPECT_EQ(seen.location, "K.acd:2:3");
    reads.clear();
    EXPECT_EQ(read("LIST = a,\\\n  b\nLIST += ,c\n", "k", "LIST", ",", 2).location, "K.acd:3:10");
}

TEST_F(ReadObserver, IsGivenTheLayer) {
    const TemporaryDirectory directory;
    directory.write("low/k.acd", "KEY = b\n");
    directory.write("top/k.acd", "KEY += ,c\n");
    useDirectories({directory.path("top"), directory.path("low")});
    static_cast<void>(AcdReader("k").getDevkey()->getstringbykey("KEY", ",", 1, nullptr, 0));
    EXPECT_EQ(reads.back().text, "c");
    EXPECT_EQ(reads.back().layer, directory.path("top"));
    EXPECT_EQ(reads.back().location, directory.path("top/k.acd") + ":1:9");
    EXPECT_EQ(reads.back().family, "k");
}

TEST_F(ReadObserver, SeesEveryReadInOrder) {
    useFiles({{"k.acd", "LIST = a,b\n"}});
    static_cast<void>(itemsOf(*AcdReader("k").getDevkey(), "LIST", ","));
    std::vector<std::string> texts;
    for (const RecordedRead& read : reads) {
        texts.push_back(read.isFound ? read.text : "missing");
    }
    EXPECT_THAT(texts, ElementsAre("a", "b", "missing"));
}

TEST_F(ReadObserver, IsReturnedWhenItIsReplaced) {
    int calls = 0;
    const AcdStore::ReadObserver former = AcdStore::setReadObserver([&](const AcdStore::Read&) { ++calls; });
    ASSERT_TRUE(former);
    useFiles({{"k.acd", "A = a\n"}});
    static_cast<void>(valueOf("k", "A"));
    EXPECT_EQ(calls, 1);
    EXPECT_THAT(reads, IsEmpty());
    AcdStore::setReadObserver(former);
    static_cast<void>(valueOf("k", "A"));
    EXPECT_EQ(calls, 1);
    EXPECT_EQ(reads.size(), 1U);
}

TEST_F(ReadObserver, IsEndedByAnEmptyOne) {
    AcdStore::setReadObserver({});
    useFiles({{"k.acd", "A = a\n"}});
    static_cast<void>(valueOf("k", "A"));
    EXPECT_THAT(reads, IsEmpty());
    EXPECT_FALSE(AcdStore::setReadObserver({}));
}

TEST_F(ReadObserver, MayReplaceItself) {
    AcdStore::setReadObserver([text = std::string(64, 'x'), this](const AcdStore::Read& read) {
        AcdStore::setReadObserver({});
        EXPECT_EQ(text, std::string(64, 'x'));
        reads.emplace_back(read);
    });
    useFiles({{"k.acd", "A = a\n"}});
    static_cast<void>(valueOf("k", "A"));
    static_cast<void>(valueOf("k", "A"));
    EXPECT_EQ(reads.size(), 1U);
}

TEST_F(ReadObserver, DoesNotSeeItsOwnReads) {
    AcdStore::setReadObserver([this](const AcdStore::Read& read) {
        reads.emplace_back(read);
        EXPECT_EQ(valueOf("other", "B"), "b");
    });
    useFiles({{"k.acd", "A = a\n"}, {"other.acd", "B = b\n"}});
    EXPECT_EQ(valueOf("k", "A"), "a");
    EXPECT_EQ(valueOf("k", "A"), "a");
    EXPECT_EQ(reads.size(), 2U);
}

TEST_F(ReadObserver, ThrowsToTheReader) {
    AcdStore::setReadObserver([](const AcdStore::Read&) { throw std::runtime_error("enough"); });
    useFiles({{"k.acd", "A = a\n"}});
    EXPECT_THROW(static_cast<void>(valueOf("k", "A")), std::runtime_error);
    EXPECT_THROW(static_cast<void>(valueOf("k", "A")), std::runtime_error);
}

TEST_F(ReadObserver, SeesAccessorsOfFiles) {
    useFiles({{"spi.acd", "A = a\n"}});
    const PicConfig configuration("spi", 1, PM_PARTNAME_BINDING::BY_NAME);
    PM_DEVKEY accessor("spi.acd", configuration, 0, 0, 0);
    ASSERT_STREQ(accessor.getstringbykey("A", ",", 0, nullptr, 0), "a");
    ASSERT_EQ(reads.size(), 1U);
    EXPECT_EQ(reads.back().family, "spi");
}
