// Work in a copy of the process.
#include "why/Apart.h"

#include <gtest/gtest.h>

namespace {

/// More than a pipe takes while nobody reads.
std::string muchText() { return std::string(std::size_t{1} << 20U, 'x'); }

TEST(Apart, GivesAllOfALongResult) { EXPECT_EQ(why::apart(muchText), muchText()); }

TEST(Apart, EndsWhenNobodyAsksForTheResult) {
    // To come to the end is all: the copy had much to say, and was waited for.
    const why::Apart apart(muchText);
}

} // namespace
