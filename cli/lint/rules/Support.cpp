// Rules about DEVICE_SUPPORTED and PROGRAM_OPTION_PACKAGE: a name without a table raises when it is asked for.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"

#include <algorithm>

namespace lint {

namespace {

constexpr Rule UNKNOWN_SUPPORTED{
    "B101",
    "unknown-supported",
    Severity::ERROR,
    "supported name that is neither family nor device",
    R"(DEVICE_SUPPORTED lists families and devices exactly as their file or header spells them, case included. Any
other name gets a table that stays empty. Flashes all belong to family "spi".)",
    "DEVICE_SUPPORTED = base,kestral",
    true};
constexpr Rule UNKNOWN_OPTION_OWNER{
    "B102",
    "unknown-option-owner",
    Severity::ERROR,
    "option table for a name that is neither family, device nor device with package",
    R"(PROGRAM_OPTION_PACKAGE lists families, devices, and devices with a package directly after them (KS50PQ208,
without "_"), case included. Any other name gets a table that stays empty.)",
    "PROGRAM_OPTION_PACKAGE = base,KS50_PQ208",
    true};
constexpr Rule UNKNOWN_PACKAGE{
    "B103",
    "unknown-package",
    Severity::ERROR,
    "option table for a package that the device does not have",
    "The device's property PACKAGES does not list the package, so the table is never used.",
    "PROGRAM_OPTION_PACKAGE = base,KS50PQ280",
    true};
constexpr Rule UNLISTED_FAMILY{
    "B104",
    "unlisted-family",
    Severity::ERROR,
    "file whose family no list names",
    R"(No list of base.acd names the family: asking about one of its devices raises OutOfRangeException, and no mode
accepts it. Name it in DEVICE_SUPPORTED, in PROGRAM_OPTION_PACKAGE and under its modes.)",
    "# a file sparrow.acd, and no \"sparrow\" in base.acd"};
constexpr Rule UNSUPPORTED_FAMILY{
    "B105",
    "unsupported-family",
    Severity::ERROR,
    "family missing from DEVICE_SUPPORTED",
    R"(A family without a table of operations raises OutOfRangeException when it is loaded and, with exceptions off,
offers nothing. List base and spi, too.)",
    "DEVICE_SUPPORTED = base,spi"};
constexpr Rule NO_OPTION_TABLE{
    "B106",
    "no-option-table",
    Severity::ERROR,
    "family or device missing from PROGRAM_OPTION_PACKAGE",
    R"(Every family, and every device of DEVICE_SUPPORTED, needs a table of options; one without raises
OutOfRangeException when it is loaded. List base and spi, too.)",
    "DEVICE_SUPPORTED       = base,kestrel\nPROGRAM_OPTION_PACKAGE = base"};

constexpr Rule PACKAGE_OF_SUPPORTED{
    "B107",
    "package-of-supported",
    Severity::ERROR,
    "option table for a package of a device of DEVICE_SUPPORTED",
    R"(The options of a device that DEVICE_SUPPORTED lists go to the table of the device alone. The table for the device
in a package stays empty, and an application that asks for the package gets no options.)",
    "DEVICE_SUPPORTED       = base,OS2000E,osprey\nPROGRAM_OPTION_PACKAGE = "
    "base,OS2000E,OS2000EFB900,osprey"};
constexpr Rule NO_TABLES{
    "B108",
    "no-tables",
    Severity::WARNING,
    "device of DEVICE_SUPPORTED without tables of its own",
    R"(The section has neither OPERATION nor BSDL_OPERATION, so the device has the operations of its family anyway, but it is
no longer found when its package follows after "_". Remove the name, or add the tables.)",
    "# while [KS50] has no OPERATION\nDEVICE_SUPPORTED = base,KS50,kestrel",
    true};

bool isKnown(const Model& model, std::string_view name) {
    // "spi" is a family of every database, even of one without flashes.
    return model.isFamily(name) || model.device(name) != nullptr || name == schema::SPI_FAMILY;
}

