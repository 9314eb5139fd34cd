// Rules about names and values that differ from all others of their kind: usually typing errors.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <algorithm>
#include <map>
#include <set>

namespace lint {

namespace {

constexpr Rule RARE_NAME{
    "C101",
    "rare-property-name",
    Severity::WARNING,
    "property name that is nearly a common one",
    R"(The name is used once or twice and differs in one letter, in two exchanged letters or only in case from one that many
sections use. Nothing asks for a misspelt name. Names that occur together in a section, and names that differ in a digit,
are different on purpose.)",
    "[KS50]\nPROPERTY = PINNS,140"};
constexpr Rule MISSING_PROPERTY{
    "C102",
    "missing-property",
    Severity::WARNING,
    "property that only one device of the family lacks",
    R"(All other devices of the family, or flashes of the class, have the property, and the family has no value that the
device could inherit.)",
    "# while all other devices of the family have PINS\n[KS50]\nPROPERTY = CELLS,1152",
    true};
constexpr Rule UNUSUAL_VALUE{
    "C103",
    "unusual-value",
    Severity::WARNING,
    "value that is not a number or flag, as it is elsewhere",
    R"(At least four of five other values of the property are decimal numbers, or TRUE and FALSE. Applications read this one
as a number up to its first other character, or as a flag that is not set.)",
    "PROPERTY = PINS,14O"};
constexpr Rule CONFUSABLE_PACKAGE{
    "C104",
    "confusable-package",
    Severity::WARNING,
    "package that looks like a common one",
    R"(The name differs from a more common package only in O and 0, I and 1, S and 5 or B and 8.)",
    "PROPERTIES = PACKAGES,1,TQI00"};

/// A name is common if that many sections use it, and rare up to the second number.
constexpr std::size_t MIN_COMMON = 5;
constexpr std::size_t MAX_RARE = 2;

/// Of names; a file full of different ones must not take forever.
constexpr std::size_t MAX_COMPARISONS = 5'000'000;

/// One property of a section.
struct Use {
    const Token* name;
    const std::vector<Token>* fields;
    std::size_t firstValue;
    std::size_t section; ///< the number of the section
};

/// Uses of properties that follow the same conventions: all of part families, or all of flashes.
struct Domain {
    const char* owners;
    std::vector<Use> uses;

    void add(const std::vector<Item>& items, std::size_t firstValue, std::size_t section) {
        for (const Item& item : items) {
            if (!item.fields.front().text.empty()) {
                uses.push_back({&item.fields.front(), &item.fields, firstValue, section});
            }
        }
    }
};

bool isDigit(char byte) { return byte >= '0' && byte <= '9'; }

/// Do two names differ in one insertion, deletion or replacement, in two exchanged neighbours, or only in case?
/// Two digits are never exchanged by mistake: BANK0 and BANK1 are both right.
bool isOneEdit(std::string_view left, std::string_view right) {
    if (sameWithoutCase(left, right)) {
        return left != right;
    }
    if (left.size() > right.size()) {
        std::swap(left, right);
    }
    if (left.size() < 3 || right.size() - left.size() > 1) {
        return false;
    }
    const std::size_t same =
        static_cast<std::size_t>(std::mismatch(left.begin(), left.end(), right.begin()).first - left.begin());
    const std::string_view restLeft = left.substr(same);
    const std::string_view restRight = right.substr(same);
    if (left.size() < right.size()) {
        return restLeft == restRight.substr(1) && !isDigit(restRight.front());
    }
    if (restLeft.substr(1) == restRight.substr(1)) {
        return !isDigit(restLeft.front()) && !isDigit(restRight.front());
    }
    return restLeft.size() > 1 && restLeft[0] == restRight[1] && restLeft[1] == restRight[0] &&
           restLeft.substr(2) == restRight.substr(2);
}

bool hasMeaning(std::string_view name) {
    const std::vector<std::string>& operations = vocabulary::operations();
    return name.starts_with(schema::OPTIONS_PREFIX) ||
           std::find(operations.begin(), operations.end(), name) != operations.end();
}

