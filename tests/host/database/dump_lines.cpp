// Writes what the engine reads in files, one JSON object a file, for a second reader to be held against.
#include <AcdLines.h>

#include <nlohmann/json.hpp>

#include <fstream>
#include <iostream>
#include <iterator>

namespace {

/// Texts hold any byte, so they go out as numbers.
nlohmann::json bytes(std::string_view text) {
    nlohmann::json all = nlohmann::json::array();
    for (const char byte : text) {
        all.push_back(static_cast<unsigned char>(byte));
    }
    return all;
}

const char* nameOf(AcdLines::Kind kind) {
    switch (kind) {
    case AcdLines::Kind::HEADER:
        return "header";
    case AcdLines::Kind::ASSIGNMENT:
        return "assignment";
    case AcdLines::Kind::APPEND:
        return "append";
    case AcdLines::Kind::INVALID:
        break;
    }
    return "fault";
}

const char* nameOf(AcdLines::ParseError fault) {
    const char* const names[] = {"none",       "no equals sign", "empty key",         "blank in key",
                                 "NUL byte",   "line too long",  "continued at end",  "unclosed header",
                                 "empty name", "blank in name",  "text behind header"};
    return names[static_cast<std::size_t>(fault)];
}

nlohmann::json asJson(const AcdLines::Line& line) {
    nlohmann::json spans = nlohmann::json::array();
    for (const AcdLines::SourceSpan& fragment : line.spans) {
        spans.push_back({fragment.offset, fragment.line, fragment.column});
    }
    return {{"kind", nameOf(line.kind)},   {"first", line.firstLine},    {"last", line.lastLine},
            {"name", bytes(line.name)},    {"value", bytes(line.value)}, {"spans", spans},
            {"line", line.line},           {"column", line.column},      {"fault", nameOf(line.error)},
            {"closes", line.closesSection}};
}

} // namespace

int main(int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        std::ifstream file(argv[i], std::ios::binary);
        const std::string text((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
        const AcdLines lines(text);
        nlohmann::json all = nlohmann::json::array();
        for (const AcdLines::Line& line : lines.lines()) {
            all.push_back(asJson(line));
        }
        nlohmann::json comments = nlohmann::json::array();
        for (const AcdLines::Comment& comment : lines.comments()) {
            comments.push_back({comment.line, comment.column, bytes(comment.text)});
        }
        std::cout << nlohmann::json{{"file", argv[i]}, {"lines", all}, {"comments", comments}} << '\n';
    }
}
