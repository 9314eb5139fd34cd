#include "DatabaseFixtures.h"

#include "database/CaseInsensitiveNameSet.h"

// What a name stands for: a file, a family, a device, or its beginning.

using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_view_literals;

class Names : public DatabaseTest {
protected:
    Names() {
        useFiles({{"base.acd", "KEY = base\n[BaseDevice]\nKEY = in base\n"},
                  {"spi.acd", "KEY = spi\n[SpiDevice]\nKEY = in spi\n"},
                  {"Kestrel.ACD", "KEY = kestrel\n[KS50]\nKEY = ks50\n[under_score]\n"},
                  {"merlin_x.acd", "KEY = merlin_x\n"}});
    }
};

TEST_F(Names, OfFilesAreFiles) {
    EXPECT_THAT(valueOf("spi.acd", "KEY"), Optional("spi"sv));
    EXPECT_STREQ(AcdReader("spi.acd").getPM(), "spi");
}

TEST_F(Names, OfFamiliesAreFamilies) { EXPECT_THAT(valueOf("Kestrel", "KEY"), Optional("kestrel"sv)); }

TEST_F(Names, BaseAndSpiAreFamiliesToo) {
    EXPECT_THAT(familyOf("base"), Optional("base"sv));
    EXPECT_THAT(familyOf("SPI"), Optional("spi"sv));
}

TEST_F(Names, OfDevicesAreDevices) {
    EXPECT_THAT(valueOf("KS50", "KEY"), Optional("ks50"sv));
    EXPECT_STREQ(AcdReader("KS50").getPM(), "Kestrel");
}

TEST_F(Names, DevicesMayStandInBaseAndSpi) {
    EXPECT_THAT(valueOf("BaseDevice", "KEY"), Optional("in base"sv));
    EXPECT_THAT(familyOf("spidevice"), Optional("spi"sv));
}

TEST_F(Names, AreComparedWithoutCase) {
    EXPECT_THAT(familyOf("kESTREL"), Optional("Kestrel"sv));
    EXPECT_THAT(familyOf("kestrel.acd"), Optional("Kestrel"sv));
    EXPECT_THAT(valueOf("ks50", "KEY"), Optional("ks50"sv));
}

TEST_F(Names, TheModuleIsSpeltAsTheFileIs) {
    EXPECT_STREQ(AcdReader("kestrel").getPM(), "Kestrel");
    EXPECT_STREQ(AcdReader("kestrel.acd").getPM(), "Kestrel");
}

TEST_F(Names, AreCutAtTheirFirstUnderscore) {
    EXPECT_THAT(valueOf("KS50_TQ144_7", "KEY"), Optional("ks50"sv));
    EXPECT_THAT(familyOf("kestrel_any"), Optional("Kestrel"sv));
    EXPECT_THAT(familyOf("spi.acd_any"), Optional("spi"sv));
}

TEST_F(Names, AreCutOnlyWhenTheyAreNothingWhole) {
    EXPECT_THAT(valueOf("merlin_x", "KEY"), Optional("merlin_x"sv));
    EXPECT_THAT(familyOf("UNDER_SCORE"), Optional("Kestrel"sv));
    EXPECT_EQ(familyOf("merlin_y"), nullopt);
    EXPECT_EQ(familyOf("under"), nullopt);
}

TEST_F(Names, ThatResolveToNothingGiveAnEmptyBaseModule) {
    const AcdReader reader("nothing");
    EXPECT_STREQ(reader.getPM(), "base");
    EXPECT_EQ(reader.getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0), nullptr);
    EXPECT_EQ(familyOf("nothing"), nullopt);
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Names, ANullNameIsTheEmptyName) {
    EXPECT_EQ(familyOf(nullptr), nullopt);
    EXPECT_STREQ(AcdReader(nullptr).getPM(), "base");
    EXPECT_EQ(valueOf(nullptr, "KEY"), nullopt);
}

TEST_F(Names, ANullNameIsNoneOfThoseThereAre) {
    std::map<std::string, std::string> files;
    for (char name = '!'; name <= '~'; ++name) {
        files[std::string{name} + ".acd"] = std::string{name} + " = x\n";
    }
    useFiles(std::move(files));
    EXPECT_EQ(familyOf("~"), "~");
    EXPECT_EQ(familyOf(nullptr), nullopt);
    EXPECT_STREQ(AcdReader(nullptr).getPM(), "base");
    EXPECT_EQ(AcdStore::value("~", "~")->text, "x");
    EXPECT_EQ(AcdStore::value(nullptr, "~"), nullopt);
    EXPECT_EQ(AcdStore::value("~", nullptr), nullopt);
}

TEST_F(Names, OddOnesFindNothing) {
    for (const char* const name :
         {"", "_", "_KS50", ".acd", "acd", "kestrel.ac", "kestrel.acd.acd", "KS50 ", " KS50", "[KS50]",
          "./kestrel.acd", "../kestrel", "/kestrel", "kestrel/", "*"}) {
        EXPECT_EQ(familyOf(name), nullopt) << name;
    }
}

