// Rules about mode lists, tables and properties that contradict each other, or that cannot be reached.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <AcdText.h>
#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <bitset>
#include <map>
#include <optional>
#include <set>

namespace lint {

namespace {

using TARVIKNS::MODE_TYPE;

constexpr Rule NO_MODE_KEY{
    "M105",
    "no-mode-key",
    Severity::ERROR,
    "mode that is used but has no key",
    R"(Tables or properties use the mode, but base.acd does not have its key: no output and no family is accepted in that
mode.)",
    "# base.acd has BS but not SM, while kestrel.acd has\nOPERATION = PROGRAM,Smap,USB2"};
constexpr Rule IDLE_FAMILY{
    "M106",
    "idle-family",
    Severity::WARNING,
    "family under a mode in which it offers nothing",
    R"(The mode accepts the family, but neither its tables nor its properties offer anything in the mode. In SPI mode all
devices are looked up as "spi", so only spi has tables there.)",
    "# while kestrel.acd has no record with SSerial\nSS = outputs,USB2:families,kestrel",
    true};
constexpr Rule PART_OUT_OF_MODE{
    "M205",
    "part-out-of-mode",
    Severity::WARNING,
    "part excluded from a mode that does not accept its family",
    R"(The mode's key does not list the family of the device, so the mode refuses the part anyway. Perhaps another mode was
meant.)",
    "DP770 = outputs,USB2:families,pipit\nNOT_SUPPORTED_PART_IN_MODE = DP770_KS50_TQ144"};
constexpr Rule OFFERED_OUT_OF_MODE{
    "P205",
    "offered-out-of-mode",
    Severity::WARNING,
    "operation offered in a mode that does not list the family",
    R"(The property offers the operation in a mode whose key in base.acd does not list the family: an application that asks
whether the device can be configured in the mode gets no, and one that asks for the operation gets yes.)",
    "# while base.acd has no kestrel under SS\nPROPERTIES = PROGRAM,2,BS,SS"};
constexpr Rule PROPERTY_WITHOUT_RECORD{
    "P206",
    "property-without-record",
    Severity::WARNING,
    "operation offered by a property but by no record",
    R"(The property offers the operation in the mode, but OPERATION has no record for it: an application that asks with an
output gets no, and one that asks without gets yes. Kite and PFF modes have no records.)",
    "OPERATION  = VERIFY,Bscan,USB2\nPROPERTIES = VERIFY,2,BS,SM",
    true};
constexpr Rule RECORD_WITHOUT_PROPERTY{
    "P207",
    "record-without-property",
    Severity::WARNING,
    "operation offered by a record but by no property",
    R"(OPERATION has a record for the operation and the mode, but the property of that name does not list the mode: an
application that asks with an output gets yes, and one that asks without gets no. Families without any such property
are not checked.)",
    "OPERATION  = VERIFY,Bscan,USB2:VERIFY,Smap,USB2\nPROPERTIES = VERIFY,1,BS",
    true};
constexpr Rule OPTION_WITHOUT_RECORD{
    "P208",
    "option-without-record",
    Severity::WARNING,
    "option of an operation that no table allows",
    R"(OP_ and an operation list an option, but PROGRAM_OPTION has no record for it in this mode, or in any mode of the
operation.)",
    "PROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTIES     = PROGRAM,1,BS:OP_PROGRAM_BS,2,VERIFY,ERASE",
    true};
constexpr Rule UNREACHABLE_OPTIONS{
    "P209",
    "unreachable-options",
    Severity::ERROR,
    "options of an operation that is not offered",
    R"(Options are given only in the modes that the property of their operation lists; here it does not list the mode, or
it does not exist, so these options are never given.)",
    "PROPERTIES = PROGRAM,1,BS:OP_PROGRAM_SM,1,VERIFY",
    true};

/// How many modes have cells in the tables.
constexpr std::size_t TABLE_MODES = static_cast<std::size_t>(MODE_TYPE::SPI) + 1;

std::optional<std::size_t> position(const std::vector<std::string>& all, std::string_view text) {
    const auto found = std::find(all.begin(), all.end(), text);
    return found == all.end() ? std::nullopt : std::optional(static_cast<std::size_t>(found - all.begin()));
}

bool isOperation(std::string_view name) {
    static const std::set<std::string_view> all(vocabulary::operations().begin(),
                                                vocabulary::operations().end());
    return all.contains(name);
}

