// What the queries return by reference or pointer stays in place however much is loaded behind it.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using testing::ElementsAre;

constexpr int DEVICES = 3000;

std::string nameOf(int device) { return "device" + std::to_string(device); }

// One family of many devices, each with properties of its own.
Files manyDevices() {
    std::string text = "PROPERTY = SHARED,a value of the family that is no short text\n";
    for (int device = 0; device < DEVICES; ++device) {
        text += "[" + nameOf(device) + "]\nPROPERTY = NAME," + nameOf(device) +
                " is longer than sixteen bytes\n" + "PROPERTIES = ERASE,2,BS,SS:OP_ERASE,2,quick,slow\n";
    }
    return {{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
            {"fam1.acd", text},
            {"spi.acd",
             "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\nFLASH1_PROPERTY = NAME,the name of the flash\n"}};
}

} // namespace

TEST(Lifetimes, WhatWasReturnedStaysThroughManyLoads) {
    ManagerFixture manager(manyDevices());
    const auto& names = manager->getDeviceStringProperties("device0", "NAME");
    const auto& shared = manager->getDeviceStringProperties("device0", "SHARED");
    const auto& options = manager->getDeviceOperationOptions("device0", "ERASE", MODE_TYPE::BS);
    const auto& nothing = manager->getDeviceStringProperties("device0", "NOTHING");
    const char* name = manager->getDeviceStringProperty("device0", "NAME");
    const char* familys = manager->getDeviceStringProperty("device0", "SHARED");
    const char* flash = manager->getDeviceStringProperty("FLASH1", "NAME");

    for (int device = 1; device < DEVICES; ++device) {
        EXPECT_EQ(manager->getDeviceStringProperties(nameOf(device).c_str(), "NAME").size(), 1U);
    }

    EXPECT_EQ(&manager->getDeviceStringProperties("device0", "NAME"), &names);
    EXPECT_EQ(&manager->getDeviceStringProperties("device0", "SHARED"), &shared);
    EXPECT_EQ(&manager->getDeviceOperationOptions("device0", "ERASE", MODE_TYPE::BS), &options);
    EXPECT_EQ(&manager->getDeviceStringProperties("device0", "NOTHING"), &nothing);
    EXPECT_EQ(manager->getDeviceStringProperty("device0", "NAME"), name);
    EXPECT_EQ(manager->getDeviceStringProperty("device0", "SHARED"), familys);
    EXPECT_EQ(manager->getDeviceStringProperty("FLASH1", "NAME"), flash);

    EXPECT_THAT(texts(names), ElementsAre("device0 is longer than sixteen bytes"));
    EXPECT_THAT(texts(options), ElementsAre("quick", "slow"));
    EXPECT_STREQ(name, "device0 is longer than sixteen bytes");
    EXPECT_STREQ(familys, "a value of the family that is no short text");
    EXPECT_STREQ(flash, "the name of the flash");
    EXPECT_TRUE(nothing.empty());
}

TEST(Lifetimes, AQuestionAskedTwiceLoadsNothingMore) {
    ManagerFixture manager(manyDevices());
    static_cast<void>(manager->getDeviceStringProperties("device0", "NAME"));
    const auto properties = manager.members().m_deviceProperties.size();
    const auto loaded = manager.members().m_loadedFamilies.size();
    static_cast<void>(manager->getDeviceStringProperties("device0", "NAME"));
    static_cast<void>(manager->getDeviceStringProperties("device0", "SHARED"));
    EXPECT_EQ(manager.members().m_deviceProperties.size(), properties);
    EXPECT_EQ(manager.members().m_loadedFamilies.size(), loaded);
}

TEST(Lifetimes, ArgumentsMayBeTextsOfTheManagerItself) {
    // A returned text is a valid argument, even where the answer changes the place it was read from.
    ManagerFixture manager(manyDevices());
    const StringBase& family = manager.members().m_partFamily.get();
    static_cast<void>(manager->getPartFamily("device0"));
    EXPECT_STREQ(manager->getDeviceStringProperty(family.c_str(), "SHARED"),
                 "a value of the family that is no short text");
    EXPECT_STREQ(manager->getPartFamily(family.c_str()).c_str(), "fam1");
}

TEST(Lifetimes, WhatWasReturnedStaysWhenAnotherOwnersPropertyTakesItsKey) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd", "[KS50]\nPROPERTY = PINS,144\nPROPERTIES = pq208_PINS,2,207,208\n"
                           "[KS50_pq208]\nPROPERTY = PINS,a value that is longer than short texts are\n"}});
    const auto& held = manager->getDeviceStringProperties("KS50", "pq208_PINS");
    const char* const heldText = manager->getDeviceStringProperty("KS50", "pq208_PINS");
    // The returned text is the argument of the very question that replaces it.
    EXPECT_STREQ(manager->getDeviceStringProperty("KS50_pq208", "PINS"),
                 "a value that is longer than short texts are");
    EXPECT_THAT(texts(held), ElementsAre("207", "208"));
    EXPECT_STREQ(heldText, "207");
    EXPECT_STREQ(manager->getDeviceStringProperty("KS50", "pq208_PINS"),
                 "a value that is longer than short texts are");
    EXPECT_THAT(texts(manager->getDeviceStringProperties("KS50", "pq208_PINS")),
                ElementsAre("a value that is longer than short texts are"));
}

TEST(Lifetimes, AReturnedTextMayBeTheKeyOfTheQuestionThatReplacesIt) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd",
               "[a]\nPROPERTY = b_key_that_is_longer_than_short_texts,key_that_is_longer_than_short_texts\n"
               "[a_b]\nPROPERTY = key_that_is_longer_than_short_texts,another value of some length\n"}});
    const char* const key = manager->getDeviceStringProperty("a", "b_key_that_is_longer_than_short_texts");
    EXPECT_STREQ(manager->getDeviceStringProperty("a_b", key), "another value of some length");
    EXPECT_STREQ(key, "key_that_is_longer_than_short_texts");
}
