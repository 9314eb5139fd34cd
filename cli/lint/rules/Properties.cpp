// Rules about PROPERTY, PROPERTIES and the _PROPERTY keys of flashes: names, counts and values that go together.
#include "lint/Findings.h"
#include "lint/Keys.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>
#include <charconv>
#include <map>
#include <optional>
#include <set>
#include <utility>

namespace lint {

namespace {

constexpr Rule WRONG_COUNT{"P101", Level::ERROR, "count that is not the number of values",
                           "PROPERTIES holds name, count and as many values. Values beyond the count are "
                           "dropped silently; one that is missing "
                           "raises DataMismatchException, and the rest of the properties is never read.",
                           "PROPERTIES = PACKAGES,3,TQ100,TQ144"};
constexpr Rule NO_COUNT{
    "P102", Level::ERROR, "property without a count",
    "The second field of a PROPERTIES entry is the number of its values, in decimal digits. What is no "
    "number counts as 0, and all values are dropped.",
    "PROPERTIES = PACKAGES,TQ100,TQ144"};
constexpr Rule NO_VALUE{
    "P103", Level::ERROR, "property without a value",
    "A PROPERTY entry is a name and a value. A missing value raises DataMismatchException, and the rest "
    "of the properties is never read; of a flash it is the empty text.",
    "PROPERTY = VENDOR:KIND,FPGA"};
constexpr Rule SEVERAL_VALUES{
    "P104", Level::ERROR, "several values in PROPERTY",
    "A PROPERTY entry has one value; what stands behind it is never read. Entries stand between "
    "\":\"; several values go into PROPERTIES, with their count.",
    "PROPERTY = PACKAGES,TQ100,TQ144"};
constexpr Rule IN_BOTH_KEYS{
    "P105", Level::ERROR, "one name in PROPERTY and PROPERTIES",
    "Both keys share one set of names, and PROPERTIES is read last: the value in PROPERTY is "
    "lost.",
    "PROPERTY   = PACKAGES,TQ100\nPROPERTIES = PACKAGES,1,TQ144"};
constexpr Rule NAME_TWICE{"P106", Level::ERROR, "property given twice",
                          "Of two entries of one name in one key the last stands; the other is lost.",
                          "PROPERTY = VENDOR,Korvel:VENDOR,Orveth"};
constexpr Rule UNKNOWN_MODE_KEY{
    "P201", Level::ERROR, "unknown mode in the property of an operation",
    "A property that is named as an operation lists the keys of the modes that offer it: BS, "
    "SS, SM, BSFILE, DP770, SPI, KITECF, KITEMPM, PFF. Any other text is never asked for.",
    "PROPERTIES = PROGRAM,1,Bscan"};
constexpr Rule UNKNOWN_OPTION_VALUE{
    "P202", Level::ERROR, "unknown option in the property of an operation",
    "OP_ and an operation list the options that go with it, by their key names in upper "
    "case.",
    "PROPERTIES = OP_PROGRAM,1,VERFY"};
constexpr Rule UNKNOWN_OPERATION_NAME{
    "P203", Level::ERROR, "OP_ property that belongs to no operation",
    "Options are looked for under OP_ and an operation, or OP_, an operation, \"_\" and a "
    "mode key, in upper case. Any other name is never asked for.",
    "PROPERTIES = OP_PROGRM,1,VERIFY"};

constexpr Rule FLAG_NOT_UPPER_CASE{"P107", Level::WARNING, "flag not in upper case",
                                   "A flag is TRUE, exactly so: \"true\" counts as no. Only the properties "
                                   "of flashes in spi.acd are compared without regard to case.",
                                   "PROPERTY = FLASH,true"};

constexpr Rule HIDDEN_OPTIONS{"P204", Level::WARNING, "options for one mode that are never looked at",
                              "Where an operation has options for all modes, in OP_ and the operation, those "
                              "for a single mode are never looked at. Keep one or the other.",
                              "PROPERTIES = OP_PROGRAM,1,VERIFY:OP_PROGRAM_BS,1,ERASE"};

bool holds(const std::vector<std::string>& all, std::string_view text) {
    return std::find(all.begin(), all.end(), text) != all.end();
}

/// A decimal number as it may stand for a count; nothing when it is none.
std::optional<std::size_t> number(std::string_view text) {
    std::size_t value = 0;
    const auto [end, fault] = std::from_chars(text.data(), text.data() + text.size(), value);
    return fault == std::errc() && end == text.data() + text.size() ? std::optional(value) : std::nullopt;
}

void checkTwice(const Entry& entry, Findings& findings) {
    std::map<std::string_view, const AcdLines*> files;
    for (const Record& record : entry.records) {
        const Token& name = record.fields.front();
        const AcdLines*& file = files[name.text];
        // A layer on top may well append another value.
        if (std::exchange(file, name.place.file) == name.place.file && !name.text.empty()) {
            findings.add(NAME_TWICE, name,
                         fmt::format("what {} was given before is lost", quoted(name.text)));
        }
    }
}

void checkSingle(const Entry& entry, Findings& findings) {
    checkTwice(entry, findings);
    for (const Record& record : entry.records) {
        if (record.whole.text.empty()) {
            continue; // found as an empty item
        }
        if (record.fields.size() < 2) {
            findings.add(NO_VALUE, record.whole,
                         fmt::format("no value behind {}", quoted(record.whole.text)));
        } else if (record.fields.size() > 2) {
            findings.add(SEVERAL_VALUES, record.fields[2],
                         fmt::format("{} is never read: {} has one value", quoted(record.fields[2].text),
                                     quoted(record.fields[0].text)));
        }
    }
}

void checkCounted(const Entry& entry, Findings& findings) {
    checkTwice(entry, findings);
    for (const Record& record : entry.records) {
        const std::vector<Token>& fields = record.fields;
        if (record.whole.text.empty()) {
            continue; // found as an empty item
        }
        const std::optional<std::size_t> count = fields.size() < 2 ? std::nullopt : number(fields[1].text);
        if (!count) {
            findings.add(NO_COUNT, fields.size() < 2 ? record.whole : fields[1],
                         fmt::format("no number of values behind {}", quoted(fields[0].text)));
        } else if (*count != fields.size() - 2) {
            findings.add(WRONG_COUNT, fields[1],
                         fmt::format("{} says {} values and has {}", quoted(fields[0].text), *count,
                                     fields.size() - 2));
        }
    }
}

/// The operation that the name behind `OP_` stands for, with or without a mode key; nothing when it is none.
bool namesOperation(std::string_view name) {
    if (holds(vocabulary::operations(), name)) {
        return true;
    }
    const std::size_t cut = name.rfind('_');
    return cut != name.npos && holds(vocabulary::operations(), name.substr(0, cut)) &&
           holds(vocabulary::modes(), name.substr(cut + 1));
}

std::vector<std::string> optionPropertyNames() {
    std::vector<std::string> all;
    for (const std::string& operation : vocabulary::operations()) {
        all.push_back("OP_" + operation);
        for (const std::string& mode : vocabulary::modes()) {
            all.push_back("OP_" + operation + '_' + mode);
        }
    }
    return all;
}

/// Properties whose name has a meaning to the manager.
void checkMeaning(const Entry& entry, std::size_t firstValue, Findings& findings) {
    for (const Record& record : entry.records) {
        const Token& name = record.fields.front();
        const bool isOption = name.text.starts_with("OP_");
        if (isOption && !namesOperation(name.text.substr(3))) {
            findings.add(UNKNOWN_OPERATION_NAME, name,
                         fmt::format("{} belongs to no operation{}", quoted(name.text),
                                     findings.didYouMean(name.text, optionPropertyNames())));
        }
        if (!isOption && !holds(vocabulary::operations(), name.text)) {
            continue;
        }
        const std::vector<std::string>& known = isOption ? vocabulary::options() : vocabulary::modes();
        for (std::size_t i = firstValue; i < record.fields.size(); ++i) {
            const Token& value = record.fields[i];
            if (value.text.empty() || holds(known, value.text)) {
                continue;
            }
            // A text that records use for a mode is the likeliest mistake.
            const std::string hint = !isOption && sameWithoutCase(value.text, "Bscan")
                                         ? "; did you mean \"BS\"?"
                                         : findings.didYouMean(value.text, known);
            findings.add(
                isOption ? UNKNOWN_OPTION_VALUE : UNKNOWN_MODE_KEY, value,
                fmt::format("unknown {} {}{}", isOption ? "option" : "mode key", quoted(value.text), hint));
        }
    }
}

void checkBoth(const Entry& single, const Entry& counted, Findings& findings) {
    std::set<std::string_view> names;
    for (const Record& record : counted.records) {
        names.insert(record.fields.front().text);
    }
    for (const Record& record : single.records) {
        const Token& name = record.fields.front();
        if (!name.text.empty() && names.contains(name.text)) {
            findings.add(IN_BOTH_KEYS, name,
                         fmt::format("{} stands in PROPERTIES too, which counts", quoted(name.text)));
        }
    }
}

void checkFlags(const Entry& entry, std::size_t firstValue, Findings& findings) {
    for (const Record& record : entry.records) {
        for (std::size_t i = firstValue; i < record.fields.size(); ++i) {
            const Token& value = record.fields[i];
            for (const char* const flag : {"TRUE", "FALSE"}) {
                if (sameWithoutCase(value.text, flag) && value.text != flag) {
                    findings.add(
                        FLAG_NOT_UPPER_CASE, value,
                        fmt::format("{} is not {}: flags are compared with case", quoted(value.text), flag));
                }
            }
        }
    }
}

/// Has a property of these keys a value?
std::optional<bool> hasValue(const Section& section, std::string_view name) {
    std::optional<bool> found;
    for (const auto& [key, firstValue] : {std::pair("PROPERTY", 1U), std::pair("PROPERTIES", 2U)}) {
        const Entry* const entry = section.find(key);
        for (std::size_t i = 0; entry != nullptr && i < entry->records.size(); ++i) {
            const std::vector<Token>& fields = entry->records[i].fields;
            if (fields.front().text == name) {
                found = fields.size() > firstValue;
            }
        }
    }
    return found;
}

void checkHiddenOptions(const Entry& entry, const Section& section, const Section& family,
                        Findings& findings) {
    for (const Record& record : entry.records) {
        const Token& name = record.fields.front();
        const std::size_t cut = name.text.rfind('_');
        if (!name.text.starts_with("OP_") || cut < 3 || !namesOperation(name.text.substr(3)) ||
            holds(vocabulary::operations(), name.text.substr(3))) {
            continue;
        }
        const std::string_view forAllModes = name.text.substr(0, cut);
        if (hasValue(section, forAllModes).value_or(hasValue(family, forAllModes).value_or(false))) {
            findings.add(
                HIDDEN_OPTIONS, name,
                fmt::format("{} is never looked at: there is {}", quoted(name.text), quoted(forAllModes)));
        }
    }
}

void checkSection(const Section& section, const Section& family, Findings& findings) {
    const Entry* const single = section.find("PROPERTY");
    const Entry* const counted = section.find("PROPERTIES");
    if (single != nullptr) {
        checkSingle(*single, findings);
        checkMeaning(*single, 1, findings);
        checkFlags(*single, 1, findings);
        checkHiddenOptions(*single, section, family, findings);
    }
    if (counted != nullptr) {
        checkCounted(*counted, findings);
        checkMeaning(*counted, 2, findings);
        checkFlags(*counted, 2, findings);
        checkHiddenOptions(*counted, section, family, findings);
    }
    if (single != nullptr && counted != nullptr) {
        checkBoth(*single, *counted, findings);
    }
}

void check(const Model& model, Findings& findings) {
    for (const Family& family : model.families()) {
        checkSection(family.own, family.own, findings);
        for (const Section& device : family.devices) {
            checkSection(device, family.own, findings);
        }
    }
    if (model.spi() != nullptr) {
        for (const auto& [key, entry] : model.spi()->own.entries) {
            if (key.ends_with(PROPERTY_ENDING) && entry.shape == Shape::RECORDS) {
                checkSingle(entry, findings);
            }
        }
    }
}

} // namespace

Group propertyRules() {
    return {{&WRONG_COUNT, &NO_COUNT, &NO_VALUE, &SEVERAL_VALUES, &IN_BOTH_KEYS, &NAME_TWICE,
             &FLAG_NOT_UPPER_CASE, &UNKNOWN_MODE_KEY, &UNKNOWN_OPTION_VALUE, &UNKNOWN_OPERATION_NAME,
             &HIDDEN_OPTIONS},
            check};
}

} // namespace lint
