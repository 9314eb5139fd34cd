// May a device, in a package, be configured in a mode: checkConstraints(mode, device, package).
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

// fam0 to fam8 are each allowed in the mode of their number alone, fam8 in PFF.
Files oneFamilyPerMode() {
    Files files = {{"base.acd", "BS = o:f,fam0\n"
                                "SS = o:f,fam1\n"
                                "SM = o:f,fam2\n"
                                "BSFILE = o:f,fam3\n"
                                "DP770 = o:f,fam4\n"
                                "SPI = o:f,fam5\n"
                                "KITECF = o:f,fam6\n"
                                "KITEMPM = o:f,fam7\n"
                                "PFF = o:f,fam8\n"}};
    for (int family = 0; family < 9; ++family) {
        const std::string number = std::to_string(family);
        files["fam" + number + ".acd"] = "[dev" + number + "]\n";
    }
    return files;
}

// dev1 of fam1, which Slave Serial allows but for the packages named.
Files slaveSerialBut(const std::string& parts) {
    return {{"base.acd", "BS = o:f,fam1\nSS = o:f,fam1\nNOT_SUPPORTED_PART_IN_MODE = " + parts + "\n"},
            {"fam1.acd", "[dev1]\n[a]\n"}};
}

} // namespace

TEST(DeviceChecks, ADeviceOfAListedFamilyIsSilentlyAllowed) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceChecks, ARefusalNamesTheDeviceAndTheMode) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, "dev1", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "dev1 is not supported in Select Map mode\n")));
}

TEST(DeviceChecks, EachModeHasItsOwnFamilies) {
    ManagerFixture manager(oneFamilyPerMode());
    for (int mode = 0; mode < 9; ++mode) {
        for (int family = 0; family < 9; ++family) {
            const bool expected = mode == 5 || mode == 8 || mode == family;
            const std::string device = "dev" + std::to_string(family);
            EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, device.c_str(), nullptr), expected)
                << "mode " << mode << " device " << device;
        }
    }
}

TEST(DeviceChecks, AFamilyCountsAsItsOwnDevice) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "fam1", nullptr));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "fam2", nullptr));
}

TEST(DeviceChecks, AnUnknownDeviceCountsAsBase) {
    ManagerFixture manager(Files{{"base.acd", "BS = o:f,base\nSS = o:f,fam1\n"}});
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::BS, "nobody", nullptr));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "nobody", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "nobody is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, AnExcludedPackageCanHaveALongName) {
    const std::string package(500, 'P');
    ManagerFixture manager(slaveSerialBut("SS_dev1_" + package));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "dev1", package.c_str()));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", (package + 'P').c_str()));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", package.substr(1).c_str()));
}

TEST(DeviceChecks, AnExcludedPackageIsRefused) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_pkg1"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "dev1", "pkg1"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(229, "dev1_pkg1 is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, AnExclusionHoldsForItsModeAndPackageAlone) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_pkg1"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::BS, "dev1", "pkg1"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", "pkg2"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "a", "pkg1"));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceChecks, ThePackageArgumentReplacesTheNamesOwn) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_pkg1"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "dev1_pkg9", "pkg1"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(229, "dev1_pkg1 is not supported in Slave Serial mode\n")));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1_pkg1", "pkg9"));
}

TEST(DeviceChecks, WithoutAPackageNoExclusionCounts) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_pkg1,SS_dev1_,SS_dev1"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", nullptr));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1_pkg1", nullptr));
}

TEST(DeviceChecks, AnEmptyPackageIsAPackage) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "dev1", ""));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "dev1_ is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, ExclusionsAreCaseSensitive) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_PKG1,ss_dev1_pkg1,SS_DEV1_pkg1"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SS, "dev1", "pkg1"));
}

TEST(DeviceChecks, TheRefusedPartIsTheCutDeviceWithoutAPackage) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, "dev1_pkg9", nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "dev1 is not supported in Select Map mode\n")));
}

