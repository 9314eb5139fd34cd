// Which programming options a device offers in a mode through an output: getProgramOptions.
#include "Members.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto SPI = MODE_TYPE::SPI;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

// dev1 has options of its own in package pq, dev2 in any; dev3 has none. Each owner allows one option.
const Files DATABASES = {
    {"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = spi,fam1,dev1pq,dev2,fam1pq\n"},
    {"fam1.acd", "PROGRAM_OPTION = ERASE,Bscan,PARALLEL\n"
                 "[dev1]\nPROGRAM_OPTION = VERIFY,Bscan,PARALLEL\n"
                 "[dev2]\nPROGRAM_OPTION = READPROTECT,Bscan,PARALLEL\n"
                 "[dev3]\n"},
    {"spi.acd", "DEVICE_FAMILY = AT\nAT_DEVICES = FLASH1\n"
                "PROGRAM_OPTION = UES,SPI,PARALLEL:OTF,Bscan,PARALLEL\n"}};

} // namespace

TEST(ProgramOptions, ADeviceHasItsFamilysOptions) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev3", BS, PARALLEL, nullptr), maskOf(0));
    EXPECT_EQ(manager->getProgramOptions("dev3_x", BS, PARALLEL, "y"), maskOf(0));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(ProgramOptions, AListedDeviceAndPackageHaveOptionsOfTheirOwn) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, "pq"), maskOf(1));
}

TEST(ProgramOptions, TheSameDeviceWithoutThePackageHasItsFamilys) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, nullptr), maskOf(0));
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, "zz"), maskOf(0));
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, "pq"), maskOf(1));
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, nullptr), maskOf(0));
}

TEST(ProgramOptions, DeviceAndPackageAreJoinedBare) {
    ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    EXPECT_EQ(manager->getProgramOptions("dev", BS, PARALLEL, "1pq"), 0);
    EXPECT_TRUE(holds(manager.members().m_programOptionsLoaded, "dev1pq"));
    EXPECT_EQ(manager->getProgramOptions("dev1_", BS, PARALLEL, "pq"), maskOf(0)) << "dev1_pq is not listed";
}

TEST(ProgramOptions, AListedDeviceNeedsNoPackage) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev2", BS, PARALLEL, nullptr), maskOf(2));
    EXPECT_EQ(manager->getProgramOptions("dev2", BS, PARALLEL, ""), maskOf(2));
}

TEST(ProgramOptions, AListedDeviceKeepsItsOptionsInAnUnlistedPackage) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev2", BS, PARALLEL, "zz"), maskOf(2));
}

TEST(ProgramOptions, AFamilyIgnoresThePackage) {
    // "fam1pq" is listed, but a name that is its own family is never joined with a package.
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("fam1", BS, PARALLEL, "pq"), maskOf(0));
    EXPECT_FALSE(holds(manager.members().m_programOptionsLoaded, "fam1pq"));
}

TEST(ProgramOptions, NamesOfPackagesAreCaseSensitive) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("DEV1", BS, PARALLEL, "pq"), maskOf(0));
    EXPECT_EQ(manager->getProgramOptions("dev1", BS, PARALLEL, "PQ"), maskOf(0));
}

TEST(ProgramOptions, ADeviceThatLooksForPackagesLoadsThemOnce) {
    ManagerFixture manager(DATABASES);
    static_cast<void>(manager->getProgramOptions("dev1", BS, PARALLEL, "pq"));
    static_cast<void>(manager->getProgramOptions("dev1", BS, PARALLEL, "pq"));
    EXPECT_THAT(texts(manager.members().m_programOptionsLoaded), ElementsAre("spi", "dev1pq", "fam1"));
    EXPECT_THAT(texts(manager.members().m_loadedFamilies), ElementsAre("dev1", "fam1"));
}

TEST(ProgramOptions, ADeviceWithoutOptionsOfItsOwnLoadsItsFamilyAlone) {
    ManagerFixture manager(DATABASES);
    static_cast<void>(manager->getProgramOptions("dev1", BS, PARALLEL, nullptr));
    EXPECT_THAT(texts(manager.members().m_programOptionsLoaded), ElementsAre("spi", "fam1"));
    EXPECT_THAT(texts(manager.members().m_loadedFamilies), ElementsAre("fam1"));
}

TEST(ProgramOptions, LoadingIsDecidedByTheLoadedOptions) {
    ManagerFixture manager(DATABASES);
    manager.members().m_programOptionsLoaded.push_back("fam1");
    EXPECT_EQ(manager->getProgramOptions("dev3", BS, PARALLEL, nullptr), 0);
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
}

TEST(ProgramOptions, SpiModeAnswersForSpiWhateverTheDevice) {
    ManagerFixture manager(DATABASES);
    for (const char* device : {"dev1", "nobody", "", static_cast<const char*>(nullptr)}) {
        EXPECT_EQ(manager->getProgramOptions(device, SPI, PARALLEL, "pq"), maskOf(10));
    }
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.empty());
}

TEST(ProgramOptions, AnSpiFlashAnswersFromTheSpiFamilyInEveryMode) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("flash1", BS, PARALLEL, nullptr), maskOf(13));
}

TEST(ProgramOptions, ModesOutOfRangeGiveADebugMessage) {
    ManagerFixture manager(DATABASES);
    for (const bool exceptions : {true, false}) {
        manager->setExceptions(exceptions);
        for (const int mode : BOUNDARY_VALUES) {
            const bool inRange = mode >= 0 && mode <= 5;
            EXPECT_EQ(manager->getProgramOptions("dev3", MODE_TYPE{mode}, PARALLEL, nullptr),
                      mode == 0   ? maskOf(0)
                      : mode == 5 ? maskOf(10)
                                  : 0);
            if (inRange) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << mode;
            } else {
                EXPECT_THAT(manager.messages(),
                            ElementsAre(debug("Mode is out of range -- " + std::to_string(mode) + ".\n")));
            }
        }
    }
}

