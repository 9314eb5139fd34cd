#include "Members.h"

#include "database/Store.h"

#include <Port_MsgManData.h>

#include <stdexcept>

// Which family a device belongs to: resolution, its cache, seeding, and the predicates built on them.

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

/// Two families with devices, and an SPI flash database.
struct FamilySession : ManagerFixture {
    FamilySession()
        : ManagerFixture({{"base.acd", "DEVICE_SUPPORTED = kestrel,spi\n"},
                          {"kestrel.acd", "[KS50]\n[KS100]\n[FLASH9]\n"},
                          {"Osprey.acd", "[OS1]\n[KS50_X]\n"},
                          {"spi.acd", "DEVICE_FAMILY = FLASHES\n"
                                      "FLASHES_DEVICES = FLASH1,FLASH9,FLASH2_X,small\n"}}) {}

    std::string familyOf(const char* device) { return text((*this)->getPartFamily(device)); }
    std::map<std::string, std::string> cache() { return entries(members().m_deviceFamilyCache); }
    void seed(const char* device, const char* family) { (*this)->addCachedDeviceFamily(device, family); }
};

TEST(PartFamily, OfADeviceIsTheFamilyThatHoldsIt) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(session.familyOf("KS100"), "kestrel");
    EXPECT_EQ(session.familyOf("OS1"), "Osprey");
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PartFamily, OfALookUpThatRaisesIsEmpty) {
    const DatabaseDirectory directory;
    directory.makeDirectory("unreadable.acd");
    FamilySession session;
    session.members().m_partFamily = "former";
    // The scan for devices reports what it can't read. It is still to come, so the start-up's databases have to be
    // forgotten.
    acd::Store::resetForTesting();
    AcdStore::setSearchPath({directory.path()});
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) { throw std::runtime_error("no room"); });
    EXPECT_THROW(static_cast<void>(session->getPartFamily("KS50")), std::runtime_error);
    EXPECT_EQ(text(session.members().m_partFamily.get()), "");
}

TEST(PartFamily, IsFoundInAnyCase) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("ks50"), "kestrel");
    EXPECT_EQ(session.familyOf("os1"), "Osprey");
}

TEST(PartFamily, OfAFamilyIsItselfAsItsFileSpellsIt) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("kestrel"), "kestrel");
    EXPECT_EQ(session.familyOf("KESTREL"), "kestrel");
    EXPECT_EQ(session.familyOf("osprey"), "Osprey");
    EXPECT_EQ(session.familyOf("base"), "base");
}

TEST(PartFamily, OfAnUnknownDeviceIsBaseSilently) {
    FamilySession session;
    for (const char* device : {"nobody", "", "_", "_KS50", "KS5", "../kestrel", "%s", "\xff"}) {
        EXPECT_EQ(session.familyOf(device), "base") << device;
    }
    EXPECT_EQ(session.familyOf(nullptr), "base");
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PartFamily, IsThatOfTheBaseName) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50_PQ100"), "kestrel");
    EXPECT_EQ(session.familyOf("KS100_"), "kestrel");
    EXPECT_EQ(session.familyOf("kestrel_a_b"), "kestrel");
}

TEST(PartFamily, SectionWithAPackageInItsNameIsNotSeen) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50_X"), "kestrel");
}

TEST(PartFamily, OfAnSpiFlashIsSpi) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("FLASH1"), "spi");
    EXPECT_EQ(session.familyOf("flash1"), "spi");
    EXPECT_EQ(session.familyOf("flashes"), "spi");
}

TEST(PartFamily, SpiTakesPrecedenceOverTheDatabase) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("FLASH9"), "spi");
}

TEST(PartFamily, SpiMembershipLooksAtTheWholeName) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("FLASH2_X"), "spi");
    EXPECT_EQ(session.familyOf("FLASH1_X"), "base");
}

TEST(PartFamily, FirstQuestionAboutABaseNameDecidesForAllPackages) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("FLASH2_Y"), "base");
    EXPECT_EQ(session.familyOf("FLASH2_X"), "base");
    EXPECT_EQ(session.familyOf("FLASH1"), "spi");
    EXPECT_EQ(session.familyOf("FLASH1_X"), "spi");
}

TEST(PartFamily, LowerCaseSpiNameNeverMatches) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("small"), "base");
    EXPECT_EQ(session.familyOf("SMALL"), "base");
}

