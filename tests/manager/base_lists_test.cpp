#include "CoreFixtures.h"

// The lists of the base database and the IDCODE map: order, case, duplicates, empty items, long lists.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

namespace {

TEST(BaseLists, SupportedDevicesStandInByteOrder) {
    BaseSession session("DEVICE_SUPPORTED = merlin,kestrel,osprey\n");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("kestrel", "merlin", "osprey"));
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(BaseLists, ShorterNameStandsFirstAndUpperCaseBeforeLower) {
    BaseSession session("DEVICE_SUPPORTED = a,abc,ab,B\n");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("B", "a", "ab", "abc"));
}

TEST(BaseLists, BytesOver127StandBehindAllOthers) {
    BaseSession session("DEVICE_SUPPORTED = a\xff,a~,a\x80,a\n");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("a", "a~", "a\x80", "a\xff"));
}

TEST(BaseLists, CaseMakesDifferentNames) {
    BaseSession session("DEVICE_SUPPORTED = abc,ABC,Abc\n");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("ABC", "Abc", "abc"));
}

TEST(BaseLists, NameListedTwiceCountsOnce) {
    BaseSession session(R"(
DEVICE_SUPPORTED = merlin,kestrel,merlin
PROGRAM_OPTION_PACKAGE = x,x,x
NOT_SUPPORTED_PART_IN_MODE = SS_dev1_pkg1,SS_dev1_pkg1
)");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("kestrel", "merlin"));
    EXPECT_THAT(texts(session.peer.programOptionPackages()), ElementsAre("x"));
    EXPECT_THAT(texts(session.peer.notSupportedPartInMode()), ElementsAre("SS_dev1_pkg1"));
}

TEST(BaseLists, ItemsAreTakenExactlyAsStored) {
    BaseSession session(R"(
DEVICE_SUPPORTED = b:c, a ,%s
PROGRAM_OPTION_PACKAGE = KS50 PQ,ks50_pq
NOT_SUPPORTED_PART_IN_MODE = ss_Dev1_pkg1, BS_dev2_pkg2
)");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre(" a ", "%s", "b:c"));
    EXPECT_THAT(texts(session.peer.programOptionPackages()), ElementsAre("KS50 PQ", "ks50_pq"));
    EXPECT_THAT(texts(session.peer.notSupportedPartInMode()), ElementsAre(" BS_dev2_pkg2", "ss_Dev1_pkg1"));
}

TEST(BaseLists, EmptyItemIsANameAndDoesNotEndTheList) {
    BaseSession session("DEVICE_SUPPORTED = b,,a\n");
    EXPECT_THAT(texts(session.peer.supportedDevices()), ElementsAre("", "a", "b"));
}

