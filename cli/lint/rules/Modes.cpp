// Rules about the mode keys of base.acd and the parts that it excludes from modes.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

constexpr Rule UNKNOWN_MODE_OUTPUT{
    "M101", Level::ERROR, "unknown output under a mode",
    "Outputs are PARALLEL, ZORVA, USB2, SVF, STAPL, EXPRESSSVF and EXPRESSQSVF, in upper case. Any other "
    "text counts as "
    "the unspecified cable, silently: the mode then takes that in place of the one that was meant.",
    "BS = outputs,USB3:families,kestrel"};
constexpr Rule UNKNOWN_MODE_FAMILY{"M102", Level::ERROR, "unknown family under a mode",
                                   "The second item of a mode key lists families, spelt as their files are, "
                                   "case included. A device can't stand there, "
                                   "only its family; flashes count as family \"spi\".",
                                   "BS = outputs,USB2:families,KS50"};
constexpr Rule NO_LABEL{"M103", Level::ERROR, "mode list without a label",
                        "The first field of either item is a label of your choice and is skipped. A list "
                        "without one loses its first entry.",
                        "BS = PARALLEL,USB2:families,kestrel"};
constexpr Rule NOT_TWO_ITEMS{
    "M104", Level::ERROR, "mode key that is not two items",
    "A mode key holds the outputs and, behind one \":\", the families. With one item the mode takes "
    "no family; what stands in a third is never read.",
    "BS = outputs,USB2,families,kestrel"};
