// `index`: writes the index of a directory, and shows what it is worth.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::AllOf;
using testing::HasSubstr;
using testing::StartsWith;

class Index : public testing::Test {
protected:
    [[nodiscard]] ProcessResult run(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), "index");
        return runTool(arguments);
    }

    [[nodiscard]] std::string state() const {
        return json::parse(run({"--show", "--json", m_database.path()}).output)["state"];
    }

    [[nodiscard]] json shown() const {
        return json::parse(run({"--show", "--json", m_database.path()}).output);
    }

    SmallDatabase m_database;
};

TEST_F(Index, IsWrittenForEachDirectory) {
    const DatabaseDirectory other(DatabaseDirectory::Files{{"finch.acd", "[FN30]\n"}});
    const ProcessResult outcome = run({m_database.path(), other.path() + "/"});
    EXPECT_EQ(outcome.status, 0) << outcome;
    EXPECT_EQ(outcome.output, m_database.path("index.acx") + ": 3 files, 2 sections\n" +
                                  other.path("index.acx") + ": 1 files, 1 sections\n");
    EXPECT_TRUE(std::filesystem::exists(m_database.path("index.acx")));
    EXPECT_TRUE(std::filesystem::exists(other.path("index.acx")));
}

TEST_F(Index, IsReplacedWhole) {
    EXPECT_EQ(run({m_database.path()}).status, 0);
    std::ofstream(m_database.path("crane.acd")) << "[CR1]\n";
    EXPECT_EQ(state(), "stale");
    EXPECT_EQ(run({m_database.path()}).status, 0);
    EXPECT_EQ(state(), "current");
    EXPECT_EQ(shown()["files"].size(), 4U);
}

TEST_F(Index, ThatDoesNotMatchIsAFindingOfLint) {
    const auto lint = [&] {
        return runTool({"lint", "--select", "L115", "--format", "json", m_database.path()}).output;
    };
    EXPECT_EQ(json::parse(lint())["findings"].size(), 0U) << "there is no index";
    EXPECT_EQ(run({m_database.path()}).status, 0);
    EXPECT_EQ(json::parse(lint())["findings"].size(), 0U);
    std::ofstream(m_database.path("crane.acd")) << "[CR1]\n";
    EXPECT_THAT(lint(), HasSubstr("index.acx of this directory does not match"));
    EXPECT_EQ(run({m_database.path()}).status, 0);
    EXPECT_EQ(json::parse(lint())["findings"].size(), 0U);
}

TEST_F(Index, HasAState) {
    EXPECT_EQ(state(), "missing");
    std::ofstream(m_database.path("index.acx")) << "tarvik index 0\n";
    EXPECT_EQ(state(), "invalid");
    EXPECT_EQ(run({m_database.path()}).status, 0);
    EXPECT_EQ(state(), "current");
    EXPECT_EQ(run({"--show", m_database.path()}).status, 0);
    std::filesystem::remove(m_database.path("spi.acd"));
    EXPECT_EQ(state(), "stale");
    const ProcessResult outcome = run({"--show", m_database.path()});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.output, HasSubstr("not used: the files have changed since it was made\n"));
}

TEST_F(Index, ShowsWhatItRecords) {
    EXPECT_EQ(run({m_database.path()}).status, 0);
    const json index = shown();
    EXPECT_EQ(index["path"], m_database.path("index.acx"));
    EXPECT_THAT(index["created"].get<std::string>(),
                testing::MatchesRegex("20..-..-..T..:..:..\\..........Z"));
    ASSERT_EQ(index["files"].size(), 3U);
    const json& finch = index["files"][1];
    EXPECT_EQ(finch["name"], "finch.acd");
    EXPECT_EQ(finch["sections"], json({"FN10", "FN20"}));
    EXPECT_EQ(finch["size"], std::filesystem::file_size(m_database.path("finch.acd")));
    EXPECT_EQ(finch["settled"], finch["changed"].get<std::string>() < index["created"].get<std::string>());
    EXPECT_THAT(
        run({"--show", m_database.path()}).output,
        AllOf(StartsWith(m_database.path("index.acx") + ": current\nmade 20"), HasSubstr("\nfinch.acd  ")));
}

TEST_F(Index, OfOneDirectoryIsShown) {
    const ProcessResult outcome = run({"--show", m_database.path(), m_database.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("--show takes one directory"));
}

TEST_F(Index, ThatCannotBeMadeIsReported) {
    EXPECT_THAT(run({"/nowhere"}).error, HasSubstr("can't read \"/nowhere\": No such file or directory"));
    EXPECT_THAT(run({"--show", "/nowhere"}).error,
                HasSubstr("can't read \"/nowhere\": No such file or directory"));
    const DatabaseDirectory empty;
    EXPECT_THAT(run({empty.path()}).error, HasSubstr("no .acd file in \"" + empty.path() + '"'));
    std::filesystem::create_directory(m_database.path("crane.acd"));
    EXPECT_THAT(run({m_database.path()}).error, HasSubstr("crane.acd: not a regular file"));
}

TEST_F(Index, ChangesNoAnswer) {
    const std::vector<std::vector<std::string>> questions{
        {"devices"}, {"show", "fn10"}, {"show", "FN20"}, {"property", "FN10_P48", "PINS"}, {"show", "ZZ"}};
    std::vector<ProcessResult> without;
    for (const auto& question : questions) {
        without.push_back(m_database.run(question));
    }
    EXPECT_EQ(run({m_database.path()}).status, 0);
    for (std::size_t number = 0; number != questions.size(); ++number) {
        const ProcessResult with = m_database.run(questions[number]);
        EXPECT_EQ(with.status, without[number].status);
        EXPECT_EQ(with.output, without[number].output);
        EXPECT_EQ(with.error, without[number].error);
    }
}

} // namespace
