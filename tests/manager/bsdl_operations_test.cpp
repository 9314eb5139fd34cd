// Which boundary-scan operations a device offers through an output: getBsdlOperations.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

const Files DATABASES = {
    {"base.acd", "DEVICE_SUPPORTED = fam2,spi,fam1\nPROGRAM_OPTION_PACKAGE = fam1,fam2,spi\n"},
    {"fam1.acd", "BSDL_OPERATION = BYPASS,PARALLEL,USB2:HIGHZ,PARALLEL:EXPRESSQSVF,STAPL\n[dev1]\n"},
    {"fam2.acd", "BSDL_OPERATION = CLAMP,PARALLEL\n[dev2]\n"},
    {"spi.acd", "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1,FLASH_2\nBSDL_OPERATION = PROGRAM,PARALLEL\n"}};

} // namespace

TEST(BsdlOperations, EachAllowedOperationIsABit) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getBsdlOperations("dev1", PARALLEL), maskOf(19, 20));
    EXPECT_EQ(manager->getBsdlOperations("dev1_p", OUTPUT_TYPE::USB2), maskOf(19));
    EXPECT_EQ(manager->getBsdlOperations("fam1", OUTPUT_TYPE::SVF), 0);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(BsdlOperations, TheLastOperationIsTheSignBit) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getBsdlOperations("dev1", OUTPUT_TYPE::STAPL), -2147483647 - 1);
}

TEST(BsdlOperations, EachFamilyHasItsOwnBlock) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getBsdlOperations("dev2", PARALLEL), maskOf(21));
    EXPECT_EQ(manager->getBsdlOperations("dev1", PARALLEL), maskOf(19, 20));
}

TEST(BsdlOperations, EveryCellIsItsOwn) {
    const char* const outputs[] = {"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"};
    std::string entry = "BSDL_OPERATION = ";
    for (int operation = 0; operation < 32; ++operation) {
        entry += std::string(operation == 0 ? "" : ":") +
                 ConstraintsManager::operationType2String(TARVIKNS::OP_TYPE{operation}).c_str() + "," +
                 outputs[operation % 5];
    }
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = a,m,spi,z\nPROGRAM_OPTION_PACKAGE = a,m,spi,z\n"},
              {"a.acd", ""},
              {"m.acd", entry + "\n"},
              {"z.acd", ""}});
    for (int output = 0; output < 5; ++output) {
        unsigned expected = 0;
        for (int operation = output; operation < 32; operation += 5) {
            expected |= 1U << static_cast<unsigned>(operation);
        }
        EXPECT_EQ(manager->getBsdlOperations("m", OUTPUT_TYPE{output}), static_cast<int>(expected));
        EXPECT_EQ(manager->getBsdlOperations("a", OUTPUT_TYPE{output}), 0);
        EXPECT_EQ(manager->getBsdlOperations("z", OUTPUT_TYPE{output}), 0);
    }
}

TEST(BsdlOperations, OutputsAboveTheTableGiveADebugMessageNegativeOnesNothing) {
    ManagerFixture manager(DATABASES);
    for (const bool exceptions : {true, false}) {
        manager->setExceptions(exceptions);
        for (const int output : BOUNDARY_VALUES) {
            EXPECT_EQ(manager->getBsdlOperations("dev2", OUTPUT_TYPE{output}), output == 0 ? maskOf(21) : 0);
            if (output < 5) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << output;
            } else {
                EXPECT_THAT(manager.messages(),
                            ElementsAre(debug("Outstream(Cable or file type) is out of range -- " +
                                              std::to_string(output) + ".\n")));
            }
        }
    }
}

TEST(BsdlOperations, AnUnsupportedFamilyIsRaisedBeforeTheRangeIsTested) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = fam3,spi\n"},
                                 {"fam3.acd", "[dev3]\n"}});
    for (const int output : BOUNDARY_VALUES) {
        expectRaises<OutOfRangeException>(
            1999, [&] { return manager->getBsdlOperations("dev3", OUTPUT_TYPE{output}); });
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(BsdlOperations, AnUnsupportedFamilyHasNoneWhileExceptionsAreOff) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                                 {"fam3.acd", "BSDL_OPERATION = CLAMP,PARALLEL\n[dev3]\n"}});
    manager->setExceptions(false);
    for (int output = -1; output < 5; ++output) {
        EXPECT_EQ(manager->getBsdlOperations("dev3", OUTPUT_TYPE{output}), 0);
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
    EXPECT_EQ(manager->getBsdlOperations("dev3", OUTPUT_TYPE{5}), 0);
    EXPECT_THAT(manager.messages(),
                ElementsAre(debug("Outstream(Cable or file type) is out of range -- 5.\n")));
}

TEST(BsdlOperations, AnSpiFlashAnswersFromTheSpiFamilyByItsWholeName) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getBsdlOperations("flash1", PARALLEL), maskOf(0));
    EXPECT_EQ(manager->getBsdlOperations("FLASH_2", PARALLEL), maskOf(0));
}

TEST(BsdlOperations, LoadingIsDecidedByTheLoadedOperations) {
    // "spi" has its operations since the start-up, but not its properties: those don't count here.
    ManagerFixture manager(DATABASES);
    static_cast<void>(manager->getBsdlOperations("FLASH1", PARALLEL));
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
}

TEST(BsdlOperations, AFamilyWhosePropertiesFailedToLoadIsTriedAgain) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd",
               "PROPERTY = BROKEN\nOPERATION = VERIFY,Bscan,PARALLEL\nBSDL_OPERATION = CLAMP,PARALLEL\n"}});
    expectRaises<DataMismatchException>(1011, [&] { return manager->getBsdlOperations("fam1", PARALLEL); });
    EXPECT_EQ(manager->getBsdlOperations("fam1", PARALLEL), maskOf(21));
    EXPECT_EQ(manager->getDeviceOperations("fam1", TARVIKNS::MODE_TYPE::BS, PARALLEL), maskOf(3));
}

TEST(BsdlOperations, AFamilyWithAPackageIsNoFamily) {
    ManagerFixture manager(DATABASES);
    expectRaises<OutOfRangeException>(1999, [&] { return manager->getBsdlOperations("fam1_x", PARALLEL); });
    expectRaises<OutOfRangeException>(1999, [&] { return manager->getBsdlOperations("fam1_x", PARALLEL); });
}

TEST(BsdlOperations, AnUnknownDeviceRaisesAsPackageThenAsFamily) {
    // "base" is tried again: what failed first is not in the list that is asked here.
    ManagerFixture manager(DATABASES);
    expectRaises<OutOfRangeException>(2024, [&] { return manager->getBsdlOperations("nobody", PARALLEL); });
    EXPECT_FALSE(holds(manager.members().m_operationsLoaded, "base"));
    expectRaises<OutOfRangeException>(1999, [&] { return manager->getBsdlOperations("nobody", PARALLEL); });
    EXPECT_TRUE(holds(manager.members().m_operationsLoaded, "base"));
    expectRaises<OutOfRangeException>(1999, [&] { return manager->getBsdlOperations("nobody", PARALLEL); });
}

TEST(BsdlOperations, ANullDeviceIsTheEmptyName) {
    ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    EXPECT_EQ(manager->getBsdlOperations(nullptr, PARALLEL), 0);
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.contains(StringBase("")));
}
