// What a device's properties say of its operations: checkConstraints(device, mode, operation, family) and
// getDeviceOperationOptions.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto BS = MODE_TYPE::BS;

// A database of one family, "fam1", with this text.
Files family(const std::string& text) {
    return {{"base.acd", "DEVICE_SUPPORTED = base,fam1,spi\nPROGRAM_OPTION_PACKAGE = base,fam1,spi\n"},
            {"fam1.acd", text}};
}

} // namespace

TEST(OperationProperty, AnOperationMayRunInTheModesThatItsPropertyLists) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = PROGRAM,2,BS,KITECF:VERIFY,1,SPI\n"));
    EXPECT_TRUE(manager->checkConstraints("dev1", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_TRUE(manager->checkConstraints("dev1", MODE_TYPE::KITECF, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(manager->checkConstraints("dev1", MODE_TYPE::SPI, OP_TYPE::PROGRAM, nullptr));
    EXPECT_TRUE(manager->checkConstraints("dev1", MODE_TYPE::SPI, OP_TYPE::VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints("dev1", BS, OP_TYPE::ERASE, nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationProperty, EachModeIsMatchedByItsKeyName) {
    const char* const keys[] = {"BS", "SS", "SM", "BSFILE", "DP770", "SPI", "KITECF", "KITEMPM", "PFF"};
    for (int listed = 0; listed < 9; ++listed) {
        ManagerFixture manager(family("[dev1]\nPROPERTY = ERASE," + std::string(keys[listed]) + "\n"));
        for (int mode = 0; mode < 9; ++mode) {
            EXPECT_EQ(manager->checkConstraints("dev1", MODE_TYPE{mode}, OP_TYPE::ERASE, nullptr),
                      mode == listed);
        }
    }
}

TEST(OperationProperty, AValueThatIsNoModeCountsAsBoundaryScan) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = PROGRAM,BS:VERIFY,SS\n"));
    for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        EXPECT_TRUE(manager->checkConstraints("dev1", MODE_TYPE{mode}, OP_TYPE::PROGRAM, nullptr)) << mode;
        EXPECT_FALSE(manager->checkConstraints("dev1", MODE_TYPE{mode}, OP_TYPE::VERIFY, nullptr)) << mode;
    }
}

TEST(OperationProperty, ModesAndOperationsAreMatchedCaseIncluded) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = PROGRAM,3,bs,Bs,Bscan:program,1,BS\n"));
    EXPECT_FALSE(manager->checkConstraints("dev1", BS, OP_TYPE::PROGRAM, nullptr));
}

TEST(OperationProperty, TheNameIsCut) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = PROGRAM,BS\n[dev1_x]\nPROPERTY = PROGRAM,SS\n"));
    EXPECT_TRUE(manager->checkConstraints("dev1_x", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(manager->checkConstraints("dev1_x", MODE_TYPE::SS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(holds(manager.members().m_loadedFamilies, "dev1_x"));
}

TEST(OperationProperty, AFamilysPropertyHoldsForItsDevices) {
    ManagerFixture manager(family("PROPERTY = PROGRAM,BS\n[dev1]\n[dev2]\nPROPERTY = PROGRAM,SS\n"));
    EXPECT_TRUE(manager->checkConstraints("dev1", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(manager->checkConstraints("dev2", BS, OP_TYPE::PROGRAM, nullptr));
}

TEST(OperationProperty, TheFamilyArgumentHasNoEffect) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = PROGRAM,BS\n"));
    for (const char* named : {"fam2", "nobody", "", "%s", static_cast<const char*>(nullptr)}) {
        EXPECT_TRUE(manager->checkConstraints("dev1", BS, OP_TYPE::PROGRAM, named));
        EXPECT_FALSE(manager->checkConstraints("fam1", BS, OP_TYPE::PROGRAM, named));
    }
}

TEST(OperationProperty, AnUnknownDeviceIsSilentlyFalse) {
    ManagerFixture manager(family(""));
    EXPECT_FALSE(manager->checkConstraints("nobody", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(manager->checkConstraints(static_cast<const char*>(nullptr), BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationProperty, AValueThatIsNoOperationHasTheEmptyName) {
    // The conversion of the operation speaks, the check itself does not.
    ManagerFixture manager(family("[dev1]\nPROPERTY = ,BS:PROGRAM,BS\n[dev2]\nPROPERTY = PROGRAM,BS\n"));
    for (const int operation : {-2147483647 - 1, -1, 32, 2147483647}) {
        EXPECT_TRUE(manager->checkConstraints("dev1", BS, OP_TYPE{operation}, nullptr));
        EXPECT_FALSE(manager->checkConstraints("dev2", BS, OP_TYPE{operation}, nullptr));
        const auto messages = manager.messages();
        ASSERT_EQ(messages.size(), 2U);
        EXPECT_EQ(messages[0].channel, Port_MsgManData::Channel::INFO);
        EXPECT_EQ(messages[0].text, "Operation " + std::to_string(operation) + " is not defined.\n");
    }
}

TEST(OperationOptions, AnOperationsOptionsInAListedMode) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM,2,slow,fast\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS)),
                ElementsAre("fast", "slow"));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationOptions, AnUnlistedModeHasNoneEvenWhereThereAreSome) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM,1,fast:OP_PROGRAM_SS,1,x\n"));
    const auto& options = manager->getDeviceOperationOptions("dev1", "PROGRAM", MODE_TYPE::SS);
    EXPECT_EQ(&options, &manager.members().m_operationOptions);
    EXPECT_TRUE(options.empty());
}

TEST(OperationOptions, WithoutCommonOptionsTheModesOwnCount) {
    ManagerFixture manager(
        family("[dev1]\nPROPERTIES = PROGRAM,2,BS,SS:OP_PROGRAM_BS,1,scan:OP_PROGRAM_SS,1,serial\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS)), ElementsAre("scan"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", MODE_TYPE::SS)),
                ElementsAre("serial"));
}

TEST(OperationOptions, CommonOptionsComeBeforeTheModesOwn) {
    ManagerFixture manager(
        family("[dev1]\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM_BS,1,scan:OP_PROGRAM,1,common\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS)), ElementsAre("common"));
}

TEST(OperationOptions, TheFamilysCommonOptionsComeBeforeTheDevicesOwnOfTheMode) {
    ManagerFixture manager(family("PROPERTIES = OP_PROGRAM,1,common\n"
                                  "[dev1]\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM_BS,1,scan\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS)), ElementsAre("common"));
}

TEST(OperationOptions, EmptyCommonOptionsAreNone) {
    ManagerFixture manager(family("[dev1]\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM,0:OP_PROGRAM_BS,1,scan\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS)), ElementsAre("scan"));
}

TEST(OperationOptions, NeitherGivesTheEmptySet) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = PROGRAM,BS\n"));
    EXPECT_TRUE(manager->getDeviceOperationOptions("dev1", "PROGRAM", BS).empty());
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationOptions, TheOperationIsMatchedAsGivenButItsOptionsAreInUpperCase) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = Prog,BS:OP_PROG,upper:OP_Prog,mixed:PROGRAM,BS\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "Prog", BS)), ElementsAre("upper"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "program", BS)), IsEmpty());
}

TEST(OperationOptions, OnlyAsciiIsTurnedToUpperCase) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = \xe4z,BS:OP_\xe4Z,found\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "\xe4z", BS)), ElementsAre("found"));
}

TEST(OperationOptions, AnyTextMayBeAnOperation) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = my_own%s,BS:OP_MY_OWN%S_BS,x\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "my_own%s", BS)), ElementsAre("x"));
}

