// May a mode use an output: checkConstraints(mode, output).
#include "ManagerFixture.h"

#include <gmock/gmock.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

// Each mode allows one output that no other mode allows, so that no two modes can be mixed up.
const Files ONE_OUTPUT_PER_MODE = {{"base.acd", "BS = outs,PARALLEL,USB2:fams\n"
                                                "SS = outs,ZORVA:fams\n"
                                                "SM = outs,SVF:fams\n"
                                                "BSFILE = outs,STAPL:fams\n"
                                                "DP770 = outs,EXPRESSSVF:fams\n"
                                                "SPI = outs,EXPRESSQSVF:fams\n"
                                                "KITECF = outs,nonsense:fams\n"
                                                "KITEMPM = outs,USB2,SVF:fams\n"}};

} // namespace

TEST(OutputChecks, AnAllowedOutputIsSilent) {
    ManagerFixture manager(ONE_OUTPUT_PER_MODE);
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OutputChecks, ARefusalNamesTheOutputAndTheMode) {
    ManagerFixture manager(ONE_OUTPUT_PER_MODE);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::ZORVA));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(201, "ZORVA cable is not supported in Boundary Scan mode\n")));
}

TEST(OutputChecks, EachModeHasItsOwnOutputs) {
    ManagerFixture manager(ONE_OUTPUT_PER_MODE);
    const std::vector<std::vector<int>> allowed = {{0, 2}, {1}, {3}, {4}, {6}, {7}, {9}, {2, 3}};
    for (int mode = 0; mode < 8; ++mode) {
        const auto& outputs = allowed[static_cast<std::size_t>(mode)];
        for (int output = -1; output <= 11; ++output) {
            const bool expected = std::find(outputs.begin(), outputs.end(), output) != outputs.end();
            EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE{output}), expected)
                << "mode " << mode << " output " << output;
        }
    }
}

TEST(OutputChecks, EachModeHasItsOwnDisplayName) {
    const char* const names[] = {"Boundary Scan mode",       "Slave Serial mode",       "Select Map mode",
                                 "Boundary Scan File mode",  "Destop Programming mode", "SPI mode",
                                 "Kite Compact Flash  mode", "Kite MPM  mode"};
    ManagerFixture manager(Files{{"base.acd", ""}});
    for (int mode = 0; mode < 8; ++mode) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::SVF));
        EXPECT_THAT(manager.messages(),
                    ElementsAre(info(201, std::string("SVF is not supported in ") + names[mode] + "\n")));
    }
}

TEST(OutputChecks, EachOutputHasItsOwnDisplayName) {
    const char* const names[] = {
        "Parallel cable", "ZORVA cable", "USB2 cable",   "SVF",        "Stapl",
        "QSVF",           "Express SVF", "Express QSVF", "Null cable", "Unspecified cable"};
    ManagerFixture manager(Files{{"base.acd", ""}});
    for (int output = 0; output < 10; ++output) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE{output}));
        EXPECT_THAT(manager.messages(),
                    ElementsAre(info(201, std::string(names[output]) + " is not supported in SPI mode\n")));
    }
}

TEST(OutputChecks, TheFormatterModeAcceptsEveryOutput) {
    ManagerFixture manager(Files{{"base.acd", "PFF = outs,SVF:fams\n"}});
    for (const int output : BOUNDARY_VALUES) {
        EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE{output})) << output;
    }
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(OutputChecks, AValueThatIsNoModeIsRefusedAndNeverRaised) {
    ManagerFixture manager(ONE_OUTPUT_PER_MODE);
    for (const bool exceptions : {true, false}) {
        manager->setExceptions(exceptions);
        for (const int mode : {-2147483647 - 1, -1, 9, 10, 31, 32, 2147483647}) {
            EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::PARALLEL)) << mode;
            EXPECT_THAT(
                manager.messages(),
                ElementsAre(info(201, "Parallel cable is not supported in Prom File Formatter mode\n")))
                << mode;
        }
    }
}

TEST(OutputChecks, AValueThatIsNoOutputIsRefusedAsUnspecified) {
    ManagerFixture manager(ONE_OUTPUT_PER_MODE);
    for (const int output : {-2147483647 - 1, -1, 10, 31, 32, 2147483647}) {
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::KITECF, OUTPUT_TYPE{output})) << output;
        EXPECT_THAT(
            manager.messages(),
            ElementsAre(info(201, "Unspecified cable is not supported in Kite Compact Flash  mode\n")))
            << output;
    }
}

TEST(OutputChecks, AnUnrecognisedOutputNameAllowsTheUnspecifiedOutput) {
    ManagerFixture manager(Files{{"base.acd", "SM = outs,usb2:fams\n"}});
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SM, OUTPUT_TYPE::NONE));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, OUTPUT_TYPE::USB2));
}

TEST(OutputChecks, OutputsWithoutADatabaseNameAreNeverAllowed) {
    ManagerFixture manager(Files{{"base.acd", "SM = outs,QSVF,NULLCABLE:fams\n"}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, OUTPUT_TYPE::QSVF));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SM, OUTPUT_TYPE::NULLCABLE));
    EXPECT_TRUE(manager->checkConstraints(MODE_TYPE::SM, OUTPUT_TYPE::NONE));
}

TEST(OutputChecks, EachRefusalHasItsOwnTexts) {
    // The display names live in shared slots: a later refusal must not speak with an earlier one's names.
    ManagerFixture manager(Files{{"base.acd", ""}});
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::STAPL));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::DP770, OUTPUT_TYPE::QSVF));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::STAPL));
    EXPECT_THAT(manager.messages(),
                ElementsAre(info(201, "Stapl is not supported in Slave Serial mode\n"),
                            info(201, "QSVF is not supported in Destop Programming mode\n"),
                            info(201, "Stapl is not supported in Slave Serial mode\n")));
}

TEST(OutputChecks, ARefusalTellsItsOriginInFull) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    std::vector<std::string> origins;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        origins.emplace_back(message.product);
        origins.emplace_back(message.source);
    });
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::STAPL));
    EXPECT_THAT(origins, ElementsAre("Tarvik", "../s/ConstraintsManager"));
}
