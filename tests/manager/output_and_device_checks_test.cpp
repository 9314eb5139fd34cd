// May a device be configured in a mode through an output: checkConstraints(mode, output, device, package).
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

// dev1 of fam1 may be configured in Slave Serial mode through a parallel cable, but not in package pkg1.
const Files SLAVE_SERIAL = {
    {"base.acd", "SS = outs,PARALLEL:fams,fam1\nNOT_SUPPORTED_PART_IN_MODE = SS_dev1_pkg1\n"},
    {"fam1.acd", "[dev1]\n"},
    {"fam2.acd", "[dev2]\n"}};

} // namespace

TEST(OutputAndDeviceChecks, BothAllowedIsSilent) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::PARALLEL, "dev1_x", "pkg2"));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OutputAndDeviceChecks, ARefusedDeviceIsNamed) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::PARALLEL, "dev2_x", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(256, "dev2 is not supported in Slave Serial mode\n")));
}

TEST(OutputAndDeviceChecks, ARefusedPartIsNamedWithItsPackage) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::PARALLEL, "dev1_pkg9", "pkg1"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(256, "dev1_pkg1 is not supported in Slave Serial mode\n")));
}

TEST(OutputAndDeviceChecks, ARefusedOutputIsNamed) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "dev1", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(249, "SVF is not supported in Slave Serial mode\n")));
}

TEST(OutputAndDeviceChecks, TheOutputIsNamedWhenBothAreRefused) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "dev2", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(249, "SVF is not supported in Slave Serial mode\n")));
}

TEST(OutputAndDeviceChecks, TheDeviceIsTestedBehindARefusedOutput) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "dev2", nullptr));
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.contains(StringBase("dev2")));
}

TEST(OutputAndDeviceChecks, AValueThatIsNoModeIsRaisedBeforeAnyMessage) {
    ManagerFixture manager(SLAVE_SERIAL);
    for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        expectRaises<OutOfRangeException>(644, [&] {
            return manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::PARALLEL, "dev1", nullptr);
        });
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OutputAndDeviceChecks, AValueThatIsNoModeIsARefusedOutputWhileExceptionsAreOff) {
    ManagerFixture manager(SLAVE_SERIAL);
    manager->setExceptions(false);
    for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::PARALLEL, "dev1", nullptr));
        EXPECT_THAT(manager.messages(),
                    ElementsAre(info(249, "Parallel cable is not supported in Prom File Formatter mode\n")))
            << mode;
    }
}

TEST(OutputAndDeviceChecks, AnExcludedPartIsRefusedBeforeTheModeIsKnownToBeOne) {
    // A value that is no mode has the key name "BS".
    ManagerFixture manager(
        Files{{"base.acd", "NOT_SUPPORTED_PART_IN_MODE = BS_dev1_pkg1\n"}, {"fam1.acd", "[dev1]\n"}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{9}, OUTPUT_TYPE::SVF, "dev1", "pkg1"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(249, "SVF is not supported in Prom File Formatter mode\n")));
}

TEST(OutputAndDeviceChecks, AValueThatIsNoOutputIsRefusedAsUnspecified) {
    ManagerFixture manager(SLAVE_SERIAL);
    for (const int output : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE{output}, "dev1", nullptr));
        EXPECT_THAT(manager.messages(),
                    ElementsAre(info(249, "Unspecified cable is not supported in Slave Serial mode\n")))
            << output;
    }
}

TEST(OutputAndDeviceChecks, SpiModeTestsTheFamilySpiInPlaceOfTheDevice) {
    ManagerFixture allowing(Files{{"base.acd", "SPI = outs,USB2:fams,spi\n"}, {"fam1.acd", "[dev1]\n"}});
    EXPECT_TRUE(allowing->checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "dev1", nullptr));
    EXPECT_THAT(allowing.messages(), IsEmpty());
    EXPECT_FALSE(allowing.members().m_deviceFamilyCache.contains(StringBase("dev1")));
}

