#pragma once

#include "cli/support/DatabaseDirectory.h"

#include "lsp/Server.h"
#include "text/Uri.h"

#include <fmt/format.h>

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

/// A message with its headers.
inline std::string framed(const std::string& content) {
    return fmt::format("Content-Length: {}\r\n\r\n{}", content.size(), content);
}

inline Json request(int id, const std::string& method, Json params = Json::object()) {
    return {{"jsonrpc", "2.0"}, {"id", id}, {"method", method}, {"params", std::move(params)}};
}

inline Json notification(const std::string& method, Json params = Json::object()) {
    return {{"jsonrpc", "2.0"}, {"method", method}, {"params", std::move(params)}};
}

inline Json openingOf(const std::string& path, const std::string& text) {
    const Json document{{"uri", asUri(path)}, {"languageId", "acd"}, {"version", 1}, {"text", text}};
    return notification("textDocument/didOpen", {{"textDocument", document}});
}

/// An editor that talks to a server in this process, about the files of one directory.
class Editor {
public:
    explicit Editor(const DatabaseDirectory::Files& files, Json initialization = Json::object(),
                    const std::vector<std::string>& layers = {})
        : m_directory(files),
          m_server(layers, [this](const Json& message) { m_received.push_back(message); }) {
        if (!initialization.is_null()) {
            static_cast<void>(ask("initialize", std::move(initialization)));
            notify("initialized");
        }
    }

    [[nodiscard]] const DatabaseDirectory& directory() const { return m_directory; }
    [[nodiscard]] std::string path(const std::string& name) const { return m_directory.path(name); }
    [[nodiscard]] std::string uri(const std::string& name) const { return asUri(path(name)); }
    [[nodiscard]] lsp::Server& server() { return m_server; }

    /// All messages of the server since the last call.
    [[nodiscard]] std::vector<Json> take() { return std::exchange(m_received, {}); }

    void sendRaw(const std::string& bytes) {
        m_server.receive(bytes);
        m_server.settle();
    }
    void send(const Json& message) { sendRaw(framed(message.dump())); }
    void notify(const std::string& method, Json params = Json::object()) {
        send(notification(method, std::move(params)));
    }

    /// The whole answer to a request. Other messages are kept in `published()`.
    [[nodiscard]] Json answer(const std::string& method, Json params = Json::object()) {
        const int id = ++m_lastId;
        send(request(id, method, std::move(params)));
        for (const Json& message : m_received) {
            if (message.value("id", Json()) == id && !message.contains("method")) {
                return message;
            }
        }
        throw std::runtime_error("no answer to " + method);
    }

    /// The result of a request, which must not be refused.
    [[nodiscard]] Json ask(const std::string& method, Json params = Json::object()) {
        const Json message = answer(method, std::move(params));
        if (!message.contains("result")) {
            throw std::runtime_error(method + ": " + message.dump());
        }
        return message["result"];
    }

    /// The code of the error that a request gets.
    [[nodiscard]] int errorOf(const std::string& method, Json params = Json::object()) {
        return answer(method, std::move(params)).at("error").at("code").get<int>();
    }

    void open(const std::string& name, const std::string& text) { send(openingOf(path(name), text)); }

    void change(const std::string& name, Json changes) {
        notify("textDocument/didChange", {{"textDocument", {{"uri", uri(name)}, {"version", 2}}},
                                          {"contentChanges", std::move(changes)}});
    }

    void replaceText(const std::string& name, const std::string& text) {
        change(name, Json::array({{{"text", text}}}));
    }

    [[nodiscard]] Json document(const std::string& name) const {
        return {{"textDocument", {{"uri", uri(name)}}}};
    }

    [[nodiscard]] Json at(const std::string& name, unsigned line, unsigned character) const {
        Json params = document(name);
        params["position"] = {{"line", line}, {"character", character}};
        return params;
    }

    /// The diagnostics of a file that were published last; null if there were none.
    [[nodiscard]] Json diagnostics(const std::string& name) const {
        const auto found = std::find_if(m_received.rbegin(), m_received.rend(), [&](const Json& message) {
            return message.value("method", Json()) == "textDocument/publishDiagnostics" &&
                   message.at("params").at("uri") == uri(name);
        });
        return found == m_received.rend() ? Json() : found->at("params").at("diagnostics");
    }

    /// Their codes.
    [[nodiscard]] std::vector<std::string> codes(const std::string& name) const {
        std::vector<std::string> all;
        for (const Json& diagnostic : diagnostics(name)) {
            all.push_back(diagnostic.value("code", "none"));
        }
        return all;
    }

private:
    DatabaseDirectory m_directory;
    std::vector<Json> m_received;
    lsp::Server m_server;
    int m_lastId = 0;
};
