// Which operations a device offers in a mode through an output: getDeviceOperations.
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
constexpr auto USB2 = OUTPUT_TYPE::USB2;

const Files DATABASES = {
    {"base.acd", "DEVICE_SUPPORTED = fam2,spi,fam1\nPROGRAM_OPTION_PACKAGE = fam1,fam2,spi\n"},
    {"fam1.acd", "OPERATION = PROGRAM,Bscan,PARALLEL,USB2:VERIFY,Bscan,USB2:ERASE,SSerial,PARALLEL:"
                 "EXPRESSQSVF,Smap,STAPL:BYPASS,DTCONFIG,ZORVA:HIGHZ,BSFILE,SVF\n[dev1]\n"},
    {"fam2.acd", "OPERATION = CLAMP,Bscan,PARALLEL\n[dev2]\n"},
    {"spi.acd", "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1,FLASH_2\n"
                "OPERATION = BLANKCHECK,SPI,PARALLEL:CONLD,Bscan,PARALLEL\n"}};

} // namespace

TEST(DeviceOperations, EachAllowedOperationIsABit) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), maskOf(0));
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, USB2), maskOf(0, 3));
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::SS, PARALLEL), maskOf(4));
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::BSFILE, OUTPUT_TYPE::SVF), maskOf(20));
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::DP770, OUTPUT_TYPE::ZORVA), maskOf(19));
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, OUTPUT_TYPE::STAPL), 0);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, TheLastOperationIsTheSignBit) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::SM, OUTPUT_TYPE::STAPL), -2147483647 - 1);
}

TEST(DeviceOperations, AllOperationsAtOnceFillTheMask) {
    std::string entry = "OPERATION = ";
    for (int operation = 0; operation < 32; ++operation) {
        entry += ConstraintsManager::operationType2String(OP_TYPE{operation}).c_str();
        entry += operation < 31 ? ",SPI,STAPL:" : ",SPI,STAPL\n";
    }
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = spi\n"}, {"spi.acd", entry}});
    EXPECT_EQ(manager->getDeviceOperations("", SPI, OUTPUT_TYPE::STAPL), -1);
    EXPECT_EQ(manager->getDeviceOperations("", SPI, OUTPUT_TYPE::SVF), 0);
}

TEST(DeviceOperations, EachFamilyHasItsOwnBlock) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("dev2", BS, PARALLEL), maskOf(21));
    EXPECT_EQ(manager->getDeviceOperations("dev1", BS, PARALLEL), maskOf(0));
    EXPECT_EQ(manager->getDeviceOperations("dev2", BS, PARALLEL), maskOf(21));
}

TEST(DeviceOperations, APackageBehindTheNameChangesNothing) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("dev1_pkg_x", BS, USB2), maskOf(0, 3));
    EXPECT_EQ(manager->getDeviceOperations("DEV1", BS, USB2), maskOf(0, 3));
}

TEST(DeviceOperations, AFamilyAnswersForItself) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("fam1", BS, USB2), maskOf(0, 3));
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.empty());
}

TEST(DeviceOperations, AFamilyWithAPackageIsNoFamily) {
    // The cut name is supported, so the name is not resolved; but no family has the whole name.
    ManagerFixture manager(DATABASES);
    expectRaises<OutOfRangeException>(1999, [&] { return manager->getDeviceOperations("fam1_x", BS, USB2); });
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceOperations("fam1_x", BS, USB2), 0);
    EXPECT_EQ(manager->getDeviceOperations("fam1", BS, USB2), maskOf(0, 3));
}

TEST(DeviceOperations, SpiModeAnswersForSpiWhateverTheDevice) {
    ManagerFixture manager(DATABASES);
    for (const char* device : {"dev1", "nobody", "", "fam1_x", static_cast<const char*>(nullptr)}) {
        EXPECT_EQ(manager->getDeviceOperations(device, SPI, PARALLEL), maskOf(6));
    }
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.empty());
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, AnSpiFlashAnswersFromTheSpiFamilyInEveryMode) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("flash1", BS, PARALLEL), maskOf(24));
}

