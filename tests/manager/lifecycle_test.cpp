#include "Members.h"

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
    ManagerFixture session({{"base.acd", ""}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    EXPECT_THAT(session.messages(), SizeIs(1));
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &*session);
    EXPECT_THAT(session.messages(), IsEmpty());
    EXPECT_THAT(session->getOperationOrders(), SizeIs(32));
}

TEST(Lifecycle, LaterCallKeepsTheExceptionsSwitch) {
    ManagerFixture session(Base{""});
    session->setExceptions(false);
    (void)ConstraintsManager::getConstraintsManager();
    EXPECT_FALSE(session.members().m_exceptions);
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
    ManagerFixture session(Base{""});
    EXPECT_THAT(session->getOperationOrders(), SizeIs(32));
}

TEST(Lifecycle, RemovalAfterAStartUpThatBuiltNoTables) {
    MessageRecorder recorder;
    AcdStore::setMemoryFiles({});
    ASSERT_NE(ConstraintsManager::getConstraintsManager(), nullptr);
    ConstraintsManager::RemoveConstraintsManager();
}

TEST(Lifecycle, AMessageSinkThatAsksForTheManagerDuringTheStartUpGetsNull) {
    AcdStore::setMemoryFiles({{"base.acd", ""}, {"spi.acd", "PROGRAM_OPTION = OTP,SPI,USB2\n"}});
    std::vector<ConstraintsManager*> answers;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message&) {
        ASSERT_LT(answers.size(), 10U);
        answers.push_back(ConstraintsManager::getConstraintsManager());
    });
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    EXPECT_NE(manager, nullptr);
    EXPECT_THAT(answers, ElementsAre(nullptr));

    EXPECT_EQ(manager->operationType2String(TARVIKNS::NO_OPERATION), StringBase(""));
    EXPECT_THAT(answers, ElementsAre(nullptr, manager));
    TarvikTestPeer::reset();
}

TEST(Exceptions, AreOnAfterTheStartUp) {
    ManagerFixture session(Base{""});
    EXPECT_TRUE(session.members().m_exceptions);
}

TEST(Exceptions, SwitchStoresItsArgumentAndNothingElse) {
    ManagerFixture session(Base{""});
    session->setExceptions(false);
    EXPECT_FALSE(session.members().m_exceptions);
    session->setExceptions(false);
    EXPECT_FALSE(session.members().m_exceptions);
    session->setExceptions(true);
    EXPECT_TRUE(session.members().m_exceptions);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Orders, OperationsAreThoseFrom0To31InAscendingOrder) {
    ManagerFixture session(Base{""});
    int value = 0;
    for (const TARVIKNS::OP_TYPE operation : session->getOperationOrders()) {
        EXPECT_EQ(static_cast<int>(operation), value++);
    }
    EXPECT_EQ(value, 32);
}

TEST(Orders, OptionsAreThoseFrom0To23InAscendingOrder) {
    ManagerFixture session(Base{""});
    int value = 0;
    for (const TARVIKNS::PROGRAM_OPTION option : session->getProgramOptionOrders()) {
        EXPECT_EQ(static_cast<int>(option), value++);
    }
    EXPECT_EQ(value, 24);
}

TEST(Orders, AreTheManagersOwn) {
    ManagerFixture session(Base{""});
    EXPECT_EQ(&session->getOperationOrders(), &session.members().m_operationOrders);
    EXPECT_EQ(&session->getProgramOptionOrders(), &session.members().m_programOptionOrders);
}

using ModeLookUp = const NameSet* (TarvikTestPeer::Members::*)(MODE_TYPE) const;

/// The two look-ups, and where each raises.
const std::map<int, ModeLookUp> MODE_LOOK_UPS{{583, &TarvikTestPeer::Members::dumpedModeDeviceSet},
                                              {644, &TarvikTestPeer::Members::checkedModeDeviceSet}};

