// May an operation run on a device, in a mode, through an output: checkConstraints with five arguments.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto SPI = MODE_TYPE::SPI;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;
constexpr auto VERIFY = OP_TYPE::VERIFY;

const Files DATABASES = {
    {"base.acd", "DEVICE_SUPPORTED = fam1,fam2,spi\nPROGRAM_OPTION_PACKAGE = fam1,fam2,spi\n"},
    {"fam1.acd", "OPERATION = VERIFY,Bscan,PARALLEL:EXPRESSQSVF,DTCONFIG,STAPL\n[dev1]\n"},
    {"fam2.acd", "OPERATION = ERASE,Bscan,PARALLEL\n[dev2]\n"},
    {"spi.acd", "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1,FLASH_2\n"
                "OPERATION = VERIFY,SPI,PARALLEL:VERIFY,Bscan,PARALLEL\n"}};

} // namespace

TEST(OperationChecks, AnAllowedOperationIsSilent) {
    ManagerFixture manager(DATABASES);
    EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "dev1", VERIFY, nullptr));
    EXPECT_TRUE(
        manager->checkConstraints(MODE_TYPE::DP770, OUTPUT_TYPE::STAPL, "dev1_p", OP_TYPE::EXPRESSQSVF, ""));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationChecks, ARefusalIsSilentToo) {
    ManagerFixture manager(DATABASES);
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev2", VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints(BS, OUTPUT_TYPE::USB2, "dev1", VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, PARALLEL, "dev1", VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev1", OP_TYPE::ERASE, nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationChecks, TheFamilyArgumentHasNoEffect) {
    ManagerFixture manager(DATABASES);
    for (const char* family : {"fam2", "nobody", "", "%s", static_cast<const char*>(nullptr)}) {
        EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "dev1", VERIFY, family));
        EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev2", VERIFY, family));
    }
    EXPECT_THAT(texts(manager.members().m_operationsLoaded), ElementsAre("spi", "fam1", "fam2"));
}

TEST(OperationChecks, ModesOutOfRangeGiveADebugMessage) {
    ManagerFixture manager(DATABASES);
    for (const bool exceptions : {true, false}) {
        manager->setExceptions(exceptions);
        for (const int mode : BOUNDARY_VALUES) {
            EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, PARALLEL, "dev1", VERIFY, nullptr),
                      mode == 0 || mode == 5);
            if (mode >= 0 && mode < 6) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << mode;
            } else {
                EXPECT_THAT(manager.messages(),
                            ElementsAre(debug("Mode is out of range -- " + std::to_string(mode) + ".\n")));
            }
        }
    }
}

TEST(OperationChecks, OutputsOutOfRangeGiveADebugMessageWithoutTheParenthesis) {
    ManagerFixture manager(DATABASES);
    for (const MODE_TYPE mode : {BS, SPI}) {
        for (const int output : BOUNDARY_VALUES) {
            EXPECT_EQ(manager->checkConstraints(mode, OUTPUT_TYPE{output}, "dev1", VERIFY, nullptr),
                      output == 0);
            if (output >= 0 && output < 5) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << output;
            } else {
                EXPECT_THAT(manager.messages(),
                            ElementsAre(debug("Outstream(Cable or file type is out of range -- " +
                                              std::to_string(output) + ".\n")));
            }
        }
    }
}

TEST(OperationChecks, OperationsOutOfRangeGiveADebugMessageThatIsMisspelt) {
    ManagerFixture manager(DATABASES);
    for (const MODE_TYPE mode : {BS, SPI}) {
        for (const int operation : BOUNDARY_VALUES) {
            EXPECT_FALSE(manager->checkConstraints(mode, PARALLEL, "dev1", OP_TYPE{operation}, nullptr));
            if (operation >= 0 && operation < 32) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << operation;
            } else {
                EXPECT_THAT(manager.messages(), ElementsAre(debug("Opeartion is out of range -- " +
                                                                  std::to_string(operation) + ".\n")));
            }
        }
    }
}

