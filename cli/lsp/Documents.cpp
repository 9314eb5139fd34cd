// The documents that the editor holds, the databases that they belong to, and the diagnostics of both.
#include "lsp/Server.h"

#include "lsp/Diagnostics.h"
#include "lsp/Params.h"
#include "text/Uri.h"

#include "database/FileNames.h"

#include <algorithm>
#include <utility>

namespace lsp {

void Server::didOpen(const Json& params) {
    const std::string path = pathIn(params);
    const Json& document = params.at("textDocument");
    Document opened{document.at("uri"), textOf(document.at("text")), document.value("version", Json()),
                    ++m_stamp};
    m_documents.insert_or_assign(path, std::move(opened));
    m_touched.insert(path);
    m_mustReload = true;
}

void Server::didChange(const Json& params) {
    const std::string path = pathIn(params);
    const auto document = m_documents.find(path);
    if (document == m_documents.end()) {
        throw RequestError(ErrorCode::INVALID_PARAMS, path + " is not open");
    }
    // A change that cannot be read leaves the document as it was.
    std::string text = document->second.text;
    for (const Json& change : params.at("contentChanges")) {
        const std::string& inserted = textOf(change.at("text"));
        if (!change.contains("range")) {
            text = inserted;
            continue;
        }
        const Range range = readRange(change["range"]);
        const std::size_t begin = offsetOf(text, range.start, m_encoding);
        const std::size_t end = std::max(begin, offsetOf(text, range.end, m_encoding));
        text.replace(begin, end - begin, inserted);
    }
    document->second.text = std::move(text);
    document->second.version = params.at("textDocument").value("version", Json());
    document->second.stamp = ++m_stamp;
    m_touched.insert(path);
    m_hasChanged = true;
}

void Server::didSave(const Json& params) {
    m_touched.insert(pathIn(params));
    m_mustReload = true;
}

void Server::didClose(const Json& params) {
    m_documents.erase(pathIn(params));
    m_mustReload = true;
}

void Server::didChangeWatchedFiles(const Json& /*which*/) { m_mustReload = true; }

/// The database of a file: the configured layers if one of them holds it, otherwise its own directory.
Workspace& Server::workspaceOf(const std::string& path) {
    const auto found = std::find_if(m_workspaces.begin(), m_workspaces.end(),
                                    [&path](const auto& each) { return each->contains(path); });
    if (found != m_workspaces.end()) {
        return **found;
    }
    auto added = std::make_unique<Workspace>(m_directories);
    if (!added->contains(path)) {
        added = std::make_unique<Workspace>(std::vector<std::string>{std::string(acd::directoryOf(path))});
    }
    added->reload(m_documents);
    return *m_workspaces.emplace_back(std::move(added));
}

/// The state of all documents, and of files if they changed, reaches the databases here.
View Server::viewOf(const Json& params) {
    const std::string path = pathIn(params);
    if (!m_documents.contains(path)) {
        throw RequestError(ErrorCode::INVALID_PARAMS, path + " is not open");
    }
    synchronise();
    Workspace& workspace = workspaceOf(path);
    const AcdLines* const file = workspace.file(path);
    if (file == nullptr) {
        throw RequestError(ErrorCode::REQUEST_FAILED, path + " is not read: it is not a file of a database");
    }
    return {workspace, *workspace.family(path), *file, m_documents, m_encoding};
}

void Server::synchronise() {
    const bool mustReload = std::exchange(m_mustReload, false);
    if (!std::exchange(m_hasChanged, false) && !mustReload) {
        return;
    }
    m_mustPublish = true;
    for (const auto& workspace : m_workspaces) {
        if (mustReload) {
            workspace->reload(m_documents);
        } else {
            workspace->update(m_documents);
        }
    }
}

void Server::publish() {
    synchronise();
    if (!std::exchange(m_mustPublish, false)) {
        return;
    }
    for (const auto& [path, document] : m_documents) {
        static_cast<void>(workspaceOf(path));
    }
    // A database without open documents is no longer watched.
    std::erase_if(m_workspaces, [this](const auto& workspace) {
        return std::none_of(m_documents.begin(), m_documents.end(),
                            [&](const auto& document) { return workspace->contains(document.first); });
    });
    std::map<std::string, Json> former = std::exchange(m_published, {});
    for (const auto& workspace : m_workspaces) {
        publish(*workspace, former);
    }
    for (const auto& [path, diagnostics] : former) {
        if (!m_published.contains(path) && !diagnostics.empty()) {
            send(path, Json::array());
        }
    }
    m_touched.clear();
}

/// Publishes what changed, and the documents that the editor waits for.
void Server::publish(Workspace& workspace, const std::map<std::string, Json>& former) {
    std::map<std::string, Json> all;
    if (workspace.fault().empty()) {
        for (const auto& family : workspace.model().families()) {
            for (const AcdLines& file : family->files) {
                all[file.path()] = diagnosticsOf({workspace, *family, file, m_documents, m_encoding});
            }
        }
    }
    for (const auto& [path, document] : m_documents) {
        if (workspace.contains(path) && !all.contains(path)) {
            all[path] = workspace.fault().empty() ? Json::array() : faultOf(workspace);
        }
    }
    for (auto& [path, diagnostics] : all) {
        const auto known = former.find(path);
        const bool isSame = known == former.end() ? diagnostics.empty() : known->second == diagnostics;
        if (!isSame || m_touched.contains(path)) {
            send(path, diagnostics);
        }
        m_published[path] = std::move(diagnostics);
    }
}

/// What `tarvik lint` says instead of findings, at the start of each open document.
Json Server::faultOf(const Workspace& workspace) {
    constexpr int ERROR = 1;
    return Json::array({{{"range", asJson(Range{})},
                         {"severity", ERROR},
                         {"source", "tarvik"},
                         {"message", workspace.fault()}}});
}

void Server::send(const std::string& path, const Json& diagnostics) {
    const auto document = m_documents.find(path);
    Json params{{"uri", document == m_documents.end() ? asUri(path) : document->second.uri}};
    if (document != m_documents.end() && document->second.version.is_number_integer()) {
        params["version"] = document->second.version;
    }
    params["diagnostics"] = diagnostics;
    m_send({{"jsonrpc", "2.0"}, {"method", "textDocument/publishDiagnostics"}, {"params", params}});
}

} // namespace lsp
