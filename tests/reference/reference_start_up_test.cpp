// The reference's start-up.
#include "BaseOnly.h"
#include "Reference.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace reference;
using namespace TARVIKNS;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

TEST(ReferenceStartUp, FillsTheModeSets) {
    Reference reference(baseOnly("BS = outs,PARALLEL,PARALLEL,USB2,QSVF:fams,b,a,b\nSM = :fams,c\n"));
    EXPECT_THAT(reference.m_cables[0], ElementsAre(0, 2, 9));
    EXPECT_THAT(reference.m_devices[0], ElementsAre("a", "b"));
    EXPECT_THAT(reference.m_cables[1], IsEmpty());
    EXPECT_THAT(reference.m_cables[2], IsEmpty());
    EXPECT_THAT(reference.m_devices[2], ElementsAre("c"));
}

TEST(ReferenceStartUp, HoldsADuplicateOnce) {
    Reference reference(baseOnly("NOT_SUPPORTED_PART_IN_MODE = SS_a_b,SS_a_b\n"));
    EXPECT_THAT(reference.m_notSupportedPartInMode, ElementsAre("SS_a_b"));
}

TEST(ReferenceStartUp, OrdersBytewise) {
    Reference reference(baseOnly("DEVICE_SUPPORTED = abc,a,\xFF,ab,B\n"));
    EXPECT_THAT(reference.m_supportedDevices, ElementsAre("B", "a", "ab", "abc", "\xFF"));
}

TEST(ReferenceStartUp, KeepsTheLastIdcodeOfAName) {
    Reference reference(baseOnly("IDCODE = a,1:B,2:a,3:c\n"));
    EXPECT_THAT(reference.getAllDeviceIdcodes(), ElementsAre(Pair("B", "2"), Pair("a", "3"), Pair("c", "")));
}

TEST(ReferenceStartUp, FillsTheOrders) {
    Reference reference(baseOnly());
    EXPECT_THAT(reference.getOperationOrders(), SizeIs(32));
    EXPECT_EQ(reference.getOperationOrders()[31], 31);
    EXPECT_THAT(reference.getProgramOptionOrders(), SizeIs(24));
    EXPECT_EQ(reference.getProgramOptionOrders()[0], 0);
}

TEST(ReferenceStartUp, WithoutABaseLeavesEverythingEmptyAndReportsOnce) {
    Reference reference(std::map<std::string, std::string>{{"spi.acd", "DEVICE_FAMILY = FLASH\n"}});
    EXPECT_THAT(reference.takeMessages(), ElementsAre(Message{Channel::INFO, ANY_LINE, std::nullopt}));
    EXPECT_THAT(reference.getOperationOrders(), IsEmpty());
    EXPECT_THAT(reference.m_spiNames, IsEmpty());
    EXPECT_THROW((void)reference.getDeviceOperations("x", MODE_TYPE::BS, OUTPUT_TYPE::USB2), Raised);
}

TEST(ReferenceStartUp, GoesOnOverFaultsThatAreGated) {
    Reference reference({{"base.acd", "DEVICE_SUPPORTED = spi\nPROGRAM_OPTION_PACKAGE = spi\n"},
                         {"spi.acd", "OPERATION = JUMP,BS,USB2:PROGRAM,SPI:VERIFY,SPI,usb2,USB2\n"}});
    EXPECT_THAT(reference.takeMessages(),
                ElementsAre(Message{Channel::INFO, ANY_LINE, "Operation JUMP is not defined.\n"},
                            Message{Channel::DEBUG, 0, "spi op = JUMP\n"},
                            Message{Channel::DEBUG, 0, "spi out = (null)\n"},
                            Message{Channel::DEBUG, 0, "spi out   = usb2\n"}));
    EXPECT_EQ(reference.getDeviceOperations("x", MODE_TYPE::SPI, OUTPUT_TYPE::USB2), 1 << 3);
}

TEST(ReferenceStartUp, StopsAtAnUnknownOption) {
    Reference reference(
        {{"base.acd", "PROGRAM_OPTION_PACKAGE = spi\n"},
         {"spi.acd", "PROGRAM_OPTION = VERIFY,SPI,USB2:OTP,SPI,USB2\nTYPE_BPI_SERIAL_LEAD = a\n"}});
    EXPECT_THAT(reference.takeMessages(), ElementsAre(Message{Channel::INFO, 1500, std::nullopt}));
    EXPECT_THAT(reference.m_operationsLoaded, ElementsAre("spi"));
    EXPECT_THAT(reference.m_programOptionsLoaded, IsEmpty());
    EXPECT_THAT(reference.m_multibootTypes, IsEmpty());
    EXPECT_EQ(reference.getProgramOptions("x", MODE_TYPE::SPI, OUTPUT_TYPE::USB2, nullptr), 1 << 1);
}

TEST(ReferenceStartUp, ListsTheFirstSpiDeviceOfAFamilyTwice) {
    Reference reference(
        {{"base.acd", ""}, {"spi.acd", "DEVICE_FAMILY = A,B\nA_DEVICES = A1,A2\nB_DEVICES =\n"}});
    EXPECT_THAT(reference.m_spiNames, ElementsAre("A", "A1", "A1", "A2", "B"));
    EXPECT_THAT(reference.m_spiFamilies, ElementsAre("A", "B"));
}

TEST(ReferenceStartUp, ResolvesTheSpiFamily) {
    Reference reference(baseOnly());
    EXPECT_THAT(reference.m_deviceFamilyCache, ElementsAre(Pair("spi", "spi")));
    EXPECT_EQ(reference.m_partFamily, "spi");
}

} // namespace
