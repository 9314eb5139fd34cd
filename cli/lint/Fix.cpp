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

std::optional<Fix> listing(const Model& model, std::string_view name, const std::vector<const char*>& lists,
                           const std::vector<std::string>& modes) {
    if (model.base() == nullptr) {
        return std::nullopt;
    }
    Fix fix{{}, false};
    bool isPossible = true;
    const auto addAfter = [&](const Token& last) {
        isPossible = isPossible && lineFrom(last);
        std::string text(last.text.empty() ? "" : ",");
        fix.edits.push_back({partOf(last, last.text.size(), 0).location, 0, text.append(name)});
    };
    std::string newLines;
    for (const char* const key : lists) {
        if (const std::vector<Token>& names = model.baseKeys().list(key); !names.empty()) {
            addAfter(names.back());
        } else {
            newLines += fmt::format("{} = {}\n", key, name);
        }
    }
    for (const std::string& mode : modes) {
        // A mode that base.acd does not have, or has without families, is another mistake.
        if (const std::vector<Item>& items = model.baseKeys().items(mode); items.size() > 1) {
            addAfter(items[1].fields.back());
        }
    }
    if (!newLines.empty()) {
        fix.edits.push_back({{&model.base()->files.front(), 1, 1}, 0, newLines});
    }
    return isPossible && !fix.edits.empty() ? std::optional(fix) : std::nullopt;
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
