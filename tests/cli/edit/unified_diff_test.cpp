// Differences of texts, as patches.
#include "edit/UnifiedDiff.h"

#include <gtest/gtest.h>

#include <random>
#include <sstream>
#include <vector>

using edit::unifiedDiff;

namespace {

std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

/// The text that a patch makes of another.
std::string applied(const std::string& text, const std::string& patch) {
    const std::vector<std::string> before = linesOf(text);
    const std::vector<std::string> steps = linesOf(patch);
    std::string after;
    std::size_t line = 0;
    for (std::size_t i = 2; i < steps.size(); ++i) {
        if (steps[i].starts_with("@@ -")) {
            std::size_t end = 0;
            const std::size_t number = std::stoul(steps[i].substr(4), &end);
            const bool isEmpty = steps[i].substr(4 + end).starts_with(",0");
            for (; line < number - (isEmpty ? 0 : 1); ++line) {
                after += before.at(line) + '\n';
            }
        } else if (steps[i][0] == '+') {
            after += steps[i].substr(1) + '\n';
        } else {
            EXPECT_EQ(before.at(line), steps[i].substr(1));
            after += steps[i][0] == ' ' ? before.at(line) + '\n' : "";
            ++line;
        }
    }
    for (; line < before.size(); ++line) {
        after += before[line] + '\n';
    }
    return after;
}

} // namespace

TEST(UnifiedDiff, ShowsThreeLinesAroundAChange) {
    EXPECT_EQ(unifiedDiff("k", "1\n2\n3\n4\n5\n6\n7\n8\n9\n", "1\n2\n3\n4\nfive\n6\n7\n8\n9\n"),
              "--- k\n+++ k\n@@ -2,7 +2,7 @@\n 2\n 3\n 4\n-5\n+five\n 6\n 7\n 8\n");
    EXPECT_EQ(unifiedDiff("k", "", "1\n"), "--- k\n+++ k\n@@ -0,0 +1 @@\n+1\n");
    EXPECT_EQ(unifiedDiff("k", "1\n", ""), "--- k\n+++ k\n@@ -1 +0,0 @@\n-1\n");
    EXPECT_EQ(unifiedDiff("k", "1", "1\n"),
              "--- k\n+++ k\n@@ -1 +1 @@\n-1\n\\ No newline at end of file\n+1\n");
    EXPECT_EQ(unifiedDiff("k", "1\n", "1\n"), "");
}

TEST(UnifiedDiff, MakesTheNewTextOfTheOld) {
    std::mt19937 random(5);
    for (int i = 0; i < 500; ++i) {
        std::string before;
        std::string after;
        for (auto line = random() % 30; line > 0; --line) {
            const std::string text = std::to_string(random() % 20) + '\n';
            before += random() % 8 == 0 ? "" : text;
            after += random() % 8 == 0 ? "" : text;
            after += random() % 8 == 0 ? "new" + text : "";
        }
        EXPECT_EQ(applied(before, unifiedDiff("k", before, after)), after) << before << "---\n" << after;
    }
}
