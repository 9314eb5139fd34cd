// Rules about the names of families and devices: a name that looks right may never be found.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "database/FileNames.h"
#include "text/Suggest.h"

#include <map>

namespace lint {

namespace {

/// Dumps show that many bytes.
constexpr std::size_t MAX_NAME = 15;

constexpr Rule DEVICE_REOPENED{
    "N101",
    "reopened-device",
    Severity::WARNING,
    "device given twice in one file",
    R"(A section that is opened again continues, and a key that both parts set keeps the last value. Join the two.)",
    "[KS50]\nPROPERTY = PINS,140\n[ks50]"};
constexpr Rule DEVICE_IN_TWO_FAMILIES{
    "N102",
    "device-in-two-families",
    Severity::ERROR,
    "device in several families",
    R"(A name is one device of one family. Of several families the one whose file name comes first in byte order has
the device, and a flash of spi.acd comes before all of them; the other sections are never read.)",
    "# in osprey.acd, while kestrel.acd has one, too\n[KS50]"};
constexpr Rule DEVICE_NAMED_AS_FAMILY{
    "N103",
    "device-named-as-family",
    Severity::ERROR,
    "device named as a family",
    R"(A name is looked up as a family before it is looked up as a device, in any case. Such a section is never read.)",
    "# in a database that has a kestrel.acd\n[KESTREL]"};
constexpr Rule UNDERSCORE_IN_DEVICE{
    "N104",
    "underscore-in-device",
    Severity::ERROR,
    R"("_" in the name of a device)",
    R"(The first "_" of a name ends the device and begins its package, so the device cannot be asked for by its whole
name.)",
    "[KS_50]"};
constexpr Rule SEPARATOR_IN_NAME{"N105",
                                 "separator-in-name",
                                 Severity::ERROR,
                                 R"("," or ":" in a name)",
                                 R"(Lists are split at "," and ":", so no list can contain such a name.)",
                                 "[KS,50]"};
constexpr Rule PERCENT_IN_NAME{"N106",
                               "percent-in-name",
                               Severity::WARNING,
                               R"("%" in a name)",
                               R"(Dumps pass names to recorders that read "%" as the start of a format.)",
                               "[KS%50]"};
constexpr Rule NAME_TOO_LONG{
    "N107",
    "name-too-long",
    Severity::WARNING,
    "name longer than the dumps show",
    R"(Dumps cut the names of families, devices, packages and flashes after 15 bytes; two names that differ only after
that look the same.)",
    "[KS50INDUSTRIAL2024]"};
constexpr Rule FAMILY_NOT_LOWER_CASE{
    "N108",
    "family-not-lower-case",
    Severity::WARNING,
    "name of a family not in lower case",
    R"(Lists contain a family's name exactly as its file spells it. If all names are in lower case, there is nothing to
remember.)",
    "# a file called Kestrel.acd"};
constexpr Rule SECTION_IN_CATALOGUE{
    "N109",
    "section-in-catalogue",
    Severity::ERROR,
    "section in base.acd or spi.acd",
    R"(A section there makes a device of family "base" or "spi". The manager treats the former as unknown, and reads of
flashes only the lists and properties before the first section. Move the device to the file of its family.)",
    "# in base.acd\n[KS50]"};
constexpr Rule SAME_FILE_NAME{
    "N110",
    "same-file-name",
    Severity::ERROR,
    "two files whose names differ only in case",
    R"(Families are found in any case of their name, so of two such files in one directory only the first one in byte
order is read.)",
    "# files Kestrel.acd and kestrel.acd in one directory"};

void checkName(std::string_view kind, const Token& name, Findings& findings) {
    if (name.text.find('%') != name.text.npos) {
        findings.add(PERCENT_IN_NAME, name, "the {} {} holds \"%\"", kind, inQuotes(name.text));
    }
    if (name.text.size() > MAX_NAME) {
        findings.add(NAME_TOO_LONG, name, "the {} {} has {} bytes; dumps show 15", kind, inQuotes(name.text),
                     name.text.size());
    }
}

void checkSeparators(std::string_view kind, const Token& name, Findings& findings) {
    if (name.text.find_first_of(",:") != name.text.npos) {
        findings.add(SEPARATOR_IN_NAME, name, "no list can hold the name of the {} {}", kind,
                     inQuotes(name.text));
    }
}

