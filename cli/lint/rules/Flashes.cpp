// Rules about spi.acd: its names are looked up in upper case, its classes only where they are families too.
#include "lint/Findings.h"
#include "lint/Keys.h"
#include "lint/rules/RuleSets.h"

#include "model/Multiboot.h"
#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <set>

namespace lint {

namespace {

constexpr Rule NAME_NOT_UPPER_CASE{
    "S101", Level::ERROR, "flash not in upper case",
    "Flashes and their families are looked for in upper case, so a name with a lower-case "
    "letter is never found.",
    "ST1_DEVICES = Tmf512K"};
constexpr Rule PROPERTY_NOT_UPPER_CASE{
    "S102", Level::ERROR, "property of a flash not in upper case",
    "Properties of flashes are looked for in upper case, so a name with a lower-case "
    "letter is never found.",
    "ST1_PROPERTY = Vendor,Tamsel"};
constexpr Rule NO_DEVICE_LIST{
    "S103", Level::ERROR, "SPI family without devices",
    "DEVICE_FAMILY names a family that has no FAMILY_DEVICES, so no flash belongs to it.",
    "DEVICE_FAMILY = ST1,ST9"};
constexpr Rule CLASS_WITHOUT_FAMILY{"S104", Level::ERROR, "properties of a class that is no SPI family",
                                    "The properties of a class are read only when DEVICE_FAMILY lists the "
                                    "class as a family. Otherwise its flashes go "
                                    "without.",
                                    "DEVICE_FAMILY = ST1\nAT1_PROPERTY = VENDOR,Orveth"};
constexpr Rule IN_SEVERAL_CLASSES{
    "S105", Level::ERROR, "flash in several classes",
    "A flash in several classes has the properties of the last one in the order AT1, ST1, "
    "ST2, BPI1, BPI2, BPI3; the others are never asked.",
    "ST1_DEVICES = TMF1M\nST2_DEVICES = TMF1M"};
constexpr Rule UNKNOWN_IN_CLASS{
    "S106", Level::ERROR, "unknown flash in a class",
    "The list of a class that is no SPI family names a flash that no family lists: the "
    "manager does not take it for a flash.",
    "DEVICE_FAMILY = NV1\nST1_DEVICES = TMF1M"};
constexpr Rule UNKNOWN_IN_MULTIBOOT{
    "S107", Level::ERROR, "unknown device in a multiboot list",
    "The list names neither a flash nor a device of a family, in any case, so nobody "
    "asks for this entry.",
    "TYPE_MB_SPI_NONE_LEAD = TMF3M"};
constexpr Rule IN_SEVERAL_FAMILIES{
    "S108", Level::WARNING, "flash in several SPI families",
    "A flash stands in one family. Families that are no classes share nothing, so the "
    "second entry says nothing.",
    "NV1_DEVICES = MRS1M\nNV2_DEVICES = MRS1M"};
constexpr Rule SAME_JOINED_NAME{
    "S109", Level::ERROR, "two flash properties with one joined name",
    "Flash and property are joined without a separator, so AB with CD and ABC with D are one "
    "and the same, and the last one stands.",
    "AB_PROPERTY = CD,1\nABC_PROPERTY = D,2"};

bool isUpperCase(std::string_view text) {
    return std::none_of(text.begin(), text.end(), [](char byte) { return byte >= 'a' && byte <= 'z'; });
}

bool isFlashFamily(const Model& model, std::string_view name) {
    const std::vector<FlashList>& all = model.flashFamilies();
    return std::any_of(all.begin(), all.end(),
                       [name](const FlashList& list) { return list.family.text == name; });
}

void checkCase(const Token& name, Findings& findings) {
    if (!isUpperCase(name.text)) {
        findings.add(NAME_NOT_UPPER_CASE, name,
                     fmt::format("the flash {} is never found", quoted(name.text)));
    }
}

void checkFamilies(const Model& model, Findings& findings) {
    std::map<std::string_view, std::string_view> families;
    for (const FlashList& list : model.flashFamilies()) {
        const std::string_view family = list.family.text;
        if (family.empty()) {
            continue;
        }
        checkCase(list.family, findings);
        if (list.devices == nullptr || list.devices->empty()) {
            findings.add(NO_DEVICE_LIST, list.family,
                         fmt::format("the family {} has no {}_DEVICES", quoted(family), family));
            continue;
        }
        for (const Token& flash : *list.devices) {
            checkCase(flash, findings);
            const auto [known, isFirst] = families.try_emplace(flash.text, family);
            // In two classes it is told by the rule of classes; twice in one list, by that of lists.
            if (!isFirst && known->second != family && !(isClass(known->second) && isClass(family))) {
                findings.add(
                    IN_SEVERAL_FAMILIES, flash,
                    fmt::format("{} stands in family {} already", quoted(flash.text), quoted(known->second)));
            }
        }
    }
}

void checkClasses(const Model& model, Findings& findings) {
    std::map<std::string, std::string_view> classes;
    for (const std::string_view name : CLASSES) {
        const Entry* const properties = model.spiEntry(std::string(name).append(PROPERTY_ENDING));
        const bool isFamily = isFlashFamily(model, name);
        if (properties != nullptr && !isFamily) {
            findings.add(CLASS_WITHOUT_FAMILY, properties->key,
                         fmt::format("never read: DEVICE_FAMILY does not list the class {}", quoted(name)));
        }
        const Entry* const devices = model.spiEntry(std::string(name).append(DEVICES_ENDING));
        for (std::size_t i = 0; devices != nullptr && i < devices->list().size(); ++i) {
            const Token& flash = devices->list()[i];
            if (flash.text.empty()) {
                continue;
            }
            // Classes are looked up without regard to case.
            const auto [known, isFirst] = classes.try_emplace(lowerCase(flash.text), name);
            if (!isFirst && known->second != name) {
                findings.add(
                    IN_SEVERAL_CLASSES, flash,
                    fmt::format("{} stands in class {} already", quoted(flash.text), quoted(known->second)));
            }
            if (!isFamily && !model.isFlashInAnyCase(std::string(flash.text))) {
                findings.add(UNKNOWN_IN_CLASS, flash,
                             fmt::format("no family of DEVICE_FAMILY has the flash {}{}", quoted(flash.text),
                                         findings.didYouMean(flash.text, model.flashNames())));
            }
        }
    }
}

void checkMultiboot(const Model& model, Findings& findings) {
    std::vector<std::string> candidates = model.flashNames();
    candidates.insert(candidates.end(), model.deviceNames().begin(), model.deviceNames().end());
    for (const std::string& key : multiboot::keys()) {
        const Entry* const entry = model.spiEntry(key);
        for (std::size_t i = 0; entry != nullptr && i < entry->list().size(); ++i) {
            const Token& token = entry->list()[i];
            const std::string name(token.text);
            if (!name.empty() && !model.isFlashInAnyCase(name) && model.deviceInAnyCase(name) == nullptr) {
                findings.add(UNKNOWN_IN_MULTIBOOT, token,
                             fmt::format("{} is neither a flash nor a device{}", quoted(name),
                                         findings.didYouMean(name, candidates)));
            }
        }
    }
}

void checkProperties(const Model& model, Findings& findings) {
    std::map<std::string, std::string_view> joined;
    for (const auto& [key, entry] : model.spi()->own.entries) {
        if (!key.ends_with(PROPERTY_ENDING) || entry.shape != Shape::RECORDS) {
            continue;
        }
        const std::string_view flash = key.substr(0, key.size() - PROPERTY_ENDING.size());
        for (const Record& record : entry.records) {
            const Token& name = record.fields.front();
            if (!isUpperCase(name.text)) {
                findings.add(PROPERTY_NOT_UPPER_CASE, name,
                             fmt::format("the property {} is never found", quoted(name.text)));
            }
            const auto [known, isFirst] = joined.try_emplace(std::string(flash).append(name.text), flash);
            if (!isFirst && known->second != flash) {
                findings.add(SAME_JOINED_NAME, name,
                             fmt::format("{} with {} is one with a property of {}", quoted(flash),
                                         quoted(name.text), quoted(known->second)));
            }
        }
    }
}

void check(const Model& model, Findings& findings) {
    if (model.spi() == nullptr) {
        return;
    }
    checkFamilies(model, findings);
    checkClasses(model, findings);
    checkMultiboot(model, findings);
    checkProperties(model, findings);
}

} // namespace

Group flashRules() {
    return {{&NAME_NOT_UPPER_CASE, &PROPERTY_NOT_UPPER_CASE, &NO_DEVICE_LIST, &CLASS_WITHOUT_FAMILY,
             &IN_SEVERAL_CLASSES, &UNKNOWN_IN_CLASS, &UNKNOWN_IN_MULTIBOOT, &IN_SEVERAL_FAMILIES,
             &SAME_JOINED_NAME},
            check};
}

} // namespace lint
