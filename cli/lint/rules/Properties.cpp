// Rules about PROPERTY, PROPERTIES and the _PROPERTY keys of flashes: names, counts and values.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Json.h"
#include "text/Suggest.h"

#include <algorithm>
#include <charconv>
#include <map>
#include <optional>
#include <set>
#include <utility>

namespace lint {

namespace {

constexpr Rule WRONG_COUNT{
    "P101",
    "wrong-count",
    Severity::ERROR,
    "count that is not the number of values",
    R"(PROPERTIES holds name, count and as many values. Values beyond the count are silently dropped; a missing value
raises DataMismatchException, and the rest of the properties is not read.)",
    "PROPERTIES = PACKAGES,3,TQ100,TQ144"};
constexpr Rule NO_COUNT{
    "P102",
    "no-count",
    Severity::ERROR,
    "property without a count",
    R"(The second field of a PROPERTIES entry is the number of its values, in decimal digits. Any other text is read as
0, and all values are dropped.)",
    "PROPERTIES = PACKAGES,TQ100,TQ144"};
constexpr Rule NO_VALUE{
    "P103",
    "no-value",
    Severity::ERROR,
    "property without a value",
    R"(A PROPERTY entry is a name and a value. A missing value raises DataMismatchException, and the rest of the
properties is not read; for a flash the value is the empty text.)",
    "PROPERTY = VENDOR:KIND,FPGA"};
constexpr Rule SEVERAL_VALUES{
    "P104",
    "several-values",
    Severity::ERROR,
    "several values in PROPERTY",
    R"(A PROPERTY entry has one value; further fields are not read. Entries are separated by ":"; several values go
into PROPERTIES, with their count.)",
    "PROPERTY = PACKAGES,TQ100,TQ144"};
constexpr Rule IN_BOTH_KEYS{
    "P105",
    "in-both-keys",
    Severity::ERROR,
    "one name in PROPERTY and PROPERTIES",
    "Both keys share one set of names, and PROPERTIES is read last: the value in PROPERTY is lost.",
    "PROPERTY   = PACKAGES,TQ100\nPROPERTIES = PACKAGES,1,TQ144"};
constexpr Rule NAME_TWICE{"P106",
                          "property-twice",
                          Severity::ERROR,
                          "property given twice",
                          "Of two entries with one name in one key the last is used; the other is lost.",
                          "PROPERTY = VENDOR,Korvel:VENDOR,Orveth"};
constexpr Rule FLAG_NOT_UPPER_CASE{
    "P107",
    "flag-not-upper-case",
    Severity::WARNING,
    "flag not in upper case",
    R"(A flag is set by exactly TRUE: "true" means no. Only the properties of flashes in spi.acd are compared in any
case.)",
    "PROPERTY = FLASH,true"};
constexpr Rule UNKNOWN_MODE_KEY{
    "P201",
    "unknown-mode-key",
    Severity::ERROR,
    "unknown mode in the property of an operation",
    R"(A property with the name of an operation lists the keys of the modes that offer it: BS, SS, SM, BSFILE, DP770,
SPI, KITECF, KITEMPM, PFF. Applications never ask for any other text.)",
    "PROPERTIES = PROGRAM,1,Bscan"};
constexpr Rule UNKNOWN_OPTION_VALUE{
    "P202",
    "unknown-option-value",
    Severity::ERROR,
    "unknown option in the property of an operation",
    R"(OP_ and an operation list the options of that operation, by their key names in upper case.)",
    "PROPERTIES = OP_PROGRAM,1,VERFY"};
constexpr Rule UNKNOWN_OPERATION_NAME{
    "P203",
    "unknown-operation-name",
    Severity::ERROR,
    "OP_ property that belongs to no operation",
    R"(Options are looked up under OP_ and an operation, or OP_, an operation, "_" and a mode key, in upper case. Any
other name is never looked up.)",
    "PROPERTIES = OP_PROGRM,1,VERIFY"};
constexpr Rule HIDDEN_OPTIONS{
    "P204",
    "hidden-options",
    Severity::WARNING,
    "options for one mode that are never looked at",
    R"(If an operation has options for all modes, in OP_ and the operation, those for a single mode are never looked
at. Keep one of them.)",
    "PROPERTIES = OP_PROGRAM,1,VERIFY:OP_PROGRAM_BS,1,ERASE"};

bool contains(const std::vector<std::string>& all, std::string_view text) {
    return std::find(all.begin(), all.end(), text) != all.end();
}

