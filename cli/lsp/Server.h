#pragma once

#include "lsp/MessageReader.h"
#include "lsp/View.h"
#include "term/ExitCode.h"

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace lsp {

/// A language server without its streams: takes bytes, and gives messages.
class Server {
public:
    /// Takes a message to the editor.
    using Send = std::function<void(const Json& message)>;

    /// @param directories the layers of the database, the uppermost first; none: each file's own directory
    Server(const std::vector<std::string>& directories, Send send);

    /// Takes bytes from the editor. A request to cancel takes effect on what was received before it and is not answered.
    void receive(std::string_view bytes);

    /// Answers what was received, then publishes diagnostics: of several changes, only the last state is checked.
    void settle();

    /// Was the server asked to end?
    [[nodiscard]] bool hasEnded() const noexcept { return m_hasEnded; }

    /// NO if the editor did not ask for a shutdown first.
    [[nodiscard]] ExitCode status() const noexcept {
        return m_state == State::SHUT_DOWN ? ExitCode::YES : ExitCode::NO;
    }

private:
    enum class State { NEW, RUNNING, SHUT_DOWN };
    using Request = Json (Server::*)(const Json& params);
    using Notification = void (Server::*)(const Json& params);

    static const std::map<std::string, Request, std::less<>>& requests();
    static const std::map<std::string, Notification, std::less<>>& notifications();

    void enqueue(Json message);
    void handle(const Json& message);
    [[nodiscard]] Json answer(const std::string& method, const Json& params);
    void notice(const std::string& method, const Json& params);
    void sendError(const Json& id, ErrorCode code, const std::string& text);

    Json initialize(const Json& params);
    Json shutdown(const Json& params);
    Json codeAction(const Json& params);
    Json formatting(const Json& params);
    Json documentSymbol(const Json& params);
    Json workspaceSymbol(const Json& params);
    Json completion(const Json& params);
    Json hover(const Json& params);
    Json definition(const Json& params);
    Json references(const Json& params);
    Json prepareRename(const Json& params);
    Json rename(const Json& params);

    void initialized(const Json& params);
    void didOpen(const Json& params);
    void didChange(const Json& params);
    void didSave(const Json& params);
    void didClose(const Json& params);
    void didChangeWatchedFiles(const Json& params);

    [[nodiscard]] Workspace& workspaceOf(const std::string& path);
    [[nodiscard]] View viewOf(const Json& params);
    void synchronise();
    void publish();
    void publish(Workspace& workspace, const std::map<std::string, Json>& former);
    void send(const std::string& path, const Json& diagnostics);
    [[nodiscard]] static Json faultOf(const Workspace& workspace);

    std::vector<std::string> m_directories;
    Send m_send;
    State m_state = State::NEW;
    bool m_hasEnded = false;
    Encoding m_encoding = Encoding::UTF16;
    bool m_canRenameFiles = false;
    bool m_canWatch = false;
    MessageReader m_reader;
    std::deque<Json> m_received;
    std::set<Json> m_cancelled; ///< the ids of requests
    Documents m_documents;
    std::uint64_t m_stamp = 0;
    std::vector<std::unique_ptr<Workspace>> m_workspaces;
    bool m_hasChanged = false;               ///< documents, since the databases took them over
    bool m_mustReload = false;               ///< files, likewise
    bool m_mustPublish = false;              ///< what the databases took over
    std::map<std::string, Json> m_published; ///< diagnostics that the editor has, by path
    std::set<std::string> m_touched; ///< documents whose diagnostics are published even if they are the same
};

} // namespace lsp
