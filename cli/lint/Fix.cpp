// Builds the edits that remove a finding.
#include "lint/Fix.h"

#include <fmt/format.h>

namespace lint {

namespace {

/// The line of the token's file from the token on; nothing if the token is not all there.
std::optional<std::string_view> lineFrom(const Token& token) {
    const std::string_view line = token.location.file->source(token.location.line);
    const std::size_t begin = token.location.column - 1;
    if (begin > line.size() || line.substr(begin, token.text.size()) != token.text) {
        return std::nullopt;
    }
    return line.substr(begin);
}

bool isSeparator(char byte) { return byte == ',' || byte == ':'; }

} // namespace

std::string Suggestion::question() const {
    return name ? fmt::format("; did you mean \"{}\"?", *name) : std::string();
}

std::optional<Fix> replacing(const Token& token, std::string text, bool isSafe) {
    if (!lineFrom(token)) {
        return std::nullopt;
    }
    return Fix{{{token.location, token.text.size(), std::move(text)}}, isSafe};
}

std::optional<Fix> replacing(const Token& token, const Suggestion& suggestion) {
    return suggestion.name ? replacing(token, *suggestion.name, suggestion.isOtherCase) : std::nullopt;
}

std::optional<Fix> insertingBefore(const Token& token, std::string text) {
    if (!lineFrom(token)) {
        return std::nullopt;
    }
    return Fix{{{token.location, 0, std::move(text)}}};
}

std::optional<Fix> removing(const Token& item) {
    const std::optional<std::string_view> rest = lineFrom(item);
    if (!rest) {
        return std::nullopt;
    }
    const std::string_view line = item.location.file->source(item.location.line);
    const std::size_t begin = item.location.column - 1;
    if (begin > 0 && isSeparator(line[begin - 1])) {
        SourceLocation before = item.location;
        --before.column;
        return Fix{{{before, item.text.size() + 1, {}}}};
    }
    if (rest->size() > item.text.size() && isSeparator((*rest)[item.text.size()])) {
        return Fix{{{item.location, item.text.size() + 1, {}}}};
    }
    return std::nullopt;
}

Token partOf(const Token& token, std::size_t offset, std::size_t length) {
    Token part{token.text.substr(offset, length), token.location};
    part.location.column += static_cast<unsigned>(offset);
    return part;
}

} // namespace lint
