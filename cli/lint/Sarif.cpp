// Prints findings in SARIF 2.1.0, the format that code review tools read.
#include "lint/Report.h"

#include "text/Uri.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

/// The number of characters in the text, as the reports show it: each byte that is not UTF-8 is one.
std::size_t characters(std::string_view text) {
    const std::string shown = Json::parse(oneLine(Json(text))).get<std::string>();
    return static_cast<std::size_t>(std::count_if(shown.begin(), shown.end(), [](char byte) {
        return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
    }));
}

/// Turns columns in bytes into columns in characters. Findings are sorted, so each line is walked over once.
class Columns {
public:
    /// The column of a byte of the finding's line.
    std::size_t at(const SourceLocation& location, std::size_t byte) {
        const std::string_view line = location.file->source(location.line);
        if (location.file != m_file || location.line != m_line || byte < m_byte) {
            m_file = location.file;
            m_line = location.line;
            m_byte = m_characters = 0;
        }
        m_characters += characters(line.substr(m_byte, byte - m_byte));
        m_byte = byte;
        return m_characters + 1;
    }

private:
    const AcdLines* m_file = nullptr;
    unsigned m_line = 0;
    std::size_t m_byte = 0;
    std::size_t m_characters = 0;
};

Json region(const Finding& finding, Columns& columns) {
    const std::size_t length = finding.location.file->source(finding.location.line).size();
    const std::size_t begin = std::min<std::size_t>(finding.location.column - 1, length);
    const std::size_t startColumn = columns.at(finding.location, begin);
    // The end is counted separately: the next finding may begin within this one.
    const std::size_t endColumn =
        startColumn +
        characters(finding.location.file->source(finding.location.line).substr(begin, finding.length));
    return {{"startLine", finding.location.line},
            {"startColumn", startColumn},
            {"endLine", finding.location.line},
            {"endColumn", endColumn}};
}

/// A safe fix, all of whose edits are in the file of the finding.
Json asSarif(const Fix& fix) {
    Json replacements = Json::array();
    for (const TextEdit& edit : fix.edits) {
        Columns columns;
        const std::size_t begin = edit.location.column - 1;
        const std::size_t startColumn = columns.at(edit.location, begin);
        replacements.push_back({{"deletedRegion",
                                 {{"startLine", edit.location.line},
                                  {"startColumn", startColumn},
                                  {"endLine", edit.location.line},
                                  {"endColumn", columns.at(edit.location, begin + edit.length)}}},
                                {"insertedContent", {{"text", edit.text}}}});
    }
    const std::string& path = fix.edits.front().location.file->path();
    return {{"artifactChanges",
             Json::array({{{"artifactLocation", {{"uri", asUri(path)}}}, {"replacements", replacements}}})}};
}

Json descriptor(const Rule& rule) {
    Json object{{"id", rule.code},
                {"name", rule.slug},
                {"shortDescription", {{"text", rule.title}}},
                {"fullDescription", {{"text", rule.explanation()}}},
                {"defaultConfiguration", {{"level", nameOf(rule.severity)}}}};
    if (!rule.example.empty()) {
        object["help"] = {{"text", fmt::format("Found in:\n{}", rule.example)}};
    }
    return object;
}

} // namespace

Json asSarif(const Report& report) {
    Json descriptors = Json::array();
    for (const Rule* rule : rules()) {
        descriptors.push_back(descriptor(*rule));
    }
    const std::vector<std::string> names = fingerprints(report.findings);
    Json results = Json::array();
    Columns columns;
    for (std::size_t i = 0; i < report.findings.size(); ++i) {
        const Finding& finding = report.findings[i];
        const auto index = std::find(rules().begin(), rules().end(), finding.rule) - rules().begin();
        Json result({{"ruleId", finding.rule->code},
                     {"ruleIndex", index},
                     {"level", nameOf(finding.rule->severity)},
                     {"message", {{"text", finding.text}}},
                     {"locations",
                      Json::array({{{"physicalLocation",
                                     {{"artifactLocation", {{"uri", asUri(finding.location.file->path())}}},
                                      {"region", region(finding, columns)}}}}})},
                     {"partialFingerprints", {{"tarvikLint/v1", names[i]}}}});
        if (finding.fix && finding.fix->isSafe) {
            result["fixes"] = Json::array({asSarif(*finding.fix)});
        }
        results.push_back(std::move(result));
    }
    return {
        {"$schema", "https://json.schemastore.org/sarif-2.1.0.json"},
        {"version", "2.1.0"},
        {"runs",
         Json::array(
             {{{"tool",
                {{"driver", {{"name", "tarvik lint"}, {"version", TARVIK_VERSION}, {"rules", descriptors}}}}},
               {"columnKind", "unicodeCodePoints"},
               {"results", results}}})}};
}

} // namespace lint