TEST(PartFamily, OfSpiIsSpiInAnyCase) {
    for (const char* name : {"spi", "SPI", "Spi"}) {
        FamilySession session;
        EXPECT_EQ(session.familyOf(name), "spi");
    }
}

TEST(PartFamily, OfSpiIsSpiWithoutAnSpiDatabase) {
    for (const char* name : {"spi", "SPI", "sPi"}) {
        ManagerFixture session(Base{"DEVICE_SUPPORTED = spi\n"});
        EXPECT_EQ(text(session->getPartFamily(name)), "spi");
    }
}

TEST(PartFamily, SpiWithAPackageIsNotSpiWithoutAnSpiDatabase) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = spi\n"});
    EXPECT_EQ(text(session->getPartFamily("spi_x")), "base");
}

TEST(PartFamily, IsCachedUnderTheLowerCasedBaseName) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50_PQ"), "kestrel");
    EXPECT_EQ(session.familyOf("ks50"), "kestrel");
    EXPECT_EQ(session.familyOf("Nobody"), "base");
    EXPECT_EQ(session.familyOf("FLASH1"), "spi");
    EXPECT_THAT(session.cache(),
                ElementsAre(Pair("flash1", "spi"), Pair("ks50", "kestrel"), Pair("nobody", "base")));
}

TEST(PartFamily, CacheAnswersBeforeDatabaseAndSpiNames) {
    FamilySession session;
    session.members().m_deviceFamilyCache[StringBase("ks50")] = "elsewhere";
    session.members().m_deviceFamilyCache[StringBase("flash1")] = "elsewhere";
    EXPECT_EQ(session.familyOf("KS50_PQ"), "elsewhere");
    EXPECT_EQ(session.familyOf("FLASH1"), "elsewhere");
}

TEST(PartFamily, CachedEmptyTextCountsAsAMissAndIsOverwritten) {
    FamilySession session;
    session.members().m_deviceFamilyCache[StringBase("ks50")] = "";
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("ks50", "kestrel")));
}

TEST(PartFamily, IsLeftInTheResultBuffer) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(text(session.members().m_partFamily.get()), "kestrel");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(text(session.members().m_partFamily.get()), "base");
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(text(session.members().m_partFamily.get()), "kestrel");
}

TEST(PartFamily, IsACopyThatLaterQuestionsLeaveAlone) {
    FamilySession session;
    const StringBase family = session->getPartFamily("KS50");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(text(family), "kestrel");
}

TEST(PartFamily, OfTheResultBufferItself) {
    FamilySession session;
    session.members().m_partFamily = "KS50_a_package_that_is_longer_than_any_short_text";
    EXPECT_EQ(session.familyOf(session.members().m_partFamily.get().c_str()), "kestrel");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("ks50", "kestrel")));
    EXPECT_EQ(session.familyOf(session.members().m_partFamily.get().c_str()), "kestrel");
}

TEST(PartFamily, OfAnSpiFlashInTheResultBufferItself) {
    FamilySession session;
    session.members().m_partFamily = "flash2_x";
    EXPECT_EQ(session.familyOf(session.members().m_partFamily.get().c_str()), "spi");
    session.members().m_partFamily = "FLASH1";
    EXPECT_EQ(session.familyOf(session.members().m_partFamily.get().c_str()), "spi");
}

TEST(PartFamily, OfAVeryLongName) {
    FamilySession session;
    EXPECT_EQ(session.familyOf(("KS50_" + std::string(1000000, 'x')).c_str()), "kestrel");
    EXPECT_EQ(session.familyOf(std::string(1000000, 'x').c_str()), "base");
}

TEST(PartFamily, DoesNotDependOnTheExceptionsSwitch) {
    FamilySession session;
    session->setExceptions(false);
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(session.familyOf("FLASH1"), "spi");
}

TEST(PartFamily, LoadsNothing) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_THAT(session.members().m_loadedFamilies, IsEmpty());
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
}

TEST(Seeding, SavesTheResolution) {
    FamilySession session;
    session.seed("ks50", "elsewhere");
    EXPECT_EQ(session.familyOf("KS50_PQ"), "elsewhere");
}

TEST(Seeding, StoresUnderTheBaseNameInTheCaseGiven) {
    FamilySession session;
    session.seed("Dev_x", "fam");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("Dev", "fam")));
    EXPECT_EQ(session.familyOf("Dev_x"), "base");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("Dev", "fam"), Pair("dev", "base")));
}

