// Rules about keys: one that is set twice loses a value, one that nobody knows says nothing.
#include "lint/Keys.h"

#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <utility>

namespace lint {

namespace {

constexpr Rule DUPLICATE_KEY{
    "K101", Level::ERROR, "key set twice in one section",
    "In one section of one file the last \"=\" stands, and what the key had before is lost. Join the values, "
    "or add to "
    "the first with \"+=\". A layer on top may set a key anew; that is what layers are for.",
    "PROPERTY = VENDOR,Korvel\nPROPERTY = KIND,FPGA"};
constexpr Rule UNKNOWN_KEY{"K102", Level::WARNING, "key that nobody reads",
                           "The manager reads a fixed set of keys, with case, and each only in its own "
                           "place: mode lists and IDCODEs in "
                           "base.acd, flashes in spi.acd, tables and properties in the families' files and "
                           "their sections. Any other key is "
                           "without effect.",
                           "PROGRAM_OPTIONS = VERIFY,Bscan,USB2"};
constexpr Rule NEVER_READ_OPERATIONS{"K201", Level::ERROR,
                                     "operations of a device that DEVICE_SUPPORTED does not list",
                                     "A section's OPERATION and BSDL_OPERATION are read only when "
                                     "DEVICE_SUPPORTED of base.acd lists the device; all "
                                     "others get their family's tables. List the device there (and in "
                                     "PROGRAM_OPTION_PACKAGE), or drop the key.",
                                     "[KS50]\nOPERATION = PROGRAM,Bscan,USB2"};
constexpr Rule LEAKING_OPTIONS{
    "K202", Level::ERROR, "options of a device that PROGRAM_OPTION_PACKAGE does not list",
    "The options of a section go to the table of the device when PROGRAM_OPTION_PACKAGE lists it by its bare "
    "name. "
    "Otherwise they go to the table of the whole family: whichever is asked for first fills it, so answers "
    "depend on "
    "the order of questions. Listing the device together with a package does not stop that.",
    "[KS50]\nPROGRAM_OPTION = VERIFY,Bscan,USB2"};

void checkDuplicates(const Model& model, Findings& findings) {
    for (const AcdLines& file : model.files()) {
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
                                 fmt::format("the key {} is set again: what line {} gave is lost",
                                             quoted(line.name), known->second));
                }
                known->second = line.line;
            }
        }
    }
}

const std::vector<std::string>& sectionKeys() {
    static const std::vector<std::string> keys(FAMILY_KEYS.begin(), FAMILY_KEYS.end());
    return keys;
}

/// Where a key would be read that is not read here.
std::string placeElsewhere(std::string_view key, Family::Kind kind) {
    if (kind != Family::Kind::BASE && shapeOf(Family::Kind::BASE, key) != Shape::NONE) {
        return "; it belongs to base.acd";
    }
    if (kind != Family::Kind::SPI && shapeOf(Family::Kind::SPI, key) != Shape::NONE) {
        return "; it belongs to spi.acd";
    }
    return {};
}

/// Looks at the keys of one file.
class KeyCheck {
public:
    KeyCheck(const Model& model, const Family& family, Findings& findings)
        : m_kind(family.kind), m_own(knownKeys(model, family.kind)), m_findings(findings) {
        std::sort(m_own.begin(), m_own.end());
    }

    void check(const AcdLines& file) {
        enum class Open { OWN, SECTION, NOTHING } open = Open::OWN;
        for (const AcdLines::Line& line : file.lines()) {
            if (line.kind == AcdLines::Kind::HEADER) {
                open = Open::SECTION;
            } else if (line.kind == AcdLines::Kind::INVALID) {
                open = line.closesSection ? Open::NOTHING : open;
            } else if (open == Open::OWN && !isRead(line.name)) {
                add(file, line, hint(line.name, m_own));
            } else if (open == Open::SECTION && shapeInSection(line.name) == Shape::NONE) {
                add(file, line,
                    isRead(line.name) ? "; it belongs before the first section"
                                      : hint(line.name, sectionKeys()));
            }
        }
    }

private:
    [[nodiscard]] bool isRead(std::string_view key) const {
        return std::binary_search(m_own.begin(), m_own.end(), key);
    }

    [[nodiscard]] std::string hint(std::string_view key, const std::vector<std::string>& known) {
        const std::string place = placeElsewhere(key, m_kind);
        return place.empty() ? m_findings.didYouMean(key, known) : place;
    }

    void add(const AcdLines& file, const AcdLines::Line& line, const std::string& hint) {
        m_findings.add(UNKNOWN_KEY, {line.name, {&file, line.line, line.column}},
                       fmt::format("nobody reads the key {} here{}", quoted(line.name), hint));
    }

    Family::Kind m_kind;
    std::vector<std::string> m_own;
    Findings& m_findings;
};

void checkKnown(const Model& model, Findings& findings) {
    for (const Family& family : model.families()) {
        KeyCheck check(model, family, findings);
        for (const AcdLines* file : family.files) {
            check.check(*file);
        }
    }
}

void checkSections(const Model& model, Findings& findings) {
    for (const auto& [name, device] : model.devices()) {
        if (model.supported().contains(name)) {
            continue; // its tables are its own
        }
        for (const char* const key : {"OPERATION", "BSDL_OPERATION"}) {
            if (const Entry* const entry = device.section->find(key)) {
                findings.add(NEVER_READ_OPERATIONS, entry->key,
                             fmt::format("{} of {} is never read: DEVICE_SUPPORTED does not list the device",
                                         key, quoted(name)));
            }
        }
        const Entry* const options = device.section->find("PROGRAM_OPTION");
        if (options != nullptr && !model.optionPackages().contains(name)) {
            findings.add(
                LEAKING_OPTIONS, options->key,
                fmt::format("the options of {} leak into those of family {}: PROGRAM_OPTION_PACKAGE does not "
                            "list the device",
                            quoted(name), quoted(device.family->name)));
        }
    }
}

void check(const Model& model, Findings& findings) {
    checkDuplicates(model, findings);
    checkKnown(model, findings);
    checkSections(model, findings);
}

} // namespace

Group keyRules() { return {{&DUPLICATE_KEY, &UNKNOWN_KEY, &NEVER_READ_OPERATIONS, &LEAKING_OPTIONS}, check}; }

} // namespace lint