/// @return the sections that have such a name
std::set<std::size_t> checkRareNames(const Domain& domain, Findings& findings) {
    // Sections come in the order of their numbers.
    std::map<std::string_view, std::vector<std::size_t>> sections;
    for (const Use& use : domain.uses) {
        std::vector<std::size_t>& users = sections[use.name->text];
        if (users.empty() || users.back() != use.section) {
            users.push_back(use.section);
        }
    }
    std::vector<std::string_view> common;
    for (const auto& [name, users] : sections) {
        if (users.size() >= MIN_COMMON) {
            common.push_back(name);
        }
    }
    std::map<std::string_view, std::string_view> rare;
    std::size_t comparisons = MAX_COMPARISONS;
    for (const auto& [name, users] : sections) {
        if (users.size() > MAX_RARE || hasMeaning(name) || common.size() > comparisons) {
            continue;
        }
        comparisons -= common.size();
        for (const std::string_view other : common) {
            if (!isOneEdit(name, other)) {
                continue;
            }
            const std::vector<std::size_t>& others = sections[other];
            if (std::none_of(users.begin(), users.end(), [&others](std::size_t section) {
                    return std::binary_search(others.begin(), others.end(), section);
                })) {
                rare.emplace(name, other);
            }
        }
    }
    std::set<std::size_t> found;
    for (const Use& use : domain.uses) {
        if (const auto meant = rare.find(use.name->text); meant != rare.end()) {
            found.insert(use.section);
            findings
                .add(RARE_NAME, *use.name, "{} is used {}, {} in {} {}; did you mean {}?",
                     inQuotes(use.name->text), sections[use.name->text].size() == 1 ? "once" : "twice",
                     inQuotes(meant->second), sections[meant->second].size(), domain.owners,
                     inQuotes(meant->second))
                .restsOn = fact::name(use.name->text);
        }
    }
    return found;
}

bool isNumber(std::string_view text) {
    if (!text.empty() && (text.front() == '-' || text.front() == '+')) {
        text.remove_prefix(1);
    }
    const std::size_t point = std::min(text.find('.'), text.size());
    const auto areDigits = [](std::string_view part) {
        return !part.empty() && std::all_of(part.begin(), part.end(), isDigit);
    };
    return areDigits(text.substr(0, point)) && (point == text.size() || areDigits(text.substr(point + 1)));
}

bool isFlag(std::string_view text) { return sameWithoutCase(text, "TRUE") || sameWithoutCase(text, "FALSE"); }

void checkValues(const Domain& domain, Findings& findings) {
    struct Kind {
        const char* text;
        bool (*matches)(std::string_view);
    };
    for (const Kind& kind : {Kind{"a number", isNumber}, Kind{"TRUE or FALSE", isFlag}}) {
        std::map<std::string_view, std::pair<std::size_t, std::vector<const Token*>>> found; ///< good, others
        for (const Use& use : domain.uses) {
            if (use.fields->size() == use.firstValue + 1) {
                const Token& value = (*use.fields)[use.firstValue];
                auto& [good, others] = found[use.name->text];
                if (kind.matches(value.text)) {
                    ++good;
                } else {
                    others.push_back(&value);
                }
            }
        }
        for (const auto& [name, counts] : found) {
            const auto& [good, others] = counts;
            // Of the other values at least four of five must be of the kind.
            if (good >= 4 && !others.empty() && good * 5 >= (good + others.size() - 1) * 4) {
                for (const Token* value : others) {
                    findings.add(UNUSUAL_VALUE, *value, "{} is not {}, as {} is in {} of {} {}",
                                 inQuotes(value->text), kind.text, name, good, good + others.size(),
                                 domain.owners);
                }
            }
        }
    }
}

/// A section that may lack a property.
struct Sibling {
    const Value* value; ///< where its properties are; null when it has none
    std::set<std::string_view> names;
    bool isReported; ///< for a misspelt name
};

void checkMissing(const std::vector<Sibling>& siblings, const std::set<std::string_view>& inherited,
                  const char* owners, Findings& findings) {
    if (siblings.size() < MIN_COMMON - 1) {
        return;
    }
    std::map<std::string_view, std::size_t> counts;
    for (const Sibling& sibling : siblings) {
        for (const std::string_view name : sibling.names) {
            ++counts[name];
        }
    }
    for (const auto& [name, count] : counts) {
        if (count + 1 != siblings.size() || inherited.contains(name) || hasMeaning(name)) {
            continue;
        }
        for (const Sibling& sibling : siblings) {
            if (sibling.value != nullptr && !sibling.isReported && !sibling.names.contains(name)) {
                findings.add(MISSING_PROPERTY, sibling.value->key, "{} is missing here; {} of {} {} have it",
                             inQuotes(name), count, siblings.size(), owners);
            }
        }
    }
}

std::set<std::string_view> namesOf(const Section& section) {
    std::set<std::string_view> names;
    for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
        for (const Item& item : section.items(key.key)) {
            names.insert(item.fields.front().text);
        }
    }
    return names;
}

