// The findings in an editor are those of `tarvik lint`, for each database with a mistake, saved or not.
#include "Editor.h"

#include "cli/support/ToolProcess.h"

#include <gtest/gtest.h>

#include <set>
#include <sstream>
#include <tuple>

namespace {

/// File, line, column, level, code and text.
using Finding = std::tuple<std::string, std::size_t, std::size_t, std::string, std::string, std::string>;
using Findings = std::multiset<Finding>;

std::string readAll(const std::filesystem::path& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
}

/// What `tarvik lint` says.
Findings lintOf(const std::string& directory) {
    const ProcessResult result = runTool({"lint", "--format", "json", directory});
    Findings all;
    const Json report = Json::parse(result.output);
    for (const Json& finding : report.at("findings")) {
        all.emplace(std::filesystem::path(finding.at("file").get<std::string>()).filename().string(),
                    finding.at("line"), finding.at("column"), finding.at("level"), finding.at("code"),
                    finding.at("text"));
    }
    return all;
}

/// What the editor was told last of each file. The encoding is UTF-8, so columns are bytes.
Findings published(const std::vector<Json>& messages) {
    std::map<std::string, Json> last;
    for (const Json& message : messages) {
        if (message.value("method", Json()) == "textDocument/publishDiagnostics") {
            last[message.at("params").at("uri")] = message.at("params").at("diagnostics");
        }
    }
    Findings all;
    for (const auto& [uri, diagnostics] : last) {
        for (const Json& each : diagnostics) {
            const Json& start = each.at("range").at("start");
            all.emplace(uri.substr(uri.rfind('/') + 1), start.at("line").get<std::size_t>() + 1,
                        start.at("character").get<std::size_t>() + 1,
                        each.at("severity") == 1 ? "error" : "warning", each.at("code"), each.at("message"));
        }
    }
    return all;
}

const Json UTF_8{{"capabilities", {{"general", {{"positionEncodings", {"utf-8"}}}}}}};

} // namespace

TEST(LspAgreement, HasTheFindingsOfLint) {
    const std::filesystem::path all(TARVIK_SOURCE_DIRECTORY "/tests/data/bad");
    std::size_t compared = 0;
    for (const auto& entry : std::filesystem::directory_iterator(all)) {
        const std::string base = readAll(entry.path() / "base.acd");
        if (base.empty() || base.find('\xff') != std::string::npos) {
            continue; // layers have a test of their own
        }
        Editor editor(DatabaseDirectory::Files{}, UTF_8);
        editor.send(openingOf((entry.path() / "base.acd").string(), base));
        EXPECT_EQ(published(editor.take()), lintOf(entry.path().string())) << entry.path();
        ++compared;
    }
    EXPECT_GT(compared, 80U);
}

TEST(LspAgreement, HasTheFindingsOfLintAfterEachEdit) {
    const std::filesystem::path demonstration(TARVIK_SOURCE_DIRECTORY "/database");
    DatabaseDirectory::Files files;
    for (const auto& entry : std::filesystem::directory_iterator(demonstration)) {
        if (entry.path().extension() == ".acd") {
            files[entry.path().filename().string()] = readAll(entry.path());
        }
    }
    Editor editor(DatabaseDirectory::Files{}, UTF_8);
    const DatabaseDirectory edited(files);
    for (const auto& [name, text] : files) {
        editor.send(openingOf(edited.path(name), text));
    }
    std::vector<Json> messages = editor.take();
    // Takes a line away from each file in turn, far from its ends, too.
    int version = 2;
    for (const auto& [name, text] : files) {
        for (const double part : {0.1, 0.5, 0.9}) {
            const std::size_t start =
                text.find('\n', static_cast<std::size_t>(static_cast<double>(text.size()) * part)) + 1;
            std::string changed = text;
            changed.erase(start, text.find('\n', start) + 1 - start);
            const Json params{{"textDocument", {{"uri", asUri(edited.path(name))}, {"version", ++version}}},
                              {"contentChanges", Json::array({{{"text", changed}}})}};
            editor.notify("textDocument/didChange", params);
            for (Json& message : editor.take()) {
                messages.push_back(std::move(message));
            }
            std::ofstream(edited.path(name), std::ios::binary) << changed;
            EXPECT_EQ(published(messages), lintOf(edited.path())) << name << ' ' << part;
        }
        std::ofstream(edited.path(name), std::ios::binary) << text;
        const Json params{{"textDocument", {{"uri", asUri(edited.path(name))}, {"version", ++version}}},
                          {"contentChanges", Json::array({{{"text", text}}})}};
        editor.notify("textDocument/didChange", params);
        for (Json& message : editor.take()) {
            messages.push_back(std::move(message));
        }
    }
    EXPECT_EQ(published(messages), Findings());
}
