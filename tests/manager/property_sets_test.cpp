// The values of a device's properties: getDeviceStringProperties and getDeviceBoolProperty.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// A database in which nothing fails to load: "fam1" with this text, and "base" for unknown devices.
Files family(const std::string& text) {
    return {
        {"base.acd", "DEVICE_SUPPORTED = base,fam1,fam2,spi\nPROGRAM_OPTION_PACKAGE = base,fam1,fam2,spi\n"},
        {"fam1.acd", text},
        {"fam2.acd", "PROPERTY = ONLY2,second\n"}};
}

} // namespace

TEST(PropertySets, ADevicesOwnValueHidesItsFamilys) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTY = K,mine\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")), ElementsAre("mine"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("fam1", "K")), ElementsAre("theirs"));
}

TEST(PropertySets, WithoutAValueOfItsOwnTheFamilysCounts) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTY = L,mine\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")), ElementsAre("theirs"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("fam1", "L")), IsEmpty());
}

TEST(PropertySets, ValuesAreInByteOrder) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = K,5,b,\xff,B,ab,a\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")),
                ElementsAre("B", "a", "ab", "b", "\xff"));
}

TEST(PropertySets, NothingFoundIsTheSharedEmptySetAndSilent) {
    ManagerFixture manager(family("[dev1]\n"));
    EXPECT_EQ(&manager->getDeviceStringProperties("dev1", "K"), &manager.members().m_operationOptions);
    EXPECT_EQ(&manager->getDeviceStringProperties("fam1", "K"), &manager.members().m_operationOptions);
    EXPECT_EQ(&manager->getDeviceStringProperties("nobody", "K"), &manager.members().m_operationOptions);
    EXPECT_TRUE(manager.members().m_operationOptions.empty());
    EXPECT_THAT(manager.messages(), IsEmpty());
}

// So many of one length that several share each place of the table.
TEST(PropertySets, NamesThatMeetInTheTableStayApart) {
    const auto number = [](int index) { return std::to_string(1000 + index); };
    constexpr int COUNT = 400;
    std::string text = "[dev1]\n[dev10]\nPROPERTY = ";
    for (int index = 0; index < COUNT; ++index) {
        text += (index == 0 ? "P" : ":P") + number(index) + ',' + number(index);
    }
    ManagerFixture manager(family(text + '\n'));
    const auto values = [&](const char* device, const std::string& key) {
        return texts(manager->getDeviceStringProperties(device, key.c_str()));
    };
    for (int index = 0; index < COUNT; ++index) {
        EXPECT_THAT(values("dev10", 'P' + number(index)), ElementsAre(number(index)));
        EXPECT_THAT(values("dev10", 'Q' + number(index)), IsEmpty());
        // As long as the first, and begun alike, but divided one byte earlier.
        EXPECT_THAT(values("dev1", "0P" + number(index)), IsEmpty());
    }
}

// Device, underscore and key of each have the same checksum, by which they are looked up.
TEST(PropertySets, NamesOfTheSameChecksumStayApart) {
    ManagerFixture manager(family("[dev1]\n[dev10]\nPROPERTY = PROPERTY1,stored\n[dev20]\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev10", "PROPERTY1")), ElementsAre("stored"));
    const std::pair<const char*, const char*> others[] = {
        {"dev10", "UIHZAFBK"},   // shorter
        {"dev10", "PNPTQAIZB"},  // of the same device
        {"dev20", "PBGVSAGRC"},  // of another, just as long
        {"dev1", "PRVQHVAINX"}}; // just as long too, but divided one byte earlier
    for (const auto& [device, key] : others) {
        const std::string joined = std::string(device) + '_' + key;
        ASSERT_EQ(StringBase(joined.c_str()).CRC32(), StringBase("dev10_PROPERTY1").CRC32());
        EXPECT_THAT(texts(manager->getDeviceStringProperties(device, key)), IsEmpty());
    }
}

TEST(PropertySets, PropertiesOfTheSameChecksumAreBothKept) {
    ManagerFixture manager(family("[dev10]\nPROPERTY = PROPERTY1,first:PNPTQAIZB,second\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev10", "PROPERTY1")), ElementsAre("first"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev10", "PNPTQAIZB")), ElementsAre("second"));
}

TEST(PropertySets, KeysAreCaseSensitive) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = K,v\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "k")), IsEmpty());
}

TEST(PropertySets, TheNameIsNeitherCutNorTurnedToAnotherCase) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = K,v\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1_p", "K")), ElementsAre("v"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("DEV1", "K")), ElementsAre("v"));
    EXPECT_THAT(texts(manager.members().m_loadedFamilies), ElementsAre("DEV1", "dev1_p", "fam1"));
}

TEST(PropertySets, TheWholeNameFindsItsOwnDevice) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = K,v\n[dev1_p]\nPROPERTY = K,packaged\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1_p", "K")), ElementsAre("packaged"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1_q", "K")), ElementsAre("v"));
}

TEST(PropertySets, AnEmptyValueOfItsOwnHidesTheFamilys) {
    ManagerFixture manager(family("PROPERTY = K,theirs\n[dev1]\nPROPERTIES = K,0\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")), IsEmpty());
    EXPECT_NE(&manager->getDeviceStringProperties("dev1", "K"), &manager.members().m_operationOptions);
}

TEST(PropertySets, NullTextsAreEmptyTexts) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ,unnamed\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", nullptr)), ElementsAre("unnamed"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "")), ElementsAre("unnamed"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties(nullptr, "K")), IsEmpty());
    EXPECT_THAT(texts(manager->getDeviceStringProperties(nullptr, nullptr)), IsEmpty());
}