void checkFamilyName(const FamilyData& family, Findings& findings) {
    // The file does not contain its name, so the first line stands for it.
    const Token name{family.name, family.start().location};
    if (family.name != lowerCase(family.name)) {
        findings.add(FAMILY_NOT_LOWER_CASE, name, "the family {} is not in lower case",
                     inQuotes(family.name));
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
                             "the section of {} is opened in line {} already", inQuotes(line.name),
                             known->second);
            }
        }
    }
}

/// Which other owner of a device's name comes first.
std::string otherOwner(const Model& model, const std::string& name) {
    if (model.isFlashInAnyCase(name)) {
        return "spi.acd has a flash of this name, which comes first";
    }
    return fmt::format("family {} has it already, and comes first",
                       inQuotes(model.deviceInAnyCase(name)->family->name));
}

void checkDevice(const FamilyData& family, const Token& name, Findings& findings) {
    if (family.kind != schema::File::FAMILY) {
        findings.add(SECTION_IN_CATALOGUE, name, "the device {} in family {} is never known",
                     inQuotes(name.text), inQuotes(family.name));
        return;
    }
    if (const std::size_t cut = name.text.find('_'); cut != name.text.npos) {
        findings.add(UNDERSCORE_IN_DEVICE, name, "the name {} is cut to {} when it is asked for",
                     inQuotes(name.text), inQuotes(name.text.substr(0, cut)));
    }
    checkName("device", name, findings);
    checkSeparators("device", name, findings);
}

/// Finds devices that are never read, since something else has their name.
void checkOwners(const Model& model, const FamilyData& family, Findings& findings) {
    for (const Section& section : family.devices) {
        const Token& name = section.name;
        const std::string text(name.text);
        if (model.isFamilyInAnyCase(text)) {
            findings.add(DEVICE_NAMED_AS_FAMILY, name,
                         "the device {} is named as a family, which is found in its place", inQuotes(text));
        }
        if (model.deviceInAnyCase(text)->section != &section || model.isFlashInAnyCase(text)) {
            findings.add(DEVICE_IN_TWO_FAMILIES, name, "the section of {} is never read: {}", inQuotes(text),
                         otherOwner(model, text));
        }
    }
}

void checkPackages(const Section& section, Findings& findings) {
    for (const Item& item : section.items(schema::PROPERTIES)) {
        for (std::size_t i = 2; item.fields.front().text == schema::PACKAGES && i < item.fields.size(); ++i) {
            checkName("package", item.fields[i], findings);
        }
    }
}

/// Dumps show a device and its package as one name.
void checkOptionPackages(const Model& model, Findings& findings) {
    for (const Token& name : model.baseKeys().list(schema::PROGRAM_OPTION_PACKAGE)) {
        if (!model.isFamily(name.text) && model.device(name.text) == nullptr) {
            checkName("device with package", name, findings);
        }
    }
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    Findings& findings = result.findings;
    for (const AcdLines& file : family.files) {
        checkReopened(file, findings);
        for (const std::string& other : file.caseCollisions()) {
            findings.add(SAME_FILE_NAME, startOf(file),
                         "nothing is read from {}: this file is called alike and comes first",
                         inQuotes(acd::fileNameOf(other)));
        }
    }
    checkFamilyName(family, findings);
    family.forEachSection([&](const Section& section) { checkPackages(section, findings); });
    for (const Section& device : family.devices) {
        checkDevice(family, device.name, findings);
    }
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    for (const auto& family : model.families()) {
        if (family->kind == schema::File::FAMILY) {
            checkOwners(model, *family, findings);
        }
    }
    checkOptionPackages(model, findings);
    for (const FlashList& family : model.flashFamilies()) {
        checkName("flash family", family.family, findings);
        for (const Token& flash : family.devices) {
            checkName("flash", flash, findings);
        }
    }
}

} // namespace

RuleSet nameRules() {
    return {"names of families and devices",
            {&DEVICE_REOPENED, &DEVICE_IN_TWO_FAMILIES, &DEVICE_NAMED_AS_FAMILY, &UNDERSCORE_IN_DEVICE,
             &SEPARATOR_IN_NAME, &PERCENT_IN_NAME, &NAME_TOO_LONG, &FAMILY_NOT_LOWER_CASE,
             &SECTION_IN_CATALOGUE, &SAME_FILE_NAME},
            checkFamily,
            check};
}

} // namespace lint
