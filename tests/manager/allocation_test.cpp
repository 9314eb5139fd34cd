#include "CoreFixtures.h"
#include "FailingAllocations.h"

#include <new>

// A machine that runs out of memory while the manager is made.

using testing::SizeIs;

namespace {

const Files DATABASES = {
    {"base.acd", R"(
DEVICE_SUPPORTED = kestrel,a_family_whose_name_is_longer_than_short_texts_are
PROGRAM_OPTION_PACKAGE = kestrel,a_package_whose_name_is_longer_than_short_texts_are
BS = outs,USB2,SVF:fams,kestrel
IDCODE = a_device_whose_name_is_longer_than_short_texts_are,an_idcode_that_is_longer_than_short_texts_are
NOT_SUPPORTED_PART_IN_MODE = SS_KS50_PQ
)"},
    {"spi.acd", R"(
DEVICE_FAMILY = FLASHES
FLASHES_DEVICES = FLASH1,A_FLASH_WHOSE_NAME_IS_LONGER_THAN_SHORT_TEXTS_ARE
FLASH1_PROPERTY = SIZE,4
AT1_DEVICES = FLASH1
OPERATION = PROGRAM,SPI,USB2
PROGRAM_OPTION = ERASE,SPI,USB2
TYPE_BPI_SERIAL_LEAD = KS50
)"},
};

void expectComplete(ConstraintsManager* manager) {
    ASSERT_NE(manager, nullptr);
    TarvikTestPeer peer(*manager);
    EXPECT_TRUE(peer.exceptions());
    EXPECT_EQ(peer.supportedDevices().size(), 2U);
    EXPECT_THAT(peer.bsCables(), SizeIs(2));
    EXPECT_THAT(peer.deviceIdcodes(), SizeIs(1));
    EXPECT_THAT(peer.operationOrders(), SizeIs(32));
    EXPECT_THAT(peer.spiNames(), SizeIs(4));
    EXPECT_THAT(peer.spiProperties(), SizeIs(1));
    EXPECT_THAT(peer.multibootTypes(), SizeIs(12));
}

TEST(OutOfMemory, ForTheObjectItselfGivesNull) {
    AcdStore::setMemoryFiles(DATABASES);
    {
        const auto failing = FailingAllocations::ofSize(sizeof(ConstraintsManager));
        EXPECT_EQ(ConstraintsManager::getConstraintsManager(), nullptr);
        EXPECT_TRUE(failing.happened());
    }
    EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
    expectComplete(ConstraintsManager::getConstraintsManager());
    TarvikTestPeer::reset();
}

/// What a request for the manager comes to while one allocation fails.
struct Attempt {
    bool failureHappened;
    bool passedOut;
    ConstraintsManager* manager;
};
Attempt attemptWithFailure(long allocation) {
    const auto failing = FailingAllocations::atNumber(allocation);
    try {
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        return {failing.happened(), false, manager};
    } catch (const std::bad_alloc&) {
        return {failing.happened(), true, nullptr};
    }
}

TEST(OutOfMemory, AtAnyAllocationOfTheStartUpPassesOutAndTheNextCallWorks) {
    int passedOut = 0;
    for (long allocation = 1;; ++allocation) {
        SCOPED_TRACE(allocation);
        AcdStore::setMemoryFiles(DATABASES);
        const Attempt attempt = attemptWithFailure(allocation);
        passedOut += attempt.passedOut ? 1 : 0;
        EXPECT_EQ(TarvikTestPeer::instance(), attempt.manager);
        expectComplete(ConstraintsManager::getConstraintsManager());
        TarvikTestPeer::reset();
        ASSERT_FALSE(HasFailure());
        if (!attempt.failureHappened) {
            break;
        }
    }
    EXPECT_GT(passedOut, 50);
}

} // namespace