/// The count of values; nothing when the text is no decimal number.
std::optional<std::size_t> number(std::string_view text) {
    std::size_t value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    return error == std::errc() && end == text.data() + text.size() ? std::optional(value) : std::nullopt;
}

void checkTwice(const std::vector<Item>& items, Findings& findings) {
    std::map<std::string_view, const AcdLines*> files;
    for (const Item& item : items) {
        const Token& name = item.fields.front();
        const AcdLines*& file = files[name.text];
        // A layer on top may append another value on purpose.
        if (std::exchange(file, name.location.file) == name.location.file && !name.text.empty()) {
            findings.add(NAME_TWICE, name, "the former value of {} is lost", inQuotes(name.text));
        }
    }
}

void checkSingle(const Item& item, Findings& findings) {
    if (item.fields.size() < 2) {
        findings.add(NO_VALUE, item.whole, "no value after {}", inQuotes(item.whole.text));
    } else if (item.fields.size() > 2) {
        findings.add(SEVERAL_VALUES, item.fields[2], "{} is never read: {} has one value",
                     inQuotes(item.fields[2].text), inQuotes(item.fields[0].text));
    }
}

void checkCounted(const Item& item, Findings& findings) {
    const std::vector<Token>& fields = item.fields;
    const std::optional<std::size_t> count = fields.size() < 2 ? std::nullopt : number(fields[1].text);
    if (!count) {
        Finding& finding = findings.add(NO_COUNT, fields.size() < 2 ? item.whole : fields[1],
                                        "no number of values after {}", inQuotes(fields[0].text));
        if (fields.size() > 1) {
            finding.fix = insertingBefore(fields[1], fmt::format("{},", fields.size() - 1));
        }
    } else if (*count != fields.size() - 2) {
        findings
            .add(WRONG_COUNT, fields[1], "{} says {} values and has {}", inQuotes(fields[0].text), *count,
                 fields.size() - 2)
            .fix = replacing(fields[1], std::to_string(fields.size() - 2));
    }
}

/// Does the name after `OP_` belong to an operation, with or without a mode key?
bool namesOperation(std::string_view name) {
    if (contains(vocabulary::operations(), name)) {
        return true;
    }
    const std::size_t cut = name.rfind('_');
    return cut != name.npos && contains(vocabulary::operations(), name.substr(0, cut)) &&
           contains(vocabulary::modes(), name.substr(cut + 1));
}

std::vector<std::string> optionPropertyNames() {
    std::vector<std::string> all;
    for (const std::string& operation : vocabulary::operations()) {
        all.push_back(std::string(schema::OPTIONS_PREFIX).append(operation));
        for (const std::string& mode : vocabulary::modes()) {
            all.push_back(fmt::format("{}{}_{}", schema::OPTIONS_PREFIX, operation, mode));
        }
    }
    return all;
}

/// Checks the properties whose name has a meaning for the manager.
void checkMeaning(const Item& item, std::size_t firstValue, const std::set<std::string_view>& names,
                  Findings& findings) {
    const Token& name = item.fields.front();
    const bool isOption = name.text.starts_with(schema::OPTIONS_PREFIX);
    const std::string upper = upperCase(name.text);
    const bool isUpperOption = upper.starts_with(schema::OPTIONS_PREFIX) &&
                               namesOperation(std::string_view(upper).substr(schema::OPTIONS_PREFIX.size()));
    if (isOption ? name.text != upper || !isUpperOption : isUpperOption) {
        findings
            .addUnknown(
                UNKNOWN_OPERATION_NAME, name, name,
                findings.suggest(name.text, optionPropertyNames(),
                                 [&names](const std::string& other) { return names.contains(other); }),
                "{} belongs to no operation", inQuotes(name.text))
            .reports = fact::name(name.text);
    }
    if (!isOption && !contains(vocabulary::operations(), name.text)) {
        return;
    }
    const std::vector<std::string>& known = isOption ? vocabulary::options() : vocabulary::modes();
    for (std::size_t i = firstValue; i < item.fields.size(); ++i) {
        const Token& value = item.fields[i];
        if (value.text.empty() || contains(known, value.text)) {
            continue;
        }
        // The word that records use for a mode is the likeliest mistake.
        const Suggestion suggestion = !isOption && sameWithoutCase(value.text, schema::BOUNDARY_SCAN)
                                          ? Suggestion{"BS", true}
                                          : findings.suggest(value.text, known, item.fields);
        findings.addUnknown(isOption ? UNKNOWN_OPTION_VALUE : UNKNOWN_MODE_KEY, value, value, suggestion,
                            "unknown {} {}", isOption ? "option" : "mode key", inQuotes(value.text));
    }
}