/// Which words of a table have a record in which modes.
struct Table {
    std::map<std::string, Modes> modes;                             ///< by operation or option
    std::map<std::pair<std::string, std::size_t>, Token> locations; ///< of the first record of word and mode

    Table() = default;
    explicit Table(const std::vector<Item>& records) {
        for (const Item& record : records) {
            if (record.fields.size() < 3) {
                continue;
            }
            const std::string mode(record.fields[1].text);
            const auto value = static_cast<std::size_t>(ConstraintsManager::modeString2Type(mode.c_str()));
            std::string word = upperCase(record.fields[0].text);
            modes[word].set(value);
            locations.try_emplace({std::move(word), value}, record.fields[0]);
        }
    }

    [[nodiscard]] Modes of(const std::string& word) const {
        const auto found = modes.find(word);
        return found == modes.end() ? Modes() : found->second;
    }
};

/// The values of the properties of a section by name.
struct PropertyValues {
    std::map<std::string_view, std::vector<Token>> values;

    PropertyValues() = default;
    explicit PropertyValues(const Section& section) {
        for (const schema::PropertyKey key : schema::PROPERTY_KEYS) {
            for (const Item& item : section.items(key.key)) {
                const auto first = static_cast<std::ptrdiff_t>(std::min(key.firstValue, item.fields.size()));
                values.insert_or_assign(item.fields.front().text,
                                        std::vector<Token>(item.fields.begin() + first, item.fields.end()));
            }
        }
    }
};

Modes modesOf(const std::vector<Token>& keys) {
    Modes modes;
    for (const Token& key : keys) {
        if (const std::optional<std::size_t> mode = position(vocabulary::modes(), key.text)) {
            modes.set(*mode);
        }
    }
    return modes;
}

/// Checks one family with all its devices, and collects the modes that it uses.
class FamilyCheck {
public:
    FamilyCheck(const FamilyData& family, const FamilyContext& context, Findings& findings)
        : m_family(family), m_context(context), m_findings(findings),
          m_operations(family.own.items(schema::OPERATION)),
          m_options(family.own.items(schema::PROGRAM_OPTION)), m_properties(family.own) {}

    /// @return the modes in which the family offers something
    Modes check() {
        checkSection(family(), m_operations, m_options, m_properties);
        for (const Section& device : m_family.devices) {
            checkDevice(device);
        }
        return m_used;
    }

private:
    [[nodiscard]] const Section& family() const { return m_family.own; }

    void checkDevice(const Section& device) {
        const bool isSupported = m_context.supported.contains(device.name.text);
        const bool hasOperations = isSupported && device.find(schema::OPERATION) != nullptr;
        const bool hasOptions = m_context.optionPackages.contains(device.name.text) &&
                                device.find(schema::PROGRAM_OPTION) != nullptr;
        const PropertyValues own(device);
        const bool hasProperties = std::any_of(own.values.begin(), own.values.end(), [](const auto& value) {
            return value.first.starts_with(schema::OPTIONS_PREFIX) || isOperation(value.first);
        });
        if (!hasOperations && !hasOptions && !hasProperties) {
            return; // its answers are those of the family
        }
        PropertyValues properties = own;
        properties.values.insert(m_properties.values.begin(), m_properties.values.end());
        const Table operations = hasOperations ? Table(device.items(schema::OPERATION)) : m_operations;
        const Table options = hasOptions ? Table(device.items(schema::PROGRAM_OPTION)) : m_options;
        checkSection(device, operations, options, properties);
    }

    void checkSection(const Section& section, const Table& operations, const Table& options,
                      const PropertyValues& properties) {
        for (const Table* table : {&operations, &options}) {
            for (const auto& [word, modes] : table->modes) {
                m_used |= modes;
            }
        }
        bool hasOperationProperties = false;
        std::map<std::string, Modes> offered;
        for (const auto& [name, values] : properties.values) {
            if (isOperation(name)) {
                hasOperationProperties = true;
                offered[std::string(name)] = modesOf(values);
                checkOffered(section, std::string(name), values, operations);
            }
        }
        for (const auto& [name, values] : properties.values) {
            checkOptions(name, values, offered, options);
        }
        if (hasOperationProperties) {
            checkRecords(section, operations, properties, offered);
        }
    }

