// Rules about the names of families and devices: one that looks good and is never found is the dearest mistake.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include "text/Suggest.h"

#include <fmt/format.h>

#include <map>

namespace lint {

namespace {

constexpr std::size_t LONGEST_NAME = 15;

constexpr Rule DEVICE_REOPENED{"N101", Level::WARNING, "device given twice in one file",
                               "A section that is opened again goes on, and a key that both parts set keeps "
                               "the last value. Join the two.",
                               "[KS50]\nPROPERTY = PINS,140\n[ks50]"};
constexpr Rule DEVICE_IN_TWO_FAMILIES{
    "N102", Level::ERROR, "device in several families",
    "A name is one device of one family. Of several families the one whose file name comes first in byte "
    "order has the "
    "device, and a flash of spi.acd comes before all of them; the other sections are never read.",
    "# in osprey.acd, while kestrel.acd has one too\n[KS50]"};
constexpr Rule DEVICE_NAMED_AS_FAMILY{
    "N103", Level::ERROR, "device named as a family",
    "A name is looked up as a family before it is looked up as a device, without regard "
    "to case. Such a section is never read.",
    "# in a database that has a kestrel.acd\n[KESTREL]"};
constexpr Rule UNDERSCORE_IN_DEVICE{"N104", Level::ERROR, "\"_\" in the name of a device",
                                    "What stands behind the first \"_\" of a name is taken for its package "
                                    "and cut off, so the device can't be asked for "
                                    "by its whole name.",
                                    "[KS_50]"};
constexpr Rule SEPARATOR_IN_NAME{"N105", Level::ERROR, "\",\" or \":\" in a name",
                                 "Lists are split at \",\" and \":\", so no list can hold such a name.",
                                 "[KS,50]"};
constexpr Rule PERCENT_IN_NAME{"N106", Level::WARNING, "\"%\" in a name",
                               "Dumps hand names to recorders that read \"%\" as the start of a format.",
                               "[KS%50]"};
constexpr Rule NAME_TOO_LONG{
    "N107", Level::WARNING, "name longer than the dumps show",
    "Dumps cut the names of families, devices, packages and flashes after 15 bytes; two names "
    "that differ only behind that look alike.",
    "[KS50INDUSTRIAL2024]"};
constexpr Rule FAMILY_NOT_LOWER_CASE{"N108", Level::WARNING, "name of a family not in lower case",
                                     "Lists hold a family's name exactly as its file spells it. One rule for "
                                     "all, lower case, leaves nothing to remember.",
                                     "# a file called Kestrel.acd"};
constexpr Rule SECTION_IN_CATALOGUE{
    "N109", Level::ERROR, "section in base.acd or spi.acd",
    "A section there makes a device of family \"base\" or \"spi\": the manager takes the former for unknown, "
    "and reads of "
    "flashes only what their lists say. Devices belong in the file of their family.",
    "# in base.acd\n[KS50]"};

constexpr Rule SAME_FILE_NAME{"N110", Level::ERROR, "two files whose names differ in case alone",
                              "Families are found without regard to case, so of two such files in one "
                              "directory only the first one in byte "
                              "order counts; nothing is read from the other.",
                              "# files Kestrel.acd and kestrel.acd in one directory"};

void checkName(std::string_view kind, const Token& name, Findings& findings) {
    if (name.text.find('%') != name.text.npos) {
        findings.add(PERCENT_IN_NAME, name, fmt::format("the {} {} holds \"%\"", kind, quoted(name.text)));
    }
    if (name.text.size() > LONGEST_NAME) {
        findings.add(
            NAME_TOO_LONG, name,
            fmt::format("the {} {} has {} bytes; dumps show 15", kind, quoted(name.text), name.text.size()));
    }
}

void checkSeparators(std::string_view kind, const Token& name, Findings& findings) {
    if (name.text.find_first_of(",:") != name.text.npos) {
        findings.add(SEPARATOR_IN_NAME, name,
                     fmt::format("no list can hold the name of the {} {}", kind, quoted(name.text)));
    }
}

void checkFamily(const Family& family, Findings& findings) {
    // The name stands nowhere in the file: what is found is told at its first line.
    const Token name{family.name, family.place().place};
    if (family.name != lowerCase(family.name)) {
        findings.add(FAMILY_NOT_LOWER_CASE, name,
                     fmt::format("the family {} is not in lower case", quoted(family.name)));
    }
    checkName("family", name, findings);
    checkSeparators("family", name, findings);
}

void checkReopened(const AcdLines& file, Findings& findings) {
    std::map<std::string, unsigned> lines;
    for (const AcdLines::Line& line : file.lines()) {
        if (line.kind == AcdLines::Kind::HEADER) {
            const auto [known, isFirst] = lines.try_emplace(lowerCase(line.name), line.line);
            if (!isFirst) {
                findings.add(DEVICE_REOPENED, {line.name, {&file, line.line, line.column}},
                             fmt::format("the section of {} is opened in line {} already", quoted(line.name),
                                         known->second));
            }
        }
    }
}

/// Who else has a device's name, and comes first.
std::string otherOwner(const Model& model, const std::string& name) {
    if (model.isFlashInAnyCase(name)) {
        return "spi.acd has a flash of this name, which comes first";
    }
    return fmt::format("family {} has it already, and comes first",
                       quoted(model.deviceInAnyCase(name)->family->name));
}

void checkDevice(const Model& model, const Family& family, const Section& section, Findings& findings) {
    const Token& name = section.name;
    if (family.kind != Family::Kind::PARTS) {
        findings.add(
            SECTION_IN_CATALOGUE, name,
            fmt::format("the device {} in family {} is never known", quoted(name.text), quoted(family.name)));
        return;
    }
    if (model.isFamilyInAnyCase(std::string(name.text))) {
        findings.add(DEVICE_NAMED_AS_FAMILY, name,
                     fmt::format("the device {} is named as a family, which is found in its place",
                                 quoted(name.text)));
    }
    if (const std::size_t cut = name.text.find('_'); cut != name.text.npos) {
        findings.add(UNDERSCORE_IN_DEVICE, name,
                     fmt::format("the name {} is cut to {} when it is asked for", quoted(name.text),
                                 quoted(name.text.substr(0, cut))));
    }
    const std::string text(name.text);
    if (model.deviceInAnyCase(text)->section != &section || model.isFlashInAnyCase(text)) {
        findings.add(
            DEVICE_IN_TWO_FAMILIES, name,
            fmt::format("the section of {} is never read: {}", quoted(text), otherOwner(model, text)));
    }
    checkName("device", name, findings);
    checkSeparators("device", name, findings);
}

void checkPackages(const Section& section, Findings& findings) {
    const Entry* const properties = section.find("PROPERTIES");
    for (std::size_t i = 0; properties != nullptr && i < properties->records.size(); ++i) {
        const std::vector<Token>& fields = properties->records[i].fields;
        for (std::size_t value = 2; fields.front().text == "PACKAGES" && value < fields.size(); ++value) {
            checkName("package", fields[value], findings);
        }
    }
}

/// Devices that are listed together with a package have one line in the dumps, under both names in one.
void checkOptionPackages(const Model& model, Findings& findings) {
    const Entry* const entry = model.baseEntry("PROGRAM_OPTION_PACKAGE");
    for (std::size_t i = 0; entry != nullptr && i < entry->list().size(); ++i) {
        const Token& name = entry->list()[i];
        if (!model.isFamily(name.text) && model.device(name.text) == nullptr) {
            checkName("device with package", name, findings);
        }
    }
}

void check(const Model& model, Findings& findings) {
    for (const AcdLines& file : model.files()) {
        checkReopened(file, findings);
        for (const std::string& other : file.caseCollisions()) {
            findings.add(SAME_FILE_NAME, startOf(file),
                         fmt::format("nothing is read from {}: this file is called alike and comes first",
                                     quoted(other.substr(other.rfind('/') + 1))));
        }
    }
    for (const Family& family : model.families()) {
        checkFamily(family, findings);
        checkPackages(family.own, findings);
        for (const Section& device : family.devices) {
            checkDevice(model, family, device, findings);
            checkPackages(device, findings);
        }
    }
    checkOptionPackages(model, findings);
    for (const FlashList& family : model.flashFamilies()) {
        checkName("flash family", family.family, findings);
        for (std::size_t i = 0; family.devices != nullptr && i < family.devices->size(); ++i) {
            checkName("flash", (*family.devices)[i], findings);
        }
    }
}

} // namespace

Group nameRules() {
    return {{&DEVICE_REOPENED, &DEVICE_IN_TWO_FAMILIES, &DEVICE_NAMED_AS_FAMILY, &UNDERSCORE_IN_DEVICE,
             &SEPARATOR_IN_NAME, &PERCENT_IN_NAME, &NAME_TOO_LONG, &FAMILY_NOT_LOWER_CASE,
             &SECTION_IN_CATALOGUE, &SAME_FILE_NAME},
            check};
}

} // namespace lint
