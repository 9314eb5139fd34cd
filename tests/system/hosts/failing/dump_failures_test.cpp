// A dump that the host breaks off has said what came before, and changes nothing in the manager.
#include "FailingDatabases.h"
#include "HostTestPeer.h"

#include <FailingHost.h>
#include <TarvikSmokeMgr.h>

#include <gtest/gtest.h>

#include <new>

namespace {

using failing_host::Failure;
using Dump = void (ConstraintsManager::*)(TarvikSmokeMgr*);

class DumpFailures : public testing::Test {
protected:
    DumpFailures() : m_manager(start()) {
        static_cast<void>(
            m_manager.getDeviceOperations("fam", TARVIKNS::MODE_TYPE::BS, TARVIKNS::OUTPUT_TYPE::SVF));
        static_cast<void>(memory_host::takeMessages());
    }
    ~DumpFailures() override {
        failing_host::serve();
        TarvikTestPeer::removeManager();
    }

    static constexpr std::size_t ALL_TRIED = 300;
    static constexpr std::size_t STRIDE = 97;

    std::string recorded(Dump dump) {
        TarvikSmokeMgr recorder;
        (m_manager.*dump)(&recorder);
        return recorder.text();
    }

    // All that was said, whichever way.
    static std::string said(const TarvikSmokeMgr& recorder) {
        std::string text = recorder.text();
        for (const memory_host::Message& message : memory_host::takeMessages()) {
            text += message.text;
        }
        return text;
    }

    // Fails at one call of the dump after the other, with and without a recorder. Behind the first calls only
    // some are tried: a dump makes thousands, all alike.
    void expectBrokenOffAnywhere(Dump dump) {
        const std::string whole = recorded(dump);
        for (const bool withRecorder : {true, false}) {
            std::size_t former = 0;
            for (std::size_t call = 1;; call += call < ALL_TRIED ? 1 : STRIDE) {
                const Failure failure = call % 2 == 0 ? Failure::BAD_ALLOC : Failure::TARVIK_EXCEPTION;
                TarvikSmokeMgr recorder;
                failing_host::failAt(call, failure);
                bool raised = false;
                try {
                    (m_manager.*dump)(withRecorder ? &recorder : nullptr);
                } catch (const failing_host::InjectedException&) {
                    raised = failure == Failure::TARVIK_EXCEPTION;
                } catch (const std::bad_alloc&) {
                    raised = failure == Failure::BAD_ALLOC;
                }
                const bool failed = failing_host::hasFailed();
                failing_host::serve();
                const std::string text = said(recorder);
                ASSERT_EQ(raised, failed) << call;
                ASSERT_EQ(whole.compare(0, text.size(), text), 0) << call;
                ASSERT_GE(text.size(), former) << call;
                former = text.size();
                if (!failed) {
                    ASSERT_EQ(text, whole);
                    break;
                }
            }
        }
        EXPECT_EQ(recorded(dump), whole);
    }

private:
    static ConstraintsManager& start() {
        memory_host::setDatabases(failingDatabases());
        return *ConstraintsManager::getConstraintsManager();
    }

protected:
    ConstraintsManager& m_manager;
};

} // namespace

TEST_F(DumpFailures, OfTheOperations) { expectBrokenOffAnywhere(&ConstraintsManager::dumpOperationsTable); }

TEST_F(DumpFailures, OfTheBoundaryScanOperations) {
    expectBrokenOffAnywhere(&ConstraintsManager::dumpBsdlOperationsTable);
}

TEST_F(DumpFailures, OfTheProgramOptions) {
    expectBrokenOffAnywhere(&ConstraintsManager::dumpProgramOptionsTable);
}

TEST_F(DumpFailures, OfTheCachedFamilies) {
    static_cast<void>(m_manager.getPartFamily("dev"));
    static_cast<void>(m_manager.getPartFamily("nobody"));
    expectBrokenOffAnywhere(&ConstraintsManager::dumpCachedDeviceFamilies);
}
