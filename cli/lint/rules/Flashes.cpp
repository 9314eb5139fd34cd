// Rules about spi.acd: names are looked up in upper case, and classes only if they are families, too.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Multiboot.h"
#include "text/Suggest.h"

#include <algorithm>
#include <map>
#include <set>

namespace lint {

namespace {

constexpr Rule NAME_NOT_UPPER_CASE{
    "S101",
    "flash-not-upper-case",
    Severity::ERROR,
    "flash not in upper case",
    R"(Flashes and their families are looked up in upper case, so a name with a lower-case letter is never found.)",
    "ST1_DEVICES = Tmf512K"};
constexpr Rule PROPERTY_NOT_UPPER_CASE{
    "S102",
    "flash-property-not-upper-case",
    Severity::ERROR,
    "property of a flash not in upper case",
    R"(Properties of flashes are looked up in upper case, so a name with a lower-case letter is never found.)",
    "ST1_PROPERTY = Vendor,Tamsel"};
constexpr Rule NO_DEVICE_LIST{
    "S103",
    "no-device-list",
    Severity::ERROR,
    "SPI family without devices",
    R"(DEVICE_FAMILY names a family that has no FAMILY_DEVICES, so no flash belongs to it.)",
    "DEVICE_FAMILY = ST1,ST9",
    true};
constexpr Rule CLASS_WITHOUT_FAMILY{
    "S104",
    "class-without-family",
    Severity::ERROR,
    "properties of a class that is not an SPI family",
    R"(The properties of a class are read only if DEVICE_FAMILY lists the class as a family. Otherwise its flashes do
not have them.)",
    "DEVICE_FAMILY = ST1\nAT1_PROPERTY = VENDOR,Orveth",
    true};
constexpr Rule IN_SEVERAL_CLASSES{
    "S105",
    "flash-in-several-classes",
    Severity::ERROR,
    "flash in several classes",
    R"(A flash in several classes has the properties of the last one in the order AT1, ST1, ST2, BPI1, BPI2, BPI3; the
others have no effect.)",
    "ST1_DEVICES = TMF1M\nST2_DEVICES = TMF1M"};
constexpr Rule UNKNOWN_IN_CLASS{
    "S106",
    "unknown-flash-in-class",
    Severity::ERROR,
    "unknown flash in a class",
    R"(The list of a class that is not an SPI family contains a flash that no family lists, so the manager does not know
the flash.)",
    "DEVICE_FAMILY = NV1\nST1_DEVICES = TMF1M",
    true};
constexpr Rule UNKNOWN_IN_MULTIBOOT{
    "S107",
    "unknown-in-multiboot",
    Severity::ERROR,
    "unknown device in a multiboot list",
    R"(The name is neither a flash nor a device of a family, in any case, so this entry has no effect.)",
    "TYPE_MB_SPI_NONE_LEAD = TMF3M",
    true};
constexpr Rule IN_SEVERAL_FAMILIES{
    "S108",
    "flash-in-several-families",
    Severity::WARNING,
    "flash in several SPI families",
    R"(One family is enough. Families that are no classes share nothing, so the second entry has no effect.)",
    "NV1_DEVICES = MRS1M\nNV2_DEVICES = MRS1M"};
constexpr Rule SAME_JOINED_NAME{
    "S109",
    "same-joined-name",
    Severity::ERROR,
    "two flash properties with one joined name",
    R"(Flash and property are joined without a separator, so AB with CD and ABC with D are the same property, and the
last value is used.)",
    "AB_PROPERTY = CD,1\nABC_PROPERTY = D,2"};

constexpr Rule NO_PROPERTIES{
    "S110",
    "flash-without-properties",
    Severity::WARNING,
    "flash without any properties",
    R"(The flash is in no class and has no _PROPERTY key, so each of its properties is the empty text, no and 0.)",
    "DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M",
    true};
constexpr Rule UNSHARED_PROPERTIES{
    "S111",
    "unshared-properties",
    Severity::WARNING,
    "properties of an SPI family that is not a class",
    R"(Only the classes AT1, ST1, ST2, BPI1, BPI2 and BPI3 share their properties with their flashes. Those of any other
family are found only under the family's own name.)",
    "DEVICE_FAMILY = NV1\nNV1_PROPERTY = VENDOR,Quillan"};

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
        findings.add(NAME_NOT_UPPER_CASE, name, "the flash {} is never found", inQuotes(name.text)).fix =
            replacing(name, upperCase(name.text));
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
        if (list.devices.empty()) {
            findings.add(NO_DEVICE_LIST, list.family, "the family {} has no {}_DEVICES", inQuotes(family),
                         family);
        }
        for (const Token& flash : list.devices) {
            checkCase(flash, findings);
            const auto [known, isFirst] = families.try_emplace(flash.text, family);
            // Two classes are reported by the rule of classes, twice in one list by the rule of lists.
            if (!isFirst && known->second != family &&
                !(schema::isFlashClass(known->second) && schema::isFlashClass(family))) {
                findings.add(IN_SEVERAL_FAMILIES, flash, "{} is already in family {}", inQuotes(flash.text),
                             inQuotes(known->second));
            }
        }
    }
}

