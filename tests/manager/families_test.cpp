#include "CoreFixtures.h"

#include <Port_MsgManData.h>

#include <stdexcept>

// Which family a device belongs to: resolution, its cache, seeding, and the predicates built on them.

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

/// Two families with devices, and an SPI flash database.
struct FamilySession : ManagerSession {
    FamilySession()
        : ManagerSession({{"base.acd", "DEVICE_SUPPORTED = kestrel,spi\n"},
                          {"kestrel.acd", "[KS50]\n[KS100]\n[FLASH9]\n"},
                          {"Osprey.acd", "[OS1]\n[KS50_X]\n"},
                          {"spi.acd", "DEVICE_FAMILY = FLASHES\n"
                                      "FLASHES_DEVICES = FLASH1,FLASH9,FLASH2_X,small\n"}}) {}

    std::string familyOf(const char* device) { return text(manager.getPartFamily(device)); }
    std::map<std::string, std::string> cache() { return entries(peer.deviceFamilyCache()); }
    void seed(const char* device, const char* family) { manager.addCachedDeviceFamily(device, family); }
};

TEST(PartFamily, OfADeviceIsTheFamilyThatHoldsIt) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(session.familyOf("KS100"), "kestrel");
    EXPECT_EQ(session.familyOf("OS1"), "Osprey");
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(PartFamily, OfALookUpThatRaisesIsEmpty) {
    const DatabaseDirectory directory;
    directory.makeDirectory("unreadable.acd");
    FamilySession session;
    session.peer.partFamily() = "former";
    // The scan for devices reports what it can't read.
    AcdStore::setSearchPath({directory.path()});
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) { throw std::runtime_error("no room"); });
    EXPECT_THROW(static_cast<void>(session.manager.getPartFamily("KS50")), std::runtime_error);
    EXPECT_EQ(text(session.peer.partFamily()), "");
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
    EXPECT_THAT(session.messages.take(), IsEmpty());
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
        BaseSession session("DEVICE_SUPPORTED = spi\n");
        EXPECT_EQ(text(session.manager.getPartFamily(name)), "spi");
    }
}

TEST(PartFamily, SpiWithAPackageIsNotSpiWithoutAnSpiDatabase) {
    BaseSession session("DEVICE_SUPPORTED = spi\n");
    EXPECT_EQ(text(session.manager.getPartFamily("spi_x")), "base");
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
    session.peer.deviceFamilyCache()[StringBase("ks50")] = "elsewhere";
    session.peer.deviceFamilyCache()[StringBase("flash1")] = "elsewhere";
    EXPECT_EQ(session.familyOf("KS50_PQ"), "elsewhere");
    EXPECT_EQ(session.familyOf("FLASH1"), "elsewhere");
}

TEST(PartFamily, CachedEmptyTextCountsAsAMissAndIsOverwritten) {
    FamilySession session;
    session.peer.deviceFamilyCache()[StringBase("ks50")] = "";
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("ks50", "kestrel")));
}

TEST(PartFamily, IsLeftInTheResultBuffer) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(text(session.peer.partFamily()), "kestrel");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(text(session.peer.partFamily()), "base");
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(text(session.peer.partFamily()), "kestrel");
}

TEST(PartFamily, IsACopyThatLaterQuestionsLeaveAlone) {
    FamilySession session;
    const StringBase family = session.manager.getPartFamily("KS50");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(text(family), "kestrel");
}

TEST(PartFamily, OfTheResultBufferItself) {
    FamilySession session;
    session.peer.partFamily() = "KS50_a_package_that_is_longer_than_any_short_text";
    EXPECT_EQ(session.familyOf(session.peer.partFamily().c_str()), "kestrel");
    EXPECT_THAT(session.cache(), ElementsAre(Pair("ks50", "kestrel")));
    EXPECT_EQ(session.familyOf(session.peer.partFamily().c_str()), "kestrel");
}

