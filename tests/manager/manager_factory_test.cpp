// Managers besides the one of the process: each starts from scratch, and none sees what another one was asked.
#include "Members.h"

#include <ManagerFactory.h>

#include <type_traits>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

const Files DATABASES{
    {"base.acd", "DEVICE_SUPPORTED = fam1,fam2,spi\nPROGRAM_OPTION_PACKAGE = fam1,fam2,spi\n"},
    {"fam1.acd", "OPERATION = PROGRAM,Bscan,USB2\nPROPERTY = VENDOR,Korvel\n[dev1]\n"},
    {"fam2.acd", "OPERATION = VERIFY,Bscan,USB2\n[dev2]\n"},
    {"spi.acd", ""}};

int operations(ConstraintsManager& manager, const char* device) {
    return manager.getDeviceOperations(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2);
}

/// Leaves no databases and no manager to the next test.
class ManagerFactoryTest : public testing::Test {
protected:
    ManagerFactoryTest() { AcdStore::setMemoryFiles(DATABASES); }
    ~ManagerFactoryTest() override { TarvikTestPeer::reset(); }

    MessageRecorder m_messages;
};

TEST_F(ManagerFactoryTest, MakesManagersThatAnswerAlike) {
    const ManagerFactory::Manager first = ManagerFactory::make();
    const ManagerFactory::Manager second = ManagerFactory::make();
    ASSERT_NE(first, second);
    EXPECT_EQ(operations(*first, "dev1"), maskOf(0));
    EXPECT_EQ(operations(*second, "dev1"), maskOf(0));
}

TEST_F(ManagerFactoryTest, MakesManagersThatShareNoState) {
    const ManagerFactory::Manager asked = ManagerFactory::make();
    const ManagerFactory::Manager fresh = ManagerFactory::make();
    asked->addCachedDeviceFamily("dev1", "fam2");
    EXPECT_EQ(operations(*asked, "dev1"), maskOf(3));
    EXPECT_TRUE(TarvikTestPeer::members(*fresh).m_deviceFamilyCache.empty());
    EXPECT_TRUE(TarvikTestPeer::members(*fresh).m_loadedFamilies.empty());
    EXPECT_STREQ(TarvikTestPeer::members(*fresh).m_partFamily.get().c_str(), "");
    EXPECT_EQ(operations(*fresh, "dev1"), maskOf(0));
}

TEST_F(ManagerFactoryTest, MakesManagersWithASwitchForExceptionsOfTheirOwn) {
    const ManagerFactory::Manager quiet = ManagerFactory::make();
    quiet->setExceptions(false);
    const ManagerFactory::Manager raising = ManagerFactory::make();
    EXPECT_EQ(quiet->getDeviceStringProperty("dev1", "NOTHING"), nullptr);
    EXPECT_THROW(static_cast<void>(raising->getDeviceStringProperty("dev1", "NOTHING")),
                 DataNotFoundException);
}

TEST_F(ManagerFactoryTest, LeavesTheManagerOfTheProcessAlone) {
    ManagerFactory::Manager other = ManagerFactory::make();
    EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
    ConstraintsManager* const own = ConstraintsManager::getConstraintsManager();
    EXPECT_NE(other.get(), own);
    const char* const vendor = own->getDeviceStringProperty("dev1", "VENDOR");
    EXPECT_EQ(operations(*other, "dev1"), maskOf(0));
    other.reset();
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), own);
    EXPECT_STREQ(vendor, "Korvel");
    EXPECT_STREQ(own->getDeviceStringProperty("dev1", "VENDOR"), "Korvel");
}

TEST_F(ManagerFactoryTest, ReportsAFaultOfTheStartUpAndMakesAManagerAllTheSame) {
    AcdStore::setMemoryFiles({{"base.acd", ""}, {"spi.acd", "OPERATION = NONSENSE,Bscan,USB2\n"}});
    const ManagerFactory::Manager manager = ManagerFactory::make();
    EXPECT_NE(manager, nullptr);
    EXPECT_TRUE(TarvikTestPeer::members(*manager).m_exceptions);
}

// Applications can't make managers of their own.
static_assert(!std::is_default_constructible_v<ConstraintsManager>);
static_assert(!std::is_destructible_v<ConstraintsManager>);

} // namespace
