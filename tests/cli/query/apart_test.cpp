// Work in a copy of the process.
#include "query/Apart.h"
#include "term/ExitCode.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

namespace {

/// More than a pipe takes while nobody reads.
std::string muchText() { return std::string(std::size_t{1} << 20U, 'x'); }

TEST(Apart, GivesAllOfALongResult) { EXPECT_EQ(why::apart(muchText), muchText()); }

TEST(Apart, LeavesNoTrace) {
    int number = 1;
    EXPECT_EQ(why::apart([&] { return std::to_string(++number); }), "2");
    EXPECT_EQ(number, 1);
}

TEST(Apart, DoesNotTakeAFailureForAnAnswer) {
    EXPECT_THROW(static_cast<void>(why::apart([]() -> std::string { throw std::runtime_error("no"); })),
                 CommandError);
}

TEST(Apart, EndsWhenNobodyAsksForTheResult) {
    // To come to the end is all: the copy had much to say, and was waited for.
    const why::Apart apart(muchText);
}

} // namespace
