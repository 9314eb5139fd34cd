// The reference's questions about one device.
#include "Reference.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace reference;
using namespace TARVIKNS;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto USB2 = OUTPUT_TYPE::USB2;

std::map<std::string, std::string> databases() {
    return {{"base.acd", "DEVICE_SUPPORTED = kes,spi\nPROGRAM_OPTION_PACKAGE = devPQ,kes,spi,base\n"},
            {"spi.acd", "OPERATION = VERIFY,SPI,USB2\nDEVICE_FAMILY = FLASH\nFLASH_PROPERTY = SIZE,16\n"},
            {"kes.acd",
             "OPERATION = PROGRAM,Bscan,USB2:EXPRESSQSVF,BSCAN,USB2:ERASE,KITECF,USB2:CLAMP,BS,EXPRESSSVF\n"
             "BSDL_OPERATION = HIGHZ,USB2\n"
             "PROGRAM_OPTION = ERASE,Bscan,USB2\n"
             "PROPERTY = VENDOR,Korvel:PROGRAM,BS\n"
             "[dev]\n"
             "PROGRAM_OPTION = VERIFY,Bscan,USB2\n"
             "PROPERTIES = PINS,2,B,A:FLASH,2,FALSE,TRUE:ERASE,1,SS:OP_ERASE_SS,1,fast:low,1,TRUE\n"}};
}

std::vector<Message> debug(const std::string& text) { return {{Channel::DEBUG, 0, text}}; }

TEST(ReferenceQueries, OperationsAreThoseOfTheFamily) {
    Reference reference(databases());
    EXPECT_EQ(reference.getDeviceOperations("dev", BS, USB2), static_cast<int>(1U | 1U << 31));
    EXPECT_EQ(reference.getDeviceOperations("dev", MODE_TYPE(6), USB2), 0);
    EXPECT_EQ(reference.getDeviceOperations("dev", MODE_TYPE(9), USB2), 0);
    EXPECT_EQ(reference.getDeviceOperations("dev", BS, OUTPUT_TYPE(5)), 0);
    EXPECT_EQ(reference.getDeviceOperations("dev", BS, OUTPUT_TYPE(6)), 0);
    EXPECT_EQ(reference.getDeviceOperations("dev", BS, OUTPUT_TYPE(-1)), 0);
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
}

TEST(ReferenceQueries, SpiModeAnswersForSpiWhateverTheDevice) {
    Reference reference(databases());
    EXPECT_EQ(reference.getDeviceOperations("nobody", MODE_TYPE::SPI, USB2), 1 << 3);
    EXPECT_TRUE(reference.checkConstraints(MODE_TYPE::SPI, USB2, "nobody", OP_TYPE::VERIFY, nullptr));
}

TEST(ReferenceQueries, AListedPackageHasOptionsOfItsOwn) {
    Reference reference(databases());
    EXPECT_EQ(reference.getProgramOptions("dev", BS, USB2, "PQ"), 1 << 1);
    EXPECT_EQ(reference.getProgramOptions("kes", BS, USB2, nullptr), 1 << 0);
}

TEST(ReferenceQueries, WithoutThePackageTheFirstOfDeviceAndFamilyFillsTheFamilysTable) {
    Reference reference(databases());
    EXPECT_EQ(reference.getProgramOptions("dev", BS, USB2, nullptr), 1 << 0);
    Reference another(databases());
    EXPECT_FALSE(another.getDeviceBoolProperty("dev", "none"));
    EXPECT_EQ(another.getProgramOptions("dev", BS, USB2, nullptr), 1 << 1);
}

TEST(ReferenceQueries, OptionsRefuseWhatIsOutOfRange) {
    Reference reference(databases());
    EXPECT_EQ(reference.getProgramOptions("dev", MODE_TYPE(6), USB2, nullptr), 0);
    EXPECT_EQ(reference.takeMessages(), debug("Mode is out of range -- 6.\n"));
    EXPECT_EQ(reference.getProgramOptions("dev", BS, OUTPUT_TYPE(-1), nullptr), 0);
    EXPECT_EQ(reference.takeMessages(), debug("Outstream(Cable or file type) is out of range -- -1.\n"));
}

TEST(ReferenceQueries, BoundaryScanOperationsHaveNoMode) {
    Reference reference(databases());
    EXPECT_EQ(reference.getBsdlOperations("dev", USB2), 1 << 20);
    EXPECT_EQ(reference.getBsdlOperations("dev", OUTPUT_TYPE(-1)), 0);
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
    EXPECT_EQ(reference.getBsdlOperations("dev", OUTPUT_TYPE(5)), 0);
    EXPECT_EQ(reference.takeMessages(), debug("Outstream(Cable or file type) is out of range -- 5.\n"));
}

