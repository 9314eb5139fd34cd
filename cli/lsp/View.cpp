// Shows places of files as editors want them.
#include "lsp/View.h"

#include "text/Uri.h"

#include <algorithm>

namespace lsp {

std::string View::uri(const std::string& path) const {
    const auto document = documents.find(path);
    return document == documents.end() ? asUri(path) : document->second.uri;
}

Range View::rangeOf(const lint::Token& token) const {
    return lsp::rangeOf(*token.location.file, token.location.line, token.location.column, token.text.size(),
                        encoding);
}

Place View::placeOf(const Position& position) const {
    const auto line = static_cast<unsigned>(position.line) + 1U;
    return {line, bytesOf(file.source(line), position.character, encoding) + 1};
}

Json View::locationOf(const lint::Token& token) const {
    return {{"uri", uri(token.location.file->path())}, {"range", asJson(rangeOf(token))}};
}

} // namespace lsp