TEST(OutputAndDeviceChecks, SpiModeRefusesWhereSpiIsNotListedButNamesTheDevice) {
    ManagerFixture manager(Files{{"base.acd", "SPI = outs,USB2:fams,fam1\n"}, {"fam1.acd", "[dev1]\n"}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "dev1_p", "q"));
    EXPECT_THAT(manager.messages(), ElementsAre(info(256, "dev1_q is not supported in SPI mode\n")));
}

TEST(OutputAndDeviceChecks, SpiModeTestsTheExclusionOfSpiInPlaceOfTheDevices) {
    ManagerFixture manager(Files{{"base.acd", "SPI = outs,USB2:fams,spi\n"
                                              "NOT_SUPPORTED_PART_IN_MODE = SPI_spi_p,SPI_dev1_q\n"}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "dev1", "p"));
    EXPECT_THAT(manager.messages(), ElementsAre(info(256, "dev1_p is not supported in SPI mode\n")));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "dev1", "q"));
}

TEST(OutputAndDeviceChecks, TheFormatterModeAcceptsEveryOutputButTestsTheDevice) {
    ManagerFixture manager(
        Files{{"base.acd", "PFF = outs:fams,fam1\nNOT_SUPPORTED_PART_IN_MODE = PFF_dev1_p\n"},
              {"fam1.acd", "[dev1]\n"},
              {"fam2.acd", "[dev2]\n"}});
    for (const int output : BOUNDARY_VALUES) {
        EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE{output}, "dev1", nullptr))
            << output;
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE::SVF, "dev2", nullptr));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE::SVF, "dev1", "p"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(256, "dev2 is not supported in Prom File Formatter mode\n"),
                            info(256, "dev1_p is not supported in Prom File Formatter mode\n")));
}

TEST(OutputAndDeviceChecks, EachModeHasItsOwnFamilies) {
    Files files;
    const char* const keys[] = {"BS", "SS", "SM", "BSFILE", "DP770", "SPI", "KITECF", "KITEMPM", "PFF"};
    for (int mode = 0; mode < 9; ++mode) {
        const std::string number = std::to_string(mode);
        const std::string family = mode == 5 ? "spi" : "fam" + number;
        files["base.acd"] += std::string(keys[mode]) + " = outs,SVF:fams," + family + "\n";
        files[family + ".acd"] = "[dev" + number + "]\n";
    }
    ManagerFixture manager(files);
    for (int mode = 0; mode < 9; ++mode) {
        for (int family = 0; family < 9; ++family) {
            const std::string device = "dev" + std::to_string(family);
            EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::SVF, device.c_str(), nullptr),
                      mode == 5 || mode == family)
                << "mode " << mode << " device " << device;
        }
    }
}

TEST(OutputAndDeviceChecks, ANullDeviceIsTheEmptyName) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::PARALLEL, nullptr, nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(256, " is not supported in Slave Serial mode\n")));
}

TEST(OutputAndDeviceChecks, AnEmptyPackageIsAPackage) {
    ManagerFixture manager(
        Files{{"base.acd", "SS = outs,SVF:fams,fam1\nNOT_SUPPORTED_PART_IN_MODE = SS_dev1_\n"},
              {"fam1.acd", "[dev1]\n"}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "dev1", ""));
    EXPECT_THAT(manager.messages(), ElementsAre(info(256, "dev1_ is not supported in Slave Serial mode\n")));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "dev1", nullptr));
}

TEST(OutputAndDeviceChecks, TheFamilySetOfAMode) {
    ManagerFixture manager(SLAVE_SERIAL);
    EXPECT_EQ(manager.members().modeDeviceSet(MODE_TYPE::SS, 644), &manager.members().m_ssDevices);
    EXPECT_EQ(manager.members().modeDeviceSet(MODE_TYPE::PFF, 583), &manager.members().m_pffDevices);
    expectRaises<OutOfRangeException>(583,
                                      [&] { return manager.members().modeDeviceSet(MODE_TYPE{9}, 583); });
    expectRaises<OutOfRangeException>(644,
                                      [&] { return manager.members().modeDeviceSet(MODE_TYPE{-1}, 644); });
    manager->setExceptions(false);
    EXPECT_EQ(manager.members().modeDeviceSet(MODE_TYPE{9}, 583), nullptr);
}