std::vector<std::string> familiesAndDevices(const Model& model) {
    std::vector<std::string> all = model.familyNames();
    all.insert(all.end(), model.deviceNames().begin(), model.deviceNames().end());
    return all;
}

bool hasOwnTables(const Device& device) {
    return device.section->find(schema::OPERATION) != nullptr ||
           device.section->find(schema::BSDL_OPERATION) != nullptr;
}

void checkSupported(const Model& model, Findings& findings) {
    const std::vector<std::string> candidates = familiesAndDevices(model);
    const std::vector<Token>& listed = model.baseKeys().list(schema::DEVICE_SUPPORTED);
    for (const Token& name : listed) {
        if (!name.text.empty() && !isKnown(model, name.text)) {
            const Suggestion suggestion = findings.suggest(name.text, candidates, listed);
            findings
                .addUnknown(UNKNOWN_SUPPORTED, name, name, suggestion, "{} is neither a family nor a device",
                            inQuotes(name.text))
                .reports = fact::inList(suggestion.name.value_or(""), schema::DEVICE_SUPPORTED);
        }
        const Device* const device = model.device(name.text);
        if (device != nullptr && !hasOwnTables(*device)) {
            findings
                .add(NO_TABLES, name, "the section of {} has neither OPERATION nor BSDL_OPERATION",
                     inQuotes(name.text))
                .reports = fact::inList(name.text, schema::DEVICE_SUPPORTED);
        }
    }
}

/// What a name is that may be a device with a package.
enum class Part {
    UNKNOWN,       ///< does not begin with the name of a device
    OTHER_PACKAGE, ///< the device is known and has other packages
    KNOWN,
};

