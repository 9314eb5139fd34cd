#include "CoreFixtures.h"

// The position of a family among the supported ones.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

struct IndexSession : ManagerSession {
    IndexSession()
        : ManagerSession({{"base.acd", "DEVICE_SUPPORTED = merlin,kestrel,Osprey,spi\n"},
                          {"kestrel.acd", "[KS50]\n"},
                          {"merlin.acd", "[ME1]\n"},
                          {"sparrow.acd", "[SP1]\n"},
                          {"spi.acd", "DEVICE_FAMILY = FLASHES\n"}}) {}

    int raises(const char* name) {
        return raisedLine<OutOfRangeException>([&] { (void)peer.familyIndex(name); });
    }
};

TEST(FamilyIndex, OfAFamilyIsItsPositionInByteOrder) {
    IndexSession session;
    EXPECT_EQ(session.peer.familyIndex("Osprey"), 0U);
    EXPECT_EQ(session.peer.familyIndex("kestrel"), 1U);
    EXPECT_EQ(session.peer.familyIndex("merlin"), 2U);
    EXPECT_EQ(session.peer.familyIndex("spi"), 3U);
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(FamilyIndex, OfADeviceIsThatOfItsFamily) {
    IndexSession session;
    EXPECT_EQ(session.peer.familyIndex("KS50"), 1U);
    EXPECT_EQ(session.peer.familyIndex("ME1_PQ"), 2U);
    EXPECT_EQ(session.peer.familyIndex("FLASHES"), 3U);
}

TEST(FamilyIndex, OfAFamilyNeedsNoResolution) {
    IndexSession session;
    EXPECT_EQ(session.peer.familyIndex("kestrel"), 1U);
    EXPECT_THAT(session.peer.deviceFamilyCache(), IsEmpty());
}

TEST(FamilyIndex, OfASupportedFamilyInAnotherCaseIsFoundThroughItsResolution) {
    IndexSession session;
    EXPECT_EQ(session.peer.familyIndex("KESTREL"), 1U);
    EXPECT_THAT(entries(session.peer.deviceFamilyCache()), ElementsAre(Pair("kestrel", "kestrel")));
}

TEST(FamilyIndex, OfASupportedFamilyWithASuffixIsNotFound) {
    IndexSession session;
    for (const char* name : {"kestrel_x", "kestrel_", "merlin_a_b"}) {
        EXPECT_EQ(session.raises(name), 1999) << name;
    }
    EXPECT_THAT(session.peer.deviceFamilyCache(), IsEmpty());
}

TEST(FamilyIndex, OfANameThatNoListHoldsRaises) {
    IndexSession session;
    for (const char* name : {"sparrow", "SP1", "nobody", "base", "", "osprey"}) {
        EXPECT_EQ(session.raises(name), 1999) << name;
    }
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(FamilyIndex, IsOnePastTheLastWhileExceptionsAreOff) {
    IndexSession session;
    session.manager.setExceptions(false);
    for (const char* name : {"sparrow", "SP1", "nobody", "base", "", "kestrel_x"}) {
        EXPECT_EQ(session.peer.familyIndex(name), 4U) << name;
    }
    EXPECT_EQ(session.peer.familyIndex(nullptr), 4U);
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(FamilyIndex, IsZeroWithoutSupportedFamilies) {
    BaseSession session("");
    session.manager.setExceptions(false);
    EXPECT_EQ(session.peer.familyIndex("kestrel"), 0U);
}

TEST(FamilyIndex, OfUnknownDevicesIsThatOfBaseWhereBaseIsSupported) {
    BaseSession session("DEVICE_SUPPORTED = kestrel,base\n");
    EXPECT_EQ(session.peer.familyIndex("nobody"), 0U);
    EXPECT_EQ(session.peer.familyIndex("base"), 0U);
}

TEST(FamilyIndex, FollowsTheFamilyCache) {
    IndexSession session;
    session.manager.addCachedDeviceFamily("nobody", "merlin");
    EXPECT_EQ(session.peer.familyIndex("NOBODY_PQ"), 2U);
}

TEST(FamilyIndex, OfTheResultBufferItself) {
    IndexSession session;
    EXPECT_EQ(text(session.manager.getPartFamily("KS50")), "kestrel");
    EXPECT_EQ(session.peer.familyIndex(session.peer.partFamily().c_str()), 1U);
    session.peer.partFamily() = "ME1_PQ";
    EXPECT_EQ(session.peer.familyIndex(session.peer.partFamily().c_str()), 2U);
}

TEST(FamilyIndex, OfASupportedNameThatHoldsAnUnderscore) {
    BaseSession session("DEVICE_SUPPORTED = kestrel,kestrel_x,sparrow_x\n");
    EXPECT_EQ(session.peer.familyIndex("kestrel_x"), 1U);
    EXPECT_EQ(raisedLine<OutOfRangeException>([&] { (void)session.peer.familyIndex("sparrow_x"); }), 1999);
}

} // namespace
