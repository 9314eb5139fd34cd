// The one value of a device's property: getDeviceStringProperty and getDeviceLongProperty.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

Files family(const std::string& text) {
    return {
        {"base.acd", "DEVICE_SUPPORTED = base,fam1,fam2,spi\nPROGRAM_OPTION_PACKAGE = base,fam1,fam2,spi\n"},
        {"fam1.acd", text},
        {"fam2.acd", "PROPERTY = ONLY2,second\n"},
        {"spi.acd", "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\n"
                    "FLASH1_PROPERTY = DENSITY,4096:NEGATIVE,-7:NAME,flash\nPROPERTY = TABLE,ordinary\n"}};
}

IssuedMessage notFound(const std::string& key, const std::string& device) {
    return info(437, "ACD entry  " + key + " not found for device family " + device + ".\n");
}

} // namespace

TEST(PropertyValues, ADevicesOwnValueHidesItsFamilys) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTY = K,mine\n"));
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "mine");
    EXPECT_STREQ(manager->getDeviceStringProperty("fam1", "K"), "theirs");
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(PropertyValues, WithoutAValueOfItsOwnTheFamilysCounts) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\n"));
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "theirs");
}

TEST(PropertyValues, OfSeveralTheSmallestInByteOrderCounts) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = K,2,B,A:L,3,b,B,\x80:M,2,\x80,z:N,2,ab,a\n"));
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "A");
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "L"), "B");
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "M"), "z");
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "N"), "a");
}

TEST(PropertyValues, AnEmptyValueIsFound) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = K,\n"));
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "");
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "K"), 0);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(PropertyValues, AMissingOneIsReportedAndNullWhileExceptionsAreOff) {
    ManagerFixture manager(family("[dev1]\n"));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceStringProperty("dev1", "K"), nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("K", "dev1")));
}

TEST(PropertyValues, AMissingOneIsReportedThenRaisedWhileExceptionsAreOn) {
    ManagerFixture manager(family("[dev1]\n"));
    expectRaises<DataNotFoundException>(437, [&] { return manager->getDeviceStringProperty("dev1", "K"); });
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("K", "dev1")));
}

TEST(PropertyValues, TheReportNamesTheDeviceAsGiven) {
    ManagerFixture manager(family("[dev1]\n"));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceStringProperty("DEV1_p_q", "k%s"), nullptr);
    EXPECT_EQ(manager->getDeviceStringProperty("fam1", "K"), nullptr);
    EXPECT_EQ(manager->getDeviceStringProperty("nobody%n", "K"), nullptr);
    EXPECT_EQ(manager->getDeviceStringProperty("base", "K"), nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("k%s", "DEV1_p_q"), notFound("K", "fam1"),
                                                notFound("K", "nobody%n"), notFound("K", "base")));
}

TEST(PropertyValues, NullTextsAreEmptyTextsThatTheReportTellsFromThem) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ,unnamed\n"));
    manager->setExceptions(false);
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", nullptr), "unnamed");
    EXPECT_EQ(manager->getDeviceStringProperty(nullptr, nullptr), nullptr);
    EXPECT_EQ(manager->getDeviceStringProperty(nullptr, "K"), nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("(null)", "(null)"), notFound("K", "(null)")));
}

TEST(PropertyValues, KeysAreCaseSensitive) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = K,v\n"));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceStringProperty("dev1", "k"), nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("k", "dev1")));
}

TEST(PropertyValues, TheSecondLookAtTheFamilyReachesTheFamilysOwnFamily) {
    ManagerFixture manager(family("[dev1]\n"));
    manager->addCachedDeviceFamily("fam1", "fam2");
    EXPECT_TRUE(manager->getDeviceStringProperties("dev1", "ONLY2").empty());
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "ONLY2"), "second");
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(PropertyValues, TheSecondLookAtTheFamilySeesBehindAnEmptyValue) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTIES = K,0\n"));
    EXPECT_TRUE(manager->getDeviceStringProperties("dev1", "K").empty());
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "theirs");
}

TEST(PropertyValues, NoValuesAtAllAreMissing) {
    ManagerFixture manager(family("PROPERTIES = K,0\n[dev1]\nPROPERTIES = K,0\n"));
    manager->setExceptions(false);
    for (const char* const name : {"fam1", "dev1", "fam1", "dev1"}) {
        EXPECT_EQ(manager->getDeviceStringProperty(name, "K"), nullptr);
        EXPECT_THAT(manager.messages(), ElementsAre(notFound("K", name)));
    }
}

