// Rules about DEVICE_SUPPORTED and PROGRAM_OPTION_PACKAGE: what has no table raises when it is asked about.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

constexpr Rule UNKNOWN_SUPPORTED{"B101", Level::ERROR, "supported name that is neither family nor device",
                                 "DEVICE_SUPPORTED lists families and devices exactly as their file or "
                                 "header spells them, case included. Any other "
                                 "name gets a table that stays empty. Flashes are all of family \"spi\".",
                                 "DEVICE_SUPPORTED = base,kestral"};
constexpr Rule UNKNOWN_OPTION_OWNER{
    "B102", Level::ERROR, "option table for a name that is neither family, device nor device with package",
    "PROGRAM_OPTION_PACKAGE lists families, devices, and devices with a package written right behind "
    "(KS50PQ208, without "
    "\"_\"), case included. Any other name gets a table that stays empty.",
    "PROGRAM_OPTION_PACKAGE = base,KS50_PQ208"};
constexpr Rule UNKNOWN_PACKAGE{
    "B103", Level::ERROR, "option table for a package that the device does not have",
    "The package behind the device is none that its property PACKAGES lists, so nobody asks "
    "for this table.",
    "PROGRAM_OPTION_PACKAGE = base,KS50PQ280"};
constexpr Rule FAMILY_NOT_LISTED{
    "B104", Level::ERROR, "file whose family no list names",
    "No list of base.acd names the family: asking about one of its devices raises OutOfRangeException, and "
    "no mode takes "
    "it. Name it in DEVICE_SUPPORTED, in PROGRAM_OPTION_PACKAGE and under its modes.",
    "# a file sparrow.acd, and no \"sparrow\" in base.acd"};
constexpr Rule FAMILY_NOT_SUPPORTED{
    "B105", Level::ERROR, "family missing from DEVICE_SUPPORTED",
    "A family without a table of operations raises OutOfRangeException when it is loaded "
    "and, with exceptions off, offers nothing. base and spi must be listed too.",
    "DEVICE_SUPPORTED = base,spi"};
constexpr Rule NO_OPTION_TABLE{
    "B106", Level::ERROR, "family or device missing from PROGRAM_OPTION_PACKAGE",
    "Every family, and every device of DEVICE_SUPPORTED, needs a table of options; one without raises "
    "OutOfRangeException when it is loaded. base and spi must be listed too.",
    "DEVICE_SUPPORTED       = base,kestrel\nPROGRAM_OPTION_PACKAGE = base"};

bool isKnown(const Model& model, std::string_view name) {
    return model.isFamily(name) || model.device(name) != nullptr;
}

std::vector<std::string> familiesAndDevices(const Model& model) {
    std::vector<std::string> all = model.familyNames();
    all.insert(all.end(), model.deviceNames().begin(), model.deviceNames().end());
    return all;
}

void checkSupported(const Model& model, Findings& findings) {
    const Entry* const entry = model.baseEntry("DEVICE_SUPPORTED");
    const std::vector<std::string> candidates = familiesAndDevices(model);
    for (std::size_t i = 0; entry != nullptr && i < entry->list().size(); ++i) {
        const Token& name = entry->list()[i];
        if (!name.text.empty() && !isKnown(model, name.text)) {
            findings.add(UNKNOWN_SUPPORTED, name,
                         fmt::format("{} is neither a family nor a device{}", quoted(name.text),
                                     findings.didYouMean(name.text, candidates)));
        }
    }
}

/// What is known of a name that may be a device with a package.
enum class Part {
    UNKNOWN,       ///< begins with no device's name
    OTHER_PACKAGE, ///< the device is known and has other packages
    KNOWN,
};

Part partOf(const Model& model, std::string_view name, std::vector<std::string>& packages) {
    Part part = Part::UNKNOWN;
    for (std::size_t length = 1; length < name.size(); ++length) {
        const Device* const device = model.device(name.substr(0, length));
        if (device == nullptr || name[length] == '_') {
            continue;
        }
        const std::vector<Token> known = model.packages(*device);
        const std::string_view package = name.substr(length);
        // Of a device that lists no packages nothing can be said.
        if (known.empty() || std::any_of(known.begin(), known.end(),
                                         [package](const Token& token) { return token.text == package; })) {
            return Part::KNOWN;
        }
        part = Part::OTHER_PACKAGE;
        for (const Token& token : known) {
            packages.push_back(std::string(name.substr(0, length)).append(token.text));
        }
    }
    return part;
}

