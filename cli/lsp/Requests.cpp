// The requests about documents: each finds its file and asks the feature.
#include "lsp/Server.h"

#include "lsp/Completion.h"
#include "lsp/Diagnostics.h"
#include "lsp/Hover.h"
#include "lsp/Names.h"
#include "lsp/Params.h"

namespace lsp {

Json Server::codeAction(const Json& params) {
    return codeActionsOf(viewOf(params), readRange(params.at("range")));
}

Json Server::formatting(const Json& params) {
    const View view = viewOf(params);
    return formattingOf(view, m_documents.at(view.file.path()).text);
}

Json Server::documentSymbol(const Json& params) { return symbolsOf(viewOf(params)); }

Json Server::workspaceSymbol(const Json& params) {
    Json all = Json::array();
    synchronise();
    for (const auto& workspace : m_workspaces) {
        if (!workspace->model().families().empty()) {
            const lint::FamilyData& family = *workspace->model().families().front();
            const Json found = symbolsOf({*workspace, family, family.files.front(), m_documents, m_encoding},
                                         textOf(params.at("query")));
            all.insert(all.end(), found.begin(), found.end());
        }
    }
    return all;
}

Json Server::completion(const Json& params) {
    return completionOf(viewOf(params), readPosition(params.at("position")));
}

Json Server::hover(const Json& params) {
    return hoverOf(viewOf(params), readPosition(params.at("position")));
}

Json Server::definition(const Json& params) {
    const View view = viewOf(params);
    const std::optional<FoundName> found = nameAt(view, readPosition(params.at("position")));
    return found ? definitionsOf(view, found->name) : Json();
}

Json Server::references(const Json& params) {
    const View view = viewOf(params);
    const std::optional<FoundName> found = nameAt(view, readPosition(params.at("position")));
    return found ? referencesOf(view, found->name, isTrue(member(params, {"context", "includeDeclaration"})))
                 : Json();
}

Json Server::prepareRename(const Json& params) {
    const std::optional<FoundName> found = nameAt(viewOf(params), readPosition(params.at("position")));
    return found && found->name.kind != NameKind::PACKAGE
               ? Json{{"range", asJson(found->range)}, {"placeholder", found->name.text}}
               : Json();
}

Json Server::rename(const Json& params) {
    const View view = viewOf(params);
    const std::optional<FoundName> found = nameAt(view, readPosition(params.at("position")));
    if (!found) {
        throw RequestError(ErrorCode::REQUEST_FAILED, "there is no name to rename");
    }
    return renamingOf(view, found->name, textOf(params.at("newName")), m_canRenameFiles);
}

} // namespace lsp