void checkFamilies(const Model& model, Findings& findings) {
    Domain domain{"sections", {}};
    std::map<const Section*, std::size_t> numbers;
    for (const FamilyData& family : model.families()) {
        family.forEachSection([&](const Section& section) {
            const std::size_t number = numbers.emplace(&section, numbers.size()).first->second;
            for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
                domain.add(section.items(key.key), key.firstValue, number);
            }
        });
    }
    const std::set<std::size_t> reported = checkRareNames(domain, findings);
    checkValues(domain, findings);
    for (const FamilyData& family : model.families()) {
        std::vector<Sibling> siblings;
        for (const Section& device : family.devices) {
            const Value* const single = device.find(schema::PROPERTY);
            siblings.push_back({single == nullptr ? device.find(schema::PROPERTIES) : single, namesOf(device),
                                reported.contains(numbers[&device])});
        }
        checkMissing(siblings, namesOf(family.own), "devices of the family", findings);
    }
}

void checkFlashes(const Model& model, Findings& findings) {
    Domain domain{"property keys", {}};
    std::map<std::string_view, std::size_t> numbers;
    for (const auto& [key, value] : model.spiKeys().values) {
        if (key.ends_with(schema::PROPERTY_SUFFIX)) {
            domain.add(value.items, 1, numbers.emplace(key, numbers.size()).first->second);
        }
    }
    const std::set<std::size_t> reported = checkRareNames(domain, findings);
    checkValues(domain, findings);
    for (const FlashList& family : model.flashFamilies()) {
        const auto names = [&model](std::string_view flash) {
            std::set<std::string_view> all;
            for (const Item& item : model.spiKeys().items(schema::propertyKey(flash))) {
                all.insert(item.fields.front().text);
            }
            return all;
        };
        std::vector<Sibling> siblings;
        for (const Token& flash : family.devices) {
            const std::string key = schema::propertyKey(flash.text);
            const auto number = numbers.find(key);
            siblings.push_back({model.spiKeys().find(key), names(flash.text),
                                number != numbers.end() && reported.contains(number->second)});
        }
        const bool isClass = schema::isFlashClass(family.family.text);
        checkMissing(siblings, isClass ? names(family.family.text) : std::set<std::string_view>(),
                     "flashes of the family", findings);
    }
}

void checkPackages(const Model& model, Findings& findings) {
    const auto normalised = [](std::string_view package) {
        std::string text(package);
        constexpr std::string_view FROM = "OISB";
        constexpr std::string_view TO = "0158";
        for (char& byte : text) {
            const std::size_t at = FROM.find(byte);
            byte = at == FROM.npos ? byte : TO[at];
        }
        return text;
    };
    std::map<std::string, std::map<std::string_view, std::vector<const Token*>>> all;
    for (const FamilyData& family : model.families()) {
        family.forEachSection([&](const Section& section) {
            for (const Item& item : section.items(schema::PROPERTIES)) {
                for (std::size_t i = 2;
                     item.fields.front().text == schema::PACKAGES && i < item.fields.size(); ++i) {
                    all[normalised(item.fields[i].text)][item.fields[i].text].push_back(&item.fields[i]);
                }
            }
        });
    }
    for (const auto& [text, spellings] : all) {
        // Of two names that are equally common the one that is letters and then digits is right.
        const auto rank = [](const auto& spelling) {
            const std::string_view package = spelling.first;
            const std::size_t digits = std::min(package.find_first_of("0123456789"), package.size());
            const bool isRegular =
                std::all_of(package.begin() + static_cast<std::ptrdiff_t>(digits), package.end(), isDigit);
            return std::pair(spelling.second.size(), isRegular);
        };
        const auto common = std::max_element(
            spellings.begin(), spellings.end(),
            [&rank](const auto& left, const auto& right) { return rank(left) < rank(right); });
        for (const auto& spelling : spellings) {
            for (const Token* use : spelling.second) {
                if (rank(spelling) < rank(*common) && spelling.second.size() <= MAX_RARE) {
                    findings
                        .add(CONFUSABLE_PACKAGE, *use,
                             "{} looks like {}, which is listed {}; did you mean that?",
                             inQuotes(spelling.first), inQuotes(common->first),
                             common->second.size() == 1 ? std::string("once")
                                                        : fmt::format("{} times", common->second.size()))
                        .reports = common->first;
                }
            }
        }
    }
}

void check(const Model& model, Findings& findings) {
    checkFamilies(model, findings);
    checkFlashes(model, findings);
    checkPackages(model, findings);
}

} // namespace

RuleSet consistencyRules() {
    return {"names and values unlike all others",
            {&RARE_NAME, &MISSING_PROPERTY, &UNUSUAL_VALUE, &CONFUSABLE_PACKAGE},
            check};
}

} // namespace lint
