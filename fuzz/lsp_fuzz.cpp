// Feeds bytes to the language server: in pieces and at once they must be the same messages, each request must get one
// answer, and nothing may end the server but "exit".
#include "Input.h"

#include "lsp/MessageReader.h"
#include "lsp/Server.h"
#include "text/Json.h"
#include "text/Uri.h"

#include <fmt/format.h>

#include <algorithm>
#include <string>
#include <vector>

namespace {

using lsp::MessageReader;

std::vector<std::string> messagesIn(std::string_view bytes, std::size_t pieces) {
    MessageReader reader;
    std::vector<std::string> all;
    while (!bytes.empty()) {
        const std::size_t length = std::min(pieces, bytes.size());
        reader.append(bytes.substr(0, length));
        bytes.remove_prefix(length);
        while (const auto message = reader.next()) {
            if (message->fault.empty()) {
                all.push_back(message->content);
            }
        }
    }
    return all;
}

std::string framed(std::string_view content) {
    return fmt::format("Content-Length: {}\r\n\r\n{}", content.size(), content);
}

const std::string DIRECTORY = TARVIK_SOURCE_DIRECTORY "/tests/data/bad/T101";

/// A request with an id that waits for its answer.
bool needsAnswer(const std::string& content) {
    const Json json = Json::parse(content, nullptr, false);
    if (!json.is_object()) {
        return true; // with an error
    }
    const bool isAnswer = !json.contains("method") && (json.contains("result") || json.contains("error"));
    return !isAnswer && (json.contains("id") || !json.contains("method") || !json["method"].is_string());
}

/// The inputs name the open document by a short word.
std::string withUri(std::string_view line) {
    std::string text(line);
    constexpr std::string_view WORD = "URI";
    for (std::size_t at = text.find(WORD); at != std::string::npos; at = text.find(WORD, at)) {
        const std::string uri = asUri(DIRECTORY + "/kestrel.acd");
        text.replace(at, WORD.size(), uri);
        at += uri.size();
    }
    return text;
}

/// Each line is the content of a message.
void converse(std::string_view lines) {
    std::size_t answers = 0;
    lsp::Server server({}, [&answers](const Json& message) {
        if (!message.is_object() || message.value("jsonrpc", Json()) != "2.0") {
            fuzz::fail("no message: " + message.dump());
        }
        answers += message.contains("result") || message.contains("error") ? 1U : 0U;
    });
    server.receive(framed(R"({"id": 0, "method": "initialize", "params": {}})"));
    server.settle();
    const std::string opening = withUri(
        R"({"method": "textDocument/didOpen", "params": {"textDocument": {"uri": "URI", "text": "[KS50]\nPROPERTY = A,\u00e9\n"}}})");
    server.receive(framed(opening));
    server.settle();
    while (!lines.empty() && !server.hasEnded()) {
        const std::string_view line = lines.substr(0, lines.find('\n'));
        lines.remove_prefix(std::min(lines.size(), line.size() + 1));
        const std::string content = withUri(line);
        answers = 0;
        server.receive(framed(content));
        server.settle();
        const bool isDeep = std::count_if(content.begin(), content.end(),
                                          [](char byte) { return byte == '[' || byte == '{'; }) > 60;
        if (!server.hasEnded() && !isDeep && answers != (needsAnswer(content) ? 1U : 0U)) {
            fuzz::fail(fmt::format("{} answers to {}", answers, content));
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::Input input(data, size);
    const std::uint8_t kind = input.byte().value_or(0);
    if (kind < 0x80) {
        converse(input.rest());
        return 0;
    }
    const std::string_view bytes = input.rest();
    const std::vector<std::string> whole = messagesIn(bytes, bytes.size());
    if (whole != messagesIn(bytes, std::size_t{kind} - 0x7F)) {
        fuzz::fail("other messages when the bytes come in pieces");
    }
    return 0;
}
