#include "CoreFixtures.h"

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
void expectBaseLoaded(TarvikTestPeer& peer) {
    EXPECT_THAT(texts(peer.supportedDevices()), ElementsAre("kestrel", "spi"));
    EXPECT_THAT(texts(peer.programOptionPackages()), ElementsAre("kestrel", "spi"));
    EXPECT_THAT(peer.bsCables(), ElementsAre(TARVIKNS::OUTPUT_TYPE::USB2));
    EXPECT_THAT(texts(peer.bsDevices()), ElementsAre("kestrel"));
    EXPECT_THAT(entries(peer.deviceIdcodes()), ElementsAre(Pair("KS50", "0x1")));
    EXPECT_THAT(texts(peer.notSupportedPartInMode()), ElementsAre("SS_KS50_PQ"));
    EXPECT_EQ(peer.operationTable()->blocks(), 2U);
    EXPECT_EQ(peer.bsdlOperationTable()->blocks(), 2U);
    EXPECT_EQ(peer.programOptionTable()->blocks(), 2U);
    EXPECT_THAT(peer.operationOrders(), SizeIs(32));
    EXPECT_THAT(peer.programOptionOrders(), SizeIs(24));
}

TEST(StartUp, OnGoodDataIsSilentAndFillsEverything) {
    ManagerSession session({{"base.acd", BASE}, {"spi.acd", "DEVICE_FAMILY = FLASH1\n"}});
    expectBaseLoaded(session.peer);
    EXPECT_THAT(texts(session.peer.spiNames()), ElementsAre("FLASH1"));
    EXPECT_THAT(session.peer.multibootTypes(), SizeIs(12));
    EXPECT_TRUE(session.peer.exceptions());
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(StartUp, ReadsNoFamilyButSpi) {
    ManagerSession session(
        {{"base.acd", BASE}, {"kestrel.acd", "OPERATION = PROGRAM,BS,USB2\nPROPERTY = A,1\n"}});
    EXPECT_THAT(texts(session.peer.operationsLoaded()), ElementsAre("spi"));
    EXPECT_THAT(texts(session.peer.programOptionsLoaded()), ElementsAre("spi"));
    EXPECT_THAT(session.peer.loadedFamilies(), IsEmpty());
    EXPECT_THAT(session.peer.deviceProperties(), IsEmpty());
    EXPECT_THAT(operationCells(session.peer), IsEmpty());
}

TEST(StartUp, TakesEntriesOfTheBaseDatabaseForNoFamilys) {
    ManagerSession session(
        {{"base.acd", std::string(BASE) + "OPERATION = PROGRAM,BS,USB2\nPROGRAM_OPTION = OTP\n"}});
    EXPECT_THAT(operationCells(session.peer), IsEmpty());
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(StartUp, OptionThatCannotBeReadEndsItBeforeTheMultibootTypes) {
    for (const char* option : {"OTP", "RS_PIN0", "nonsense", ""}) {
        ManagerSession session({{"base.acd", BASE},
                                {"spi.acd", std::string("DEVICE_FAMILY = FLASH1\n"
                                                        "FLASH1_PROPERTY = SIZE,4\n"
                                                        "BPI3_DEVICES = F\n"
                                                        "OPERATION = PROGRAM,SPI,USB2\n"
                                                        "BSDL_OPERATION = BYPASS,SVF\n"
                                                        "TYPE_BPI_SERIAL_LEAD = KS50\n"
                                                        "PROGRAM_OPTION = ERASE,SPI,USB2:") +
                                                option + ",SPI,USB2:VERIFY,SPI,USB2\n"}});
        expectBaseLoaded(session.peer);
        EXPECT_THAT(texts(session.peer.spiNames()), ElementsAre("FLASH1"));
        EXPECT_THAT(entries(session.peer.spiProperties()), ElementsAre(Pair("FLASH1SIZE", "4")));
        EXPECT_THAT(texts(session.peer.bpi3Devices()), ElementsAre("F"));
        EXPECT_THAT(operationCells(session.peer), ElementsAre(Cell{1, 0, 5, 2}));
        EXPECT_THAT(bsdlOperationCells(session.peer), ElementsAre(Cell{1, 19, 0, 3}));
        EXPECT_THAT(programOptionCells(session.peer), ElementsAre(Cell{1, 0, 5, 2}));
        EXPECT_THAT(texts(session.peer.operationsLoaded()), ElementsAre("spi"));
        EXPECT_THAT(session.peer.programOptionsLoaded(), IsEmpty());
        EXPECT_THAT(session.peer.multibootTypes(), IsEmpty());
        EXPECT_TRUE(session.peer.exceptions());
    }
}

TEST(StartUp, OptionThatCannotBeReadIsReportedOnce) {
    ManagerSession session({{"base.acd", BASE}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    const auto messages = session.messages.take();
    ASSERT_THAT(messages, SizeIs(1));
    EXPECT_EQ(messages[0].channel, Port_MsgManData::Channel::INFO);
    EXPECT_EQ(messages[0].line, 1500);
    EXPECT_THAT(messages[0].text, HasSubstr("DataMismatchException"));
}

TEST(StartUp, OptionsThatEndedItAreTriedOnceMoreAndNotAgain) {
    ManagerSession session({{"base.acd", BASE}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    const auto raised = [&] {
        return raisedLine<DataMismatchException>([&] { session.peer.loadDeviceData("spi", nullptr); });
    };
    EXPECT_EQ(raised(), 1500);
    EXPECT_THAT(texts(session.peer.programOptionsLoaded()), ElementsAre("spi"));
    EXPECT_EQ(raised(), -1);
}

TEST(StartUp, UnreadableSpiDatabaseEndsItBeforeTheSpiCatalogue) {
    const DatabaseDirectory directory;
    directory.writeFile("base.acd", BASE);
    directory.makeDirectory("spi.acd");
    ManagerSession session(directory);
    expectBaseLoaded(session.peer);
    EXPECT_THAT(session.peer.spiNames(), IsEmpty());
    EXPECT_THAT(session.peer.operationsLoaded(), IsEmpty());
    EXPECT_THAT(session.peer.programOptionsLoaded(), IsEmpty());
    EXPECT_THAT(session.peer.multibootTypes(), IsEmpty());
    EXPECT_THAT(session.peer.deviceFamilyCache(), IsEmpty());
    EXPECT_TRUE(session.peer.exceptions());
    const auto messages = session.messages.take();
    ASSERT_THAT(messages, Not(IsEmpty()));
    EXPECT_EQ(messages.back().channel, Port_MsgManData::Channel::INFO);
    EXPECT_THAT(messages.back().text, HasSubstr("DataNotFoundException"));
}

TEST(StartUp, MissingBaseDatabaseLeavesAnEmptyManager) {
    ManagerSession session(Files{{"spi.acd", "DEVICE_FAMILY = FLASH1\nTYPE_BPI_SERIAL_LEAD = KS50\n"}});
    EXPECT_EQ(session.peer.devKey(), nullptr);
    EXPECT_EQ(session.peer.supportedDevices().size(), 0U);
    EXPECT_EQ(session.peer.operationTable()->blocks(), 0U);
    EXPECT_EQ(session.peer.bsdlOperationTable()->blocks(), 0U);
    EXPECT_EQ(session.peer.programOptionTable()->blocks(), 0U);
    EXPECT_THAT(session.manager.getOperationOrders(), IsEmpty());
    EXPECT_THAT(session.manager.getProgramOptionOrders(), IsEmpty());
    EXPECT_THAT(session.peer.spiNames(), IsEmpty());
    EXPECT_THAT(session.peer.operationsLoaded(), IsEmpty());
    EXPECT_THAT(session.peer.multibootTypes(), IsEmpty());
    EXPECT_TRUE(session.peer.exceptions());
    const auto messages = session.messages.take();
    ASSERT_THAT(messages, Not(IsEmpty()));
    EXPECT_EQ(messages.back().channel, Port_MsgManData::Channel::INFO);
    EXPECT_THAT(messages.back().text, HasSubstr("DataNotFoundException"));
}

TEST(StartUp, UnreadableBaseDatabaseLeavesAnEmptyManager) {
    const DatabaseDirectory directory;
    directory.makeDirectory("base.acd");
    ManagerSession session(directory);
    EXPECT_EQ(session.peer.devKey(), nullptr);
    EXPECT_EQ(session.peer.operationTable()->blocks(), 0U);
    EXPECT_THAT(session.manager.getOperationOrders(), IsEmpty());
    EXPECT_TRUE(session.peer.exceptions());
}

TEST(StartUp, AnyFaultLeavesOneManagerForAllLaterCalls) {
    ManagerSession session(Files{});
    (void)session.messages.take();
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &session.manager);
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

} // namespace
