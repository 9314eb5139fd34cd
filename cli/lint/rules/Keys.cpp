// Rules about keys: one that is set twice loses a value, one that is unknown has no effect.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "text/Suggest.h"

#include <UT_STR.h>

#include <algorithm>
#include <map>
#include <set>
#include <utility>

namespace lint {

namespace {

constexpr Rule DUPLICATE_KEY{
    "K101",
    "duplicate-key",
    Severity::ERROR,
    "key set twice in one section",
    R"(In one section of one file the last "=" wins, and the former value of the key is lost. Join the values, or
add to the first with "+=". A layer on top may set a key again; that is what layers are for.)",
    "PROPERTY = VENDOR,Korvel\nPROPERTY = KIND,FPGA"};
constexpr Rule UNKNOWN_KEY{
    "K102",
    "unknown-key",
    Severity::WARNING,
    "key that is not read",
    R"(The manager reads a fixed set of keys, case-sensitive, and each only in its own file: mode lists and IDCODEs in
base.acd, flashes in spi.acd, tables and properties in the families' files and their sections. Any other key has
no effect.)",
    "PROGRAM_OPTIONS = VERIFY,Bscan,USB2"};
constexpr Rule IGNORED_OPERATIONS{
    "K201",
    "ignored-operations",
    Severity::ERROR,
    "operations of a device that DEVICE_SUPPORTED does not list",
    R"(A section's OPERATION and BSDL_OPERATION are read only if DEVICE_SUPPORTED of base.acd lists the device; all
others get their family's tables. List the device there (and in PROGRAM_OPTION_PACKAGE), or remove the key.)",
    "[KS50]\nOPERATION = PROGRAM,Bscan,USB2"};
constexpr Rule LEAKING_OPTIONS{
    "K202",
    "leaking-options",
    Severity::ERROR,
    "options of a device that PROGRAM_OPTION_PACKAGE does not list",
    R"(The options of a section fill the table of the device if PROGRAM_OPTION_PACKAGE lists it by its bare name.
Otherwise they fill the table of the whole family: the device or family that is asked for first fills it, so answers
depend on the order of questions. Listing the device together with a package does not prevent that.)",
    "[KS50]\nPROGRAM_OPTION = VERIFY,Bscan,USB2"};

void checkDuplicates(const FamilyData& family, Findings& findings) {
    for (const AcdLines& file : family.files) {
        std::map<std::pair<std::string, std::string_view>, unsigned> lines;
        std::string section;
        bool isDropped = false;
        for (const AcdLines::Line& line : file.lines()) {
            if (line.kind == AcdLines::Kind::HEADER) {
                section = lowerCase(line.name);
                isDropped = false;
            } else if (line.kind == AcdLines::Kind::INVALID) {
                isDropped = isDropped || line.closesSection;
            } else if (!isDropped) {
                const auto [known, isFirst] = lines.try_emplace({section, line.name}, line.line);
                if (!isFirst && line.kind == AcdLines::Kind::ASSIGNMENT) {
                    findings.add(DUPLICATE_KEY, {line.name, {&file, line.line, line.column}},
                                 "the key {} is set again; the value of line {} is lost", inQuotes(line.name),
                                 known->second);
                }
                known->second = line.line;
            }
        }
    }
}

/// The keys that are read before the first section of a file.
std::vector<std::string> knownKeys(const FamilyData& family) {
    std::vector<std::string> all = schema::fixedKeys(family.kind);
    if (family.kind == schema::File::SPI) {
        const std::vector<FlashList> flashes = flashLists(family.own);
        for (const FlashList& list : flashes) {
            all.push_back(schema::devicesKey(list.family.text));
        }
        for (const std::string& name : namesOf(flashes)) {
            all.push_back(schema::propertyKey(name));
        }
    }
    return all;
}

/// The file that a key belongs to, when it is another one.
std::string fileHint(std::string_view key, schema::File kind) {
    for (const auto& [other, name] :
         {std::pair(schema::File::BASE, schema::BASE), {schema::File::SPI, schema::SPI}}) {
        if (kind != other && schema::shapeOf(other, key) != schema::Shape::NONE) {
            return fmt::format("; it belongs to {}", name);
        }
    }
    return {};
}

/// Checks the keys of the files of one family.
class KeyCheck {
public:
    KeyCheck(const FamilyData& family, Findings& findings)
        : m_kind(family.kind), m_own(knownKeys(family)), m_findings(findings) {
        std::sort(m_own.begin(), m_own.end());
    }