    /// Reports a finding once, even if several devices share its line.
    /// @param fact that the finding reports and rests on, if it has consequences
    template <typename... Arguments>
    Finding* report(const Rule& rule, const Token& token, const std::string& fact,
                    fmt::format_string<Arguments...> format, Arguments&&... arguments) {
        if (!m_reported.insert({&rule, token.location.file, token.location.line, token.location.column})
                 .second) {
            return nullptr;
        }
        Finding& finding = m_findings.add(rule, token, format, std::forward<Arguments>(arguments)...);
        finding.reports = finding.restsOn = fact;
        return &finding;
    }

    [[nodiscard]] std::string owner(const Section& section) const {
        return inQuotes(&section == &m_family.own ? std::string_view(m_family.name) : section.name.text);
    }

    /// Has a mode records for this family? In SPI mode only spi has.
    [[nodiscard]] bool hasRecords(std::size_t mode) const {
        return mode < TABLE_MODES &&
               (mode != static_cast<std::size_t>(MODE_TYPE::SPI) || m_family.kind != schema::File::FAMILY);
    }

    void checkOffered(const Section& section, const std::string& name, const std::vector<Token>& values,
                      const Table& operations) {
        for (const Token& value : values) {
            const std::optional<std::size_t> mode = position(vocabulary::modes(), value.text);
            if (!mode) {
                continue; // found as an unknown mode key
            }
            m_used.set(*mode);
            const auto& families = m_context.modes[*mode].families;
            if (m_family.kind != schema::File::BASE && families && !families->contains(m_family.name)) {
                Finding* const finding =
                    report(OFFERED_OUT_OF_MODE, value, fact::inMode(m_family.name, value.text),
                           "{} of base.acd does not list the family {}", value.text, inQuotes(m_family.name));
                if (finding != nullptr) {
                    finding->unlistedIn = value.text;
                }
            } else if (hasRecords(*mode) && !operations.modes.empty() && !operations.of(name).test(*mode)) {
                report(PROPERTY_WITHOUT_RECORD, value, {}, "OPERATION of {} has no record for {} in mode {}",
                       owner(section), name, value.text);
            }
        }
    }

    /// Identifies the property: that of the family may contradict several tables.
    [[nodiscard]] std::string origin(const Section& section, const PropertyValues& properties,
                                     const std::string& name) const {
        const auto found = properties.values.find(name);
        if (found == properties.values.end() || found->second.empty()) {
            return name + " of " + owner(section);
        }
        const SourceLocation& location = found->second.front().location;
        return fmt::format("{}:{}:{}", location.file->path(), location.line, location.column);
    }

    void checkRecords(const Section& section, const Table& operations, const PropertyValues& properties,
                      std::map<std::string, Modes>& offered) {
        for (const auto& [place, token] : operations.locations) {
            const auto& [name, mode] = place;
            if (hasRecords(mode) && isOperation(name) && !offered[name].test(mode)) {
                report(RECORD_WITHOUT_PROPERTY, token,
                       fact::inMode(origin(section, properties, name), vocabulary::modes()[mode]),
                       "the property {} of {} does not list the mode {}", name, owner(section),
                       vocabulary::modes()[mode]);
            }
        }
    }

    void checkOptions(std::string_view name, const std::vector<Token>& values,
                      const std::map<std::string, Modes>& offered, const Table& options) {
        if (!name.starts_with(schema::OPTIONS_PREFIX) || values.empty()) {
            return;
        }
        std::string operation(name.substr(schema::OPTIONS_PREFIX.size()));
        Modes wanted;
        wanted.set();
        if (!isOperation(operation)) {
            const std::size_t cut = operation.rfind('_');
            const std::optional<std::size_t> mode =
                cut == operation.npos
                    ? std::nullopt
                    : position(vocabulary::modes(), std::string_view(operation).substr(cut + 1));
            operation.resize(std::min(cut, operation.size()));
            if (!mode || !isOperation(operation)) {
                return; // found as a name that belongs to no operation
            }
            wanted = Modes().set(*mode);
        }
        const auto found = offered.find(operation);
        const Modes reached = found == offered.end() ? Modes() : found->second & wanted;
        if (reached.none()) {
            report(UNREACHABLE_OPTIONS, values.front(), {},
                   "{} is never given: the property {} does not list the mode", inQuotes(name), operation);
            return;
        }
        // Only modes with cells have options; nothing can be said of Kite and PFF modes.
        const bool hasCells = (reached & ~((~Modes()) << TABLE_MODES)).any();
        for (const Token& value : values) {
            const std::string text(value.text);
            if (hasCells && !options.modes.empty() && position(vocabulary::options(), text) &&
                (options.of(text) & reached).none()) {
                report(OPTION_WITHOUT_RECORD, value, {},
                       "PROGRAM_OPTION has no record for {} in the mode of {}", inQuotes(text),
                       inQuotes(name));
            }
        }
    }

