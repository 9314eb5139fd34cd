// Shows findings to people, and to programs in the tool's own JSON.
#include "lint/Report.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

constexpr std::size_t LINE_WIDTH = 100;

bool continuesCharacter(char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U; }

bool isControl(std::string_view text, std::size_t index) {
    const auto byte = static_cast<unsigned char>(text[index]);
    const auto next = index + 1 < text.size() ? static_cast<unsigned char>(text[index + 1]) : 0U;
    return byte < 0x20 || byte == 0x7F || (byte == 0xC2 && next >= 0x80 && next <= 0x9F);
}

/// The text with its control bytes as `?`, each as one column, so that it does no harm on a terminal.
std::string printable(std::string_view text) {
    std::string shown;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\t') {
            shown += ' ';
        } else if (isControl(text, i)) {
            shown += '?';
            i += text[i] == '\xC2' ? 1U : 0U;
        } else {
            shown += text[i];
        }
    }
    return shown;
}

/// The number of columns, taking the text as UTF-8.
std::size_t width(std::string_view text) {
    const std::string shown = printable(text);
    return static_cast<std::size_t>(
        std::count_if(shown.begin(), shown.end(), [](char byte) { return !continuesCharacter(byte); }));
}

/// The line of the file, of a long one what is around the finding, and a caret below.
std::string excerpt(const Finding& finding) {
    const std::string_view line = finding.place.file->source(finding.place.line);
    const std::size_t at = std::min<std::size_t>(finding.place.column - 1, line.size());
    std::size_t begin = line.size() <= LINE_WIDTH ? 0 : at - std::min(at, LINE_WIDTH / 2);
    while (begin > 0 && continuesCharacter(line[begin])) {
        --begin;
    }
    const std::string_view shown = line.substr(begin, LINE_WIDTH);
    const std::string_view marked = shown.substr(at - begin, finding.length);
    const std::string_view before = begin == 0 ? "" : "...";
    const std::size_t indent = before.size() + width(shown.substr(0, at - begin));
    const std::size_t tildes = std::max<std::size_t>(width(marked), 1) - 1;
    return fmt::format("    {}{}{}\n    {:{}}^{:~<{}}\n", before, printable(shown),
                       begin + shown.size() < line.size() ? "..." : "", "", indent, "", tildes);
}

std::string counted(std::size_t count, const char* noun) {
    return fmt::format("{} {}{}", count, noun, count == 1 ? "" : "s");
}

} // namespace

std::size_t Report::count(Level level) const {
    return static_cast<std::size_t>(
        std::count_if(findings.begin(), findings.end(),
                      [level](const Finding& finding) { return finding.rule->level == level; }));
}

std::string summary(const Report& report) {
    return counted(report.count(Level::ERROR), "error") + ", " +
           counted(report.count(Level::WARNING), "warning");
}

std::string asText(const Report& report) {
    std::string text;
    for (const Finding& finding : report.findings) {
        text += fmt::format("{}:{}:{}: {}: {} [{}]\n", printable(finding.place.file->path()),
                            finding.place.line, finding.place.column, nameOf(finding.rule->level),
                            printable(finding.text), finding.rule->code);
        text += excerpt(finding);
    }
    return text;
}

Json asJson(const Report& report) {
    const std::vector<std::string> names = fingerprints(report.findings);
    Json list = Json::array();
    for (std::size_t i = 0; i < report.findings.size(); ++i) {
        const Finding& finding = report.findings[i];
        list.push_back({{"file", finding.place.file->path()},
                        {"line", finding.place.line},
                        {"column", finding.place.column},
                        {"length", finding.length},
                        {"level", nameOf(finding.rule->level)},
                        {"code", finding.rule->code},
                        {"text", finding.text},
                        {"fingerprint", names[i]}});
    }
    return {{"errors", report.count(Level::ERROR)},
            {"warnings", report.count(Level::WARNING)},
            {"findings", list}};
}

} // namespace lint
