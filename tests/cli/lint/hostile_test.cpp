// The linter on databases that are all edge: it always comes to an end, with findings or without.
#include "LintFixtures.h"
#include "host/database/HostileTexts.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

Files demonstration() {
    Files files;
    for (const auto& entry : std::filesystem::directory_iterator(TARVIK_SOURCE_DIRECTORY "/database")) {
        std::ostringstream text;
        text << std::ifstream(entry.path(), std::ios::binary).rdbuf();
        files[entry.path().filename().string()] = text.str();
    }
    return files;
}

/// Moves, drops and doubles pieces of a text.
void spoil(std::string& text, HostileTexts& random) {
    for (int i = 0; i < 20 && !text.empty(); ++i) {
        const std::size_t from = random.pick(text.size());
        const std::string piece = text.substr(from, random.pick(30));
        if (random.pick(2) == 0) {
            text.erase(from, piece.size());
        }
        text.insert(random.pick(text.size() + 1), random.pick(3) == 0 ? random.next(4) : piece);
    }
}

} // namespace

TEST(LintOnHostileDatabases, EndsWithFindings) {
    HostileTexts random(1);
    for (int i = 0; i < 10; ++i) {
        Files files = demonstration();
        for (auto& [name, text] : files) {
            spoil(text, random);
        }
        const ProcessResult outcome = lint(files, {"--format", "sarif"});
        ASSERT_EQ(outcome.status, 1) << outcome.error;
        EXPECT_TRUE(nlohmann::json::accept(outcome.output)) << outcome.error;
    }
}

TEST(LintOnHostileDatabases, EndsOnNonsense) {
    HostileTexts random(2);
    for (int i = 0; i < 10; ++i) {
        const ProcessResult outcome = lint(Files{{"base.acd", random.next(200)},
                                                 {"spi.acd", random.next(200)},
                                                 {"a.acd", random.next(200)},
                                                 {"b.acd", random.noise(500)}});
        EXPECT_LE(outcome.status, 1) << outcome.error;
    }
}