TEST(OperationChecks, ModeThenOutputThenOperationAreTested) {
    ManagerFixture manager(DATABASES);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{8}, OUTPUT_TYPE{7}, "dev1", OP_TYPE{32}, nullptr));
    EXPECT_FALSE(manager->checkConstraints(BS, OUTPUT_TYPE{7}, "dev1", OP_TYPE{32}, nullptr));
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev1", OP_TYPE{32}, nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(debug("Mode is out of range -- 8.\n"),
                                                debug("Outstream(Cable or file type is out of range -- 7.\n"),
                                                debug("Opeartion is out of range -- 32.\n")));
}

TEST(OperationChecks, TheRangesAreTestedBeforeTheFamilyIsLookedUp) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = fam3,spi\n"},
                                 {"fam3.acd", "[dev3]\n"}});
    const auto check = [&](int mode, int output, int operation) {
        return manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE{output}, "dev3", OP_TYPE{operation},
                                         nullptr);
    };
    // The first question loads the family, which fails before anything is tested.
    expectRaises<OutOfRangeException>(1999, [&] { return check(6, 5, 32); });
    EXPECT_FALSE(check(6, 5, 32));
    EXPECT_FALSE(check(0, 5, 32));
    EXPECT_FALSE(check(0, 0, 32));
    EXPECT_EQ(manager.messages().size(), 3U);
    expectRaises<OutOfRangeException>(1999, [&] { return check(0, 0, 31); });
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationChecks, AnUnsupportedFamilyIsRefusedWhileExceptionsAreOff) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                                 {"fam3.acd", "OPERATION = VERIFY,Bscan,PARALLEL\n[dev3]\n"}});
    manager->setExceptions(false);
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev3", VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "dev3", OP_TYPE{31}, "fam3"));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OperationChecks, SpiModeAnswersForSpiWhateverTheDevice) {
    ManagerFixture manager(DATABASES);
    for (const char* device : {"dev1", "nobody", "", static_cast<const char*>(nullptr)}) {
        EXPECT_TRUE(manager->checkConstraints(SPI, PARALLEL, device, VERIFY, nullptr));
        EXPECT_FALSE(manager->checkConstraints(SPI, PARALLEL, device, OP_TYPE::ERASE, nullptr));
    }
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.empty());
}

TEST(OperationChecks, SpiModeIsRaisedLastWhereSpiIsNotSupported) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"}});
    EXPECT_FALSE(manager->checkConstraints(SPI, OUTPUT_TYPE{5}, "x", VERIFY, nullptr));
    EXPECT_FALSE(manager->checkConstraints(SPI, PARALLEL, "x", OP_TYPE{32}, nullptr));
    expectRaises<OutOfRangeException>(
        1999, [&] { return manager->checkConstraints(SPI, PARALLEL, "x", VERIFY, nullptr); });
    manager->setExceptions(false);
    EXPECT_FALSE(manager->checkConstraints(SPI, PARALLEL, "x", VERIFY, nullptr));
}

TEST(OperationChecks, TheCutNameIsResolved) {
    // "FLASH_2" is an SPI flash, but "FLASH" is nothing; getDeviceOperations resolves the whole name.
    ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "FLASH_2", VERIFY, nullptr));
    EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "FLASH1", VERIFY, nullptr));
}

TEST(OperationChecks, AFamilyWithAPackageIsNoFamily) {
    ManagerFixture manager(DATABASES);
    expectRaises<OutOfRangeException>(
        1999, [&] { return manager->checkConstraints(BS, PARALLEL, "fam1_x", VERIFY, nullptr); });
    manager->setExceptions(false);
    EXPECT_FALSE(manager->checkConstraints(BS, PARALLEL, "fam1_x", VERIFY, nullptr));
    EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "fam1", VERIFY, nullptr));
}

TEST(OperationChecks, LoadingIsDecidedByTheLoadedOperations) {
    ManagerFixture manager(DATABASES);
    EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "FLASH1", VERIFY, nullptr));
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
}

TEST(OperationChecks, AFamilyWhosePropertiesFailedToLoadIsTriedAgain) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd", "PROPERTY = BROKEN\nOPERATION = VERIFY,Bscan,PARALLEL\n"}});
    expectRaises<DataMismatchException>(
        1011, [&] { return manager->checkConstraints(BS, PARALLEL, "fam1", VERIFY, nullptr); });
    EXPECT_TRUE(manager->checkConstraints(BS, PARALLEL, "fam1", VERIFY, nullptr));
}