TEST(PropertySets, DeviceAndKeyAreJoinedByAnUnderscore) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = A_B,v\n"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "A_B")), ElementsAre("v"));
    EXPECT_TRUE((*manager.members().m_deviceProperties.begin()).key == "dev1_A_B");
}

TEST(PropertySets, AnUnknownDeviceIsAnsweredFromTheBaseDatabase) {
    auto files = family("");
    files["base.acd"] += "PROPERTY = K,base value\n";
    ManagerFixture manager(files);
    EXPECT_THAT(texts(manager->getDeviceStringProperties("nobody", "K")), ElementsAre("base value"));
}

TEST(PropertySets, OnlyOneStepUpIsTaken) {
    ManagerFixture manager(family("[dev1]\n"));
    manager->addCachedDeviceFamily("fam1", "fam2");
    EXPECT_THAT(texts(manager->getDeviceStringProperties("fam1", "ONLY2")), ElementsAre("second"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "ONLY2")), IsEmpty());
}

TEST(PropertySets, AFamilyThatTheCacheNamesIsLoaded) {
    ManagerFixture manager(family(""));
    manager->addCachedDeviceFamily("nobody", "fam2");
    EXPECT_THAT(texts(manager->getDeviceStringProperties("nobody", "ONLY2")), ElementsAre("second"));
    EXPECT_TRUE(holds(manager.members().m_loadedFamilies, "fam2"));
}

TEST(PropertySets, LoadingIsDecidedByTheLoadedProperties) {
    ManagerFixture manager(family("PROPERTY = K,v\n[dev1]\nPROPERTY = K,w\n"));
    manager.members().m_loadedFamilies.insert(StringBase("dev1"));
    manager.members().m_loadedFamilies.insert(StringBase("fam1"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")), IsEmpty());
    EXPECT_TRUE(manager.members().m_deviceProperties.empty());
}

TEST(PropertySets, AFailureToLoadPassesThroughAndIsNotTriedAgain) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = GOOD,v:BROKEN\n"));
    expectRaises<DataMismatchException>(
        1011, [&] { return manager->getDeviceStringProperties("dev1", "GOOD").size(); });
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "GOOD")), ElementsAre("v"));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "BROKEN")), IsEmpty());
}

TEST(PropertySets, ASeveralValuedPropertyCutShortIsRaised) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = K,2,only\n"));
    expectRaises<DataMismatchException>(
        1051, [&] { return manager->getDeviceStringProperties("dev1", "K").size(); });
}

TEST(PropertySets, MissingValuesAreEmptyTextsWhileExceptionsAreOff) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = BROKEN\nPROPERTIES = K,2,only\n"));
    manager->setExceptions(false);
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "BROKEN")), ElementsAre(""));
    EXPECT_THAT(texts(manager->getDeviceStringProperties("dev1", "K")), ElementsAre("", "only"));
}

TEST(PropertySets, AnSpiFlashIsLookedUpLikeAnyOtherName) {
    auto files = family("");
    files["spi.acd"] =
        "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\nFLASH1_PROPERTY = K,catalogue\nPROPERTY = K,table\n";
    ManagerFixture manager(files);
    EXPECT_THAT(texts(manager->getDeviceStringProperties("FLASH1", "K")), ElementsAre("table"));
}

TEST(BoolProperty, OnlyTheExactTextIsTrue) {
    ManagerFixture manager(
        family("[dev1]\nPROPERTIES = A,1,TRUE:B,1,true:C,1,True:D,1,TRUE :E,1,1:F,0:G,1,\n"));
    EXPECT_TRUE(manager->getDeviceBoolProperty("dev1", "A"));
    for (const char* key : {"B", "C", "D", "E", "F", "G"}) {
        EXPECT_FALSE(manager->getDeviceBoolProperty("dev1", key)) << key;
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(BoolProperty, AnyOfSeveralValuesMayBeTrue) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = K,3,FALSE,TRUE,zzz\n"));
    EXPECT_TRUE(manager->getDeviceBoolProperty("dev1", "K"));
}

TEST(BoolProperty, AMissingPropertyIsSilentlyFalse) {
    ManagerFixture manager(family("[dev1]\n"));
    EXPECT_FALSE(manager->getDeviceBoolProperty("dev1", "K"));
    EXPECT_FALSE(manager->getDeviceBoolProperty("nobody", "K"));
    EXPECT_FALSE(manager->getDeviceBoolProperty(nullptr, nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(BoolProperty, TheFamilysValueCountsOnlyWithoutOneOfItsOwn) {
    ManagerFixture manager(family("PROPERTY = K,TRUE\n[dev1]\n[dev2]\nPROPERTY = K,FALSE\n"));
    EXPECT_TRUE(manager->getDeviceBoolProperty("dev1", "K"));
    EXPECT_FALSE(manager->getDeviceBoolProperty("dev2", "K"));
}

TEST(BoolProperty, AnSpiFlashIsLookedUpInTheOrdinaryTable) {
    auto files = family("");
    files["spi.acd"] = "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\nFLASH1_PROPERTY = CATALOGUE,TRUE\n"
                       "PROPERTY = TABLE,TRUE\n";
    ManagerFixture manager(files);
    EXPECT_FALSE(manager->getDeviceBoolProperty("FLASH1", "CATALOGUE"));
    EXPECT_TRUE(manager->getDeviceBoolProperty("FLASH1", "TABLE"));
}
