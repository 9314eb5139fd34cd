// docs/embedding.md lists every location that raises.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <regex>
#include <set>
#include <string>

namespace {

/// The first group of every line of a file that a pattern matches.
std::set<std::string> matches(const std::string& path, const std::regex& pattern) {
    std::ifstream file(TARVIK_SOURCE_DIRECTORY + path);
    std::set<std::string> found;
    std::smatch match;
    for (std::string line; std::getline(file, line);) {
        if (std::regex_search(line, match, pattern)) {
            found.insert(match[1]);
        }
    }
    return found;
}

TEST(Locations, ThatRaiseAreAllDocumented) {
    const std::set<std::string> messagesOnly{"201", "229", "249", "256", "1300", "1777"};
    std::set<std::string> locations =
        matches("/s/Diagnostics.h", std::regex("inline constexpr int \\w+ = (\\d+);"));
    EXPECT_EQ(locations.size(), 30U);
    for (const std::string& location : messagesOnly) {
        EXPECT_EQ(locations.erase(location), 1U) << location;
    }
    EXPECT_THAT(matches("/docs/embedding.md", std::regex("^\\| (\\d+) \\|")),
                testing::ContainerEq(locations));
}

} // namespace
