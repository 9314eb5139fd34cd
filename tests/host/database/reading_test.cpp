#include "DatabaseFixtures.h"
#include "HostileTexts.h"

#include <memory>

// How a value is split into items and fields, whatever the order in which they are asked for.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsNull;
using testing::StrEq;

class Reading : public DatabaseTest {
protected:
    /// An accessor of a database where KEY has this value.
    PM_DEVKEY& accessorOf(const std::string& value) {
        useFiles({{"kestrel.acd", "KEY = " + value + "\nOTHER = o1,o2:o3\n"}});
        return *AcdReader("kestrel").getDevkey();
    }
};

TEST_F(Reading, SplitsIntoItems) {
    EXPECT_THAT(itemsOf(accessorOf("a,b,c"), "KEY", ","), ElementsAre("a", "b", "c"));
}

TEST_F(Reading, AValueWithoutSeparatorIsOneItem) {
    EXPECT_THAT(itemsOf(accessorOf("abc"), "KEY", ","), ElementsAre("abc"));
}

TEST_F(Reading, CountsEmptyItemsFirstAndLastIncluded) {
    EXPECT_THAT(itemsOf(accessorOf(",a,,b,"), "KEY", ","), ElementsAre("", "a", "", "b", ""));
}

TEST_F(Reading, ASeparatorAloneMakesTwoEmptyItems) {
    EXPECT_THAT(itemsOf(accessorOf(","), "KEY", ","), ElementsAre("", ""));
}

TEST_F(Reading, AnEmptyValueHasNoItems) { EXPECT_THAT(itemsOf(accessorOf(""), "KEY", ","), IsEmpty()); }

TEST_F(Reading, AnEmptyValueHasNoItemsEvenWhole) {
    EXPECT_THAT(accessorOf("").getstringbykey("KEY", nullptr, 0, nullptr, 0), IsNull());
    EXPECT_THAT(accessorOf("").getstringbykey("KEY", ":", 0, ",", 0), IsNull());
}

TEST_F(Reading, TrimsNothing) {
    EXPECT_THAT(itemsOf(accessorOf("a , b"), "KEY", ","), ElementsAre("a ", " b"));
}

TEST_F(Reading, SplitsAnItemIntoFields) {
    PM_DEVKEY& accessor = accessorOf("a,b:c,d,e");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 0, ",", 1), "b");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 2), "e");
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 0, ",", 2), IsNull());
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 2, ",", 0), IsNull());
}

TEST_F(Reading, AnEmptyItemHasOneEmptyField) {
    PM_DEVKEY& accessor = accessorOf("a::b");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 0), "");
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 1, ",", 1), IsNull());
}

TEST_F(Reading, CountsEmptyFields) {
    PM_DEVKEY& accessor = accessorOf("x:,a,");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 0), "");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 1), "a");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 2), "");
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 1, ",", 3), IsNull());
}

TEST_F(Reading, WithoutSubSeparatorIgnoresTheSubIndex) {
    EXPECT_STREQ(accessorOf("a,b:c").getstringbykey("KEY", ":", 0, nullptr, -7), "a,b");
}

TEST_F(Reading, WithoutSeparatorTheWholeValueIsItemZero) {
    PM_DEVKEY& accessor = accessorOf("a,b");
    for (const char* const separator : {static_cast<const char*>(nullptr), ""}) {
        EXPECT_STREQ(accessor.getstringbykey("KEY", separator, 0, nullptr, 0), "a,b");
        EXPECT_THAT(accessor.getstringbykey("KEY", separator, 1, nullptr, 0), IsNull());
        EXPECT_STREQ(accessor.getstringbykey("KEY", separator, 0, ",", 1), "b");
    }
}

TEST_F(Reading, AnEmptySubSeparatorSplitsNothing) {
    PM_DEVKEY& accessor = accessorOf("a,b:c");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 0, "", 0), "a,b");
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 0, "", 1), IsNull());
}

TEST_F(Reading, SeparatorsMayHaveSeveralBytes) {
    EXPECT_THAT(itemsOf(accessorOf("a--b---c"), "KEY", "--"), ElementsAre("a", "b", "-c"));
    EXPECT_THAT(itemsOf(accessorOf("aaaaa"), "KEY", "aa"), ElementsAre("", "", "a"));
}

TEST_F(Reading, TheSameSeparatorTwiceFindsOneField) {
    PM_DEVKEY& accessor = accessorOf("a,b");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, ",", 0), "b");
    EXPECT_THAT(accessor.getstringbykey("KEY", ",", 1, ",", 1), IsNull());
}

