#include "Members.h"

// The start-up pass: what faults of the databases end it, and what then is there.

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::Pair;
using testing::SizeIs;

namespace {

const char* const BASE = R"(
DEVICE_SUPPORTED = kestrel,spi
PROGRAM_OPTION_PACKAGE = kestrel,spi
BS = outs,USB2:fams,kestrel
IDCODE = KS50,0x1
NOT_SUPPORTED_PART_IN_MODE = SS_KS50_PQ
)";

/// All that the steps before the SPI catalogue fill.
void expectBaseLoaded(TarvikTestPeer::Members& members) {
    EXPECT_THAT(texts(members.m_supportedDevices), ElementsAre("kestrel", "spi"));
    EXPECT_THAT(texts(members.m_programOptionPackages), ElementsAre("kestrel", "spi"));
    EXPECT_THAT(members.m_bsCables, ElementsAre(TARVIKNS::OUTPUT_TYPE::USB2));
    EXPECT_THAT(texts(members.m_bsDevices), ElementsAre("kestrel"));
    EXPECT_THAT(entries(members.m_deviceIdcodes.get()), ElementsAre(Pair("KS50", "0x1")));
    EXPECT_THAT(texts(members.m_notSupportedPartInMode), ElementsAre("SS_KS50_PQ"));
    EXPECT_EQ(members.m_operationTable.blocks(), 2U);
    EXPECT_EQ(members.m_bsdlOperationTable.blocks(), 2U);
    EXPECT_EQ(members.m_programOptionTable.blocks(), 2U);
    EXPECT_THAT(members.m_operationOrders, SizeIs(32));
    EXPECT_THAT(members.m_programOptionOrders, SizeIs(24));
}

TEST(StartUp, OnGoodDataIsSilentAndFillsEverything) {
    ManagerFixture session({{"base.acd", BASE}, {"spi.acd", "DEVICE_FAMILY = FLASH1\n"}});
    expectBaseLoaded(session.members());
    EXPECT_THAT(texts(session.members().m_spiNames), ElementsAre("FLASH1"));
    EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
    EXPECT_TRUE(session.members().m_exceptions);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(StartUp, ReadsNoFamilyButSpi) {
    ManagerFixture session(
        {{"base.acd", BASE}, {"kestrel.acd", "OPERATION = PROGRAM,BS,USB2\nPROPERTY = A,1\n"}});
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.members().m_loadedFamilies, IsEmpty());
    EXPECT_THAT(session.members().m_deviceProperties, IsEmpty());
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
}

TEST(StartUp, TakesEntriesOfTheBaseDatabaseForNoFamilys) {
    ManagerFixture session(
        {{"base.acd", std::string(BASE) + "OPERATION = PROGRAM,BS,USB2\nPROGRAM_OPTION = OTP\n"}});
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(StartUp, OptionThatCannotBeReadEndsItBeforeTheMultibootTypes) {
    for (const char* option : {"OTP", "RS_PIN0", "nonsense", ""}) {
        ManagerFixture session({{"base.acd", BASE},
                                {"spi.acd", std::string("DEVICE_FAMILY = FLASH1\n"
                                                        "FLASH1_PROPERTY = SIZE,4\n"
                                                        "BPI3_DEVICES = F\n"
                                                        "OPERATION = PROGRAM,SPI,USB2\n"
                                                        "BSDL_OPERATION = BYPASS,SVF\n"
                                                        "TYPE_BPI_SERIAL_LEAD = KS50\n"
                                                        "PROGRAM_OPTION = ERASE,SPI,USB2:") +
                                                option + ",SPI,USB2:VERIFY,SPI,USB2\n"}});
        expectBaseLoaded(session.members());
        EXPECT_THAT(texts(session.members().m_spiNames), ElementsAre("FLASH1"));
        EXPECT_THAT(entries(session.members().m_spiProperties.get()), ElementsAre(Pair("FLASH1SIZE", "4")));
        EXPECT_THAT(texts(session.members().m_bpi3Devices), ElementsAre("F"));
        EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 5, 2}));
        EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 3}));
        EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 5, 2}));
        EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
        EXPECT_THAT(session.members().m_programOptionsLoaded, IsEmpty());
        EXPECT_THAT(session.members().m_multibootTypes, IsEmpty());
        EXPECT_TRUE(session.members().m_exceptions);
    }
}

