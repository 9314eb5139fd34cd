// Shows findings to people, and to programs in the tool's own JSON.
#include "lint/Report.h"

#include <AcdText.h>

#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <utility>

namespace lint {

namespace {

/// The columns beside the line of the file: the indentation, and "..." at both ends.
constexpr std::size_t EXCERPT_MARGIN = 10;
constexpr std::size_t MIN_EXCERPT = 20;

/// The number of columns, reading the text as UTF-8.
std::size_t width(std::string_view text) {
    const std::string shown = printable(text);
    return static_cast<std::size_t>(std::count_if(
        shown.begin(), shown.end(), [](char byte) { return !AcdText::continuesCharacter(byte); }));
}

/// The line of the file, or of a long line the part around the finding, and a caret below it.
std::string excerpt(const Finding& finding, const Terminal& terminal) {
    // A line of a database may have megabytes, so the unlimited lines of a file or a pipe get a short excerpt, too.
    const std::size_t columns =
        terminal.isTerminal() ? terminal.width() : std::min(terminal.width(), LINE_WIDTH);
    const std::size_t room = std::max(columns, EXCERPT_MARGIN + MIN_EXCERPT) - EXCERPT_MARGIN;
    const std::string_view line = finding.location.file->source(finding.location.line);
    const std::size_t at = std::min<std::size_t>(finding.location.column - 1, line.size());
    std::size_t begin = line.size() <= room ? 0 : at - std::min(at, room / 2);
    while (begin > 0 && AcdText::continuesCharacter(line[begin])) {
        --begin;
    }
    const std::string_view shown = line.substr(begin, room);
    const std::string_view marked = shown.substr(at - begin, finding.length);
    const std::string_view before = begin == 0 ? "" : "...";
    const std::size_t indent = before.size() + width(shown.substr(0, at - begin));
    const std::size_t tildes = std::max<std::size_t>(width(marked), 1) - 1;
    return fmt::format("    {}{}{}\n    {:{}}{}\n", before, printable(shown),
                       begin + shown.size() < line.size() ? "..." : "", "", indent,
                       terminal.good('^' + std::string(tildes, '~')));
}

std::string counted(std::size_t count, const char* noun) {
    return fmt::format("{} {}{}", count, noun, count == 1 ? "" : "s");
}

} // namespace

std::size_t Report::count(Severity severity) const {
    return static_cast<std::size_t>(
        std::count_if(findings.begin(), findings.end(),
                      [severity](const Finding& finding) { return finding.rule->severity == severity; }));
}

std::string summary(const Report& report) {
    return counted(report.count(Severity::ERROR), "error") + ", " +
           counted(report.count(Severity::WARNING), "warning");
}

std::string countsByCode(const Report& report) {
    std::map<std::string_view, std::size_t> counts;
    for (const Finding& finding : report.findings) {
        ++counts[finding.rule->code];
    }
    std::vector<std::pair<std::string_view, std::size_t>> sorted(counts.begin(), counts.end());
    std::stable_sort(sorted.begin(), sorted.end(),
                     [](const auto& left, const auto& right) { return left.second > right.second; });
    std::string text;
    for (const auto& [code, count] : sorted) {
        text += fmt::format("{}{}: {}", text.empty() ? "" : ", ", code, count);
    }
    return text;
}

std::string asGithub(const Report& report) {
    // The runner unescapes all texts, and ends a property at ":" or ",".
    const auto escaped = [](std::string_view text, bool isProperty) {
        std::string result;
        for (const char byte : printable(text)) {
            const bool isSpecial = byte == '%' || (isProperty && (byte == ':' || byte == ','));
            result += isSpecial ? fmt::format("%{:02X}", static_cast<unsigned>(byte)) : std::string(1, byte);
        }
        return result;
    };
    std::string text;
    for (const Finding& finding : report.findings) {
        text += fmt::format("::{} file={},line={},col={},title={}::{}\n", nameOf(finding.rule->severity),
                            escaped(finding.location.file->path(), true), finding.location.line,
                            finding.location.column, finding.rule->code, escaped(finding.text, false));
    }
    return text;
}

std::string asText(const Report& report, const Terminal& terminal) {
    std::string text;
    for (const Finding& finding : report.findings) {
        const std::string place = fmt::format("{}:{}:{}:", printable(finding.location.file->path()),
                                              finding.location.line, finding.location.column);
        const Severity severity = finding.rule->severity;
        const std::string severityText = fmt::format("{}:", nameOf(severity));
        text += fmt::format("{} {} {} [{}]\n", terminal.heading(place),
                            severity == Severity::ERROR ? terminal.bad(severityText)
                                                        : terminal.warning(severityText),
                            printable(finding.text), finding.rule->code);
        text += excerpt(finding, terminal);
    }
    return text;
}

namespace {

Json asJson(const Fix& fix) {
    Json edits = Json::array();
    for (const TextEdit& edit : fix.edits) {
        edits.push_back({{"file", edit.location.file->path()},
                         {"line", edit.location.line},
                         {"column", edit.location.column},
                         {"length", edit.length},
                         {"text", edit.text}});
    }
    return {{"safe", fix.isSafe}, {"edits", edits}};
}

} // namespace

Json asJson(const Report& report) {
    const std::vector<std::string> names = fingerprints(report.findings);
    Json list = Json::array();
    for (std::size_t i = 0; i < report.findings.size(); ++i) {
        const Finding& finding = report.findings[i];
        Json object{{"file", finding.location.file->path()},
                    {"line", finding.location.line},
                    {"column", finding.location.column},
                    {"length", finding.length},
                    {"level", nameOf(finding.rule->severity)},
                    {"code", finding.rule->code},
                    {"name", finding.rule->slug},
                    {"text", finding.text},
                    {"fingerprint", names[i]}};
        if (finding.fix) {
            object["fix"] = asJson(*finding.fix);
        }
        list.push_back(std::move(object));
    }
    return {{"errors", report.count(Severity::ERROR)},
            {"warnings", report.count(Severity::WARNING)},
            {"findings", list}};
}

} // namespace lint
