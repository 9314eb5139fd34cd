#include "CoreFixtures.h"

#include <cstdint>

// Making and removing the manager, the exceptions switch, and what is handed out by reference.

using TARVIKNS::MODE_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

namespace {

TEST(Lifecycle, AbsentAtFirst) { EXPECT_EQ(TarvikTestPeer::instance(), nullptr); }

TEST(Lifecycle, EveryCallGivesTheSameManager) {
    AcdStore::setMemoryFiles({{"base.acd", ""}});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    ASSERT_NE(manager, nullptr);
    EXPECT_EQ(TarvikTestPeer::instance(), manager);
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), manager);
    TarvikTestPeer::reset();
}

TEST(Lifecycle, StartsUpOnce) {
    ManagerSession session({{"base.acd", ""}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    EXPECT_THAT(session.messages.take(), SizeIs(1));
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &session.manager);
    EXPECT_THAT(session.messages.take(), IsEmpty());
    EXPECT_THAT(session.manager.getOperationOrders(), SizeIs(32));
}

TEST(Lifecycle, LaterCallKeepsTheExceptionsSwitch) {
    BaseSession session("");
    session.manager.setExceptions(false);
    (void)ConstraintsManager::getConstraintsManager();
    EXPECT_FALSE(session.peer.exceptions());
}

TEST(Lifecycle, RemovalLeavesThePointerAsItStands) {
    AcdStore::setMemoryFiles({{"base.acd", "DEVICE_SUPPORTED = kestrel\n"}});
    const auto before = reinterpret_cast<std::uintptr_t>(ConstraintsManager::getConstraintsManager());
    ConstraintsManager::RemoveConstraintsManager();
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(TarvikTestPeer::instance()), before);
}

TEST(Lifecycle, RemovalWithoutAManagerDoesNothing) {
    ConstraintsManager::RemoveConstraintsManager();
    EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
    BaseSession session("");
    EXPECT_THAT(session.manager.getOperationOrders(), SizeIs(32));
}

TEST(Lifecycle, RemovalAfterAStartUpThatBuiltNoTables) {
    MessageRecorder recorder;
    AcdStore::setMemoryFiles({});
    ASSERT_NE(ConstraintsManager::getConstraintsManager(), nullptr);
    ConstraintsManager::RemoveConstraintsManager();
}

TEST(Exceptions, AreOnAfterTheStartUp) {
    BaseSession session("");
    EXPECT_TRUE(session.peer.exceptions());
}