TEST(BaseLists, EmptyValueHasNoItems) {
    BaseSession session(R"(
DEVICE_SUPPORTED =
PROGRAM_OPTION_PACKAGE =
NOT_SUPPORTED_PART_IN_MODE =
)");
    EXPECT_EQ(session.peer.supportedDevices().size(), 0U);
    EXPECT_EQ(session.peer.programOptionPackages().size(), 0U);
    EXPECT_EQ(session.peer.notSupportedPartInMode().size(), 0U);
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(BaseLists, MissingNotSupportedListDoesNotEndTheStartUp) {
    BaseSession session("DEVICE_SUPPORTED = kestrel\n");
    EXPECT_EQ(session.peer.notSupportedPartInMode().size(), 0U);
    EXPECT_THAT(session.peer.operationOrders(), SizeIs(32));
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(BaseLists, ItemsBehindIndex32767DoNotExist) {
    for (const auto& [count, held] :
         {std::pair(32767, 32767U), {32768, 32768U}, {32769, 32768U}, {40000, 32768U}}) {
        ManagerSession session(
            {{"base.acd", "NOT_SUPPORTED_PART_IN_MODE = " + numberedList("d", count) + "\n"}});
        EXPECT_EQ(session.peer.notSupportedPartInMode().size(), held);
        EXPECT_TRUE(session.peer.notSupportedPartInMode().contains("d" + std::to_string(held - 1)));
        EXPECT_THAT(session.messages.take(), IsEmpty());
    }
}

TEST(BaseLists, SupportedDevicesAndPackagesEndAtIndex32767) {
    ManagerSession session(
        {{"base.acd", "DEVICE_SUPPORTED = " + numberedList("d", 40000) +
                          "\nPROGRAM_OPTION_PACKAGE = " + numberedList("p", 40000) + "\n"}});
    EXPECT_EQ(session.peer.supportedDevices().size(), 32768U);
    EXPECT_EQ(session.peer.programOptionPackages().size(), 32768U);
    EXPECT_EQ(session.peer.operationTable()->blocks(), 32768U);
    EXPECT_EQ(session.peer.bsdlOperationTable()->blocks(), 32768U);
    EXPECT_EQ(session.peer.programOptionTable()->blocks(), 32768U);
    EXPECT_FALSE(session.peer.supportedDevices().contains("d32768"));
}

TEST(Idcodes, MapDevicesAsTheyAreWritten) {
    BaseSession session("IDCODE = KS50,0x1,extra:ks50,0x2: m 1 , 0x3 \n");
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()),
                ElementsAre(Pair(" m 1 ", " 0x3"), Pair("KS50", "0x1"), Pair("ks50", "0x2")));
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(Idcodes, LaterEntryOverwrites) {
    BaseSession session("IDCODE = KS50,0x1:KS100,0x2:KS50,0x3\n");
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()),
                ElementsAre(Pair("KS100", "0x2"), Pair("KS50", "0x3")));
}

TEST(Idcodes, MissingSecondFieldIsTheEmptyText) {
    BaseSession session("IDCODE = KS50:KS100,0x2:KS200,\n");
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()),
                ElementsAre(Pair("KS100", "0x2"), Pair("KS200", ""), Pair("KS50", "")));
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(Idcodes, LaterEntryWithoutACodeOverwritesToo) {
    BaseSession session("IDCODE = KS50,0x1:KS50\n");
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()), ElementsAre(Pair("KS50", "")));
}

TEST(Idcodes, EmptyEntryDoesNotEndTheList) {
    BaseSession session("IDCODE = KS50,0x1::KS100,0x2\n");
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()),
                ElementsAre(Pair("", ""), Pair("KS100", "0x2"), Pair("KS50", "0x1")));
}

TEST(Idcodes, MissingOrEmptyKeyGivesAnEmptyMap) {
    for (const char* base : {"", "IDCODE =\n"}) {
        BaseSession session(base);
        EXPECT_THAT(session.manager.getAllDeviceIdcodes(), IsEmpty());
        EXPECT_THAT(session.peer.operationOrders(), SizeIs(32));
    }
}

TEST(Idcodes, AreHandedOutAsTheyStand) {
    ManagerSession session(
        {{"base.acd", "IDCODE = KS50,0x1\n"}, {"kestrel.acd", "[KS50]\nIDCODE = KS60,0x2\n"}});
    session.manager.setExceptions(false);
    session.peer.loadDeviceData("KS50", nullptr);
    EXPECT_EQ(&session.manager.getAllDeviceIdcodes(), &session.peer.deviceIdcodes());
    EXPECT_THAT(entries(session.manager.getAllDeviceIdcodes()), ElementsAre(Pair("KS50", "0x1")));
}

TEST(Idcodes, EntriesBehindIndex32767DoNotExist) {
    BaseSession session("IDCODE = " + numberedList("d", 40000, ",1:") + ",1\n");
    EXPECT_THAT(session.manager.getAllDeviceIdcodes(), SizeIs(32768));
    EXPECT_EQ(session.manager.getAllDeviceIdcodes().count(StringBase("d32767")), 1U);
    EXPECT_EQ(session.manager.getAllDeviceIdcodes().count(StringBase("d32768")), 0U);
}

} // namespace
