// Rules about the mode keys of base.acd and the parts that it excludes from modes.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <algorithm>
#include <set>

namespace lint {

namespace {

constexpr Rule UNKNOWN_MODE_OUTPUT{
    "M101",
    "unknown-mode-output",
    Severity::ERROR,
    "unknown output under a mode",
    R"(Outputs are PARALLEL, ZORVA, USB2, SVF, STAPL, EXPRESSSVF and EXPRESSQSVF, in upper case. Any other text is
silently read as the unspecified cable, and the mode then accepts that instead of the output that was meant.)",
    "BS = outputs,USB3:families,kestrel"};
constexpr Rule UNKNOWN_MODE_FAMILY{
    "M102",
    "unknown-mode-family",
    Severity::ERROR,
    "unknown family under a mode",
    R"(The second item of a mode key lists families as their files are spelt, case included. A device cannot be listed,
only its family; flashes belong to family "spi".)",
    "BS = outputs,USB2:families,KS50"};
constexpr Rule NO_LABEL{
    "M103",
    "no-label",
    Severity::ERROR,
    "mode list without a label",
    R"(The first field of either item is a label of your choice and is skipped. A list without one loses its first
entry.)",
    "BS = PARALLEL,USB2:families,kestrel"};
constexpr Rule NOT_TWO_ITEMS{
    "M104",
    "not-two-items",
    Severity::ERROR,
    "mode key that is not two items",
    R"(A mode key holds the outputs and, after one ":", the families. With one item the mode accepts no family; a third
item is not read.)",
    "BS = outputs,USB2,families,kestrel"};
constexpr Rule MALFORMED_PART{
    "M201",
    "malformed-part",
    Severity::ERROR,
    "excluded part that is not mode, device and package",
    R"(A part is looked up as the mode's key, "_", the device, "_" and the package. Any other form is never found; to
exclude a device in all its packages, list each of them.)",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS50"};
constexpr Rule UNKNOWN_PART_MODE{
    "M202",
    "unknown-part-mode",
    Severity::ERROR,
    "excluded part with an unknown mode",
    R"(The mode is written by its key: BS, SS, SM, BSFILE, DP770, SPI, KITECF, KITEMPM or PFF, case included. A part
with any other mode is never found.)",
    "NOT_SUPPORTED_PART_IN_MODE = Smap_KS50_TQ100"};
constexpr Rule UNKNOWN_PART_DEVICE{
    "M203",
    "unknown-part-device",
    Severity::ERROR,
    "excluded part with an unknown device",
    R"(No family's file has a section for the device, and it is not a flash either.)",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS55_TQ100",
    true};
constexpr Rule UNKNOWN_PART_PACKAGE{
    "M204",
    "unknown-part-package",
    Severity::ERROR,
    "excluded part with a package that the device does not have",
    "The device's property PACKAGES does not list the package, so applications never ask for this part.",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS50_TQ101",
    true};

constexpr Rule SPI_PART{
    "M206",
    "spi-part",
    Severity::ERROR,
    "excluded part in SPI mode that is not spi",
    R"(In SPI mode every device is looked up as "spi", so only SPI_spi_PACKAGE is ever found. It excludes the package for
all devices.)",
    "NOT_SUPPORTED_PART_IN_MODE = SPI_OVD1_SO8"};

bool contains(const std::vector<std::string>& all, std::string_view text) {
    return std::find(all.begin(), all.end(), text) != all.end();
}

void checkLabel(const Token& label, bool isEntry, Findings& findings) {
    if (isEntry) {
        findings.add(NO_LABEL, label, "{} is in the place of the label, and is skipped",
                     inQuotes(label.text));
    }
}

void checkOutputs(std::string_view mode, const std::vector<Token>& outputs, Findings& findings) {
    checkLabel(outputs.front(), contains(schema::modeOutputs(), outputs.front().text), findings);
    for (std::size_t i = 1; i < outputs.size(); ++i) {
        const std::string_view text = outputs[i].text;
        if (!text.empty() && !contains(schema::modeOutputs(), text)) {
            const Suggestion suggestion = findings.suggest(text, schema::modeOutputs(), outputs);
            findings
                .addUnknown(UNKNOWN_MODE_OUTPUT, outputs[i], outputs[i], suggestion, "unknown output {}",
                            inQuotes(text))
                .reports = fact::inMode(suggestion.name.value_or(""), mode);
        }
    }
}

void checkFamilies(const Model& model, std::string_view mode, const std::vector<Token>& families,
                   Findings& findings) {
    checkLabel(families.front(), model.isFamily(families.front().text), findings);
    for (std::size_t i = 1; i < families.size(); ++i) {
        const std::string_view text = families[i].text;
        if (text.empty() || model.isFamily(text)) {
            continue;
        }
        if (const Device* const device = model.device(text)) {
            findings.add(UNKNOWN_MODE_FAMILY, families[i],
                         "{} is a device; only its family {} can be listed here", inQuotes(text),
                         inQuotes(device->family->name));
        } else {
            const Suggestion suggestion = findings.suggest(text, model.familyNames(), families);
            findings
                .addUnknown(UNKNOWN_MODE_FAMILY, families[i], families[i], suggestion, "unknown family {}",
                            inQuotes(text))
                .reports = fact::inMode(suggestion.name.value_or(""), mode);
        }
    }
}