TEST(Exceptions, SwitchStoresItsArgumentAndNothingElse) {
    BaseSession session("");
    session.manager.setExceptions(false);
    EXPECT_FALSE(session.peer.exceptions());
    session.manager.setExceptions(false);
    EXPECT_FALSE(session.peer.exceptions());
    session.manager.setExceptions(true);
    EXPECT_TRUE(session.peer.exceptions());
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(Orders, OperationsAreThoseFrom0To31InAscendingOrder) {
    BaseSession session("");
    int value = 0;
    for (const TARVIKNS::OP_TYPE operation : session.manager.getOperationOrders()) {
        EXPECT_EQ(static_cast<int>(operation), value++);
    }
    EXPECT_EQ(value, 32);
}

TEST(Orders, OptionsAreThoseFrom0To23InAscendingOrder) {
    BaseSession session("");
    int value = 0;
    for (const TARVIKNS::PROGRAM_OPTION option : session.manager.getProgramOptionOrders()) {
        EXPECT_EQ(static_cast<int>(option), value++);
    }
    EXPECT_EQ(value, 24);
}

TEST(Orders, AreTheManagersOwn) {
    BaseSession session("");
    EXPECT_EQ(&session.manager.getOperationOrders(), &session.peer.operationOrders());
    EXPECT_EQ(&session.manager.getProgramOptionOrders(), &session.peer.programOptionOrders());
}

TEST(ModeLookUp, GivesTheSetOfEachMode) {
    BaseSession session("BS = outs:fams,kestrel\n");
    const auto sets = modeDevices(session.peer);
    for (int mode = 0; mode < 9; ++mode) {
        EXPECT_EQ(session.peer.modeDeviceSet(MODE_TYPE{mode}, 583), sets[static_cast<std::size_t>(mode)]);
        EXPECT_EQ(session.peer.modeDeviceSet(MODE_TYPE{mode}, 644), sets[static_cast<std::size_t>(mode)]);
    }
}

TEST(ModeLookUp, RaisesAtItsLocationForAValueThatIsNoMode) {
    BaseSession session("");
    for (const int mode : {9, -1, 2147483647, -2147483647 - 1}) {
        for (const int location : {583, 644}) {
            EXPECT_EQ(raisedLine<OutOfRangeException>(
                          [&] { (void)session.peer.modeDeviceSet(MODE_TYPE{mode}, location); }),
                      location);
        }
    }
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(ModeLookUp, GivesNothingWhileExceptionsAreOff) {
    BaseSession session("");
    session.manager.setExceptions(false);
    for (const int mode : {9, -1, 2147483647, -2147483647 - 1}) {
        EXPECT_EQ(session.peer.modeDeviceSet(MODE_TYPE{mode}, 583), nullptr);
        EXPECT_EQ(session.peer.modeDeviceSet(MODE_TYPE{mode}, 644), nullptr);
    }
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(Members, WithoutDataAreEmpty) {
    BaseSession session("");
    TarvikTestPeer& peer = session.peer;
    for (const auto* outputs : modeOutputs(peer)) {
        EXPECT_THAT(*outputs, IsEmpty());
    }
    for (const auto* devices : modeDevices(peer)) {
        EXPECT_EQ(devices->size(), 0U);
    }
    EXPECT_EQ(peer.supportedDevices().size(), 0U);
    EXPECT_EQ(peer.programOptionPackages().size(), 0U);
    EXPECT_EQ(peer.notSupportedPartInMode().size(), 0U);
    EXPECT_THAT(peer.deviceIdcodes(), IsEmpty());
    EXPECT_THAT(peer.loadedFamilies(), IsEmpty());
    EXPECT_THAT(peer.deviceProperties(), IsEmpty());
    EXPECT_THAT(peer.programOptionPackageIndex(), IsEmpty());
    EXPECT_THAT(peer.operationOptions(), IsEmpty());
    EXPECT_THAT(peer.spiNames(), IsEmpty());
    EXPECT_THAT(peer.spiFamilies(), IsEmpty());
    EXPECT_THAT(peer.spiProperties(), IsEmpty());
    EXPECT_THAT(session.messages.take(), IsEmpty());
}

TEST(Members, TablesAreSizedByTheirLists) {
    BaseSession session("DEVICE_SUPPORTED = a,b,c,a\nPROGRAM_OPTION_PACKAGE = x,y\n");
    EXPECT_EQ(session.peer.operationTable()->blocks(), 3U);
    EXPECT_EQ(session.peer.bsdlOperationTable()->blocks(), 3U);
    EXPECT_EQ(session.peer.programOptionTable()->blocks(), 2U);
}

TEST(Members, TablesOfNothingHaveNoBlocks) {
    BaseSession session("");
    EXPECT_EQ(session.peer.operationTable()->blocks(), 0U);
    EXPECT_EQ(session.peer.bsdlOperationTable()->blocks(), 0U);
    EXPECT_EQ(session.peer.programOptionTable()->blocks(), 0U);
}

TEST(Members, CellsStartFalse) {
    BaseSession session("DEVICE_SUPPORTED = a,b\nPROGRAM_OPTION_PACKAGE = x,y\n");
    EXPECT_THAT(operationCells(session.peer), IsEmpty());
    EXPECT_THAT(bsdlOperationCells(session.peer), IsEmpty());
    EXPECT_THAT(programOptionCells(session.peer), IsEmpty());
}

TEST(Members, BaseAccessorOutlivesTheStartUp) {
    BaseSession session("DEVICE_SUPPORTED = kestrel\n");
    ASSERT_NE(session.peer.devKey(), nullptr);
    EXPECT_STREQ(session.peer.devKey()->getstringbykey("DEVICE_SUPPORTED", ",", 0, nullptr, 0), "kestrel");
}

} // namespace