    void check(const AcdLines& file) {
        enum class Open { OWN, SECTION, NOTHING } open = Open::OWN;
        std::string section;
        m_file = &file;
        m_set.clear();
        for (const AcdLines::Line& line : file.lines()) {
            if (line.kind == AcdLines::Kind::HEADER) {
                open = Open::SECTION;
                section = lowerCase(line.name);
            } else if (line.kind == AcdLines::Kind::INVALID) {
                open = line.closesSection ? Open::NOTHING : open;
            } else if (open == Open::OWN && !isRead(line.name)) {
                addUnknown(line, section, m_own);
            } else if (open == Open::SECTION && schema::shapeInSection(line.name) == schema::Shape::NONE) {
                if (isRead(line.name)) {
                    add(line, {}, "; it belongs before the first section");
                } else {
                    addUnknown(line, section, m_inSection);
                }
            }
        }
    }

private:
    [[nodiscard]] bool isRead(std::string_view key) const {
        return std::binary_search(m_own.begin(), m_own.end(), key);
    }

    /// Adds a finding about a key that the file does not have, with the nearest one that the section does not set.
    void addUnknown(const AcdLines::Line& line, const std::string& section,
                    const std::vector<std::string>& known) {
        if (const std::string file = fileHint(line.name, m_kind); !file.empty()) {
            add(line, {}, file);
        } else {
            add(line, m_findings.suggest(line.name, known, [&](const std::string& other) {
                return keysSet().contains({section, other});
            }));
        }
    }

    /// The keys that the file sets, each with its section in lower case: collected for the first unknown key only.
    [[nodiscard]] const std::set<std::pair<std::string, std::string>>& keysSet() {
        std::string section;
        for (auto line = m_set.empty() ? m_file->lines().begin() : m_file->lines().end();
             line != m_file->lines().end(); ++line) {
            if (line->kind == AcdLines::Kind::HEADER) {
                section = lowerCase(line->name);
            } else if (line->kind != AcdLines::Kind::INVALID) {
                m_set.emplace(section, line->name);
            }
        }
        return m_set;
    }

    void add(const AcdLines::Line& line, const Suggestion& suggestion, const std::string& hint = {}) {
        const Token key{line.name, {m_file, line.line, line.column}};
        Finding& finding = m_findings.addUnknown(UNKNOWN_KEY, key, key, suggestion,
                                                 "the key {} is not read here{}", inQuotes(line.name), hint);
        finding.reports = suggestion.name ? fact::key(*suggestion.name) : std::string();
        if (key.text.ends_with(schema::PROPERTY_SUFFIX)) {
            finding.restsOn = key.text.substr(0, key.text.size() - schema::PROPERTY_SUFFIX.size());
        }
    }

    schema::File m_kind;
    std::vector<std::string> m_own;
    std::vector<std::string> m_inSection = schema::fixedKeys(schema::File::FAMILY);
    Findings& m_findings;
    const AcdLines* m_file = nullptr;
    std::set<std::pair<std::string, std::string>> m_set;
};

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    checkDuplicates(family, result.findings);
    KeyCheck check(family, result.findings);
    for (const AcdLines& file : family.files) {
        check.check(file);
    }
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    for (const Device& device : model.devices()) {
        const std::string_view name = device.section->name.text;
        if (model.supported().contains(name)) {
            continue; // its tables are its own
        }
        for (const char* const key : {schema::OPERATION, schema::BSDL_OPERATION}) {
            if (const Value* const value = device.section->find(key)) {
                findings.add(IGNORED_OPERATIONS, value->key,
                             "{} of {} is never read: DEVICE_SUPPORTED does not list the device", key,
                             inQuotes(name));
            }
        }
        const Value* const options = device.section->find(schema::PROGRAM_OPTION);
        if (options != nullptr && !model.optionPackages().contains(name)) {
            findings
                .add(LEAKING_OPTIONS, options->key,
                     "the options of {} leak into those of family {}: PROGRAM_OPTION_PACKAGE does not list "
                     "the "
                     "device",
                     inQuotes(name), inQuotes(device.family->name))
                .fix = listing(model, name, {schema::PROGRAM_OPTION_PACKAGE});
        }
    }
}

} // namespace

RuleSet keyRules() {
    return {
        "keys", {&DUPLICATE_KEY, &UNKNOWN_KEY, &IGNORED_OPERATIONS, &LEAKING_OPTIONS}, checkFamily, check};
}

} // namespace lint
