// Every exported method, asked of a fresh manager and of one that has answered everything before, while its Nth
// allocation fails, for every N: it answers rightly or raises std::bad_alloc, and the manager goes on. (That nothing
// leaks is told by the run under the address sanitizer.)
#include "manager/FailingAllocations.h"
#include "reference/CallRunner.h"
#include "support/TarvikTestPeer.h"
#include "system/torture/EachMethod.h"

#include <gtest/gtest.h>

#include <new>
#include <optional>
#include <set>

namespace {

using namespace reference;
using torture::calls;
using torture::DATABASES;

/// A manager over the databases, and all that it says.
class Session {
public:
    Session() {
        TarvikTestPeer::reset();
        AcdStore::setMemoryFiles(DATABASES);
        m_messages.listen();
        m_manager = ConstraintsManager::getConstraintsManager();
    }
    ~Session() { TarvikTestPeer::reset(); }
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    void warmUp() {
        for (const Call& call : calls()) {
            static_cast<void>(answer(call));
        }
    }

    [[nodiscard]] std::string answer(const Call& call) { return ask(*m_manager, m_messages, call).result; }

    /// The answer while allocation number `number` fails; nothing when std::bad_alloc came of it.
    [[nodiscard]] std::optional<std::string> answerFailing(const Call& call, long number) {
        const auto failing = FailingAllocations::atNumber(number);
        std::optional<std::string> answered;
        try {
            answered = answer(call);
        } catch (const std::bad_alloc&) {
        }
        m_happened = failing.happened();
        static_cast<void>(m_messages.take());
        return answered;
    }

    /// Did the latest call get as far as the failing allocation?
    [[nodiscard]] bool happened() const { return m_happened; }

private:
    ManagerMessages m_messages;
    ConstraintsManager* m_manager = nullptr;
    bool m_happened = false;
};

/// About another family, which no call above touches.
const Call UNTOUCHED{Method::GET_DEVICE_OPERATIONS, {"SW10", 0, 2}};

class Allocations : public testing::TestWithParam<std::size_t> {
protected:
    const Call& call = calls()[GetParam()];
};

TEST_P(Allocations, FailOneByOneInAFreshManager) {
    const std::string right = Session().answer(call);
    const std::string rightUntouched = Session().answer(UNTOUCHED);
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        Session session;
        const std::optional<std::string> answered = session.answerFailing(call, number);
        happened = session.happened();
        EXPECT_EQ(answered.value_or(right), right);
        EXPECT_EQ(session.answer(UNTOUCHED), rightUntouched);
        // A load that failed may leave something undone, but the question has an answer again.
        static_cast<void>(session.answer(call));
        ASSERT_FALSE(HasFailure());
    }
}

TEST_P(Allocations, FailOneByOneInAWarmManager) {
    Session session;
    session.warmUp();
    const std::string right = session.answer(call);
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        EXPECT_EQ(session.answerFailing(call, number).value_or(right), right);
        happened = session.happened();
        EXPECT_EQ(session.answer(call), right);
        ASSERT_FALSE(HasFailure());
    }
}

std::string nameOf(const testing::TestParamInfo<std::size_t>& info) {
    return std::string(signatures()[info.param].name);
}

INSTANTIATE_TEST_SUITE_P(OfEachMethod, Allocations, testing::Range(std::size_t{0}, calls().size()), nameOf);

TEST(AllocationCalls, AreOneForEachMethodInTheirOrder) {
    ASSERT_EQ(calls().size(), signatures().size());
    for (std::size_t number = 0; number < calls().size(); ++number) {
        EXPECT_EQ(calls()[number].method, signatures()[number].method);
        EXPECT_EQ(calls()[number].arguments.size(), signatures()[number].arguments.size());
    }
}

} // namespace
