#include "text/Glob.h"

#include <gtest/gtest.h>

#include <fnmatch.h>

#include <random>
#include <string>
#include <vector>

// Patterns mean the same as in a shell.

namespace {

bool agrees(const std::string& pattern, const std::string& text) {
    return matchesGlob(pattern, text) == (::fnmatch(pattern.c_str(), text.c_str(), FNM_CASEFOLD) == 0);
}

TEST(Globs, MeanWhatShellsMean) {
    EXPECT_TRUE(matchesGlob("ks*", "KS50"));
    EXPECT_TRUE(matchesGlob("*5?", "KS50"));
    EXPECT_TRUE(matchesGlob("[a-k]s[!6]0", "KS50"));
    EXPECT_TRUE(matchesGlob("*a*b", "xaxxabxb"));
    EXPECT_FALSE(matchesGlob("ks", "KS50"));
    EXPECT_FALSE(matchesGlob("ks50?", "KS50"));
    EXPECT_FALSE(matchesGlob("", "KS50"));
    EXPECT_TRUE(matchesGlob("", ""));
    // A bracket that is not closed means itself.
    EXPECT_TRUE(matchesGlob("[a", "[a"));
    EXPECT_TRUE(matchesGlob("x[a-", "x[A-"));
    EXPECT_FALSE(matchesGlob("[a", "a"));
    EXPECT_FALSE(matchesGlob("[a\\", "a"));
}

TEST(Globs, AgreeWithTheSystemOnRandomPatterns) {
    std::mt19937 random(1);
    const auto make = [&random](const std::vector<std::string>& pieces, unsigned most) {
        std::string text;
        for (auto left = random() % (most + 1); left != 0; --left) {
            text += pieces[random() % pieces.size()];
        }
        return text;
    };
    for (int number = 0; number < 300'000; ++number) {
        const std::string pattern = make({"a", "B", "*", "?", "[ab]", "[!a]", "[^b]", "[A-c]", "[]a]", "[a-]",
                                          "[c-a]", "[\\]]", "\\*", "\\a"},
                                         6);
        const std::string text = make({"a", "b", "c", "A", "B", "]", "-", "*", "!"}, 6);
        ASSERT_TRUE(agrees(pattern, text)) << pattern << " and " << text;
    }
}

TEST(Globs, OfManyStarsTakeNoLongTime) {
    std::string pattern;
    for (int stars = 0; stars < 1000; ++stars) {
        pattern += "*a";
    }
    EXPECT_FALSE(matchesGlob(pattern + "b", std::string(5000, 'a')));
}

} // namespace
