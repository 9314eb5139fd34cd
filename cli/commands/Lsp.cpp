// `lsp`: a language server for editors, on standard input and output.
#include "commands/Commands.h"

#include "lsp/Server.h"
#include "query/Tool.h"
#include "term/Streams.h"

#include "database/SearchPath.h"

#include <fmt/format.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <memory>

namespace {

/// Reads what there is, waiting for it.
/// @return nothing at the end of the input
std::string_view readSome(std::array<char, std::size_t{64} * 1024>& buffer) {
    const std::ptrdiff_t count = streams::readInput(buffer.data(), buffer.size());
    if (count < 0) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("cannot read standard input: {}", std::strerror(errno)));
    }
    return {buffer.data(), static_cast<std::size_t>(count)};
}

ExitCode run(Tool& tool) {
    std::vector<std::string> directories;
    for (const std::string& list : tool.databases()) {
        for (std::string& directory : acd::splitDirectories(list)) {
            directories.push_back(std::move(directory));
        }
    }
    lsp::Server server(directories, [&tool](const Json& message) {
        const std::string content = oneLine(message);
        tool.output().write(fmt::format("Content-Length: {}\r\n\r\n{}", content.size(), content));
    });
    const auto buffer = std::make_unique<std::array<char, std::size_t{64} * 1024>>();
    while (!server.hasEnded() && !tool.output().closed()) {
        const std::string_view bytes = readSome(*buffer);
        server.receive(bytes);
        // What has come already may cancel a request, or change a document again.
        if (bytes.empty() || streams::isInputWaiting()) {
            server.settle();
            tool.output().flush();
        }
        if (bytes.empty()) {
            break;
        }
    }
    return server.status();
}

Action declare(ArgumentList& list) {
    auto isGiven = std::make_shared<bool>(false);
    list = {{.name = "--stdio",
             .description = "Has no effect: for editors that name the streams",
             .target = isGiven.get()}};
    return [isGiven](Tool& tool) { return run(tool); };
}

} // namespace

const Command command::LSP{
    "lsp",
    "Serve editors: findings, completion, names and formatting as you type",
    "Speaks the Language Server Protocol on standard input and output. A file belongs to the database of its "
    "directory, or to the layers of --database if one of them holds it. See docs/editors.md.",
    "tarvik lsp\n"
    "tarvik --database site:company lsp",
    declare,
};
