#include "Members.h"

// The lists of the base database and the IDCODE map: order, case, duplicates, empty items, long lists.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

namespace {

TEST(BaseLists, SupportedDevicesStandInByteOrder) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = merlin,kestrel,osprey\n"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("kestrel", "merlin", "osprey"));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BaseLists, ShorterNameStandsFirstAndUpperCaseBeforeLower) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = a,abc,ab,B\n"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("B", "a", "ab", "abc"));
}

TEST(BaseLists, BytesOver127StandBehindAllOthers) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = a\xff,a~,a\x80,a\n"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("a", "a~", "a\x80", "a\xff"));
}

TEST(BaseLists, CaseMakesDifferentNames) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = abc,ABC,Abc\n"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("ABC", "Abc", "abc"));
}

TEST(BaseLists, NameListedTwiceCountsOnce) {
    ManagerFixture session(Base{R"(
DEVICE_SUPPORTED = merlin,kestrel,merlin
PROGRAM_OPTION_PACKAGE = x,x,x
NOT_SUPPORTED_PART_IN_MODE = SS_dev1_pkg1,SS_dev1_pkg1
)"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("kestrel", "merlin"));
    EXPECT_THAT(texts(session.members().m_programOptionPackages), ElementsAre("x"));
    EXPECT_THAT(texts(session.members().m_notSupportedPartInMode), ElementsAre("SS_dev1_pkg1"));
}

TEST(BaseLists, ItemsAreTakenExactlyAsStored) {
    ManagerFixture session(Base{R"(
DEVICE_SUPPORTED = b:c, a ,%s
PROGRAM_OPTION_PACKAGE = KS50 PQ,ks50_pq
NOT_SUPPORTED_PART_IN_MODE = ss_Dev1_pkg1, BS_dev2_pkg2
)"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre(" a ", "%s", "b:c"));
    EXPECT_THAT(texts(session.members().m_programOptionPackages), ElementsAre("KS50 PQ", "ks50_pq"));
    EXPECT_THAT(texts(session.members().m_notSupportedPartInMode),
                ElementsAre(" BS_dev2_pkg2", "ss_Dev1_pkg1"));
}

TEST(BaseLists, EmptyItemIsANameAndDoesNotEndTheList) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = b,,a\n"});
    EXPECT_THAT(texts(session.members().m_supportedDevices), ElementsAre("", "a", "b"));
}

TEST(BaseLists, EmptyValueHasNoItems) {
    ManagerFixture session(Base{R"(
DEVICE_SUPPORTED =
PROGRAM_OPTION_PACKAGE =
NOT_SUPPORTED_PART_IN_MODE =
)"});
    EXPECT_EQ(session.members().m_supportedDevices.size(), 0U);
    EXPECT_EQ(session.members().m_programOptionPackages.size(), 0U);
    EXPECT_EQ(session.members().m_notSupportedPartInMode.size(), 0U);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BaseLists, MissingNotSupportedListDoesNotEndTheStartUp) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    EXPECT_EQ(session.members().m_notSupportedPartInMode.size(), 0U);
    EXPECT_THAT(session.members().m_operationOrders, SizeIs(32));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BaseLists, ItemsBehindIndex32767DoNotExist) {
    for (const auto& [count, held] :
         {std::pair(32767, 32767U), {32768, 32768U}, {32769, 32768U}, {40000, 32768U}}) {
        ManagerFixture session(
            {{"base.acd", "NOT_SUPPORTED_PART_IN_MODE = " + numberedList("d", count) + "\n"}});
        EXPECT_EQ(session.members().m_notSupportedPartInMode.size(), held);
        EXPECT_TRUE(session.members().m_notSupportedPartInMode.contains("d" + std::to_string(held - 1)));
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(BaseLists, SupportedDevicesAndPackagesEndAtIndex32767) {
    ManagerFixture session(
        {{"base.acd", "DEVICE_SUPPORTED = " + numberedList("d", 40000) +
                          "\nPROGRAM_OPTION_PACKAGE = " + numberedList("p", 40000) + "\n"}});
    EXPECT_EQ(session.members().m_supportedDevices.size(), 32768U);
    EXPECT_EQ(session.members().m_programOptionPackages.size(), 32768U);
    EXPECT_EQ(session.members().m_operationTable.blocks(), 32768U);
    EXPECT_EQ(session.members().m_bsdlOperationTable.blocks(), 32768U);
    EXPECT_EQ(session.members().m_programOptionTable.blocks(), 32768U);
    EXPECT_FALSE(session.members().m_supportedDevices.contains("d32768"));
}

TEST(Idcodes, MapDevicesAsTheyAreWritten) {
    ManagerFixture session(Base{"IDCODE = KS50,0x1,extra:ks50,0x2: m 1 , 0x3 \n"});
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()),
                ElementsAre(Pair(" m 1 ", " 0x3"), Pair("KS50", "0x1"), Pair("ks50", "0x2")));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Idcodes, LaterEntryOverwrites) {
    ManagerFixture session(Base{"IDCODE = KS50,0x1:KS100,0x2:KS50,0x3\n"});
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()),
                ElementsAre(Pair("KS100", "0x2"), Pair("KS50", "0x3")));
}

TEST(Idcodes, MissingSecondFieldIsTheEmptyText) {
    ManagerFixture session(Base{"IDCODE = KS50:KS100,0x2:KS200,\n"});
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()),
                ElementsAre(Pair("KS100", "0x2"), Pair("KS200", ""), Pair("KS50", "")));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Idcodes, LaterEntryWithoutACodeOverwritesToo) {
    ManagerFixture session(Base{"IDCODE = KS50,0x1:KS50\n"});
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()), ElementsAre(Pair("KS50", "")));
}

TEST(Idcodes, EmptyEntryDoesNotEndTheList) {
    ManagerFixture session(Base{"IDCODE = KS50,0x1::KS100,0x2\n"});
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()),
                ElementsAre(Pair("", ""), Pair("KS100", "0x2"), Pair("KS50", "0x1")));
}

TEST(Idcodes, MissingOrEmptyKeyGivesAnEmptyMap) {
    for (const char* base : {"", "IDCODE =\n"}) {
        ManagerFixture session(Base{base});
        EXPECT_THAT(session->getAllDeviceIdcodes(), IsEmpty());
        EXPECT_THAT(session.members().m_operationOrders, SizeIs(32));
    }
}

TEST(Idcodes, AreHandedOutAsTheyStand) {
    ManagerFixture session(
        {{"base.acd", "IDCODE = KS50,0x1\n"}, {"kestrel.acd", "[KS50]\nIDCODE = KS60,0x2\n"}});
    session->setExceptions(false);
    session.members().loadDeviceData("KS50", {});
    EXPECT_EQ(&session->getAllDeviceIdcodes(), &session.members().m_deviceIdcodes.get());
    EXPECT_THAT(entries(session->getAllDeviceIdcodes()), ElementsAre(Pair("KS50", "0x1")));
}

TEST(Idcodes, EntriesBehindIndex32767DoNotExist) {
    ManagerFixture session(Base{"IDCODE = " + numberedList("d", 40000, ",1:") + ",1\n"});
    EXPECT_THAT(session->getAllDeviceIdcodes(), SizeIs(32768));
    EXPECT_EQ(session->getAllDeviceIdcodes().count(StringBase("d32767")), 1U);
    EXPECT_EQ(session->getAllDeviceIdcodes().count(StringBase("d32768")), 0U);
}

} // namespace
