// The life of a server: which messages it takes when, what it keeps, and what it publishes.
#include "lsp/Server.h"

#include "lsp/Params.h"
#include "text/Uri.h"

#include "database/SearchPath.h"
#include "platform/Platform.h"

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <utility>

namespace lsp {

namespace {

bool contains(const Json& list, const char* text) {
    return list.is_array() && std::find(list.begin(), list.end(), Json(text)) != list.end();
}

/// The directories of `initializationOptions.database`: a list, or one text as in the environment variable.
std::vector<std::string> directoriesIn(const Json& option) {
    if (option.is_string()) {
        return acd::splitDirectories(option.get<std::string>());
    }
    std::vector<std::string> directories;
    for (const Json& each : option.is_array() ? option : Json::array()) {
        directories.push_back(textOf(each));
    }
    return directories;
}

/// Directories as the paths of documents begin: absolute, in normal form, without a slash at the end.
std::vector<std::string> normalised(const std::vector<std::string>& directories, const std::string& root) {
    std::vector<std::string> all;
    for (const std::string& directory : directories) {
        const std::filesystem::path base = root.empty() ? std::filesystem::current_path() : acd::toPath(root);
        std::string path = acd::fromPath((base / acd::toPath(directory)).lexically_normal());
        if (path.size() > 1 && path.ends_with('/')) {
            path.pop_back();
        }
        all.push_back(std::move(path));
    }
    return all;
}

/// Deeply nested values would take the stack when they are copied or destroyed.
Json parsed(const std::string& text) {
    constexpr int MAX_DEPTH = 64;
    bool isTooDeep = false;
    const auto limit = [&isTooDeep](int depth, Json::parse_event_t /*any*/, const Json& /*any*/) {
        isTooDeep = isTooDeep || depth > MAX_DEPTH;
        return !isTooDeep;
    };
    Json json = Json::parse(text, limit, false);
    return isTooDeep ? Json(Json::value_t::discarded) : json;
}

Json response(const Json& id) { return {{"jsonrpc", "2.0"}, {"id", id}}; }

bool isId(const Json& json) { return json.is_string() || json.is_number_integer(); }

} // namespace

Server::Server(const std::vector<std::string>& directories, Send send)
    : m_directories(normalised(directories, {})), m_send(std::move(send)) {}

const std::map<std::string, Server::Request, std::less<>>& Server::requests() {
    static const std::map<std::string, Request, std::less<>> all{
        {"initialize", &Server::initialize},
        {"shutdown", &Server::shutdown},
        {"textDocument/codeAction", &Server::codeAction},
        {"textDocument/completion", &Server::completion},
        {"textDocument/definition", &Server::definition},
        {"textDocument/documentSymbol", &Server::documentSymbol},
        {"textDocument/formatting", &Server::formatting},
        {"textDocument/hover", &Server::hover},
        {"textDocument/prepareRename", &Server::prepareRename},
        {"textDocument/references", &Server::references},
        {"textDocument/rename", &Server::rename},
        {"workspace/symbol", &Server::workspaceSymbol},
    };
    return all;
}

const std::map<std::string, Server::Notification, std::less<>>& Server::notifications() {
    static const std::map<std::string, Notification, std::less<>> all{
        {"initialized", &Server::initialized},
        {"textDocument/didChange", &Server::didChange},
        {"textDocument/didClose", &Server::didClose},
        {"textDocument/didOpen", &Server::didOpen},
        {"textDocument/didSave", &Server::didSave},
        {"workspace/didChangeWatchedFiles", &Server::didChangeWatchedFiles},
    };
    return all;
}

void Server::receive(std::string_view bytes) {
    m_reader.append(bytes);
    while (std::optional<MessageReader::Message> message = m_reader.next()) {
        if (!message->fault.empty()) {
            sendError({}, ErrorCode::PARSE_ERROR, message->fault);
            continue;
        }
        Json json = parsed(message->content);
        if (json.is_discarded()) {
            sendError({}, ErrorCode::PARSE_ERROR, "the content is no JSON, or nested too deeply");
        } else {
            enqueue(std::move(json));
        }
    }
}

void Server::enqueue(Json message) {
    if (message.is_object() && !message.contains("id") &&
        message.value("method", Json()) == "$/cancelRequest") {
        // Only what waits can be cancelled; everything else is answered already.
        const Json id = member(message, {"params", "id"});
        const bool isWaiting = std::any_of(m_received.begin(), m_received.end(), [&id](const Json& other) {
            return isId(id) && other.is_object() && other.contains("method") &&
                   other.value("id", Json()) == id;
        });
        if (isWaiting) {
            m_cancelled.insert(id);
        }
        return;
    }
    m_received.push_back(std::move(message));
}

void Server::settle() {
    while (!m_received.empty() && !m_hasEnded) {
        const Json message = std::move(m_received.front());
        m_received.pop_front();
        handle(message);
    }
    if (!m_hasEnded && m_state == State::RUNNING) {
        publish();
    }
}

void Server::sendError(const Json& id, ErrorCode code, const std::string& text) {
    Json message = response(id);
    message["error"] = {{"code", static_cast<int>(code)}, {"message", text}};
    m_send(message);
}

void Server::handle(const Json& message) {
    if (!message.is_object()) {
        return sendError({}, ErrorCode::INVALID_REQUEST, "a message is an object");
    }
    const Json id = message.contains("id") && isId(message["id"]) ? message["id"] : Json();
    if (!message.contains("method")) {
        if (!message.contains("result") && !message.contains("error")) {
            sendError(id, ErrorCode::INVALID_REQUEST, "a message has a method");
        }
        return; // an answer to a request of this server
    }
    const Json& method = message["method"];
    static const Json NO_PARAMS = Json::object();
    const Json& params = message.contains("params") ? message["params"] : NO_PARAMS;
    if (!method.is_string() || (message.contains("id") && id.is_null())) {
        return sendError(id, ErrorCode::INVALID_REQUEST,
                         "the method is a text, and the id a text or a whole number");
    }
    if (!message.contains("id")) {
        return notice(method.get<std::string>(), params);
    }
    if (m_cancelled.erase(id) != 0) {
        return sendError(id, ErrorCode::REQUEST_CANCELLED, "cancelled");
    }
    try {
        Json answered = response(id);
        answered["result"] = answer(method.get<std::string>(), params);
        m_send(answered);
    } catch (const RequestError& error) {
        sendError(id, error.code(), error.what());
    } catch (const Json::exception& error) {
        sendError(id, ErrorCode::INVALID_PARAMS, error.what());
    } catch (const std::exception& error) {
        sendError(id, ErrorCode::INTERNAL_ERROR, error.what());
    }
}

Json Server::answer(const std::string& method, const Json& params) {
    if (m_state == State::NEW && method != "initialize") {
        throw RequestError(ErrorCode::NOT_INITIALIZED, "the first request is initialize");
    }
    if (m_state == State::SHUT_DOWN || (m_state == State::RUNNING && method == "initialize")) {
        throw RequestError(ErrorCode::INVALID_REQUEST, "not in this state of the server");
    }
    const auto found = requests().find(method);
    if (found == requests().end()) {
        throw RequestError(ErrorCode::METHOD_NOT_FOUND, fmt::format("there is no method {}", method));
    }
    return (this->*found->second)(params);
}

void Server::notice(const std::string& method, const Json& params) {
    if (method == "exit") {
        m_hasEnded = true;
        return;
    }
    const auto found = notifications().find(method);
    if (m_state != State::RUNNING || found == notifications().end()) {
        return; // notifications have no answer
    }
    try {
        (this->*found->second)(params);
    } catch (const std::exception& error) {
        constexpr int LOG_ERROR = 1;
        m_send({{"jsonrpc", "2.0"},
                {"method", "window/logMessage"},
                {"params", {{"type", LOG_ERROR}, {"message", fmt::format("{}: {}", method, error.what())}}}});
    }
}

Json Server::initialize(const Json& params) {
    const Json capabilities = member(params, {"capabilities"});
    const bool isUtf8 = contains(member(capabilities, {"general", "positionEncodings"}), "utf-8");
    m_encoding = isUtf8 ? Encoding::UTF8 : Encoding::UTF16;
    m_canRenameFiles =
        isTrue(member(capabilities, {"workspace", "workspaceEdit", "documentChanges"})) &&
        contains(member(capabilities, {"workspace", "workspaceEdit", "resourceOperations"}), "rename");
    m_canWatch = isTrue(member(capabilities, {"workspace", "didChangeWatchedFiles", "dynamicRegistration"}));
    const std::vector<std::string> directories =
        directoriesIn(member(params, {"initializationOptions", "database"}));
    if (!directories.empty()) {
        const Json root = member(params, {"rootUri"});
        m_directories = normalised(directories, root.is_string() ? pathOf(textOf(root)) : std::string());
    }
    m_state = State::RUNNING;
    constexpr int INCREMENTAL = 2;
    return {{"capabilities",
             {{"positionEncoding", isUtf8 ? "utf-8" : "utf-16"},
              {"textDocumentSync",
               {{"openClose", true}, {"change", INCREMENTAL}, {"save", {{"includeText", false}}}}},
              {"codeActionProvider", {{"codeActionKinds", Json::array({"quickfix"})}}},
              {"completionProvider", {{"triggerCharacters", Json::array({",", ":", "=", "[", "_"})}}},
              {"definitionProvider", true},
              {"documentFormattingProvider", true},
              {"documentSymbolProvider", true},
              {"hoverProvider", true},
              {"referencesProvider", true},
              {"renameProvider", {{"prepareProvider", true}}},
              {"workspaceSymbolProvider", true}}},
            {"serverInfo", {{"name", "tarvik"}, {"version", TARVIK_VERSION}}}};
}

Json Server::shutdown(const Json& /*none*/) {
    m_state = State::SHUT_DOWN;
    return {};
}

/// Registers for changes of files by other programs.
void Server::initialized(const Json& /*none*/) {
    if (m_canWatch) {
        const Json watcher{{"globPattern", "**/*.acd"}};
        const Json registration{{"id", "files"},
                                {"method", "workspace/didChangeWatchedFiles"},
                                {"registerOptions", {{"watchers", Json::array({watcher})}}}};
        m_send({{"jsonrpc", "2.0"},
                {"id", "register"},
                {"method", "client/registerCapability"},
                {"params", {{"registrations", Json::array({registration})}}}});
    }
}

} // namespace lsp