TEST(ModeLookUp, GivesTheSetOfEachMode) {
    ManagerFixture session(Base{"BS = outs:fams,kestrel\n"});
    const auto sets = modeDevices(session.members());
    for (const auto& [location, lookUp] : MODE_LOOK_UPS) {
        for (int mode = 0; mode < 9; ++mode) {
            EXPECT_EQ((session.members().*lookUp)(MODE_TYPE{mode}), sets[static_cast<std::size_t>(mode)]);
        }
    }
}

TEST(ModeLookUp, RaisesAtItsLocationForAValueThatIsNoMode) {
    ManagerFixture session(Base{""});
    for (const int mode : {9, -1, 2147483647, -2147483647 - 1}) {
        for (const auto& [location, lookUp] : MODE_LOOK_UPS) {
            EXPECT_EQ(raisedLine<OutOfRangeException>(
                          [&, look = lookUp] { (void)(session.members().*look)(MODE_TYPE{mode}); }),
                      location);
        }
    }
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ModeLookUp, GivesNothingWhileExceptionsAreOff) {
    ManagerFixture session(Base{""});
    session->setExceptions(false);
    for (const int mode : {9, -1, 2147483647, -2147483647 - 1}) {
        for (const auto& [location, lookUp] : MODE_LOOK_UPS) {
            EXPECT_EQ((session.members().*lookUp)(MODE_TYPE{mode}), nullptr);
        }
    }
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Members, WithoutDataAreEmpty) {
    ManagerFixture session(Base{""});
    TarvikTestPeer::Members& members = session.members();
    for (const auto* outputs : modeOutputs(members)) {
        EXPECT_THAT(*outputs, IsEmpty());
    }
    for (const auto* devices : modeDevices(members)) {
        EXPECT_EQ(devices->size(), 0U);
    }
    EXPECT_EQ(members.m_supportedDevices.size(), 0U);
    EXPECT_EQ(members.m_programOptionPackages.size(), 0U);
    EXPECT_EQ(members.m_notSupportedPartInMode.size(), 0U);
    EXPECT_THAT(members.m_deviceIdcodes.get(), IsEmpty());
    EXPECT_THAT(members.m_loadedFamilies, IsEmpty());
    EXPECT_THAT(members.m_deviceProperties, IsEmpty());
    EXPECT_THAT(members.m_programOptionPackageIndex, IsEmpty());
    EXPECT_THAT(members.m_operationOptions, IsEmpty());
    EXPECT_THAT(members.m_spiNames, IsEmpty());
    EXPECT_THAT(members.m_spiFamilies, IsEmpty());
    EXPECT_THAT(members.m_spiProperties.get(), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Members, TablesAreSizedByTheirLists) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = a,b,c,a\nPROGRAM_OPTION_PACKAGE = x,y\n"});
    EXPECT_EQ(session.members().m_operationTable.blocks(), 3U);
    EXPECT_EQ(session.members().m_bsdlOperationTable.blocks(), 3U);
    EXPECT_EQ(session.members().m_programOptionTable.blocks(), 2U);
}

TEST(Members, TablesOfNothingHaveNoBlocks) {
    ManagerFixture session(Base{""});
    EXPECT_EQ(session.members().m_operationTable.blocks(), 0U);
    EXPECT_EQ(session.members().m_bsdlOperationTable.blocks(), 0U);
    EXPECT_EQ(session.members().m_programOptionTable.blocks(), 0U);
}

TEST(Members, CellsStartFalse) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = a,b\nPROGRAM_OPTION_PACKAGE = x,y\n"});
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
}

TEST(Members, BaseAccessorOutlivesTheStartUp) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    ASSERT_NE(session.members().m_devKey, nullptr);
    EXPECT_STREQ(session.members().m_devKey->getstringbykey("DEVICE_SUPPORTED", ",", 0, nullptr, 0),
                 "kestrel");
}

} // namespace