TEST(ProgramOptions, OutputsOutOfRangeGiveADebugMessage) {
    ManagerFixture manager(DATABASES);
    for (const MODE_TYPE mode : {BS, SPI}) {
        for (const int output : BOUNDARY_VALUES) {
            const bool inRange = output >= 0 && output <= 4;
            const int parallel = mode == BS ? maskOf(0) : maskOf(10);
            EXPECT_EQ(manager->getProgramOptions("dev3", mode, OUTPUT_TYPE{output}, nullptr),
                      output == 0 ? parallel : 0);
            if (inRange) {
                EXPECT_THAT(manager.messages(), IsEmpty()) << output;
            } else {
                EXPECT_THAT(manager.messages(),
                            ElementsAre(debug("Outstream(Cable or file type) is out of range -- " +
                                              std::to_string(output) + ".\n")));
            }
        }
    }
}

TEST(ProgramOptions, TheModeIsTestedBeforeTheOutput) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(manager->getProgramOptions("dev3", MODE_TYPE::KITECF, OUTPUT_TYPE::QSVF, nullptr), 0);
    EXPECT_THAT(manager.messages(), ElementsAre(debug("Mode is out of range -- 6.\n")));
}

TEST(ProgramOptions, TheRangesAreTestedBeforeThePackageIsLookedUp) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = fam3,spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                                 {"fam3.acd", "[dev3]\n"}});
    expectRaises<OutOfRangeException>(
        2024, [&] { return manager->getProgramOptions("dev3", BS, PARALLEL, nullptr); });
    EXPECT_TRUE(holds(manager.members().m_programOptionsLoaded, "fam3"))
        << "what failed to load is not tried again";

    EXPECT_EQ(manager->getProgramOptions("dev3", MODE_TYPE{6}, PARALLEL, nullptr), 0);
    EXPECT_EQ(manager->getProgramOptions("dev3", BS, OUTPUT_TYPE{5}, nullptr), 0);
    EXPECT_THAT(manager.messages(),
                ElementsAre(debug("Mode is out of range -- 6.\n"),
                            debug("Outstream(Cable or file type) is out of range -- 5.\n")));
    expectRaises<OutOfRangeException>(
        2024, [&] { return manager->getProgramOptions("dev3", BS, PARALLEL, nullptr); });
}

TEST(ProgramOptions, AnUnlistedFamilyHasNoOptionsWhileExceptionsAreOff) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = fam3,spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                                 {"fam3.acd", "PROGRAM_OPTION = ERASE,Bscan,PARALLEL\n[dev3]\n"}});
    manager->setExceptions(false);
    for (int mode = 0; mode < 6; ++mode) {
        for (int output = 0; output < 5; ++output) {
            EXPECT_EQ(manager->getProgramOptions("dev3", MODE_TYPE{mode}, OUTPUT_TYPE{output}, nullptr), 0);
        }
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(ProgramOptions, SpiModeIsRaisedWhereSpiIsNotListed) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = fam1\n"}});
    expectRaises<OutOfRangeException>(
        2024, [&] { return manager->getProgramOptions("x", SPI, PARALLEL, nullptr); });
    EXPECT_EQ(manager->getProgramOptions("x", SPI, OUTPUT_TYPE{5}, nullptr), 0);
    manager->setExceptions(false);
    EXPECT_EQ(manager->getProgramOptions("x", SPI, PARALLEL, nullptr), 0);
}

TEST(ProgramOptions, EveryCellIsItsOwn) {
    // The whole extent of the options that a database can name, in the middle block of three.
    const char* const modes[] = {"Bscan", "SS", "SM", "BSFILE", "DP770", "SPI"};
    const char* const outputs[] = {"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"};
    std::string entry = "PROGRAM_OPTION = ";
    for (std::size_t mode = 0; mode < 6; ++mode) {
        for (std::size_t output = 0; output < 5; ++output) {
            const auto option = TARVIKNS::PROGRAM_OPTION{static_cast<int>((mode * 5 + output) % 17)};
            entry += std::string(mode + output == 0 ? "" : ":") +
                     ConstraintsManager::optionType2String(option).c_str() + "," + modes[mode] + "," +
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
            EXPECT_EQ(manager->getProgramOptions("spi", MODE_TYPE{mode}, OUTPUT_TYPE{output}, nullptr),
                      maskOf((mode * 5 + output) % 17));
            for (const char* other : {"a", "z"}) {
                if (mode != 5) {
                    EXPECT_EQ(
                        manager->getProgramOptions(other, MODE_TYPE{mode}, OUTPUT_TYPE{output}, nullptr), 0);
                }
            }
        }
    }
}

TEST(ProgramOptions, AnUnknownOptionIsRaisedWhateverTheSwitchSays) {
    ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd", "PROGRAM_OPTION = ERASE,Bscan,PARALLEL:OTP,Bscan,PARALLEL\n"}});
    manager->setExceptions(false);
    expectRaises<DataMismatchException>(
        1500, [&] { return manager->getProgramOptions("fam1", BS, PARALLEL, nullptr); });
    EXPECT_EQ(manager->getProgramOptions("fam1", BS, PARALLEL, nullptr), maskOf(0));
}
