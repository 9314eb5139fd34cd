// A question that was asked before is answered by a shorter way: nothing but the time it takes may show that.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::IsEmpty;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto SPI = MODE_TYPE::SPI;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

Files databases(const std::string& ofTheFamily, const std::string& ofTheFlash) {
    return {
        {"base.acd", "DEVICE_SUPPORTED = fam1,fam2,spi,fam3\nPROGRAM_OPTION_PACKAGE = fam1,fam2,spi\n"},
        {"fam1.acd",
         ofTheFamily + "OPERATION = PROGRAM,Bscan,PARALLEL\nBSDL_OPERATION = VERIFY,PARALLEL\n[dev1]\n"},
        {"fam2.acd",
         "OPERATION = CLAMP,Bscan,PARALLEL\nPROGRAM_OPTION = READPROTECT,Bscan,PARALLEL\n[dev2]\n[dev3]\n"},
        {"fam3.acd", "[dev4]\n"},
        {"spi.acd",
         ofTheFlash +
             "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\nOPERATION = ERASE,SPI,PARALLEL:ERASE,Bscan,PARALLEL\n"
             "PROGRAM_OPTION = UES,SPI,PARALLEL\n"}};
}

bool mayProgram(const ManagerFixture& manager, const char* device, MODE_TYPE mode = BS) {
    return manager->checkConstraints(mode, PARALLEL, device, OP_TYPE::PROGRAM, nullptr);
}

} // namespace

TEST(CachedLookups, AreNotTakenBeforeTheFamilysOperationsAreLoaded) {
    ManagerFixture manager(databases("PROPERTY = BROKEN\n", ""));
    EXPECT_THROW(static_cast<void>(manager->getDeviceOperations("dev1", BS, PARALLEL)),
                 DataMismatchException);
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), 0);
    EXPECT_TRUE(mayProgram(manager, "dev1"));
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), maskOf(0));
}

TEST(CachedLookups, AreNotTakenBeforeTheFamilysPropertiesAreLoaded) {
    ManagerFixture manager(databases("", "PROPERTY = BROKEN\n"));
    EXPECT_FALSE(mayProgram(manager, "FLASH1"));
    EXPECT_THROW(static_cast<void>(manager->getDeviceOperations("FLASH1", BS, PARALLEL)),
                 DataMismatchException);
}

TEST(CachedLookups, OfADeviceAreThoseOfItsFamilyWhateverWasAskedInSpiMode) {
    ManagerFixture manager(databases("", ""));
    EXPECT_EQ(manager->getDeviceOperations("FLASH1", BS, PARALLEL), maskOf(4));
    EXPECT_FALSE(mayProgram(manager, "dev1", SPI));
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), maskOf(0));
}

TEST(CachedLookups, LeaveTheLatestResolutionAloneInSpiMode) {
    ManagerFixture manager(databases("", ""));
    EXPECT_EQ(manager->getProgramOptions("dev2", BS, PARALLEL, nullptr), maskOf(2));
    for (int time = 0; time < 2; ++time) {
        EXPECT_STREQ(manager->getPartFamily("dev1").c_str(), "fam1");
        static_cast<void>(manager->getProgramOptions("dev2", SPI, PARALLEL, nullptr));
        static_cast<void>(manager->getDeviceOperations("dev2", SPI, PARALLEL));
        EXPECT_FALSE(mayProgram(manager, "dev2", SPI));
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
    }
}

TEST(CachedLookups, LeaveTheSameResolutionAsLongOnes) {
    ManagerFixture manager(databases("", ""));
    for (int time = 0; time < 3; ++time) {
        EXPECT_EQ(manager->getProgramOptions("dev2", BS, PARALLEL, nullptr), maskOf(2));
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam2");
        EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), maskOf(0));
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
        EXPECT_EQ(manager->getBsdlOperations("dev3", PARALLEL), 0);
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam2");
        EXPECT_TRUE(mayProgram(manager, "dev1"));
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
        EXPECT_EQ(manager->getDeviceOperations("fam2", BS, PARALLEL), maskOf(21));
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
    }
}

TEST(CachedLookups, AreNoneForADeviceWhoseOptionsAreNotListed) {
    ManagerFixture manager(databases("", ""));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getProgramOptions("dev4", BS, PARALLEL, nullptr), 0);
    manager->setExceptions(true);
    EXPECT_THROW(static_cast<void>(manager->getProgramOptions("dev4", BS, PARALLEL, nullptr)),
                 OutOfRangeException);
}

TEST(CachedLookups, OfAFlashDoNotLeadPastItsCatalogue) {
    ManagerFixture manager(databases("[FLASH1]\nPROPERTY = NAME,own\n[dev0]\n",
                                     "AT_PROPERTY = NAME,catalogue\n"
                                     "FLASH1_PROPERTY = NAME,flash\n"));
    EXPECT_EQ(manager->getDeviceStringProperties("FLASH1", "NAME").size(), 1U);
    EXPECT_STREQ(manager->getDeviceStringProperty("FLASH1", "NAME"), "flash");
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(CachedLookups, AreAsManyAsThereAreDevicesHoweverManyNamesTheyAreAskedForBy) {
    ManagerFixture manager(databases("", ""));
    for (int lot = 0; lot < 20'000; ++lot) {
        const std::string name = "dev2_lot" + std::to_string(lot);
        EXPECT_EQ(manager->getDeviceOperations(name.c_str(), BS, PARALLEL), maskOf(21));
        EXPECT_EQ(manager->getProgramOptions(name.c_str(), BS, PARALLEL, nullptr), maskOf(2));
        ASSERT_LE(manager.members().m_operationLookups.size(), 1030U);
        ASSERT_LE(manager.members().m_optionLookups.size(), 1030U);
    }
    EXPECT_EQ(manager.members().m_deviceFamilyCache.size(), 1U);
}

TEST(CachedLookups, OfManyDevicesAreAllHeld) {
    Files files = databases("", "");
    for (int device = 0; device < 5'000; ++device) {
        files["fam2.acd"] += "[many" + std::to_string(device) + "]\n";
    }
    ManagerFixture manager(files);
    for (int device = 0; device < 5'000; ++device) {
        static_cast<void>(
            manager->getDeviceOperations(("many" + std::to_string(device)).c_str(), BS, PARALLEL));
    }
    EXPECT_EQ(manager.members().m_operationLookups.size(), 5'000U);
}

TEST(LookupCache, FindsWhatWasAddedAndNothingElse) {
    const StringBase family("fam");
    LookupCache cache;
    EXPECT_EQ(cache.find("0"), nullptr);
    for (std::size_t number = 0; number < 3'000; ++number) {
        cache.add(std::to_string(number).c_str(), {&family, number}, 3'000);
    }
    for (std::size_t number = 0; number < 3'000; ++number) {
        const CachedLookup* const found = cache.find(std::to_string(number));
        ASSERT_NE(found, nullptr);
        EXPECT_EQ(found->block, number);
        EXPECT_EQ(found->family, &family);
    }
    EXPECT_EQ(cache.find("3000"), nullptr);
    cache.add("3000", {nullptr, 7}, 3'000);
    EXPECT_EQ(cache.size(), 1U);
    EXPECT_EQ(cache.find("0"), nullptr);
    EXPECT_EQ(cache.find("3000")->block, 7U);
    cache.clear();
    EXPECT_EQ(cache.find("3000"), nullptr);
}