constexpr Rule MALFORMED_PART{
    "M201", Level::ERROR, "excluded part that is not mode, device and package",
    "A part is looked up as the mode's key, \"_\", the device, \"_\" and the package. Any other form "
    "is never found; to exclude a device in all its packages, list each.",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS50"};
constexpr Rule UNKNOWN_PART_MODE{
    "M202", Level::ERROR, "excluded part with an unknown mode",
    "The mode is given by its key: BS, SS, SM, BSFILE, DP770, SPI, KITECF, KITEMPM or PFF, "
    "case included. A part with any other is never found.",
    "NOT_SUPPORTED_PART_IN_MODE = Smap_KS50_TQ100"};
constexpr Rule UNKNOWN_PART_DEVICE{
    "M203", Level::ERROR, "excluded part with an unknown device",
    "The device is none that a family's file has a section for. Flashes, of which there are "
    "no sections, may stand here too.",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS55_TQ100"};
constexpr Rule UNKNOWN_PART_PACKAGE{
    "M204", Level::ERROR, "excluded part with a package that the device does not have",
    "The package is none that the device's property PACKAGES lists, so nobody asks for "
    "this part.",
    "NOT_SUPPORTED_PART_IN_MODE = SM_KS50_TQ101"};

bool isOutput(std::string_view text) {
    const std::vector<std::string>& all = vocabulary::outputs();
    return text != "QSVF" && text != "NULLCABLE" && text != "NONE" &&
           std::find(all.begin(), all.end(), text) != all.end();
}

std::vector<std::string> readableOutputs() {
    std::vector<std::string> all = vocabulary::outputs();
    all.erase(std::remove_if(all.begin(), all.end(), [](const std::string& text) { return !isOutput(text); }),
              all.end());
    return all;
}

void checkLabel(const std::vector<Token>& fields, bool isEntry, Findings& findings) {
    if (isEntry) {
        findings.add(
            NO_LABEL, fields.front(),
            fmt::format("{} stands where the label does, and is skipped", quoted(fields.front().text)));
    }
}

void checkMode(const Model& model, const Entry& entry, Findings& findings) {
    if (entry.records.size() != 2) {
        findings.add(NOT_TWO_ITEMS, entry.records.size() > 2 ? entry.records[2].whole : entry.key,
                     entry.records.size() > 2 ? "what stands behind the families is never read"
                                              : "no list of families behind the outputs");
    }
    if (entry.records.empty()) {
        return;
    }
    const std::vector<Token>& outputs = entry.records[0].fields;
    checkLabel(outputs, isOutput(outputs.front().text), findings);
    for (std::size_t i = 1; i < outputs.size(); ++i) {
        const std::string_view text = outputs[i].text;
        if (!text.empty() && !isOutput(text)) {
            findings.add(UNKNOWN_MODE_OUTPUT, outputs[i],
                         fmt::format("unknown output {}{}", quoted(text),
                                     findings.didYouMean(text, readableOutputs())));
        }
    }
    if (entry.records.size() < 2) {
        return;
    }
    const std::vector<Token>& families = entry.records[1].fields;
    checkLabel(families, model.isFamily(families.front().text), findings);
    for (std::size_t i = 1; i < families.size(); ++i) {
        const std::string_view text = families[i].text;
        if (text.empty() || model.isFamily(text)) {
            continue;
        }
        const Device* const device = model.device(text);
        findings.add(UNKNOWN_MODE_FAMILY, families[i],
                     device == nullptr ? fmt::format("unknown family {}{}", quoted(text),
                                                     findings.didYouMean(text, model.familyNames()))
                                       : fmt::format("{} is a device; only its family {} can stand here",
                                                     quoted(text), quoted(device->family->name)));
    }
}

bool holds(const std::vector<std::string>& all, std::string_view text) {
    return std::find(all.begin(), all.end(), text) != all.end();
}

void checkPart(const Model& model, const Token& part, Findings& findings) {
    const std::string_view text = part.text;
    const std::size_t first = text.find('_');
    const std::size_t second = first == text.npos ? first : text.find('_', first + 1);
    if (second == text.npos || first == 0 || second == first + 1 || second + 1 == text.size() ||
        text.find('_', second + 1) != text.npos) {
        findings.add(MALFORMED_PART, part, fmt::format("{} is not MODE_DEVICE_PACKAGE", quoted(text)));
        return;
    }
    const std::string_view mode = text.substr(0, first);
    const std::string_view name = text.substr(first + 1, second - first - 1);
    const std::string_view package = text.substr(second + 1);
    if (!holds(vocabulary::modes(), mode)) {
        findings.add(UNKNOWN_PART_MODE, part,
                     fmt::format("unknown mode {} in {}{}", quoted(mode), quoted(text),
                                 findings.didYouMean(mode, vocabulary::modes())));
    }
    if (holds(model.flashNames(), name)) {
        return;
    }
    const Device* const device = model.device(name);
    if (device == nullptr) {
        findings.add(UNKNOWN_PART_DEVICE, part,
                     fmt::format("unknown device {} in {}{}", quoted(name), quoted(text),
                                 findings.didYouMean(name, model.deviceNames())));
        return;
    }
    std::vector<std::string> packages;
    for (const Token& known : model.packages(*device)) {
        packages.emplace_back(known.text);
    }
    // Of a device that lists no packages nothing can be said.
    if (!packages.empty() && !holds(packages, package)) {
        findings.add(UNKNOWN_PART_PACKAGE, part,
                     fmt::format("{} has no package {}{}", quoted(name), quoted(package),
                                 findings.didYouMean(package, packages)));
    }
}

void check(const Model& model, Findings& findings) {
    for (const std::string& mode : vocabulary::modes()) {
        if (const Entry* const entry = model.baseEntry(mode)) {
            checkMode(model, *entry, findings);
        }
    }
    if (const Entry* const parts = model.baseEntry("NOT_SUPPORTED_PART_IN_MODE")) {
        for (const Token& part : parts->list()) {
            if (!part.text.empty()) {
                checkPart(model, part, findings);
            }
        }
    }
}

} // namespace

Group modeRules() {
    return {{&UNKNOWN_MODE_OUTPUT, &UNKNOWN_MODE_FAMILY, &NO_LABEL, &NOT_TWO_ITEMS, &MALFORMED_PART,
             &UNKNOWN_PART_MODE, &UNKNOWN_PART_DEVICE, &UNKNOWN_PART_PACKAGE},
            check};
}

} // namespace lint