TEST(DeviceOperations, TheWholeNameIsResolved) {
    // "FLASH_2" is an SPI flash, "FLASH" is nothing.
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getDeviceOperations("FLASH_2", BS, PARALLEL), maskOf(24));
}

TEST(DeviceOperations, ModesWithoutARowAreSilentlyZero) {
    ManagerFixture manager(DATABASES);
    for (const bool exceptions : {true, false}) {
        manager->setExceptions(exceptions);
        for (const int mode : BOUNDARY_VALUES) {
            if (mode < 0 || mode > 5) {
                EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE{mode}, PARALLEL), 0) << mode;
            }
        }
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, OutputsWithoutACellAreSilentlyZero) {
    ManagerFixture manager(DATABASES);
    for (const MODE_TYPE mode : {BS, SPI}) {
        for (const int output : BOUNDARY_VALUES) {
            if (output < 0 || output > 4) {
                EXPECT_EQ(manager->getDeviceOperations("dev1", mode, OUTPUT_TYPE{output}), 0) << output;
            }
        }
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, EveryCellIsItsOwn) {
    // The whole extent of one block: a cell written through one mode and output shows through no other.
    const char* const modes[] = {"Bscan", "SS", "SM", "BSFILE", "DP770", "SPI"};
    const char* const outputs[] = {"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"};
    std::string entry = "OPERATION = ";
    for (std::size_t mode = 0; mode < 6; ++mode) {
        for (std::size_t output = 0; output < 5; ++output) {
            const auto operation = OP_TYPE{static_cast<int>(mode * 5 + output)};
            entry += std::string(mode + output == 0 ? "" : ":") +
                     ConstraintsManager::operationType2String(operation).c_str() + "," + modes[mode] + "," +
                     outputs[output];
        }
    }
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = a,spi,z\nPROGRAM_OPTION_PACKAGE = a,spi,z\n"},
              {"a.acd", ""},
              {"spi.acd", entry + "\n"},
              {"z.acd", ""}});
    for (int mode = 0; mode < 6; ++mode) {
        for (int output = 0; output < 5; ++output) {
            EXPECT_EQ(manager->getDeviceOperations("spi", MODE_TYPE{mode}, OUTPUT_TYPE{output}),
                      maskOf(mode * 5 + output));
            for (const char* other : {"a", "z"}) {
                if (mode != 5) {
                    EXPECT_EQ(manager->getDeviceOperations(other, MODE_TYPE{mode}, OUTPUT_TYPE{output}), 0);
                }
            }
        }
    }
}

TEST(DeviceOperations, TheFamilyIsLoadedOnceAndTheDeviceNotAtAll) {
    ManagerFixture manager(DATABASES);
    static_cast<void>(manager->getDeviceOperations("dev1", BS, PARALLEL));
    static_cast<void>(manager->getDeviceOperations("dev1", BS, PARALLEL));
    EXPECT_THAT(texts(manager.members().m_loadedFamilies), ElementsAre("fam1"));
    EXPECT_THAT(texts(manager.members().m_operationsLoaded), ElementsAre("spi", "fam1"));
    EXPECT_THAT(texts(manager.members().m_programOptionsLoaded), ElementsAre("spi", "fam1"));
}

TEST(DeviceOperations, LoadingIsDecidedByTheLoadedProperties) {
    // "spi" has its operations since the start-up, but not its properties: those alone count here.
    ManagerFixture manager(DATABASES);
    EXPECT_FALSE(holds(manager.members().m_loadedFamilies, "spi"));
    static_cast<void>(manager->getDeviceOperations("FLASH1", BS, PARALLEL));
    EXPECT_TRUE(holds(manager.members().m_loadedFamilies, "spi"));
}

