// Shows findings in SARIF 2.1.0, the form that code review tools read.
#include "lint/Report.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

/// A path as the path of a URI.
std::string asUri(std::string_view path) {
    constexpr std::string_view PLAIN = "-._~/";
    std::string uri = path.starts_with('/') ? "file://" : "";
    for (const char byte : path) {
        const bool isLetterOrDigit =
            (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') || (byte >= '0' && byte <= '9');
        if (isLetterOrDigit || PLAIN.find(byte) != PLAIN.npos) {
            uri += byte;
        } else {
            uri += fmt::format("%{:02X}", static_cast<unsigned char>(byte));
        }
    }
    return uri;
}

/// The number of characters in the text, as the reports show it: each byte that is no UTF-8 is one.
std::size_t characters(std::string_view text) {
    const std::string shown = Json::parse(oneLine(Json(text))).get<std::string>();
    return static_cast<std::size_t>(std::count_if(shown.begin(), shown.end(), [](char byte) {
        return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
    }));
}

/// Turns columns in bytes into columns in characters. Findings come in order, so each line is walked over once.
class Columns {
public:
    /// The column of a byte of the finding's line.
    std::size_t at(const Place& place, std::size_t byte) {
        const std::string_view line = place.file->source(place.line);
        if (place.file != m_file || place.line != m_line || byte < m_byte) {
            m_file = place.file;
            m_line = place.line;
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
    const std::size_t length = finding.place.file->source(finding.place.line).size();
    const std::size_t begin = std::min<std::size_t>(finding.place.column - 1, length);
    const std::size_t startColumn = columns.at(finding.place, begin);
    // The end is counted apart: the next finding may begin within this one.
    const std::size_t endColumn =
        startColumn +
        characters(finding.place.file->source(finding.place.line).substr(begin, finding.length));
    return {{"startLine", finding.place.line},
            {"startColumn", startColumn},
            {"endLine", finding.place.line},
            {"endColumn", endColumn}};
}

Json descriptor(const Rule& rule) {
    Json object{{"id", rule.code},
                {"shortDescription", {{"text", rule.title}}},
                {"fullDescription", {{"text", rule.explanation}}},
                {"defaultConfiguration", {{"level", nameOf(rule.level)}}}};
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
        results.push_back(
            {{"ruleId", finding.rule->code},
             {"ruleIndex", index},
             {"level", nameOf(finding.rule->level)},
             {"message", {{"text", finding.text}}},
             {"locations", Json::array({{{"physicalLocation",
                                          {{"artifactLocation", {{"uri", asUri(finding.place.file->path())}}},
                                           {"region", region(finding, columns)}}}}})},
             {"partialFingerprints", {{"tarvikLint/v1", names[i]}}}});
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
