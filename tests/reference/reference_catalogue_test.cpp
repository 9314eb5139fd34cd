// The reference's families, its loading on demand, SPI flash and multiboot.
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

TEST(ReferenceCatalogue, NamesOfOneBaseShareACacheEntry) {
    Reference reference({{"base.acd", ""}, {"kes.acd", "[abc]\n"}});
    EXPECT_EQ(reference.getPartFamily("ABC_pkg"), "kes");
    EXPECT_EQ(reference.getPartFamily("abc"), "kes");
    EXPECT_THAT(reference.m_deviceFamilyCache, ElementsAre(Pair("abc", "kes"), Pair("spi", "spi")));
}

TEST(ReferenceCatalogue, SpiMembershipComesBeforeTheDatabase) {
    Reference reference({{"base.acd", ""}, {"kes.acd", "[FL]\n"}, {"spi.acd", "DEVICE_FAMILY = FL\n"}});
    EXPECT_EQ(reference.getPartFamily("fl"), "spi");
    EXPECT_TRUE(reference.isKorvelDevice("FL"));
}

TEST(ReferenceCatalogue, SpiIsAFamilyThoughNoDatabaseKnowsIt) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.getPartFamily("SpI"), "spi");
}

TEST(ReferenceCatalogue, AnUnknownDeviceBelongsToTheBase) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.getPartFamily("nobody"), "base");
    EXPECT_EQ(reference.getPartFamily(nullptr), "base");
    EXPECT_FALSE(reference.isKorvelDevice("nobody"));
}

TEST(ReferenceCatalogue, ASeedKeepsTheCaseThatALookUpDoesNot) {
    Reference reference(baseOnly());
    (void)reference.getPartFamily("x");
    reference.addCachedDeviceFamily("Dev_x", "fam");
    reference.addCachedDeviceFamily("low_x", "fam");
    EXPECT_EQ(reference.getPartFamily("Dev_x"), "base");
    EXPECT_EQ(reference.getPartFamily("LOW"), "fam");
}

TEST(ReferenceCatalogue, ASeedIsRefusedWhileTheLatestFamilyIsCachedAsADevice) {
    Reference reference(baseOnly());
    reference.addCachedDeviceFamily("dev", "fam"); // The latest family is "spi", which stands in the cache.
    EXPECT_EQ(reference.getPartFamily("dev"), "base");
}

TEST(ReferenceCatalogue, ASeededEmptyFamilyCountsAsNone) {
    Reference reference({{"base.acd", ""}, {"kes.acd", "[dev]\n"}});
    (void)reference.getPartFamily("x");
    reference.addCachedDeviceFamily("dev", nullptr);
    EXPECT_EQ(reference.getPartFamily("dev"), "kes");
}

TEST(ReferenceCatalogue, AnUnsupportedFamilyRaisesWhileExceptionsAreOn) {
    Reference reference({{"base.acd", "PROGRAM_OPTION_PACKAGE = kes\n"}, {"kes.acd", "[dev]\n"}});
    try {
        (void)reference.getBsdlOperations("dev", OUTPUT_TYPE::USB2);
        FAIL();
    } catch (const Raised& raised) {
        EXPECT_EQ(raised.type, "OutOfRangeException");
        EXPECT_EQ(raised.line, 1999);
    }
    reference.setExceptions(false);
    EXPECT_EQ(reference.getBsdlOperations("dev", OUTPUT_TYPE::USB2), 0);
}

