// The manager gives the same answers whichever host it is built against.
#include "HostUnderTest.h"

#include <HostTestPeer.h>

#include <TarvikException.h>
#include <TarvikSmokeMgr.h>

#include <gtest/gtest.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

class ManagerConformance : public testing::Test {
protected:
    ManagerConformance() {
        const std::map<std::string, std::string> family = {
            {"OPERATION", "PROGRAM,Bscan,PARALLEL,USB2"},
            {"BSDL_OPERATION", "BYPASS,PARALLEL"},
            {"PROGRAM_OPTION", "ERASE,Bscan,PARALLEL"},
            {"PROPERTY", "VENDOR,a vendor with a longer name:PROGRAM,BS"},
            {"PROPERTIES", "OP_PROGRAM,2,slow,fast"}};
        auto device = family;
        device["PROPERTY"] = "PINS,144";
        device["PROGRAM_OPTION"] = "VERIFY,Bscan,PARALLEL";
        host_under_test::install({{"base",
                                   {"base",
                                    {{"DEVICE_SUPPORTED", "fam,spi"},
                                     {"PROGRAM_OPTION_PACKAGE", "fam,spi,devpq"},
                                     {"BS", "outs,PARALLEL:fams,fam"},
                                     {"SPI", "outs,USB2:fams,spi"},
                                     {"IDCODE", "dev,0x123"},
                                     {"NOT_SUPPORTED_PART_IN_MODE", "BS_dev_pkg"}}}},
                                  {"spi",
                                   {"spi",
                                    {{"DEVICE_FAMILY", "AT"},
                                     {"AT_DEVICES", "FLASH"},
                                     {"FLASH_PROPERTY", "DENSITY,4096"},
                                     {"OPERATION", "ERASE,SPI,USB2"},
                                     {"TYPE_BPI_SERIAL_LEAD", "FLASH"}}}},
                                  {"fam", {"fam", family}},
                                  {"dev", {"fam", device}}});
        m_manager = ConstraintsManager::getConstraintsManager();
    }
    ~ManagerConformance() override { TarvikTestPeer::removeManager(); }

    // The texts of all messages since the last call.
    static std::string said() {
        std::string text;
        for (const host_under_test::Message& message : host_under_test::takeMessages()) {
            text += std::to_string(message.line) + " " + message.text;
        }
        return text;
    }

    ConstraintsManager* m_manager = nullptr;
};

} // namespace

TEST_F(ManagerConformance, StartsInSilence) {
    ASSERT_NE(m_manager, nullptr);
    EXPECT_EQ(said(), "");
    EXPECT_EQ(m_manager->getOperationOrders().size(), 32U);
    EXPECT_EQ(m_manager->getProgramOptionOrders().size(), 24U);
}

TEST_F(ManagerConformance, AnswersFromTheTables) {
    EXPECT_EQ(m_manager->getDeviceOperations("dev_x", BS, OUTPUT_TYPE::USB2), 1);
    EXPECT_EQ(m_manager->getDeviceOperations("dev", MODE_TYPE::SPI, OUTPUT_TYPE::USB2), 16);
    EXPECT_EQ(m_manager->getProgramOptions("dev", BS, PARALLEL, nullptr), 1);
    EXPECT_EQ(m_manager->getProgramOptions("dev", BS, PARALLEL, "pq"), 2);
    EXPECT_EQ(m_manager->getBsdlOperations("dev", PARALLEL), 1 << 19);
    EXPECT_TRUE(m_manager->checkConstraints(BS, PARALLEL, "dev", OP_TYPE::PROGRAM, nullptr));
    EXPECT_EQ(said(), "");
}

TEST_F(ManagerConformance, RefusesInTheUsersWords) {
    EXPECT_TRUE(m_manager->checkConstraints(BS, PARALLEL, "dev", "other"));
    EXPECT_FALSE(m_manager->checkConstraints(BS, OUTPUT_TYPE::SVF));
    EXPECT_FALSE(m_manager->checkConstraints(BS, "dev_x", "pkg"));
    EXPECT_FALSE(m_manager->checkConstraints(MODE_TYPE::SPI, PARALLEL, "dev", nullptr));
    EXPECT_EQ(said(), "201 SVF is not supported in Boundary Scan mode\n"
                      "229 dev_pkg is not supported in Boundary Scan mode\n"
                      "249 Parallel cable is not supported in SPI mode\n");
}

TEST_F(ManagerConformance, TellsDevelopersOfValuesOutOfRange) {
    EXPECT_EQ(m_manager->getProgramOptions("dev", MODE_TYPE{6}, PARALLEL, nullptr), 0);
    EXPECT_EQ(said(), "0 Mode is out of range -- 6.\n");
}

TEST_F(ManagerConformance, FindsProperties) {
    EXPECT_STREQ(m_manager->getDeviceStringProperty("dev", "VENDOR"), "a vendor with a longer name");
    EXPECT_EQ(m_manager->getDeviceLongProperty("dev", "PINS"), 144);
    EXPECT_TRUE(m_manager->checkConstraints("dev", BS, OP_TYPE::PROGRAM, nullptr));
    EXPECT_EQ(m_manager->getDeviceOperationOptions("dev", "PROGRAM", BS).size(), 2U);
    EXPECT_STREQ(m_manager->getDeviceStringProperty("flash", "DENSITY"), "4096");
}

TEST_F(ManagerConformance, RaisesTheHostsExceptions) {
    EXPECT_THROW(static_cast<void>(m_manager->getDeviceStringProperty("dev", "NOSUCH")),
                 DataNotFoundException);
    EXPECT_EQ(said(), "437 ACD entry  NOSUCH not found for device family dev.\n");
    EXPECT_THROW(static_cast<void>(m_manager->getDeviceOperations("nobody", BS, PARALLEL)),
                 OutOfRangeException);
    EXPECT_THROW(static_cast<void>(ConstraintsManager::optionString2Type("OTP")), DataMismatchException);
}

TEST_F(ManagerConformance, ResolvesFamilies) {
    EXPECT_STREQ(m_manager->getPartFamily("dev_x").c_str(), "fam");
    EXPECT_STREQ(m_manager->getPartFamily("Flash").c_str(), "spi");
    EXPECT_STREQ(m_manager->getPartFamily("nobody").c_str(), "base");
    EXPECT_STREQ(m_manager->getAllDeviceIdcodes().at("dev").c_str(), "0x123");
    EXPECT_TRUE(m_manager->isMbBpiSpiSupport("flash", "type_bpi", "serial", true));
}

TEST_F(ManagerConformance, Dumps) {
    static_cast<void>(m_manager->getPartFamily("dev"));
    TarvikSmokeMgr recorder;
    m_manager->dumpCachedDeviceFamilies(&recorder);
    EXPECT_STREQ(recorder.text().c_str(), "Device dev belongs to fam\n");
    m_manager->dumpCachedDeviceFamilies(nullptr);
    EXPECT_EQ(said(), "1777 Device dev belongs to fam\n");
}