void checkUnclassed(const Model& model, Findings& findings) {
    std::set<std::string> classed;
    for (const std::string_view name : schema::FLASH_CLASSES) {
        for (const Token& flash : model.spiKeys().list(schema::devicesKey(name))) {
            classed.insert(lowerCase(flash.text));
        }
    }
    for (const FlashList& list : model.flashFamilies()) {
        const Value* const shared = model.spiKeys().find(schema::propertyKey(list.family.text));
        if (!schema::isFlashClass(list.family.text) && shared != nullptr) {
            findings.add(UNSHARED_PROPERTIES, shared->key,
                         "the flashes of {} do not have these properties: it is not a class",
                         inQuotes(list.family.text));
        }
        for (const Token& flash : list.devices) {
            if (!flash.text.empty() && !classed.contains(lowerCase(flash.text)) &&
                model.spiKeys().find(schema::propertyKey(flash.text)) == nullptr) {
                const std::string key = schema::propertyKey(flash.text);
                findings
                    .add(NO_PROPERTIES, flash, "{} is in no class and has no {}", inQuotes(flash.text), key)
                    .restsOn = fact::key(key);
            }
        }
    }
}

void checkClasses(const Model& model, Findings& findings) {
    std::map<std::string, std::string_view> classes;
    for (const std::string_view name : schema::FLASH_CLASSES) {
        const Value* const properties = model.spiKeys().find(schema::propertyKey(name));
        const bool isFamily = isFlashFamily(model, name);
        if (properties != nullptr && !isFamily) {
            findings.add(CLASS_WITHOUT_FAMILY, properties->key,
                         "never read: DEVICE_FAMILY does not list the class {}", inQuotes(name));
        }
        const std::vector<Token>& listed = model.spiKeys().list(schema::devicesKey(name));
        for (const Token& flash : listed) {
            if (flash.text.empty()) {
                continue;
            }
            // Classes are searched in any case.
            const auto [known, isFirst] = classes.try_emplace(lowerCase(flash.text), name);
            if (!isFirst && known->second != name) {
                findings.add(IN_SEVERAL_CLASSES, flash, "{} is already in class {}", inQuotes(flash.text),
                             inQuotes(known->second));
            }
            if (!isFamily && !model.isFlashInAnyCase(std::string(flash.text))) {
                findings.addUnknown(UNKNOWN_IN_CLASS, flash, flash,
                                    findings.suggest(flash.text, model.flashNames(), listed),
                                    "no family of DEVICE_FAMILY has the flash {}", inQuotes(flash.text));
            }
        }
    }
}

void checkMultiboot(const Model& model, Findings& findings) {
    std::vector<std::string> candidates = model.flashNames();
    candidates.insert(candidates.end(), model.deviceNames().begin(), model.deviceNames().end());
    for (const std::string& key : multiboot::keys()) {
        const std::vector<Token>& listed = model.spiKeys().list(key);
        for (const Token& token : listed) {
            const std::string name(token.text);
            if (!name.empty() && !model.isFlashInAnyCase(name) && model.deviceInAnyCase(name) == nullptr) {
                findings.addUnknown(UNKNOWN_IN_MULTIBOOT, token, token,
                                    findings.suggest(name, candidates, listed),
                                    "{} is neither a flash nor a device", inQuotes(name));
            }
        }
    }
}

void checkProperties(const Model& model, Findings& findings) {
    std::map<std::string, std::string_view> joined;
    for (const auto& [key, value] : model.spiKeys().values) {
        if (!key.ends_with(schema::PROPERTY_SUFFIX)) {
            continue;
        }
        const std::string_view flash = key.substr(0, key.size() - schema::PROPERTY_SUFFIX.size());
        for (const Item& item : value.items) {
            const Token& name = item.fields.front();
            if (!isUpperCase(name.text)) {
                findings
                    .add(PROPERTY_NOT_UPPER_CASE, name, "the property {} is never found", inQuotes(name.text))
                    .fix = replacing(name, upperCase(name.text));
            }
            const auto [known, isFirst] = joined.try_emplace(std::string(flash).append(name.text), flash);
            if (!isFirst && known->second != flash) {
                findings.add(SAME_JOINED_NAME, name, "{} and {} make the same name as a property of {}",
                             inQuotes(flash), inQuotes(name.text), inQuotes(known->second));
            }
        }
    }
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    checkFamilies(model, findings);
    checkClasses(model, findings);
    checkUnclassed(model, findings);
    checkMultiboot(model, findings);
    checkProperties(model, findings);
}

} // namespace

RuleSet flashRules() {
    return {"flashes",
            {&NAME_NOT_UPPER_CASE, &PROPERTY_NOT_UPPER_CASE, &NO_DEVICE_LIST, &CLASS_WITHOUT_FAMILY,
             &IN_SEVERAL_CLASSES, &UNKNOWN_IN_CLASS, &UNKNOWN_IN_MULTIBOOT, &IN_SEVERAL_FAMILIES,
             &SAME_JOINED_NAME, &NO_PROPERTIES, &UNSHARED_PROPERTIES},
            nullptr,
            check};
}

} // namespace lint
