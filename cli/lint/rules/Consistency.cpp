// Rules about names and values that differ from all others of their kind: usually typing errors.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <algorithm>
#include <array>
#include <map>
#include <numeric>
#include <set>
#include <unordered_map>
#include <utility>

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
/// A name is common if that many sections use it, and rare up to the second number.
constexpr std::size_t MIN_COMMON = 5;
constexpr std::size_t MAX_RARE = 2;

/// Of names; a file full of different ones must not take forever.
constexpr std::size_t MAX_COMPARISONS = 5'000'000;

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

/// What property names are reported of; one for all part families, and one for the flashes.
struct Domain {
    const char* owners;
    std::vector<const PropertyUses*> families;
};

/// The uses of each property, with the number of the family in the domain.
using Uses = std::map<std::string_view, std::vector<std::pair<std::size_t, const PropertyUses::Property*>>>;

Uses usesOf(const Domain& domain) {
    Uses all;
    for (std::size_t i = 0; i < domain.families.size(); ++i) {
        for (const auto& [name, property] : domain.families[i]->properties) {
            all[name].emplace_back(i, &property);
        }
    }
    return all;
}

/// How many sections use a property.
std::size_t countSections(const Uses::mapped_type& uses) {
    return std::accumulate(uses.begin(), uses.end(), std::size_t{0}, [](std::size_t sum, const auto& use) {
        return sum + use.second->sections.size();
    });
}

/// Does a section of the domain use the name of `uses` together with another one?
bool isUsedWith(const Domain& domain, const Uses::mapped_type& uses, std::string_view other) {
    return std::any_of(uses.begin(), uses.end(), [&](const auto& use) {
        const auto& properties = domain.families[use.first]->properties;
        const auto found = properties.find(other);
        return found != properties.end() &&
               std::any_of(use.second->sections.begin(), use.second->sections.end(),
                           [&found](std::size_t section) {
                               return std::binary_search(found->second.sections.begin(),
                                                         found->second.sections.end(), section);
                           });
    });
}

/// The sections that have a misspelt name, each with the number of its family.
using Misspelt = std::set<std::pair<std::size_t, std::size_t>>;