TEST(PropertyValues, TheFamilyIsLeftAsTheOneResolvedLatest) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTIES = K,0\n"));
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "theirs");
    manager.members().m_partFamily = "something else";
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "theirs");
    EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
}

TEST(PropertyValues, AnSpiFlashAnswersFromItsCatalogue) {
    ManagerFixture manager(family(""));
    EXPECT_STREQ(manager->getDeviceStringProperty("FLASH1", "NAME"), "flash");
    EXPECT_STREQ(manager->getDeviceStringProperty("flash1", "name"), "flash");
    EXPECT_EQ(manager->getDeviceStringProperty("FLASH1", "NAME"),
              manager->getSpiDeviceStringProperty("FLASH1", "NAME"));
}

TEST(PropertyValues, AnSpiFlashAnswersFromItsCatalogueWhateverElseIsLoaded) {
    ManagerFixture manager(family("[FLASH1]\nPROPERTY = NAME,ordinary\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("FLASH1", "NAME")), ElementsAre("ordinary"));
    EXPECT_STREQ(manager->getDeviceStringProperty("FLASH1", "NAME"), "flash");
}

TEST(PropertyValues, AnSpiFlashWithoutThePropertyIsEmptyAndSilent) {
    ManagerFixture manager(family(""));
    EXPECT_STREQ(manager->getDeviceStringProperty("FLASH1", "TABLE"), "");
    EXPECT_EQ(manager->getDeviceLongProperty("FLASH1", "TABLE"), 0);
    EXPECT_THAT(manager.messages(), IsEmpty());
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
}

TEST(PropertyValues, AnSpiFlashIsKnownByItsWholeName) {
    ManagerFixture manager(family(""));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceStringProperty("FLASH1_p", "NAME"), nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("NAME", "FLASH1_p")));
}

TEST(PropertyValues, AnSpiFamilyIsAnSpiFlash) {
    ManagerFixture manager(family(""));
    EXPECT_STREQ(manager->getDeviceStringProperty("at", "NOTHING"), "");
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(PropertyValues, AFailureToLoadPassesThroughWithoutAReport) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = BROKEN\n"));
    expectRaises<DataMismatchException>(1011, [&] { return manager->getDeviceStringProperty("dev1", "K"); });
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(LongProperty, TheValueIsReadAsADecimalNumber) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = A,42:B,-1:C,+7:D,  12x9:E,x:F,0x10:G,007\n"));
    const std::map<const char*, long> expected = {{"A", 42}, {"B", -1}, {"C", 7}, {"D", 12},
                                                  {"E", 0},  {"F", 0},  {"G", 7}};
    for (const auto& [key, value] : expected) {
        EXPECT_EQ(manager->getDeviceLongProperty("dev1", key), value) << key;
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(LongProperty, TheValueStaysWithin32Bits) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = A,2147483647:B,2147483648:C,-2147483648:D,-2147483649:"
                                  "E,99999999999999999999999999\n"));
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "A"), 2147483647L);
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "B"), 2147483647L);
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "C"), -2147483648L);
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "D"), -2147483648L);
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "E"), 2147483647L);
}

TEST(LongProperty, OfSeveralTheSmallestInByteOrderCounts) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = K,2,9,10\n"));
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "K"), 10);
}

TEST(LongProperty, AMissingOneIsReportedAndMinusOneWhileExceptionsAreOff) {
    ManagerFixture manager(family("[dev1]\n"));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "K"), -1);
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("K", "dev1")));
}

TEST(LongProperty, AMissingOneIsReportedThenRaisedWhileExceptionsAreOn) {
    ManagerFixture manager(family("[dev1]\n"));
    expectRaises<DataNotFoundException>(437, [&] { return manager->getDeviceLongProperty("dev1", "K"); });
    EXPECT_THAT(manager.messages(), ElementsAre(notFound("K", "dev1")));
}

TEST(LongProperty, AnSpiFlashAnswersFromItsCatalogue) {
    ManagerFixture manager(family(""));
    EXPECT_EQ(manager->getDeviceLongProperty("FLASH1", "DENSITY"), 4096);
    EXPECT_EQ(manager->getDeviceLongProperty("FLASH1", "NEGATIVE"), -7);
}