TEST(OperationOptions, ANullOperationIsTheEmptyText) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ,BS:OP_,x\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", nullptr, BS)), ElementsAre("x"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions(nullptr, nullptr, BS)), IsEmpty());
}

TEST(OperationOptions, AValueThatIsNoModeCountsAsBoundaryScan) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ERASE,BS:OP_ERASE_BS,x\n"));
    for (const int mode : {-2147483647 - 1, -1, 0, 9, 10, 2147483647}) {
        EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "ERASE", MODE_TYPE{mode})),
                    ElementsAre("x"));
    }
}

TEST(OperationOptions, ModesWithoutATableHaveOptionsToo) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ERASE,PFF:OP_ERASE_PFF,x\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "ERASE", MODE_TYPE::PFF)), ElementsAre("x"));
}

TEST(OperationOptions, TheNameIsNotCut) {
    ManagerFixture manager(family("[dev1]\nPROPERTY = ERASE,BS:OP_ERASE,whole\n"
                                  "[dev1_x]\nPROPERTY = ERASE,BS:OP_ERASE,package\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1_x", "ERASE", BS)), ElementsAre("package"));
    EXPECT_TRUE(holds(manager.members().m_loadedFamilies, "dev1_x"));
    EXPECT_FALSE(holds(manager.members().m_loadedFamilies, "dev1"));
}

TEST(OperationOptions, SpiModeHasNoPlaceOfItsOwn) {
    // Unlike the queries of the tables, this one answers for the device in SPI mode too.
    ManagerFixture manager(family("[dev1]\nPROPERTY = ERASE,SPI:OP_ERASE,x\n"));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "ERASE", MODE_TYPE::SPI)), ElementsAre("x"));
}