TEST_F(Names, VeryLongOnesFindNothing) { EXPECT_EQ(familyOf(std::string(1 << 20, 'x').c_str()), nullopt); }

TEST_F(Names, AFileGoesBeforeAFamilyOfThatName) {
    useFiles({{"a.acd", "KEY = a\n"}, {"a.acd.acd", "KEY = a.acd\n"}});
    EXPECT_THAT(familyOf("a.acd"), Optional("a"sv));
    EXPECT_THAT(familyOf("a.acd.acd"), Optional("a.acd"sv));
}

TEST_F(Names, AFamilyGoesBeforeADeviceOfThatName) {
    useFiles({{"a.acd", "[b]\n[c]\n"}, {"b.acd", "KEY = b\n"}});
    EXPECT_THAT(familyOf("b"), Optional("b"sv));
}

TEST_F(Names, AWholeDeviceGoesBeforeTheFamilyItBeginsWith) {
    useFiles({{"a.acd", "[b_c]\n"}, {"b.acd", "KEY = b\n"}});
    EXPECT_THAT(familyOf("b_c"), Optional("a"sv));
    EXPECT_THAT(familyOf("b_d"), Optional("b"sv));
}

TEST_F(Names, OfSeveralFamiliesTheFirstFileNameInByteOrderHasADevice) {
    useFiles({{"b.acd", "[D]\nKEY = b\n"},
              {"a.acd", "[d]\nKEY = a\n"},
              {"a-.acd", "[D]\nKEY = a-\n"},
              {"C.acd", "[E]\nKEY = C\n"},
              {"b2.acd", "[e]\nKEY = b2\n"}});
    EXPECT_THAT(AcdStore::families(), ElementsAre("C", "a-", "a", "b", "b2"));
    EXPECT_THAT(valueOf("D", "KEY"), Optional("a-"sv));
    EXPECT_THAT(valueOf("E", "KEY"), Optional("C"sv));
}

TEST_F(Names, ADeviceMayBeCalledLikeAPath) {
    useFiles({{"a.acd", "[../x/y]\n"}});
    EXPECT_THAT(familyOf("../x/y"), Optional("a"sv));
    EXPECT_EQ(familyOf("../x"), nullopt);
}

// The public list of names

TEST_F(Names, FamiliesAreThoseThatHaveAFile) {
    EXPECT_THAT(AcdStore::families(), ElementsAre("Kestrel", "base", "merlin_x", "spi"));
}

TEST_F(Names, DevicesAreThoseOfTheFamily) {
    EXPECT_THAT(AcdStore::devices("KESTREL"), ElementsAre("KS50", "under_score"));
    EXPECT_THAT(AcdStore::devices("merlin_x"), IsEmpty());
    EXPECT_THAT(AcdStore::devices("nothing"), IsEmpty());
    EXPECT_THAT(AcdStore::devices("KS50"), IsEmpty());
    EXPECT_THAT(AcdStore::devices(""), IsEmpty());
}

// The table behind all that

TEST(NameTables, CountNamesInOrderOfArrival) {
    acd::CaseInsensitiveNameSet table;
    EXPECT_EQ(table.add("b"), 0U);
    EXPECT_EQ(table.add("a"), 1U);
    EXPECT_EQ(table.add("B"), 0U);
    EXPECT_EQ(table.size(), 2U);
    EXPECT_EQ(table[0], "b");
    EXPECT_EQ(table.find("A"), 1U);
    EXPECT_EQ(table.find("c"), acd::CaseInsensitiveNameSet::NONE);
}

TEST(NameTables, AnEmptyOneHasNoNames) {
    const acd::CaseInsensitiveNameSet table;
    EXPECT_EQ(table.find(""), acd::CaseInsensitiveNameSet::NONE);
    EXPECT_EQ(table.find("a"), acd::CaseInsensitiveNameSet::NONE);
}

// So many that some of them hash alike: there are 2^32 hashes.
TEST(NameTables, HoldManyNames) {
    std::vector<std::string> names;
    for (int index = 0; index < 300000; ++index) {
        names.push_back("Name" + std::to_string(index));
    }
    acd::CaseInsensitiveNameSet table;
    for (std::uint32_t index = 0; index != names.size(); ++index) {
        ASSERT_EQ(table.add(names[index]), index);
    }
    for (std::uint32_t index = 0; index != names.size(); ++index) {
        ASSERT_EQ(table.find("nAME" + std::to_string(index)), index);
    }
    EXPECT_EQ(table.find("name300000"), acd::CaseInsensitiveNameSet::NONE);
}

TEST(NameTables, TellApartWhatOnlyLooksLikeCase) {
    acd::CaseInsensitiveNameSet table;
    table.add("@[`{\xC0");
    for (const char* const other : {"`[`{\xC0", "@{`{\xC0", "@[@{\xC0", "@[`[\xC0", "@[`{\xE0", "@[`{"}) {
        EXPECT_EQ(table.find(other), acd::CaseInsensitiveNameSet::NONE) << other;
    }
}
