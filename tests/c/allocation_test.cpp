// Every function of the C interface, asked of a fresh manager and of one that has answered everything before, while its
// Nth allocation fails, for every N: it answers right or returns TARVIK_NO_MEMORY, and the manager continues.
#include "CManager.h"

#include "manager/FailingAllocations.h"
#include "reference/Call.h"
#include "system/torture/EachMethod.h"

#include <gtest/gtest.h>

#include <memory>
#include <new>
#include <optional>

namespace {

using namespace reference;

/// The answer while allocation number `number` fails; nothing if memory ran out.
std::optional<std::string> answerFailing(CManager& manager, const Call& call, long number, bool& happened) {
    std::optional<std::string> answered;
    {
        const auto failing = FailingAllocations::atNumber(number);
        try {
            answered = ask(manager, call).result;
        } catch (const std::bad_alloc&) {
        }
        happened = failing.happened();
    }
    static_cast<void>(manager.takeMessages());
    return answered;
}

class CAllocations : public testing::TestWithParam<std::size_t> {
protected:
    const Call& call = torture::calls()[GetParam()];
};

TEST_P(CAllocations, FailOneByOneInAFreshManager) {
    const std::string right = ask(*std::make_unique<CManager>(torture::DATABASES), call).result;
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        CManager manager(torture::DATABASES);
        EXPECT_EQ(answerFailing(manager, call, number, happened).value_or(right), right);
        static_cast<void>(ask(manager, call)); // has an answer again
        ASSERT_FALSE(HasFailure());
    }
}

TEST_P(CAllocations, FailOneByOneInAWarmManager) {
    CManager manager(torture::DATABASES);
    for (const Call& other : torture::calls()) {
        static_cast<void>(ask(manager, other));
    }
    const std::string right = ask(manager, call).result;
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        EXPECT_EQ(answerFailing(manager, call, number, happened).value_or(right), right);
        EXPECT_EQ(ask(manager, call).result, right);
        ASSERT_FALSE(HasFailure());
    }
}

std::string nameOf(const testing::TestParamInfo<std::size_t>& info) {
    return std::string(signatures()[info.param].name);
}

INSTANTIATE_TEST_SUITE_P(OfEachFunction, CAllocations,
                         testing::Range(std::size_t{0}, torture::calls().size()), nameOf);

} // namespace