TEST(DeviceOperations, AFamilyWhosePropertiesFailedToLoadHasNoOperations) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd", "PROPERTY = BROKEN\nOPERATION = VERIFY,Bscan,PARALLEL\n"}});
    expectRaises<DataMismatchException>(1011,
                                        [&] { return manager->getDeviceOperations("fam1", BS, PARALLEL); });
    EXPECT_EQ(manager->getDeviceOperations("fam1", BS, PARALLEL), 0);
    EXPECT_TRUE(holds(manager.members().m_loadedFamilies, "fam1"));
    EXPECT_FALSE(holds(manager.members().m_operationsLoaded, "fam1"));
}

TEST(DeviceOperations, AnUnsupportedFamilyIsRaisedBeforeTheRangesAreTested) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = fam3,spi\n"},
                                 {"fam3.acd", "[dev3]\n"}});
    for (const int mode : BOUNDARY_VALUES) {
        if (mode != 5) {
            expectRaises<OutOfRangeException>(
                1999, [&] { return manager->getDeviceOperations("dev3", MODE_TYPE{mode}, OUTPUT_TYPE{7}); });
        }
    }
    for (const int output : BOUNDARY_VALUES) {
        expectRaises<OutOfRangeException>(
            1999, [&] { return manager->getDeviceOperations("dev3", MODE_TYPE::BS, OUTPUT_TYPE{output}); });
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, AnUnsupportedFamilyHasNoOperationsWhileExceptionsAreOff) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                                 {"fam3.acd", "OPERATION = VERIFY,Bscan,PARALLEL\n[dev3]\n"}});
    manager->setExceptions(false);
    for (int mode = -1; mode < 10; ++mode) {
        for (int output = -1; output < 10; ++output) {
            EXPECT_EQ(manager->getDeviceOperations("dev3", MODE_TYPE{mode}, OUTPUT_TYPE{output}), 0);
        }
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, SpiModeIsRaisedWhereSpiIsNotSupported) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = fam1\nPROGRAM_OPTION_PACKAGE = fam1\n"},
                                 {"fam1.acd", "OPERATION = VERIFY,SPI,PARALLEL\n[dev1]\n"}});
    expectRaises<OutOfRangeException>(1999,
                                      [&] { return manager->getDeviceOperations("dev1", SPI, PARALLEL); });
    expectRaises<OutOfRangeException>(
        1999, [&] { return manager->getDeviceOperations("dev1", SPI, OUTPUT_TYPE::NONE); });
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceOperations("dev1", SPI, PARALLEL), 0);
}

TEST(DeviceOperations, AnUnknownDeviceRaisesFirstAsPackageThenAsFamily) {
    // Its family "base" is loaded once, and fails at its program options; what is loaded is not tried again.
    ManagerFixture manager(DATABASES);
    expectRaises<OutOfRangeException>(2024,
                                      [&] { return manager->getDeviceOperations("nobody", BS, PARALLEL); });
    expectRaises<OutOfRangeException>(1999,
                                      [&] { return manager->getDeviceOperations("nobody", BS, PARALLEL); });
    expectRaises<OutOfRangeException>(1999,
                                      [&] { return manager->getDeviceOperations("another", BS, PARALLEL); });
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, ANullDeviceIsTheEmptyName) {
    ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceOperations(nullptr, BS, PARALLEL), 0);
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.contains(StringBase("")));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, TheBaseDatabaseCanBeAFamilyForUnknownDevices) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = base,spi\nPROGRAM_OPTION_PACKAGE = base,spi\n"
                           "OPERATION = READIDCODE,Bscan,PARALLEL\n"}});
    EXPECT_EQ(manager->getDeviceOperations("nobody", BS, PARALLEL), maskOf(9));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceOperations, ABrokenRecordKeepsTheCellsBeforeIt) {
    ManagerFixture manager(Files{
        {"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
        {"fam1.acd", "OPERATION = VERIFY,Bscan,PARALLEL:NOSUCH,Bscan,PARALLEL:ERASE,Bscan,PARALLEL\n"}});
    expectRaises<OutOfRangeException>(1631,
                                      [&] { return manager->getDeviceOperations("fam1", BS, PARALLEL); });
    EXPECT_EQ(manager->getDeviceOperations("fam1", BS, PARALLEL), maskOf(3));
}