TEST(Seeding, LeavesTheResultBufferAlone) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    session.seed("dev", "fam");
    EXPECT_EQ(text(session.members().m_partFamily.get()), "kestrel");
}

TEST(Seeding, IsRefusedWhileTheLatestResolutionIsItselfCached) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("kestrel"), "kestrel");
    session.seed("dev", "fam");
    EXPECT_EQ(session.familyOf("dev"), "base");
}

TEST(Seeding, IsAcceptedAgainOnceTheLatestResolutionIsNotCached) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("kestrel"), "kestrel");
    EXPECT_EQ(session.familyOf("OS1"), "Osprey");
    session.seed("dev", "fam");
    EXPECT_EQ(session.familyOf("dev"), "fam");
}

TEST(Seeding, LooksForTheLatestResolutionCaseIncluded) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("Osprey"), "Osprey");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("osprey", "Osprey")));
    session.seed("dev", "fam");
    EXPECT_EQ(session.familyOf("dev"), "fam");
}

TEST(Seeding, OfACachedNameOverwrites) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("ks50"), "kestrel");
    session.seed("ks50", "elsewhere");
    EXPECT_EQ(session.familyOf("ks50"), "elsewhere");
}

TEST(Seeding, EmptyValueOfTheLatestResolutionDoesNotRefuse) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    session.members().m_deviceFamilyCache[StringBase("kestrel")] = "";
    session.seed("dev", "fam");
    EXPECT_THAT(session.cache(), Contains(Pair("dev", "fam")));
}

TEST(Seeding, IsRefusedRightAfterAStartUpThatResolvedSpi) {
    ManagerFixture session(Base{""});
    EXPECT_EQ(text(session.members().m_partFamily.get()), "spi");
    session->addCachedDeviceFamily("dev", "fam");
    EXPECT_THAT(entries(session.members().m_deviceFamilyCache), ElementsAre(Pair("spi", "spi")));
}

TEST(Seeding, NullDeviceIsTheEmptyName) {
    FamilySession session;
    session.seed(nullptr, "fam");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("", "fam")));
}

TEST(Seeding, NullFamilyIsTheEmptyTextWhichIsNoAnswer) {
    FamilySession session;
    session.seed("ks50", nullptr);
    EXPECT_THAT(session.cache(), ElementsAre(Pair("ks50", "")));
    EXPECT_EQ(session.familyOf("ks50"), "kestrel");
}

TEST(Seeding, WithTheResultBufferItself) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    session.seed(session.members().m_partFamily.get().c_str(), session.members().m_partFamily.get().c_str());
    EXPECT_THAT(session.cache(), ElementsAre(Pair("kestrel", "kestrel"), Pair("ks50", "kestrel")));
}

TEST(KorvelDevice, IsADeviceWhoseFamilyIsKnown) {
    FamilySession session;
    EXPECT_TRUE(session->isKorvelDevice("KS50"));
    EXPECT_TRUE(session->isKorvelDevice("ks50_PQ"));
    EXPECT_TRUE(session->isKorvelDevice("kestrel"));
    EXPECT_TRUE(session->isKorvelDevice("FLASH1"));
    EXPECT_FALSE(session->isKorvelDevice("nobody"));
    EXPECT_FALSE(session->isKorvelDevice("base"));
    EXPECT_FALSE(session->isKorvelDevice(""));
    EXPECT_FALSE(session->isKorvelDevice(nullptr));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(KorvelDevice, ComparesCaseIncluded) {
    FamilySession session;
    session.seed("dev", "BASE");
    EXPECT_TRUE(session->isKorvelDevice("dev"));
}

TEST(FamilyName, IsANameThatResolvesToItselfExactly) {
    FamilySession session;
    EXPECT_TRUE(session.members().isFamilyName("kestrel"));
    EXPECT_TRUE(session.members().isFamilyName("Osprey"));
    EXPECT_TRUE(session.members().isFamilyName("spi"));
    EXPECT_TRUE(session.members().isFamilyName("base"));
    EXPECT_FALSE(session.members().isFamilyName("KESTREL"));
    EXPECT_FALSE(session.members().isFamilyName("osprey"));
    EXPECT_FALSE(session.members().isFamilyName("KS50"));
    EXPECT_FALSE(session.members().isFamilyName("kestrel_x"));
    EXPECT_FALSE(session.members().isFamilyName("nobody"));
    EXPECT_FALSE(session.members().isFamilyName(""));
}

} // namespace