void checkOptionOwners(const Model& model, Findings& findings) {
    const Entry* const entry = model.baseEntry("PROGRAM_OPTION_PACKAGE");
    const std::vector<std::string> candidates = familiesAndDevices(model);
    for (std::size_t i = 0; entry != nullptr && i < entry->list().size(); ++i) {
        const Token& name = entry->list()[i];
        if (name.text.empty() || isKnown(model, name.text)) {
            continue;
        }
        std::vector<std::string> packages;
        switch (partOf(model, name.text, packages)) {
        case Part::UNKNOWN:
            findings.add(UNKNOWN_OPTION_OWNER, name,
                         fmt::format("{} is neither a family nor a device, nor a device with a package{}",
                                     quoted(name.text), findings.didYouMean(name.text, candidates)));
            break;
        case Part::OTHER_PACKAGE: {
            packages.insert(packages.end(), candidates.begin(), candidates.end());
            findings.add(UNKNOWN_PACKAGE, name,
                         fmt::format("no device has the package of {}{}", quoted(name.text),
                                     findings.didYouMean(name.text, packages)));
            break;
        }
        case Part::KNOWN:
            break;
        }
    }
}

bool isUnderAMode(const Model& model, std::string_view family) {
    for (const auto& [key, entry] : model.base()->own.entries) {
        if (key == "IDCODE" || entry.shape != Shape::RECORDS || entry.records.size() < 2) {
            continue;
        }
        const std::vector<Token>& families = entry.records[1].fields;
        if (std::any_of(families.begin(), families.end(),
                        [family](const Token& token) { return token.text == family; })) {
            return true;
        }
    }
    return false;
}

/// Where a missing name belongs: the list's key, or the start of base.acd where there is no list.
Token listPlace(const Model& model, std::string_view key) {
    const Entry* const entry = model.baseEntry(key);
    return entry == nullptr ? model.base()->place() : entry->key;
}

void checkFamilies(const Model& model, Findings& findings) {
    for (const Family& family : model.families()) {
        const bool isSupported = model.supported().contains(family.name);
        const bool hasOptions = model.optionPackages().contains(family.name);
        if (!isSupported && !hasOptions && !isUnderAMode(model, family.name)) {
            findings.add(FAMILY_NOT_LISTED, family.place(),
                         fmt::format("no list of base.acd names the family {}", quoted(family.name)));
            continue;
        }
        if (!isSupported) {
            findings.add(FAMILY_NOT_SUPPORTED, listPlace(model, "DEVICE_SUPPORTED"),
                         fmt::format("DEVICE_SUPPORTED lacks the family {}", quoted(family.name)));
        }
        if (!hasOptions) {
            findings.add(NO_OPTION_TABLE, listPlace(model, "PROGRAM_OPTION_PACKAGE"),
                         fmt::format("PROGRAM_OPTION_PACKAGE lacks the family {}", quoted(family.name)));
        }
    }
    for (const std::string_view name : model.supported()) {
        if (model.device(name) != nullptr && !model.optionPackages().contains(name)) {
            findings.add(
                NO_OPTION_TABLE, listPlace(model, "PROGRAM_OPTION_PACKAGE"),
                fmt::format("PROGRAM_OPTION_PACKAGE lacks {}, a device of DEVICE_SUPPORTED", quoted(name)));
        }
    }
}

void check(const Model& model, Findings& findings) {
    if (model.base() == nullptr) {
        return;
    }
    checkSupported(model, findings);
    checkOptionOwners(model, findings);
    checkFamilies(model, findings);
}

} // namespace

Group supportRules() {
    return {{&UNKNOWN_SUPPORTED, &UNKNOWN_OPTION_OWNER, &UNKNOWN_PACKAGE, &FAMILY_NOT_LISTED,
             &FAMILY_NOT_SUPPORTED, &NO_OPTION_TABLE},
            check};
}

} // namespace lint