void checkFlags(const Item& item, std::size_t firstValue, Findings& findings) {
    for (std::size_t i = firstValue; i < item.fields.size(); ++i) {
        const Token& value = item.fields[i];
        for (const char* const flag : schema::FLAGS) {
            if (sameWithoutCase(value.text, flag) && value.text != flag) {
                findings
                    .add(FLAG_NOT_UPPER_CASE, value, "{} is not {}: flags are compared with case",
                         inQuotes(value.text), flag)
                    .fix = replacing(value, flag);
            }
        }
    }
}

/// Does a property have a value? Nothing when the section does not give it.
std::optional<bool> hasValue(const Section& section, std::string_view name) {
    std::optional<bool> found;
    for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
        for (const Item& item : section.items(key.key)) {
            if (item.fields.front().text == name) {
                found = item.fields.size() > key.firstValue;
            }
        }
    }
    return found;
}

void checkHiddenOptions(const Item& item, const Section& section, const Section& family, Findings& findings) {
    const Token& name = item.fields.front();
    const std::size_t cut = name.text.rfind('_');
    if (!name.text.starts_with(schema::OPTIONS_PREFIX) || cut < schema::OPTIONS_PREFIX.size() ||
        !namesOperation(name.text.substr(schema::OPTIONS_PREFIX.size())) ||
        contains(vocabulary::operations(), name.text.substr(schema::OPTIONS_PREFIX.size()))) {
        return;
    }
    const std::string_view forAllModes = name.text.substr(0, cut);
    if (hasValue(section, forAllModes).value_or(hasValue(family, forAllModes).value_or(false))) {
        findings.add(HIDDEN_OPTIONS, name, "{} is never looked at: there is {}", inQuotes(name.text),
                     inQuotes(forAllModes));
    }
}

void checkBothKeys(const Section& section, Findings& findings) {
    std::map<std::string_view, const AcdLines*> files;
    for (const Item& item : section.items(schema::PROPERTIES)) {
        files.insert_or_assign(item.fields.front().text, item.whole.location.file);
    }
    for (const Item& item : section.items(schema::PROPERTY)) {
        const Token& name = item.fields.front();
        // A layer on top may replace a single value by a list on purpose.
        const auto known = files.find(name.text);
        if (!name.text.empty() && known != files.end() && known->second == name.location.file) {
            findings.add(IN_BOTH_KEYS, name, "{} is in PROPERTIES too, whose value is used",
                         inQuotes(name.text));
        }
    }
}

void checkSection(const Section& section, const Section& family, Findings& findings) {
    std::set<std::string_view> names;
    for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
        for (const Item& item : section.items(key.key)) {
            names.insert(item.fields.front().text);
        }
    }
    for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
        checkTwice(section.items(key.key), findings);
        for (const Item& item : section.items(key.key)) {
            if (item.whole.text.empty()) {
                continue; // found as an empty item
            }
            if (std::string_view(key.key) == schema::PROPERTY) {
                checkSingle(item, findings);
            } else {
                checkCounted(item, findings);
            }
            checkMeaning(item, key.firstValue, names, findings);
            checkFlags(item, key.firstValue, findings);
            checkHiddenOptions(item, section, family, findings);
        }
    }
    checkBothKeys(section, findings);
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    Findings& findings = result.findings;
    family.forEachSection([&](const Section& section) { checkSection(section, family.own, findings); });
    for (const auto& [key, value] : family.own.values) {
        if (family.kind != schema::File::SPI || !key.ends_with(schema::PROPERTY_SUFFIX)) {
            continue;
        }
        checkTwice(value.items, findings);
        for (const Item& item : value.items) {
            if (!item.whole.text.empty()) {
                checkSingle(item, findings);
            }
        }
    }
}

} // namespace

RuleSet propertyRules() {
    return {"properties",
            {&WRONG_COUNT, &NO_COUNT, &NO_VALUE, &SEVERAL_VALUES, &IN_BOTH_KEYS, &NAME_TWICE,
             &FLAG_NOT_UPPER_CASE, &UNKNOWN_MODE_KEY, &UNKNOWN_OPTION_VALUE, &UNKNOWN_OPERATION_NAME,
             &HIDDEN_OPTIONS},
            checkFamily,
            nullptr};
}

} // namespace lint