/// @param found set to the device of a known part
Part partOf(const Model& model, std::string_view name, std::vector<std::string>& packages,
            std::string& found) {
    Part part = Part::UNKNOWN;
    for (std::size_t length = 1; length < name.size(); ++length) {
        const Device* const device = model.device(name.substr(0, length));
        if (device == nullptr || name[length] == '_') {
            continue;
        }
        const std::vector<Token> known = model.packages(*device);
        const std::string_view package = name.substr(length);
        // The packages of a device that lists none are unknown.
        if (known.empty() || std::any_of(known.begin(), known.end(),
                                         [package](const Token& token) { return token.text == package; })) {
            found = name.substr(0, length);
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
    const std::vector<std::string> candidates = familiesAndDevices(model);
    const std::vector<Token>& listed = model.baseKeys().list(schema::PROGRAM_OPTION_PACKAGE);
    for (const Token& name : listed) {
        if (name.text.empty() || isKnown(model, name.text)) {
            continue;
        }
        std::vector<std::string> packages;
        std::string device;
        Suggestion suggestion;
        switch (partOf(model, name.text, packages, device)) {
        case Part::UNKNOWN:
            suggestion = findings.suggest(name.text, candidates, listed);
            findings
                .addUnknown(UNKNOWN_OPTION_OWNER, name, name, suggestion,
                            "{} is neither a family nor a device, nor a device with a package",
                            inQuotes(name.text))
                .reports = fact::inList(suggestion.name.value_or(""), schema::PROGRAM_OPTION_PACKAGE);
            break;
        case Part::OTHER_PACKAGE:
            packages.insert(packages.end(), candidates.begin(), candidates.end());
            findings.addUnknown(UNKNOWN_PACKAGE, name, name, findings.suggest(name.text, packages, listed),
                                "no device has the package of {}", inQuotes(name.text));
            break;
        case Part::KNOWN:
            if (model.supported().contains(device)) {
                findings
                    .add(PACKAGE_OF_SUPPORTED, name, "the table of {} stays empty: DEVICE_SUPPORTED lists {}",
                         inQuotes(name.text), inQuotes(device))
                    .restsOn = fact::inList(device, schema::DEVICE_SUPPORTED);
            }
            break;
        }
    }
}

bool isUnderAMode(const Model& model, std::string_view family) {
    const std::vector<std::string>& modes = vocabulary::modes();
    return std::any_of(modes.begin(), modes.end(), [&](const std::string& mode) {
        const std::vector<Item>& items = model.baseKeys().items(mode);
        return items.size() > 1 && std::any_of(items[1].fields.begin(), items[1].fields.end(),
                                               [&](const Token& token) { return token.text == family; });
    });
}

/// Where to report a missing name: the list's key, or the start of base.acd when there is no list.
Token listKey(const Model& model, std::string_view key) {
    const Value* const value = model.baseKeys().find(key);
    return value == nullptr ? model.base()->start() : value->key;
}

/// Reports that a list lacks a name.
void addMissing(const Model& model, const Rule& rule, const char* list, std::string_view name,
                const std::string& text, Findings& findings) {
    Finding& finding = findings.addText(rule, listKey(model, list), text);
    finding.restsOn = fact::inList(name, list);
    finding.fix = listing(model, name, {list});
}

void checkTables(const Model& model, const std::string& family, Findings& findings) {
    const std::string lacks = fmt::format(" lacks the family {}", inQuotes(family));
    if (!model.supported().contains(family)) {
        addMissing(model, UNSUPPORTED_FAMILY, schema::DEVICE_SUPPORTED, family,
                   schema::DEVICE_SUPPORTED + lacks, findings);
    }
    if (!model.optionPackages().contains(family)) {
        addMissing(model, NO_OPTION_TABLE, schema::PROGRAM_OPTION_PACKAGE, family,
                   schema::PROGRAM_OPTION_PACKAGE + lacks, findings);
    }
}

/// The modes in which a family offers something.
std::vector<std::string> modesOf(const FamilyResults& results,
                                 const std::shared_ptr<const FamilyData>& family) {
    std::vector<std::string> modes;
    const auto result = results.find(family);
    for (std::size_t mode = 0; mode < vocabulary::modes().size(); ++mode) {
        if (result != results.end() && result->second.usedModes[mode]) {
            modes.push_back(vocabulary::modes()[mode]);
        }
    }
    return modes;
}

void checkFamilies(const Model& model, const FamilyResults& results, Findings& findings) {
    for (const auto& family : model.families()) {
        if (!model.supported().contains(family->name) && !model.optionPackages().contains(family->name) &&
            !isUnderAMode(model, family->name)) {
            findings
                .add(UNLISTED_FAMILY, family->start(), "no list of base.acd names the family {}",
                     inQuotes(family->name))
                .fix =
                listing(model, family->name, {schema::DEVICE_SUPPORTED, schema::PROGRAM_OPTION_PACKAGE},
                        modesOf(results, family));
        } else {
            checkTables(model, family->name, findings);
        }
    }
    // In SPI mode every device is looked up as spi, with or without flashes.
    if (model.spi() == nullptr && model.baseKeys().find(schema::SPI_MODE) != nullptr) {
        checkTables(model, std::string(schema::SPI_FAMILY), findings);
    }
    for (const std::string_view name : model.supported()) {
        const Device* const device = model.device(name);
        // A device without tables of its own does not belong into the list in the first place.
        if (device != nullptr && hasOwnTables(*device) && !model.optionPackages().contains(name)) {
            addMissing(
                model, NO_OPTION_TABLE, schema::PROGRAM_OPTION_PACKAGE, name,
                fmt::format("PROGRAM_OPTION_PACKAGE lacks {}, a device of DEVICE_SUPPORTED", inQuotes(name)),
                findings);
        }
    }
}

void check(const Model& model, const FamilyResults& results, Findings& findings) {
    if (model.base() == nullptr) {
        return;
    }
    checkSupported(model, findings);
    checkOptionOwners(model, findings);
    checkFamilies(model, results, findings);
}

} // namespace

RuleSet supportRules() {
    return {"lists of names with tables",
            {&UNKNOWN_SUPPORTED, &UNKNOWN_OPTION_OWNER, &UNKNOWN_PACKAGE, &UNLISTED_FAMILY,
             &UNSUPPORTED_FAMILY, &NO_OPTION_TABLE, &PACKAGE_OF_SUPPORTED, &NO_TABLES},
            nullptr,
            check};
}

} // namespace lint