TEST_F(Reading, ASubSeparatorDoesNotReachBeyondItsItem) {
    PM_DEVKEY& accessor = accessorOf("xa,:b");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",:", 0, "a,", 0), "xa");
    EXPECT_THAT(accessor.getstringbykey("KEY", ",:", 0, "a,", 1), IsNull());
}

TEST_F(Reading, ANullKeyIsNone) {
    EXPECT_THAT(accessorOf("a").getstringbykey(nullptr, ",", 0, nullptr, 0), IsNull());
}

TEST_F(Reading, AnEmptyKeyIsNone) {
    EXPECT_THAT(accessorOf("a").getstringbykey("", ",", 0, nullptr, 0), IsNull());
}

TEST_F(Reading, AnUnknownKeyIsNone) {
    PM_DEVKEY& accessor = accessorOf("a");
    EXPECT_THAT(accessor.getstringbykey("NONE", ",", 0, nullptr, 0), IsNull());
    EXPECT_THAT(accessor.getstringbykey("NONE", ",", 0, nullptr, 0), IsNull());
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), "a");
}

TEST_F(Reading, NegativeIndexesAreNone) {
    PM_DEVKEY& accessor = accessorOf("a,b");
    EXPECT_THAT(accessor.getstringbykey("KEY", ",", -1, nullptr, 0), IsNull());
    EXPECT_THAT(accessor.getstringbykey("KEY", ",", -32768, nullptr, 0), IsNull());
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 0, ",", -1), IsNull());
}

TEST_F(Reading, IndexesPastTheEndAreNone) {
    PM_DEVKEY& accessor = accessorOf("a,b");
    EXPECT_THAT(accessor.getstringbykey("KEY", ",", 2, nullptr, 0), IsNull());
    EXPECT_THAT(accessor.getstringbykey("KEY", ",", 32767, nullptr, 0), IsNull());
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, nullptr, 0), "b");
}

TEST_F(Reading, TheLastIndexIsReached) {
    std::string value;
    for (int item = 0; item < 32769; ++item) {
        value += (item == 0 ? "" : ",") + std::to_string(item);
    }
    EXPECT_STREQ(accessorOf(value).getstringbykey("KEY", ",", 32767, nullptr, 0), "32767");
}

TEST_F(Reading, GoesBackwardsToo) {
    PM_DEVKEY& accessor = accessorOf("a,b,c");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 2, nullptr, 0), "c");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), "a");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), "a");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, nullptr, 0), "b");
}

TEST_F(Reading, AMissThenTheSameItemsFieldsAreThoseOfTheItem) {
    PM_DEVKEY& accessor = accessorOf("a,b:c,d");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 0, ",", 1), "b");
    EXPECT_THAT(accessor.getstringbykey("KEY", ":", 9, ",", 0), IsNull());
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 1), "d");
}

TEST_F(Reading, InAnyOrderGivesWhatPlainSplittingGives) {
    const std::vector<std::vector<std::string>> records = {{"a", "b", "c"}, {""}, {"", "d"}, {"e"}};
    PM_DEVKEY& accessor = accessorOf("a,b,c::,d:e");
    HostileTexts random(7);
    for (int round = 0; round < 20000; ++round) {
        const unsigned item = random.pick(6);
        const unsigned field = random.pick(5);
        if (random.pick(10) == 0) {
            EXPECT_STREQ(accessor.getstringbykey("OTHER", ",", 1, nullptr, 0), "o2:o3");
        }
        const char* const text =
            accessor.getstringbykey("KEY", ":", static_cast<short>(item), ",", static_cast<short>(field));
        if (item < records.size() && field < records[item].size()) {
            ASSERT_THAT(text, StrEq(records[item][field])) << item << ' ' << field;
        } else {
            ASSERT_THAT(text, IsNull()) << item << ' ' << field;
        }
    }
}

TEST_F(Reading, SwitchesBetweenSeparators) {
    PM_DEVKEY& accessor = accessorOf("a,b:c,d");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, nullptr, 0), "b:c");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, nullptr, 0), "c,d");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, ":", 1), "c");
    EXPECT_STREQ(accessor.getstringbykey("KEY", ":", 1, ",", 1), "d");
}