Misspelt checkRareNames(const Domain& domain, const Uses& uses, Findings& findings) {
    std::map<std::string_view, std::size_t> sections;
    std::vector<std::string_view> common;
    for (const auto& [name, users] : uses) {
        sections.emplace(name, countSections(users));
        if (sections[name] >= MIN_COMMON) {
            common.push_back(name);
        }
    }
    Misspelt found;
    std::size_t comparisons = MAX_COMPARISONS;
    for (const auto& [name, users] : uses) {
        if (sections[name] > MAX_RARE || hasMeaning(name) || common.size() > comparisons) {
            continue;
        }
        comparisons -= common.size();
        const auto meant =
            std::find_if(common.begin(), common.end(), [&, &name = name, &users = users](auto other) {
                return isOneEdit(name, other) && !isUsedWith(domain, users, other);
            });
        if (meant == common.end()) {
            continue;
        }
        for (const auto& [family, property] : users) {
            for (const std::size_t section : property->sections) {
                found.emplace(family, section);
            }
            for (const Token* use : property->names) {
                findings
                    .add(RARE_NAME, *use, "{} is used {}, {} in {} {}; did you mean {}?", inQuotes(name),
                         sections[name] == 1 ? "once" : "twice", inQuotes(*meant), sections[*meant],
                         domain.owners, inQuotes(*meant))
                    .restsOn = fact::name(name);
            }
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

bool isFlag(std::string_view text) {
    return std::any_of(schema::FLAGS.begin(), schema::FLAGS.end(),
                       [text](const char* flag) { return sameWithoutCase(text, flag); });
}

struct ValueKind {
    const char* text;
    bool (*matches)(std::string_view);
};

constexpr std::array<ValueKind, 2> VALUE_KINDS{{{"a number", isNumber}, {"TRUE or FALSE", isFlag}}};

void checkValues(const Domain& domain, const Uses& uses, Findings& findings) {
    for (const auto& [name, users] : uses) {
        for (std::size_t kind = 0; kind < VALUE_KINDS.size(); ++kind) {
            std::size_t good = 0;
            std::vector<const Token*> others;
            for (const auto& [family, property] : users) {
                const PropertyUses::Kind& values = property->kinds[kind];
                good += values.matching;
                others.insert(others.end(), values.others.begin(), values.others.end());
            }
            // Of the other values at least four of five must be of the kind.
            if (good >= 4 && !others.empty() && good * 5 >= (good + others.size() - 1) * 4) {
                for (const Token* value : others) {
                    findings.add(UNUSUAL_VALUE, *value, "{} is not {}, as {} is in {} of {} {}",
                                 inQuotes(value->text), VALUE_KINDS[kind].text, name, good,
                                 good + others.size(), domain.owners);
                }
            }
        }
    }
}

/// Adds the properties of a section, or of a property key of flashes.
void addUses(const std::vector<Item>& items, std::size_t firstValue, std::size_t section,
             PropertyUses& uses) {
    for (const Item& item : items) {
        const std::vector<Token>& fields = item.fields;
        if (fields.front().text.empty()) {
            continue;
        }
        PropertyUses::Property& property = uses.properties[fields.front().text];
        property.names.push_back(&fields.front());
        if (property.sections.empty() || property.sections.back() != section) {
            property.sections.push_back(section);
        }
        for (std::size_t kind = 0; kind < VALUE_KINDS.size() && fields.size() == firstValue + 1; ++kind) {
            if (VALUE_KINDS[kind].matches(fields.back().text)) {
                ++property.kinds[kind].matching;
            } else {
                property.kinds[kind].others.push_back(&fields.back());
            }
        }
    }
}

/// A section that may lack a property.
struct Sibling {
    const Value* value; ///< where its properties are; null when it has none
    std::set<std::string_view> names;
    std::size_t section;
};

void findMissing(const std::vector<Sibling>& siblings, const std::set<std::string_view>& inherited,
                 PropertyUses& uses) {
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
            if (sibling.value != nullptr && !sibling.names.contains(name)) {
                uses.missing.push_back({name, &sibling.value->key, sibling.section, siblings.size()});
            }
        }
    }
}

/// Checks what was collected. A section with a misspelt name does not lack the name that was meant.
void checkUses(const Domain& domain, const char* siblings, Findings& findings) {
    const Uses uses = usesOf(domain);
    const Misspelt reported = checkRareNames(domain, uses, findings);
    checkValues(domain, uses, findings);
    for (std::size_t family = 0; family < domain.families.size(); ++family) {
        for (const PropertyUses::Missing& missing : domain.families[family]->missing) {
            if (!reported.contains({family, missing.section})) {
                findings.add(MISSING_PROPERTY, *missing.key, "{} is missing here; {} of {} {} have it",
                             inQuotes(missing.name), missing.siblings - 1, missing.siblings, siblings);
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

PropertyUses usesOfSections(const FamilyData& family) {
    PropertyUses uses;
    std::vector<Sibling> siblings;
    std::size_t number = 0;
    family.forEachSection([&](const Section& section) {
        for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
            addUses(section.items(key.key), key.firstValue, number, uses);
        }
        if (&section != &family.own) {
            const Value* const single = section.find(schema::PROPERTY);
            siblings.push_back(
                {single == nullptr ? section.find(schema::PROPERTIES) : single, namesOf(section), number});
        }
        ++number;
    });
    findMissing(siblings, namesOf(family.own), uses);
    return uses;
}

PropertyUses usesOfFlashes(const Section& spiKeys) {
    PropertyUses uses;
    std::map<std::string_view, std::size_t> numbers;
    for (const auto& [key, value] : spiKeys.values) {
        if (key.ends_with(schema::PROPERTY_SUFFIX)) {
            addUses(value.items, 1, numbers.emplace(key, numbers.size()).first->second, uses);
        }
    }
    for (const FlashList& family : flashLists(spiKeys)) {
        const auto names = [&spiKeys](std::string_view flash) {
            std::set<std::string_view> all;
            for (const Item& item : spiKeys.items(schema::propertyKey(flash))) {
                all.insert(item.fields.front().text);
            }
            return all;
        };
        std::vector<Sibling> siblings;
        for (const Token& flash : family.devices) {
            const std::string key = schema::propertyKey(flash.text);
            const auto number = numbers.find(key);
            siblings.push_back({spiKeys.find(key), names(flash.text),
                                number == numbers.end() ? numbers.size() : number->second});
        }
        const bool isClass = schema::isFlashClass(family.family.text);
        findMissing(siblings, isClass ? names(family.family.text) : std::set<std::string_view>(), uses);
    }
    return uses;
}

void checkFlashes(const FamilyData& spi, Findings& findings) {
    const PropertyUses uses = usesOfFlashes(spi.own);
    checkUses({"property keys", {&uses}}, "flashes of the family", findings);
}

void check(const Model& /*any*/, const FamilyResults& families, Findings& findings) {
    Domain domain{"sections", {}};
    for (const auto& [family, result] : families) {
        domain.families.push_back(&result.uses);
    }
    checkUses(domain, "devices of the family", findings);
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    result.uses = usesOfSections(family);
    if (family.kind == schema::File::SPI) {
        checkFlashes(family, result.findings);
    }
}

} // namespace

RuleSet consistencyRules() {
    return {"names and values unlike all others",
            {&RARE_NAME, &MISSING_PROPERTY, &UNUSUAL_VALUE},
            checkFamily,
            check};
}

} // namespace lint