TEST(DeviceChecks, ANameIsCutAtItsFirstUnderscore) {
    ManagerFixture manager(slaveSerialBut("SM_a_x"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, "a_b_c", "x"));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "a_x is not supported in Select Map mode\n")));
}

TEST(DeviceChecks, ANameThatBeginsWithAnUnderscoreIsEmpty) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "_dev1", "p"));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, "_p is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, ANullDeviceIsTheEmptyName) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, static_cast<const char*>(nullptr), nullptr));
    EXPECT_THAT(manager.messages(), ElementsAre(info(229, " is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, PercentSignsInNamesAreText) {
    ManagerFixture manager(oneFamilyPerMode());
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "50%s%n", "%%d"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(229, "50%s%n_%%d is not supported in Slave Serial mode\n")));
}

TEST(DeviceChecks, SpiModeAcceptsEveryDeviceUnseen) {
    auto files = oneFamilyPerMode();
    files["base.acd"] += "NOT_SUPPORTED_PART_IN_MODE = SPI_dev1_p,SPI_spi_p\n";
    ManagerFixture manager(files);
    const auto cached = manager.members().m_deviceFamilyCache.size();
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SPI, "dev1", "p"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SPI, "nobody", nullptr));
    EXPECT_EQ(manager.members().m_deviceFamilyCache.size(), cached);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceChecks, TheFormatterModeAcceptsEveryDeviceUnseen) {
    auto files = oneFamilyPerMode();
    files["base.acd"] += "NOT_SUPPORTED_PART_IN_MODE = PFF_dev1_p\n";
    ManagerFixture manager(files);
    const auto cached = manager.members().m_deviceFamilyCache.size();
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::PFF, "dev1", "p"));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::PFF, "nobody", nullptr));
    EXPECT_EQ(manager.members().m_deviceFamilyCache.size(), cached);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceChecks, AValueThatIsNoModeIsRaisedWhileExceptionsAreOn) {
    ManagerFixture manager(oneFamilyPerMode());
    for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        expectRaises<OutOfRangeException>(
            644, [&] { return manager->checkConstraints(MODE_TYPE{mode}, "dev0", nullptr); });
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(DeviceChecks, AValueThatIsNoModeIsRefusedWhileExceptionsAreOff) {
    ManagerFixture manager(oneFamilyPerMode());
    manager->setExceptions(false);
    for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, "dev0", nullptr));
        EXPECT_THAT(manager.messages(),
                    ElementsAre(info(229, "dev0 is not supported in Prom File Formatter mode\n")))
            << mode;
    }
}

TEST(DeviceChecks, AnExclusionIsTestedBeforeTheModeIsKnownToBeOne) {
    // A value that is no mode has the key name "BS".
    ManagerFixture manager(slaveSerialBut("BS_dev1_pkg1"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{9}, "dev1", "pkg1"));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(229, "dev1_pkg1 is not supported in Prom File Formatter mode\n")));
}

TEST(DeviceChecks, AnExcludedPartIsNotResolved) {
    ManagerFixture manager(slaveSerialBut("SS_dev1_pkg1"));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, "dev1", "pkg1"));
    EXPECT_FALSE(manager.members().m_deviceFamilyCache.contains(StringBase("dev1")));
}

TEST(DeviceChecks, TheDisplayNameOfEachRefusingMode) {
    const std::map<int, std::string> names = {{0, "Boundary Scan mode"},      {1, "Slave Serial mode"},
                                              {2, "Select Map mode"},         {3, "Boundary Scan File mode"},
                                              {4, "Destop Programming mode"}, {6, "Kite Compact Flash  mode"},
                                              {7, "Kite MPM  mode"}};
    ManagerFixture manager(oneFamilyPerMode());
    for (const auto& [mode, name] : names) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, "dev5", nullptr));
        EXPECT_THAT(manager.messages(), ElementsAre(info(229, "dev5 is not supported in " + name + "\n")));
    }
}