TEST(ReferenceCatalogue, ALoadThatRaisedIsNotTriedAgain) {
    Reference reference({{"base.acd", "DEVICE_SUPPORTED = kes\n"},
                         {"kes.acd", "OPERATION = PROGRAM,BS,USB2:VERIFY\nPROPERTY = A,1:B\n"}});
    EXPECT_THROW((void)reference.getDeviceStringProperties("kes", "A"), Raised);
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "A"), ElementsAre("1"));
    EXPECT_THROW((void)reference.getBsdlOperations("kes", OUTPUT_TYPE::USB2), Raised);
    EXPECT_EQ(reference.getBsdlOperations("kes", OUTPUT_TYPE::USB2), 0);
    EXPECT_EQ(reference.getDeviceOperations("kes", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
}

TEST(ReferenceCatalogue, ADeviceIsLoadedUnderItsOwnNameAndItsFamilys) {
    Reference reference({{"base.acd", "DEVICE_SUPPORTED = kes\nPROGRAM_OPTION_PACKAGE = devPQ,kes\n"},
                         {"kes.acd", "PROPERTY = A,1\n[dev]\n"}});
    EXPECT_EQ(reference.getProgramOptions("dev", MODE_TYPE::BS, OUTPUT_TYPE::USB2, "PQ"), 0);
    EXPECT_THAT(reference.m_loadedFamilies, ElementsAre("dev", "kes"));
    EXPECT_THAT(reference.m_operationsLoaded, ElementsAre("spi", "kes"));
    EXPECT_THAT(reference.m_programOptionsLoaded, ElementsAre("spi", "devPQ", "kes"));
    EXPECT_THAT(reference.m_deviceProperties,
                ElementsAre(Pair("dev_A", ElementsAre("1")), Pair("kes_A", ElementsAre("1"))));
}

TEST(ReferenceCatalogue, PropertiesCountTheirValues) {
    Reference reference(
        {{"base.acd", ""}, {"kes.acd", "PROPERTIES = A,2,y,x,z:B,0,x:C:A2,3,q\nPROPERTY = B,old:A2,one\n"}});
    reference.setExceptions(false);
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "A"), ElementsAre("x", "y"));
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "B"), IsEmpty());
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "C"), IsEmpty());
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "A2"), ElementsAre("", "q"));
}

TEST(ReferenceCatalogue, AMissingValueRaisesAndKeepsTheFormerOne) {
    Reference reference(
        {{"base.acd", "DEVICE_SUPPORTED = kes\n"}, {"kes.acd", "PROPERTY = A,1\nPROPERTIES = A,3,x,y\n"}});
    try {
        (void)reference.getDeviceStringProperties("kes", "A");
        FAIL();
    } catch (const Raised& raised) {
        EXPECT_EQ(raised.type, "DataMismatchException");
        EXPECT_EQ(raised.line, 1051);
    }
    EXPECT_THAT(reference.getDeviceStringProperties("kes", "A"), ElementsAre("1"));
}

TEST(ReferenceCatalogue, SpiNamesMatchInUpperCaseOnly) {
    Reference reference(
        {{"base.acd", ""}, {"spi.acd", "DEVICE_FAMILY = FLASH,low\nFLASH_DEVICES = FLASH25A\n"}});
    EXPECT_TRUE(reference.isSpiDevice("flash25a"));
    EXPECT_TRUE(reference.isSpiDevice("FLASH"));
    EXPECT_FALSE(reference.isSpiDevice("low"));
    EXPECT_FALSE(reference.isSpiDevice("LOW"));
}

TEST(ReferenceCatalogue, ASpiDeviceFallsBackToItsLastClass) {
    Reference reference(
        {{"base.acd", ""},
         {"spi.acd", "DEVICE_FAMILY = A,ST1,BPI1\nST1_DEVICES = a,b\nBPI1_DEVICES = A\n"
                     "ST1_PROPERTY = SIZE,1\nBPI1_PROPERTY = SIZE,2\nA_PROPERTY = WIDTH,TRUE\n"}});
    EXPECT_EQ(reference.getSpiDeviceStringProperty("b", "size"), "1");
    EXPECT_EQ(reference.getSpiDeviceLongProperty("a", "SIZE"), 2);
    EXPECT_TRUE(reference.getSpiDeviceBoolProperty("a", "width"));
    EXPECT_EQ(reference.getSpiDeviceStringProperty("c", "SIZE"), "");
    EXPECT_EQ(reference.getSpiDeviceLongProperty("a", "WIDTH"), 0);
}

TEST(ReferenceCatalogue, MultibootIgnoresCase) {
    Reference reference(
        {{"base.acd", ""}, {"spi.acd", "TYPE_MB_SPI_NONE_LEAD = Dev\nTYPE_BPI_NONE_LEAD = Dev\n"}});
    EXPECT_TRUE(reference.isMbBpiSpiSupport("dEV", "type_mb_spi", "none", true));
    EXPECT_FALSE(reference.isMbBpiSpiSupport("dEV", "type_mb_spi", "none", false));
    EXPECT_FALSE(reference.isMbBpiSpiSupport("Dev", "TYPE_BPI", "NONE", true));
}

} // namespace
