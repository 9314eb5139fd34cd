// Findings of lint as diagnostics, their fixes as code actions, and the canonical form as edits.
#include "lsp/Diagnostics.h"

#include "edit/Format.h"
#include "edit/SourceFile.h"
#include "text/Trimmed.h"

#include "database/FileNames.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace lsp {

namespace {

/// The numbers of the protocol.
constexpr int ERROR = 1;
constexpr int WARNING = 2;

Json diagnosticOf(UnitCounter& counter, const lint::Finding& finding) {
    const lint::SourceLocation& location = finding.location;
    const Position start = counter.positionOf(*location.file, location.line, location.column);
    const Position end = counter.positionOf(*location.file, location.line, location.column + finding.length);
    return {{"range", asJson(Range{start, end})},
            {"severity", finding.rule->severity == lint::Severity::ERROR ? ERROR : WARNING},
            {"code", finding.rule->code},
            {"source", "tarvik"},
            {"message", finding.text}};
}

/// What an edit of a fix does, for a menu.
std::string titleOf(const lint::TextEdit& edit, const AcdLines& shown) {
    const std::string_view line = edit.location.file->source(edit.location.line);
    const std::string_view before =
        line.substr(std::min<std::size_t>(edit.location.column - 1, line.size()), edit.length);
    if (before.empty()) {
        const AcdLines& file = *edit.location.file;
        return fmt::format("insert {}{}", lint::inQuotes(trimmed(edit.text, "\n")),
                           &file == &shown ? "" : fmt::format(" in {}", acd::fileNameOf(file.path())));
    }
    return edit.text.empty()
               ? fmt::format("remove {}", lint::inQuotes(before))
               : fmt::format("replace {} with {}", lint::inQuotes(before), lint::inQuotes(edit.text));
}

/// The end of the file's first line: an editor that has CR and LF shows neither.
std::string_view lineEndOf(const View& view, const std::string& path) {
    const auto document = view.documents.find(path);
    return document != view.documents.end() && document->second.text.find("\r\n") != std::string::npos
               ? "\r\n"
               : "\n";
}

Json actionOf(const View& view, const lint::Finding& finding) {
    UnitCounter counter(view.encoding);
    Json changes = Json::object();
    for (const lint::TextEdit& edit : finding.fix->edits) {
        const AcdLines& file = *edit.location.file;
        std::string text;
        for (const char byte : edit.text) {
            text += byte == '\n' ? lineEndOf(view, file.path()) : std::string_view(&byte, 1);
        }
        const Range range =
            lsp::rangeOf(file, edit.location.line, edit.location.column, edit.length, view.encoding);
        changes[view.uri(file.path())].push_back({{"range", asJson(range)}, {"newText", text}});
    }
    return {
        {"title", fmt::format("{}: {}{}", finding.rule->code, titleOf(finding.fix->edits.front(), view.file),
                              finding.fix->isSafe ? "" : " (a guess)")},
        {"kind", "quickfix"},
        {"diagnostics", Json::array({diagnosticOf(counter, finding)})},
        {"isPreferred", finding.fix->isSafe},
        {"edit", {{"changes", changes}}}};
}

} // namespace

Json diagnosticsOf(const View& view) {
    Json all = Json::array();
    UnitCounter counter(view.encoding);
    for (const lint::Finding& finding : view.workspace.findingsIn(view.file)) {
        all.push_back(diagnosticOf(counter, finding));
    }
    return all;
}

Json codeActionsOf(const View& view, const Range& range) {
    Json all = Json::array();
    const Place first = view.placeOf(range.start);
    const Place last = view.placeOf(range.end);
    const std::pair start(first.line, first.column);
    const std::pair end(last.line, last.column);
    for (const lint::Finding& finding : view.workspace.findingsIn(view.file)) {
        const lint::SourceLocation& location = finding.location;
        const bool isBefore = std::pair(location.line, location.column + finding.length) < start;
        const bool isAfter = std::pair<unsigned, std::size_t>(location.line, location.column) > end;
        if (finding.fix && !isBefore && !isAfter) {
            all.push_back(actionOf(view, finding));
        }
    }
    return all;
}

Json formattingOf(const View& view, const std::string& text) {
    const edit::SourceFile source(text, view.file.path(), view.file.family());
    const std::vector<edit::Segment> segments = edit::formatted(source);
    if (!edit::readsAlike(source.lines(), AcdLines(edit::joined(segments)))) {
        throw RequestError(ErrorCode::REQUEST_FAILED, "the file has no canonical form that reads alike");
    }
    Json edits = Json::array();
    Position position;
    for (const edit::Segment& segment : segments) {
        const Position start = position;
        // Segments end with their lines, so only the last one has to be measured.
        const auto lines =
            static_cast<std::size_t>(std::count(segment.before.begin(), segment.before.end(), '\n'));
        const std::string_view last = segment.before.substr(segment.before.rfind('\n') + 1);
        position = {position.line + lines,
                    (lines == 0 ? position.character : 0) + unitsOf(last, view.encoding)};
        if (segment.before != segment.after) {
            edits.push_back({{"range", asJson(Range{start, position})}, {"newText", segment.after}});
        }
    }
    return edits;
}

} // namespace lsp