TEST(PartFamily, OfAnSpiFlashInTheResultBufferItself) {
    FamilySession session;
    session.peer.partFamily() = "flash2_x";
    EXPECT_EQ(session.familyOf(session.peer.partFamily().c_str()), "spi");
    session.peer.partFamily() = "FLASH1";
    EXPECT_EQ(session.familyOf(session.peer.partFamily().c_str()), "spi");
}

TEST(PartFamily, OfAVeryLongName) {
    FamilySession session;
    EXPECT_EQ(session.familyOf(("KS50_" + std::string(1000000, 'x')).c_str()), "kestrel");
    EXPECT_EQ(session.familyOf(std::string(1000000, 'x').c_str()), "base");
}

TEST(PartFamily, DoesNotDependOnTheExceptionsSwitch) {
    FamilySession session;
    session.manager.setExceptions(false);
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_EQ(session.familyOf("nobody"), "base");
    EXPECT_EQ(session.familyOf("FLASH1"), "spi");
}

TEST(PartFamily, LoadsNothing) {
    FamilySession session;
    EXPECT_EQ(session.familyOf("KS50"), "kestrel");
    EXPECT_THAT(session.peer.loadedFamilies(), IsEmpty());
    EXPECT_THAT(texts(session.peer.operationsLoaded()), ElementsAre("spi"));
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
    EXPECT_EQ(text(session.peer.partFamily()), "kestrel");
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
    session.peer.deviceFamilyCache()[StringBase("kestrel")] = "";
    session.seed("dev", "fam");
    EXPECT_THAT(session.cache(), Contains(Pair("dev", "fam")));
}

TEST(Seeding, IsRefusedRightAfterAStartUpThatResolvedSpi) {
    BaseSession session("");
    EXPECT_EQ(text(session.peer.partFamily()), "spi");
    session.manager.addCachedDeviceFamily("dev", "fam");
    EXPECT_THAT(entries(session.peer.deviceFamilyCache()), ElementsAre(Pair("spi", "spi")));
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
    session.seed(session.peer.partFamily().c_str(), session.peer.partFamily().c_str());
    EXPECT_THAT(session.cache(), ElementsAre(Pair("kestrel", "kestrel"), Pair("ks50", "kestrel")));
}

TEST(KorvelDevice, IsADeviceWhoseFamilyIsKnown) {
    FamilySession session;
    EXPECT_TRUE(session.manager.isKorvelDevice("KS50"));
    EXPECT_TRUE(session.manager.isKorvelDevice("ks50_PQ"));
    EXPECT_TRUE(session.manager.isKorvelDevice("kestrel"));
    EXPECT_TRUE(session.manager.isKorvelDevice("FLASH1"));
    EXPECT_FALSE(session.manager.isKorvelDevice("nobody"));
    EXPECT_FALSE(session.manager.isKorvelDevice("base"));
    EXPECT_FALSE(session.manager.isKorvelDevice(""));
    EXPECT_FALSE(session.manager.isKorvelDevice(nullptr));
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(KorvelDevice, ComparesCaseIncluded) {
    FamilySession session;
    session.seed("dev", "BASE");
    EXPECT_TRUE(session.manager.isKorvelDevice("dev"));
}

TEST(FamilyName, IsANameThatResolvesToItselfExactly) {
    FamilySession session;
    EXPECT_TRUE(session.peer.isFamilyName("kestrel"));
    EXPECT_TRUE(session.peer.isFamilyName("Osprey"));
    EXPECT_TRUE(session.peer.isFamilyName("spi"));
    EXPECT_TRUE(session.peer.isFamilyName("base"));
    EXPECT_FALSE(session.peer.isFamilyName("KESTREL"));
    EXPECT_FALSE(session.peer.isFamilyName("osprey"));
    EXPECT_FALSE(session.peer.isFamilyName("KS50"));
    EXPECT_FALSE(session.peer.isFamilyName("kestrel_x"));
    EXPECT_FALSE(session.peer.isFamilyName("nobody"));
    EXPECT_FALSE(session.peer.isFamilyName(""));
}

} // namespace