void checkMode(const Model& model, const Value& value, Findings& findings) {
    const std::vector<Item>& items = value.items;
    if (items.empty() && value.isReplaced) {
        return; // a layer empties the key on purpose
    }
    if (items.size() > 2) {
        findings.addText(NOT_TWO_ITEMS, items[2].whole, "text after the families is never read");
    } else if (items.size() < 2) {
        findings.addText(NOT_TWO_ITEMS, value.key, "no list of families after the outputs");
    }
    if (!items.empty()) {
        checkOutputs(value.key.text, items[0].fields, findings);
    }
    if (items.size() > 1) {
        checkFamilies(model, value.key.text, items[1].fields, findings);
    }
}

void checkPart(const Model& model, const Token& part, const std::set<std::string_view>& excluded,
               Findings& findings) {
    const auto isExcluded = [&excluded](const std::string& other) { return excluded.contains(other); };
    const std::string_view text = part.text;
    const std::size_t first = text.find('_');
    const std::size_t second = first == text.npos ? first : text.find('_', first + 1);
    if (second == text.npos || first == 0 || second == first + 1 || second + 1 == text.size() ||
        text.find('_', second + 1) != text.npos) {
        findings.add(MALFORMED_PART, part, "{} is not MODE_DEVICE_PACKAGE", inQuotes(text));
        return;
    }
    const std::string_view mode = text.substr(0, first);
    const std::string_view name = text.substr(first + 1, second - first - 1);
    const std::string_view package = text.substr(second + 1);
    if (!contains(vocabulary::modes(), mode)) {
        findings.addUnknown(UNKNOWN_PART_MODE, part, partOf(part, 0, mode.size()),
                            findings.suggest(mode, vocabulary::modes(),
                                             [&](const std::string& other) {
                                                 return isExcluded(
                                                     fmt::format("{}_{}_{}", other, name, package));
                                             }),
                            "unknown mode {} in {}", inQuotes(mode), inQuotes(text));
    }
    if (mode == schema::SPI_MODE) {
        if (name != schema::SPI_FAMILY) {
            Finding& finding =
                findings.add(SPI_PART, part,
                             "never looked up: in SPI mode every device is {}; did you mean \"SPI_spi_{}\"?",
                             inQuotes(schema::SPI_FAMILY), package);
            if (sameWithoutCase(name, schema::SPI_FAMILY)) {
                finding.fix =
                    replacing(partOf(part, first + 1, name.size()), std::string(schema::SPI_FAMILY));
            }
        }
        return;
    }
    if (contains(model.flashNames(), name)) {
        return;
    }
    const Device* const device = model.device(name);
    if (device == nullptr) {
        findings.addUnknown(UNKNOWN_PART_DEVICE, part, partOf(part, first + 1, name.size()),
                            findings.suggest(name, model.deviceNames(),
                                             [&](const std::string& other) {
                                                 return isExcluded(
                                                     fmt::format("{}_{}_{}", mode, other, package));
                                             }),
                            "unknown device {} in {}", inQuotes(name), inQuotes(text));
        return;
    }
    std::vector<std::string> packages;
    for (const Token& known : model.packages(*device)) {
        packages.emplace_back(known.text);
    }
    // The packages of a device that lists none are unknown.
    if (!packages.empty() && !contains(packages, package)) {
        findings.addUnknown(UNKNOWN_PART_PACKAGE, part, partOf(part, second + 1, package.size()),
                            findings.suggest(package, packages,
                                             [&](const std::string& other) {
                                                 return isExcluded(
                                                     fmt::format("{}_{}_{}", mode, name, other));
                                             }),
                            "{} has no package {}", inQuotes(name), inQuotes(package));
    }
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    for (const std::string& mode : vocabulary::modes()) {
        if (const Value* const value = model.baseKeys().find(mode)) {
            checkMode(model, *value, findings);
        }
    }
    std::set<std::string_view> excluded;
    for (const Token& part : model.baseKeys().list(schema::NOT_SUPPORTED_PART_IN_MODE)) {
        excluded.insert(part.text);
    }
    for (const Token& part : model.baseKeys().list(schema::NOT_SUPPORTED_PART_IN_MODE)) {
        if (!part.text.empty()) {
            checkPart(model, part, excluded, findings);
        }
    }
}

} // namespace

RuleSet modeRules() {
    return {"modes and excluded parts",
            {&UNKNOWN_MODE_OUTPUT, &UNKNOWN_MODE_FAMILY, &NO_LABEL, &NOT_TWO_ITEMS, &MALFORMED_PART,
             &UNKNOWN_PART_MODE, &UNKNOWN_PART_DEVICE, &UNKNOWN_PART_PACKAGE, &SPI_PART},
            nullptr,
            check};
}

} // namespace lint
