#include "FailingAllocations.h"
#include "Members.h"

#include <algorithm>
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
    auto& members = TarvikTestPeer::members(*manager);
    EXPECT_TRUE(members.m_exceptions);
    EXPECT_EQ(members.m_supportedDevices.size(), 2U);
    EXPECT_THAT(members.m_bsCables, SizeIs(2));
    EXPECT_THAT(members.m_deviceIdcodes.get(), SizeIs(1));
    EXPECT_THAT(members.m_operationOrders, SizeIs(32));
    EXPECT_THAT(members.m_spiNames, SizeIs(4));
    EXPECT_THAT(members.m_spiProperties.get(), SizeIs(1));
    EXPECT_THAT(members.m_multibootTypes, SizeIs(12));
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

TEST(OutOfMemory, WhileALoadReadsPropertiesKeepsThoseBeforeIt) {
    constexpr int PROPERTIES = 50;
    const auto nameOf = [](int number) { return "P" + std::to_string(number); };
    const auto valueOf = [](int number) {
        return "value number " + std::to_string(number) + " is longer than short texts are";
    };
    Files files = DATABASES;
    files["kestrel.acd"] = "PROPERTY = ";
    for (int number = 0; number < PROPERTIES; ++number) {
        files["kestrel.acd"] += (number == 0 ? "" : ":") + nameOf(number) + "," + valueOf(number);
    }
    int mostKept = 0;
    bool happened = true;
    for (long allocation = 1; happened; ++allocation) {
        SCOPED_TRACE(allocation);
        ManagerFixture fixture(files);
        fixture->setExceptions(false);
        try {
            const auto failing = FailingAllocations::atNumber(allocation);
            fixture.members().loadDeviceData("kestrel", {});
            happened = failing.happened();
        } catch (const std::bad_alloc&) {
        }
        // The same family again: every property up to some place is there, and none after it.
        int found = 0;
        while (found < PROPERTIES &&
               holds(fixture->getDeviceStringProperties("kestrel", nameOf(found).c_str()),
                     valueOf(found).c_str())) {
            ++found;
        }
        for (int number = found; number < PROPERTIES; ++number) {
            EXPECT_EQ(fixture->getDeviceStringProperty("kestrel", nameOf(number).c_str()), nullptr) << number;
        }
        EXPECT_TRUE(happened || found == PROPERTIES);
        mostKept = happened && found < PROPERTIES ? std::max(mostKept, found) : mostKept;
        ASSERT_FALSE(HasFailure());
    }
    EXPECT_EQ(mostKept, PROPERTIES - 1);
}

} // namespace
