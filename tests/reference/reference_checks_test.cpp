// The reference's checks of mode, output and device.
#include "Reference.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace reference;
using namespace TARVIKNS;
using testing::ElementsAre;
using testing::IsEmpty;

std::map<std::string, std::string> databases() {
    return {{"base.acd", "BS = o,PARALLEL,USB2,QSVF:f,kes\n"
                         "SS = o,USB2:f,kes\n"
                         "SPI = o,USB2:f,spi\n"
                         "NOT_SUPPORTED_PART_IN_MODE = SS_dev1_pkg1,SPI_spi_pkg1\n"},
            {"kes.acd", "[dev1]\n"}};
}

int raisedLine(const auto& call) {
    try {
        call();
    } catch (const Raised& raised) {
        EXPECT_EQ(raised.type, "OutOfRangeException");
        return raised.line;
    }
    return 0;
}

TEST(ReferenceChecks, AnOutputOfTheModeIsAllowedSilently) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::NONE));
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE(77)));
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
}

TEST(ReferenceChecks, AnotherOutputIsRefusedByName) {
    Reference reference(databases());
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::ZORVA));
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE(9), OUTPUT_TYPE::PARALLEL));
    EXPECT_THAT(
        reference.takeMessages(),
        ElementsAre(
            Message{Channel::INFO, 201, "ZORVA cable is not supported in Boundary Scan mode\n"},
            Message{Channel::INFO, 201, "Parallel cable is not supported in Prom File Formatter mode\n"}));
}

TEST(ReferenceChecks, ADeviceIsCheckedByItsFamily) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SS, "DEV1_x", nullptr));
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::SM, "DEV1_x", nullptr));
    EXPECT_THAT(reference.takeMessages(),
                ElementsAre(Message{Channel::INFO, 229, "DEV1 is not supported in Select Map mode\n"}));
}

TEST(ReferenceChecks, APartMayBeExcludedFromAMode) {
    Reference reference(databases());
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::SS, "dev1_pkg9", "pkg1"));
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SS, "dev1_pkg1", nullptr));
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SS, "dev1", "pkg2"));
    EXPECT_THAT(
        reference.takeMessages(),
        ElementsAre(Message{Channel::INFO, 229, "dev1_pkg1 is not supported in Slave Serial mode\n"}));
}

TEST(ReferenceChecks, SpiAndPffAcceptEveryDevice) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SPI, "nobody", "pkg1"));
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::PFF, "nobody", "pkg1"));
}

TEST(ReferenceChecks, BothAtOnceDoesCheckSpiAndPff) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "nobody", nullptr));
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::SPI, OUTPUT_TYPE::USB2, "nobody", "pkg1"));
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE::USB2, "dev1", nullptr));
    EXPECT_THAT(
        reference.takeMessages(),
        ElementsAre(Message{Channel::INFO, 256, "nobody_pkg1 is not supported in SPI mode\n"},
                    Message{Channel::INFO, 256, "dev1 is not supported in Prom File Formatter mode\n"}));
}

TEST(ReferenceChecks, TheOutputIsNamedWhenBothAreRefused) {
    Reference reference(databases());
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE::SS, OUTPUT_TYPE::SVF, "nobody", nullptr));
    EXPECT_THAT(reference.takeMessages(),
                ElementsAre(Message{Channel::INFO, 249, "SVF is not supported in Slave Serial mode\n"}));
}

TEST(ReferenceChecks, AnUnknownModeRaisesWhileExceptionsAreOn) {
    Reference reference(databases());
    EXPECT_EQ(raisedLine([&] { (void)reference.checkConstraints(MODE_TYPE(9), "dev1", nullptr); }), 644);
    EXPECT_EQ(raisedLine([&] {
                  (void)reference.checkConstraints(MODE_TYPE(-1), OUTPUT_TYPE::USB2, "dev1", nullptr);
              }),
              644);
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
    reference.setExceptions(false);
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE(9), "dev1", nullptr));
    EXPECT_THAT(
        reference.takeMessages(),
        ElementsAre(Message{Channel::INFO, 229, "dev1 is not supported in Prom File Formatter mode\n"}));
}

} // namespace
