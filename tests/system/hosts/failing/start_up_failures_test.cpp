// What the start-up leaves behind when the host fails at any one of its calls.
#include "FailingDatabases.h"
#include "Snapshot.h"

#include <FailingHost.h>

#include <gtest/gtest.h>

#include <new>
#include <set>
#include <sstream>

namespace {

using failing_host::Extent;
using failing_host::Failure;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

class StartUpFailures : public testing::Test {
protected:
    StartUpFailures() { memory_host::setDatabases(failingDatabases()); }
    ~StartUpFailures() override {
        failing_host::serve();
        TarvikTestPeer::removeManager();
    }

    static Snapshot healthy() {
        failing_host::serve();
        const Snapshot snapshot = Snapshot::of(*ConstraintsManager::getConstraintsManager());
        TarvikTestPeer::removeManager();
        return snapshot;
    }
};

// The elements of a snapshot's text; of a key with its value (or an output with its mask), the key.
std::set<std::string> elements(const std::string& text) {
    std::istringstream words(text);
    std::set<std::string> found;
    for (std::string word; words >> word;) {
        found.insert(word.substr(0, word.find_first_of("=:")));
    }
    return found;
}

// How many steps ran to their end: they hold what they hold in a healthy manager, the next one may hold some of
// it, and all behind that hold nothing.
std::size_t completedSteps(const Snapshot& snapshot, const Snapshot& healthy) {
    std::size_t completed = 0;
    while (completed < healthy.steps.size() && snapshot.steps[completed] == healthy.steps[completed]) {
        ++completed;
    }
    for (std::size_t step = completed; step < healthy.steps.size(); ++step) {
        const auto& [name, text] = snapshot.steps[step];
        if (step > completed) {
            EXPECT_EQ(text, "") << name << " although " << healthy.steps[completed].first
                                << " was not reached";
            continue;
        }
        const auto all = elements(healthy.steps[step].second);
        for (const std::string& element : elements(text)) {
            EXPECT_TRUE(all.count(element) != 0) << name << " holds " << element;
        }
    }
    return completed;
}

// Asks everything, for what it does to the process; no failure but those that the manager itself raises may come
// out, and none while exceptions are off.
void askEverything(ConstraintsManager& manager) {
    for (const bool exceptions : {true, false}) {
        manager.setExceptions(exceptions);
        const auto ask = [&](auto question) {
            try {
                static_cast<void>(question());
            } catch (const LogicException&) {
                EXPECT_TRUE(exceptions);
            }
        };
        for (const char* device : {"dev_pq", "fam", "FLASH", "nobody"}) {
            for (const int mode : {0, 5, 6, 9}) {
                for (const int output : {-1, 0, 5}) {
                    const MODE_TYPE modeType{mode};
                    const OUTPUT_TYPE outputType{output};
                    ask([&] { return manager.getDeviceOperations(device, modeType, outputType); });
                    ask([&] { return manager.getProgramOptions(device, modeType, outputType, "pq"); });
                    ask([&] { return manager.getBsdlOperations(device, outputType); });
                    ask([&] { return manager.checkConstraints(modeType, outputType); });
                    ask([&] { return manager.checkConstraints(modeType, outputType, device, "pkg"); });
                    ask([&] {
                        return manager.checkConstraints(modeType, outputType, device, OP_TYPE::ERASE,
                                                        nullptr);
                    });
                }
                ask([&] { return manager.checkConstraints(MODE_TYPE{mode}, device, "pkg"); });
                ask([&] {
                    return manager.getDeviceOperationOptions(device, "ERASE", MODE_TYPE{mode}).size();
                });
            }
            ask([&] { return manager.getDeviceStringProperty(device, "VENDOR"); });
            ask([&] { return manager.getDeviceLongProperty(device, "PINS"); });
            ask([&] { return manager.getSpiDeviceStringProperty(device, "DENSITY"); });
            ask([&] { return manager.isMbBpiSpiSupport(device, "TYPE_MB_SPI", "NONE", true); });
            ask([&] { return manager.isKorvelDevice(device); });
        }
        manager.dumpCachedDeviceFamilies(nullptr);
        manager.dumpMbBpiSpi();
    }
    for (const auto dump :
         {&ConstraintsManager::dumpOperationsTable, &ConstraintsManager::dumpBsdlOperationsTable,
          &ConstraintsManager::dumpProgramOptionsTable}) {
        TarvikSmokeMgr recorder;
        (manager.*dump)(&recorder);
        EXPECT_FALSE(recorder.text().empty());
    }
    static_cast<void>(memory_host::takeMessages());
}

} // namespace