// A list so long that a walk from its start for each item would take hours: some 32 MiB of bytes at which every
// search for the separator stumbles.
TEST_F(Reading, TheLongestListCostsTimeLinearInItsLength) {
    std::string half;
    std::vector<std::string> items;
    for (int item = 0; item < 16384; ++item) {
        items.push_back(std::string(1000, 'a') + std::to_string(item));
        half += (item == 0 ? "" : "ab") + items.back();
    }
    useFiles({{"kestrel.acd", "KEY = " + half + "\nKEY += ab" + half + "\n"}});
    PM_DEVKEY& accessor = *AcdReader("kestrel").getDevkey();
    for (int item = 0; item < 32768; ++item) {
        ASSERT_EQ(accessor.getstringbykey("KEY", "ab", static_cast<short>(item), nullptr, 0),
                  items[static_cast<std::size_t>(item % 16384)]);
    }
}

TEST_F(Reading, TheLongestRecordCostsTimeLinearInItsLength) {
    std::string half;
    for (int field = 0; field < 16384; ++field) {
        half += std::string(1000, 'a') + std::to_string(field) + (field == 16383 ? "" : "ab");
    }
    useFiles({{"kestrel.acd", "KEY = x:" + half + "\nKEY += ab" + half + "\n"}});
    PM_DEVKEY& accessor = *AcdReader("kestrel").getDevkey();
    for (int field = 0; field < 32768; ++field) {
        ASSERT_EQ(accessor.getstringbykey("KEY", ":", 1, "ab", static_cast<short>(field)),
                  std::string(1000, 'a') + std::to_string(field % 16384));
    }
}

TEST_F(Reading, ManyRecordsOfFieldsCostTimeLinearInTheirLength) {
    std::string value;
    for (int record = 0; record < 30000; ++record) {
        value += (record == 0 ? "" : ":") + std::string(250, 'a') + "," + std::to_string(record) + ",b";
    }
    PM_DEVKEY& accessor = accessorOf(value);
    for (int record = 0; record < 30000; ++record) {
        const auto index = static_cast<short>(record);
        ASSERT_EQ(accessor.getstringbykey("KEY", ":", index, ",", 0), std::string(250, 'a'));
        ASSERT_EQ(accessor.getstringbykey("KEY", ":", index, ",", 1), std::to_string(record));
        ASSERT_STREQ(accessor.getstringbykey("KEY", ":", index, ",", 2), "b");
        ASSERT_EQ(accessor.getstringbykey("KEY", ":", index, ",", 3), nullptr);
    }
}

// Accessors

class Accessors : public DatabaseTest {};

TEST_F(Accessors, OutliveTheirReader) {
    useFiles({{"base.acd", "KEY = a\n"}});
    auto reader = std::make_unique<AcdReader>();
    PM_DEVKEY* const accessor = reader->getDevkey();
    reader.reset();
    EXPECT_STREQ(accessor->getstringbykey("KEY", ",", 0, nullptr, 0), "a");
}

TEST_F(Accessors, OfOneDatabaseAreOne) {
    useFiles({{"kestrel.acd", "[A]\n[B]\n"}});
    EXPECT_EQ(AcdReader("A").getDevkey(), AcdReader("a_PKG").getDevkey());
    EXPECT_EQ(AcdReader("kestrel").getDevkey(), AcdReader("KESTREL.ACD").getDevkey());
    EXPECT_NE(AcdReader("A").getDevkey(), AcdReader("B").getDevkey());
    EXPECT_NE(AcdReader("A").getDevkey(), AcdReader("kestrel").getDevkey());
}

TEST_F(Accessors, OfSeveralSectionsDoNotDisturbEachOther) {
    useFiles({{"kestrel.acd", "[A]\nKEY = a\n[B]\nKEY = b\n"}});
    const char* const a = AcdReader("A").getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0);
    const char* const b = AcdReader("B").getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0);
    EXPECT_STREQ(a, "a");
    EXPECT_STREQ(b, "b");
}

TEST_F(Accessors, OfAFileReadTheFamilysKeys) {
    useFiles({{"SPI.acd", "KEY = a\n[A]\nKEY = b\n"}});
    const PicConfig configuration("base", 1, PM_PARTNAME_BINDING::BY_NAME);
    PM_DEVKEY accessor("spi.ACD", configuration, 1, 1, 1);
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), "a");
}

TEST_F(Accessors, OfAMissingFileReadNothing) {
    useFiles({{"kestrel.acd", "KEY = a\n"}});
    const PicConfig configuration("base", 1, PM_PARTNAME_BINDING::BY_NAME);
    for (const char* const file : {"spi.acd", "kestrel", "", static_cast<const char*>(nullptr)}) {
        PM_DEVKEY accessor(file, configuration, 1, 1, 1);
        EXPECT_THAT(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), IsNull());
    }
    EXPECT_THAT(messages.take(), IsEmpty());
}
