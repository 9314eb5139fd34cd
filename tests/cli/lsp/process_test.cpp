// The server as a process: what an editor sends in one go, and how it ends.
#include "Editor.h"

#include "cli/support/ToolProcess.h"

#include <gtest/gtest.h>

namespace {

/// The messages in an output.
std::vector<Json> messagesIn(const std::string& output) {
    lsp::MessageReader reader;
    reader.append(output);
    std::vector<Json> all;
    while (const auto message = reader.next()) {
        all.push_back(Json::parse(message->content));
    }
    return all;
}

ProcessResult run(const std::vector<Json>& messages, std::vector<std::string> arguments = {"lsp"}) {
    std::string input;
    for (const Json& message : messages) {
        input += framed(message.dump());
    }
    return runTool({std::move(arguments), input, {}, {}});
}

} // namespace

TEST(LspProcess, AnswersAndEnds) {
    const DatabaseDirectory database(DatabaseDirectory::Files{{"base.acd", "X = 1\n"}});
    const ProcessResult result =
        run({request(1, "initialize"), notification("initialized"),
             openingOf(database.path("base.acd"), "Y = 1\n"),
             request(2, "textDocument/documentSymbol",
                     {{"textDocument", {{"uri", asUri(database.path("base.acd"))}}}}),
             request(3, "shutdown"), notification("exit")},
            {"lsp", "--stdio"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.error, "");
    const std::vector<Json> all = messagesIn(result.output);
    ASSERT_EQ(all.size(), 3U);
    EXPECT_EQ(all[1].at("result").at(0).at("name"), "Y");
}

TEST(LspProcess, PublishesWhenTheInputEnds) {
    const DatabaseDirectory database(DatabaseDirectory::Files{{"base.acd", ""}});
    const ProcessResult result =
        run({request(1, "initialize"), openingOf(database.path("base.acd"), "Y = 1\n")});
    EXPECT_EQ(result.status, 1);
    const std::vector<Json> all = messagesIn(result.output);
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all[1].at("params").at("diagnostics").back().at("code"), "K102");
}

TEST(LspProcess, EndsWithTheStatusesOfTheProtocol) {
    EXPECT_EQ(run({request(1, "initialize"), request(2, "shutdown"), notification("exit")}).status, 0);
    EXPECT_EQ(run({request(1, "initialize"), notification("exit")}).status, 1);
    EXPECT_EQ(run({notification("exit")}).status, 1);
    EXPECT_EQ(run({}).status, 1);
    EXPECT_EQ(runTool({"lsp", "--no-such"}).status, 2);
}

TEST(LspProcess, EndsQuietlyWhenItsReaderIsGone) {
    const DatabaseDirectory database(DatabaseDirectory::Files{{"base.acd", ""}});
    InteractiveProcess process({{"lsp"}, {}, {}, {}});
    process.closeOutput();
    process.write(framed(request(1, "initialize").dump()));
    EXPECT_EQ(process.wait(), 1);
}
