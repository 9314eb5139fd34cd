#include "Members.h"

#include <StringViews.h>

// The position of a family among the supported ones.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

struct IndexSession : ManagerFixture {
    IndexSession()
        : ManagerFixture({{"base.acd", "DEVICE_SUPPORTED = merlin,kestrel,Osprey,spi\n"},
                          {"kestrel.acd", "[KS50]\n"},
                          {"merlin.acd", "[ME1]\n"},
                          {"sparrow.acd", "[SP1]\n"},
                          {"spi.acd", "DEVICE_FAMILY = FLASHES\n"}}) {}

    int raises(const char* name) {
        return raisedLine<OutOfRangeException>([&] { (void)members().familyIndex(name); });
    }
};

TEST(FamilyIndex, OfAFamilyIsItsPositionInByteOrder) {
    IndexSession session;
    EXPECT_EQ(session.members().familyIndex("Osprey"), 0U);
    EXPECT_EQ(session.members().familyIndex("kestrel"), 1U);
    EXPECT_EQ(session.members().familyIndex("merlin"), 2U);
    EXPECT_EQ(session.members().familyIndex("spi"), 3U);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(FamilyIndex, OfADeviceIsThatOfItsFamily) {
    IndexSession session;
    EXPECT_EQ(session.members().familyIndex("KS50"), 1U);
    EXPECT_EQ(session.members().familyIndex("ME1_PQ"), 2U);
    EXPECT_EQ(session.members().familyIndex("FLASHES"), 3U);
}

TEST(FamilyIndex, OfAFamilyNeedsNoResolution) {
    IndexSession session;
    EXPECT_EQ(session.members().familyIndex("kestrel"), 1U);
    EXPECT_THAT(session.members().m_deviceFamilyCache, IsEmpty());
}

TEST(FamilyIndex, OfASupportedFamilyInAnotherCaseIsFoundThroughItsResolution) {
    IndexSession session;
    EXPECT_EQ(session.members().familyIndex("KESTREL"), 1U);
    EXPECT_THAT(entries(session.members().m_deviceFamilyCache), ElementsAre(Pair("kestrel", "kestrel")));
}

TEST(FamilyIndex, OfASupportedFamilyWithASuffixIsNotFound) {
    IndexSession session;
    for (const char* name : {"kestrel_x", "kestrel_", "merlin_a_b"}) {
        EXPECT_EQ(session.raises(name), 1999) << name;
    }
    EXPECT_THAT(session.members().m_deviceFamilyCache, IsEmpty());
}

TEST(FamilyIndex, OfANameThatNoListHoldsRaises) {
    IndexSession session;
    for (const char* name : {"sparrow", "SP1", "nobody", "base", "", "osprey"}) {
        EXPECT_EQ(session.raises(name), 1999) << name;
    }
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(FamilyIndex, IsOnePastTheLastWhileExceptionsAreOff) {
    IndexSession session;
    session->setExceptions(false);
    for (const char* name : {"sparrow", "SP1", "nobody", "base", "", "kestrel_x"}) {
        EXPECT_EQ(session.members().familyIndex(name), 4U) << name;
    }
    EXPECT_EQ(session.members().familyIndex(view(static_cast<const char*>(nullptr))), 4U);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(FamilyIndex, IsZeroWithoutSupportedFamilies) {
    ManagerFixture session(Base{""});
    session->setExceptions(false);
    EXPECT_EQ(session.members().familyIndex("kestrel"), 0U);
}

TEST(FamilyIndex, OfUnknownDevicesIsThatOfBaseWhereBaseIsSupported) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel,base\n"});
    EXPECT_EQ(session.members().familyIndex("nobody"), 0U);
    EXPECT_EQ(session.members().familyIndex("base"), 0U);
}

TEST(FamilyIndex, FollowsTheFamilyCache) {
    IndexSession session;
    session->addCachedDeviceFamily("nobody", "merlin");
    EXPECT_EQ(session.members().familyIndex("NOBODY_PQ"), 2U);
}

TEST(FamilyIndex, OfTheResultBufferItself) {
    IndexSession session;
    EXPECT_EQ(text(session->getPartFamily("KS50")), "kestrel");
    EXPECT_EQ(session.members().familyIndex(session.members().m_partFamily.get().c_str()), 1U);
    session.members().m_partFamily = "ME1_PQ";
    EXPECT_EQ(session.members().familyIndex(session.members().m_partFamily.get().c_str()), 2U);
}

TEST(FamilyIndex, OfASupportedNameThatHoldsAnUnderscore) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel,kestrel_x,sparrow_x\n"});
    EXPECT_EQ(session.members().familyIndex("kestrel_x"), 1U);
    EXPECT_EQ(raisedLine<OutOfRangeException>([&] { (void)session.members().familyIndex("sparrow_x"); }),
              1999);
}

} // namespace