    const FamilyData& m_family;
    const FamilyContext& m_context;
    Findings& m_findings;
    Table m_operations;
    Table m_options;
    PropertyValues m_properties;
    Modes m_used;
    std::set<std::tuple<const Rule*, const AcdLines*, unsigned, unsigned>> m_reported;
};

void checkModes(const Model& model, const std::map<std::string_view, Modes>& used, Findings& findings) {
    const std::vector<std::string>& modes = vocabulary::modes();
    const Section& base = model.baseKeys();
    const bool hasModes = std::any_of(
        modes.begin(), modes.end(), [&base](const std::string& mode) { return base.find(mode) != nullptr; });
    for (std::size_t mode = 0; mode < modes.size(); ++mode) {
        const auto user = std::find_if(used.begin(), used.end(),
                                       [mode](const auto& entry) { return entry.second.test(mode); });
        // A base.acd without any mode key is a fragment.
        if (hasModes && base.find(modes[mode]) == nullptr && user != used.end()) {
            findings
                .add(NO_MODE_KEY, model.base()->start(), "there is no key {}, though family {} uses the mode",
                     modes[mode], inQuotes(user->first))
                .restsOn = fact::key(modes[mode]);
        }
        const std::vector<Item>& items = base.items(modes[mode]);
        for (std::size_t i = 1; items.size() > 1 && i < items[1].fields.size(); ++i) {
            const Token& family = items[1].fields[i];
            const auto found = used.find(family.text);
            // A family that offers nothing anywhere is not finished yet.
            if (found != used.end() && found->second.any() && !found->second.test(mode)) {
                findings.add(IDLE_FAMILY, family, "the family {} offers nothing in mode {}",
                             inQuotes(family.text), modes[mode]);
            }
        }
    }
}

void checkParts(const Model& model, Findings& findings) {
    const FamilyContext context(model);
    for (const Token& part : model.baseKeys().list(schema::NOT_SUPPORTED_PART_IN_MODE)) {
        const std::size_t first = part.text.find('_');
        const std::size_t second = part.text.find('_', first == part.text.npos ? first : first + 1);
        const std::optional<std::size_t> mode = position(vocabulary::modes(), part.text.substr(0, first));
        if (!mode || second == part.text.npos || !context.modes[*mode].families ||
            *mode == static_cast<std::size_t>(MODE_TYPE::SPI)) {
            continue;
        }
        const std::string_view name = part.text.substr(first + 1, second - first - 1);
        const Device* const device = model.device(name);
        const std::string_view family = model.isFlashInAnyCase(std::string(name)) ? schema::SPI_FAMILY
                                        : device != nullptr                       ? device->family->name
                                                                                  : std::string_view();
        if (!family.empty() && !context.modes[*mode].families->contains(family)) {
            findings
                .add(PART_OUT_OF_MODE, part,
                     "{} does not list the family {} of {}, so it refuses the part anyway",
                     vocabulary::modes()[*mode], inQuotes(family), inQuotes(name))
                .restsOn = fact::inMode(family, vocabulary::modes()[*mode]);
        }
    }
}

void checkFamily(const FamilyData& family, const FamilyContext& context, FamilyResult& result) {
    result.usedModes = FamilyCheck(family, context, result.findings).check();
}

void check(const Model& model, const FamilyResults& families, Findings& findings) {
    std::map<std::string_view, Modes> used;
    for (const auto& [family, result] : families) {
        used[family->name] = result.usedModes;
    }
    checkModes(model, used, findings);
    checkParts(model, findings);
}

} // namespace

RuleSet agreementRules() {
    return {"",
            {&NO_MODE_KEY, &IDLE_FAMILY, &PART_OUT_OF_MODE, &OFFERED_OUT_OF_MODE, &PROPERTY_WITHOUT_RECORD,
             &RECORD_WITHOUT_PROPERTY, &OPTION_WITHOUT_RECORD, &UNREACHABLE_OPTIONS},
            checkFamily,
            check};
}

} // namespace lint