TEST(ReferenceQueries, AnOperationIsCheckedInOrderOfModeOutputOperation) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints(BS, USB2, "dev_x", OP_TYPE::PROGRAM, "nobody"));
    EXPECT_FALSE(reference.checkConstraints(BS, USB2, "dev_x", OP_TYPE::VERIFY, "kes"));
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
    EXPECT_FALSE(reference.checkConstraints(MODE_TYPE(6), OUTPUT_TYPE(7), "dev", OP_TYPE(32), nullptr));
    EXPECT_EQ(reference.takeMessages(), debug("Mode is out of range -- 6.\n"));
    EXPECT_FALSE(reference.checkConstraints(BS, OUTPUT_TYPE(7), "dev", OP_TYPE(32), nullptr));
    EXPECT_EQ(reference.takeMessages(), debug("Outstream(Cable or file type is out of range -- 7.\n"));
    EXPECT_FALSE(reference.checkConstraints(BS, USB2, "dev", OP_TYPE(32), nullptr));
    EXPECT_EQ(reference.takeMessages(), debug("Opeartion is out of range -- 32.\n"));
}

TEST(ReferenceQueries, AnOperationIsCheckedByProperty) {
    Reference reference(databases());
    EXPECT_TRUE(reference.checkConstraints("dev_x", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_FALSE(reference.checkConstraints("dev_x", MODE_TYPE::SS, OP_TYPE::PROGRAM, nullptr));
}

TEST(ReferenceQueries, OperationOptionsNeedTheMode) {
    Reference reference(databases());
    EXPECT_THAT(reference.getDeviceOperationOptions("dev", "ERASE", MODE_TYPE::SS), ElementsAre("fast"));
    EXPECT_THAT(reference.getDeviceOperationOptions("dev", "ERASE", BS), IsEmpty());
}

TEST(ReferenceQueries, OperationOptionsAreLookedUpInUpperCase) {
    Reference reference({{"base.acd", "DEVICE_SUPPORTED = kes\nPROGRAM_OPTION_PACKAGE = kes\n"},
                         {"kes.acd", "PROPERTY = erase,SM:OP_ERASE,x:OP_ERASE_SM,y\n"}});
    EXPECT_THAT(reference.getDeviceOperationOptions("kes", "erase", MODE_TYPE::SM), ElementsAre("x"));
}

TEST(ReferenceQueries, PropertiesAreOfTheDeviceOrElseOfItsFamily) {
    Reference reference(databases());
    EXPECT_THAT(reference.getDeviceStringProperties("dev", "PINS"), ElementsAre("A", "B"));
    EXPECT_EQ(reference.getDeviceStringProperty("dev", "PINS"), "A");
    EXPECT_EQ(reference.getDeviceStringProperty("dev", "VENDOR"), "Korvel");
    EXPECT_TRUE(reference.getDeviceBoolProperty("dev", "FLASH"));
    EXPECT_FALSE(reference.getDeviceBoolProperty("dev", "VENDOR"));
    EXPECT_FALSE(reference.getDeviceBoolProperty("dev", "flash"));
}

TEST(ReferenceQueries, AMissingPropertyIsReportedThenRaises) {
    Reference reference(databases());
    try {
        (void)reference.getDeviceLongProperty("dev", "none");
        FAIL();
    } catch (const Raised& raised) {
        EXPECT_EQ(raised.type, "DataNotFoundException");
        EXPECT_EQ(raised.line, 437);
    }
    const Message report{Channel::INFO, ANY_LINE, "ACD entry  none not found for device family dev.\n"};
    EXPECT_THAT(reference.takeMessages(), ElementsAre(report));
    reference.setExceptions(false);
    EXPECT_EQ(reference.getDeviceStringProperty("dev", "none"), std::nullopt);
    EXPECT_EQ(reference.getDeviceLongProperty("dev", "none"), -1);
    EXPECT_THAT(reference.takeMessages(), ElementsAre(report, report));
}

TEST(ReferenceQueries, ASpiFlashAnswersFromItsCatalogue) {
    Reference reference(databases());
    EXPECT_EQ(reference.getDeviceStringProperty("flash", "size"), "16");
    EXPECT_EQ(reference.getDeviceLongProperty("flash", "none"), 0);
    EXPECT_THAT(reference.takeMessages(), IsEmpty());
    reference.setExceptions(false);
    EXPECT_THAT(reference.getDeviceStringProperties("flash", "SIZE"), IsEmpty());
}

} // namespace