TEST(StartUp, OptionThatCannotBeReadIsReportedOnce) {
    ManagerFixture session({{"base.acd", BASE}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    const auto messages = session.messages();
    ASSERT_THAT(messages, SizeIs(1));
    EXPECT_EQ(messages[0].channel, Port_MsgManData::Channel::INFO);
    EXPECT_EQ(messages[0].line, 1500);
    EXPECT_THAT(messages[0].text, HasSubstr("DataMismatchException"));
}

TEST(StartUp, OptionsThatEndedItAreTriedOnceMoreAndNotAgain) {
    ManagerFixture session({{"base.acd", BASE}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    const auto raised = [&] {
        return raisedLine<DataMismatchException>([&] { session.members().loadDeviceData("spi", {}); });
    };
    EXPECT_EQ(raised(), 1500);
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_EQ(raised(), -1);
}

TEST(StartUp, UnreadableSpiDatabaseEndsItBeforeTheSpiCatalogue) {
    const DatabaseDirectory directory;
    directory.writeFile("base.acd", BASE);
    directory.makeDirectory("spi.acd");
    ManagerFixture session(directory);
    expectBaseLoaded(session.members());
    EXPECT_THAT(session.members().m_spiNames, IsEmpty());
    EXPECT_THAT(session.members().m_operationsLoaded, IsEmpty());
    EXPECT_THAT(session.members().m_programOptionsLoaded, IsEmpty());
    EXPECT_THAT(session.members().m_multibootTypes, IsEmpty());
    EXPECT_THAT(session.members().m_deviceFamilyCache, IsEmpty());
    EXPECT_TRUE(session.members().m_exceptions);
    const auto messages = session.messages();
    ASSERT_THAT(messages, Not(IsEmpty()));
    EXPECT_EQ(messages.back().channel, Port_MsgManData::Channel::INFO);
    EXPECT_THAT(messages.back().text, HasSubstr("DataNotFoundException"));
}

TEST(StartUp, MissingBaseDatabaseLeavesAnEmptyManager) {
    ManagerFixture session(Files{{"spi.acd", "DEVICE_FAMILY = FLASH1\nTYPE_BPI_SERIAL_LEAD = KS50\n"}});
    EXPECT_EQ(session.members().m_devKey, nullptr);
    EXPECT_EQ(session.members().m_supportedDevices.size(), 0U);
    EXPECT_EQ(session.members().m_operationTable.blocks(), 0U);
    EXPECT_EQ(session.members().m_bsdlOperationTable.blocks(), 0U);
    EXPECT_EQ(session.members().m_programOptionTable.blocks(), 0U);
    EXPECT_THAT(session->getOperationOrders(), IsEmpty());
    EXPECT_THAT(session->getProgramOptionOrders(), IsEmpty());
    EXPECT_THAT(session.members().m_spiNames, IsEmpty());
    EXPECT_THAT(session.members().m_operationsLoaded, IsEmpty());
    EXPECT_THAT(session.members().m_multibootTypes, IsEmpty());
    EXPECT_TRUE(session.members().m_exceptions);
    const auto messages = session.messages();
    ASSERT_THAT(messages, Not(IsEmpty()));
    EXPECT_EQ(messages.back().channel, Port_MsgManData::Channel::INFO);
    EXPECT_THAT(messages.back().text, HasSubstr("DataNotFoundException"));
}

TEST(StartUp, UnreadableBaseDatabaseLeavesAnEmptyManager) {
    const DatabaseDirectory directory;
    directory.makeDirectory("base.acd");
    ManagerFixture session(directory);
    EXPECT_EQ(session.members().m_devKey, nullptr);
    EXPECT_EQ(session.members().m_operationTable.blocks(), 0U);
    EXPECT_THAT(session->getOperationOrders(), IsEmpty());
    EXPECT_TRUE(session.members().m_exceptions);
}

TEST(StartUp, AnyFaultLeavesOneManagerForAllLaterCalls) {
    ManagerFixture session(Files{});
    (void)session.messages();
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &*session);
    EXPECT_THAT(session.messages(), IsEmpty());
}

} // namespace
