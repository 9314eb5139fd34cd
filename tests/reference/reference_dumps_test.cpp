// The reference's dumps.
#include "BaseOnly.h"
#include "Reference.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace reference;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;
using testing::StartsWith;

std::string blanks(std::size_t count) { return std::string(count, ' '); }

std::string repeated(const std::string& text, int times) {
    std::string all;
    for (int time = 0; time < times; ++time) {
        all += text;
    }
    return all;
}

TEST(ReferenceDumps, OperationsOfNobodyAreThreeHeaderLines) {
    Reference reference(baseOnly());
    std::string recorder;
    reference.dumpOperationsTable(&recorder);
    const auto lines = split(recorder, '\n');
    ASSERT_THAT(lines, SizeIs(4));
    EXPECT_THAT(lines[0], StartsWith(blanks(15) + "PROGRAM" + blanks(53) + "PROGRAMFLASH" + blanks(48)));
    EXPECT_THAT(lines[0], SizeIs(15 + 32 * 60));
    EXPECT_EQ(lines[1],
              blanks(15) + repeated("BS        SS        SM        BSFILE    DP770     SPI       ", 32));
    EXPECT_EQ(lines[2], blanks(15) + repeated("P Z U S S ", 32 * 6));
    EXPECT_EQ(lines[3], "");
}

TEST(ReferenceDumps, ARowHasAFlagForEachOperationModeAndOutput) {
    Reference reference({{"base.acd", "DEVICE_SUPPORTED = spi,quillfamilyname16\n"},
                         {"spi.acd", "OPERATION = PROGRAM,SS,PARALLEL,USB2\n"}});
    std::string recorder;
    reference.dumpOperationsTable(&recorder);
    const auto lines = split(recorder, '\n');
    ASSERT_THAT(lines, SizeIs(6));
    EXPECT_EQ(lines[3], "quillfamilyname" + repeated("0 ", 960));
    EXPECT_EQ(lines[4], "spi" + blanks(12) + repeated("0 ", 5) + "1 0 1 0 0 " + repeated("0 ", 950));
}

TEST(ReferenceDumps, BoundaryScanNamesAreCutToSixBytes) {
    Reference reference(
        {{"base.acd", "DEVICE_SUPPORTED = spi\n"}, {"spi.acd", "BSDL_OPERATION = VERIFY,SVF\n"}});
    std::string recorder;
    reference.dumpBsdlOperationsTable(&recorder);
    const auto lines = split(recorder, '\n');
    ASSERT_THAT(lines, SizeIs(4));
    EXPECT_THAT(lines[0], StartsWith(blanks(15) + "PROGRA    PROGRA    PROGRA    VERIFY    ERASE     "));
    EXPECT_EQ(lines[2], "spi" + blanks(12) + repeated("0 ", 18) + "1 " + repeated("0 ", 141));
}

TEST(ReferenceDumps, OptionsAreThoseOfThePackages) {
    Reference reference(
        {{"base.acd", "PROGRAM_OPTION_PACKAGE = spi\n"}, {"spi.acd", "PROGRAM_OPTION = VERIFY,BS,ZORVA\n"}});
    std::string recorder;
    reference.dumpProgramOptionsTable(&recorder);
    const auto lines = split(recorder, '\n');
    ASSERT_THAT(lines, SizeIs(5));
    EXPECT_THAT(lines[0], SizeIs(15 + 24 * 60));
    EXPECT_EQ(lines[3], "spi" + blanks(12) + repeated("0 ", 31) + "1 " + repeated("0 ", 688));
}

TEST(ReferenceDumps, ANameIsReadAsAFormat) {
    Reference reference(baseOnly("DEVICE_SUPPORTED = a%%%d\n"));
    std::string recorder;
    reference.dumpOperationsTable(&recorder);
    EXPECT_THAT(recorder, HasSubstr("\na%%d" + blanks(10) + "0 "));
}

TEST(ReferenceDumps, FamiliesAreThoseInTheCache) {
    Reference reference(baseOnly());
    (void)reference.getPartFamily("Dev");
    reference.dumpCachedDeviceFamilies(nullptr);
    EXPECT_THAT(reference.takeMessages(),
                ElementsAre(Message{Channel::STATUS, 1777, "Device dev belongs to base\n"},
                            Message{Channel::STATUS, 1777, "Device spi belongs to spi\n"}));
}

TEST(ReferenceDumps, WithoutARecorderEachPieceIsAMessage) {
    Reference reference(baseOnly());
    reference.dumpBsdlOperationsTable(nullptr);
    const auto messages = reference.takeMessages();
    ASSERT_THAT(messages, SizeIs(2 + 32 + 2 + 160));
    EXPECT_EQ(messages[1], (Message{Channel::STATUS, 1777, "PROGRA    "}));
    EXPECT_EQ(messages[33], (Message{Channel::STATUS, 1777, "\n"}));
}

TEST(ReferenceDumps, MultibootTypesComeInByteOrder) {
    Reference reference({{"base.acd", ""}, {"spi.acd", "TYPE_BPI_PARALLEL_CHAIN = D1,D%%2\n"}});
    reference.dumpMbBpiSpi();
    const auto messages = reference.takeMessages();
    ASSERT_THAT(messages, SizeIs(12 * 2 + 2));
    EXPECT_EQ(messages[0], (Message{Channel::STATUS, 1777, "TYPE_BPI_PARALLEL_CHAIN:"}));
    EXPECT_EQ(messages[1], (Message{Channel::STATUS, 1777, " D1"}));
    EXPECT_EQ(messages[2], (Message{Channel::STATUS, 1777, " D%%2"}));
    EXPECT_EQ(messages[3], (Message{Channel::STATUS, 1777, "\n"}));
    EXPECT_EQ(messages[4], (Message{Channel::STATUS, 1777, "TYPE_BPI_PARALLEL_LEAD:"}));
}

} // namespace