TEST_F(StartUpFailures, EveryStepOfAHealthyStartUpLeavesSomething) {
    for (const auto& [name, text] : healthy().steps) {
        EXPECT_NE(text, "") << name;
    }
}

TEST_F(StartUpFailures, ATarvikExceptionEndsThePassAndIsReported) {
    const Snapshot expected = healthy();
    std::set<std::size_t> ends;
    std::size_t former = 0;
    for (std::size_t call = 1;; ++call) {
        failing_host::failAt(call, Failure::TARVIK_EXCEPTION);
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        const bool failed = failing_host::hasFailed();
        const int reports = failing_host::reports();
        failing_host::serve();
        ASSERT_NE(manager, nullptr) << call;
        if (!failed) {
            break;
        }
        EXPECT_EQ(reports, 1) << call;
        EXPECT_TRUE(TarvikTestPeer::members(*manager).m_exceptions) << call;
        EXPECT_EQ(ConstraintsManager::getConstraintsManager(), manager) << "made once, failed or not";

        const std::size_t completed = completedSteps(Snapshot::of(*manager), expected);
        EXPECT_GE(completed, former) << call;
        former = completed;
        ends.insert(completed);
        TarvikTestPeer::removeManager();
    }
    // Each step was the first unfinished one at some call, but for the orders: they ask nothing of the host.
    EXPECT_EQ(ends.size(), expected.steps.size() - 1);
    EXPECT_EQ(*ends.begin(), 0U);
}

TEST_F(StartUpFailures, ATarvikExceptionReportsItselfBeforeTheBaseReaderIsClosed) {
    constexpr std::size_t OPENS_THE_READER = 1;
    int reported = 0;
    for (std::size_t call = OPENS_THE_READER + 1;; ++call) {
        failing_host::failAt(call, Failure::TARVIK_EXCEPTION);
        ASSERT_NE(ConstraintsManager::getConstraintsManager(), nullptr);
        const bool failed = failing_host::hasFailed();
        const std::vector<std::string> events = failing_host::events();
        failing_host::serve();
        TarvikTestPeer::removeManager();
        if (!failed) {
            break;
        }
        EXPECT_EQ(events, (std::vector<std::string>{"report", "close base"})) << call;
        ++reported;
    }
    EXPECT_GT(reported, 10);
}

TEST_F(StartUpFailures, TheManagerIsUsableBehindATarvikException) {
    for (std::size_t call = 1;; ++call) {
        failing_host::failAt(call, Failure::TARVIK_EXCEPTION);
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        const bool failed = failing_host::hasFailed();
        failing_host::serve();
        ASSERT_NE(manager, nullptr);
        askEverything(*manager);
        TarvikTestPeer::removeManager();
        if (!failed) {
            break;
        }
    }
}

TEST_F(StartUpFailures, AnyOtherExceptionLeavesNoManagerAndTheNextCallTriesAgain) {
    const Snapshot expected = healthy();
    for (std::size_t call = 1;; ++call) {
        failing_host::failAt(call, Failure::BAD_ALLOC);
        try {
            static_cast<void>(ConstraintsManager::getConstraintsManager());
            EXPECT_FALSE(failing_host::hasFailed()) << "a failure was lost at call " << call;
            break;
        } catch (const std::bad_alloc&) {
            EXPECT_TRUE(failing_host::hasFailed());
        }
        EXPECT_FALSE(TarvikTestPeer::exists()) << call;
        failing_host::serve();
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        ASSERT_NE(manager, nullptr);
        EXPECT_EQ(Snapshot::of(*manager).steps, expected.steps) << call;
        EXPECT_TRUE(TarvikTestPeer::members(*manager).m_exceptions);
        TarvikTestPeer::removeManager();
    }
}

TEST_F(StartUpFailures, AHostThatFailsForGoodBreaksNothing) {
    const Snapshot expected = healthy();
    for (const Failure failure : {Failure::TARVIK_EXCEPTION, Failure::BAD_ALLOC}) {
        for (std::size_t call = 1;; ++call) {
            failing_host::failAt(call, failure, Extent::ALL_FROM_THERE);
            bool raised = false;
            try {
                static_cast<void>(ConstraintsManager::getConstraintsManager());
            } catch (const std::bad_alloc&) {
                raised = true;
            }
            const bool failed = failing_host::hasFailed();
            failing_host::serve();
            EXPECT_EQ(raised, failed && failure == Failure::BAD_ALLOC) << call;
            EXPECT_EQ(TarvikTestPeer::exists(), !raised) << call;
            TarvikTestPeer::removeManager();
            if (!failed) {
                break;
            }
        }
    }
    EXPECT_EQ(healthy().steps, expected.steps);
}
