// Follows the manager's loading on demand step by step, so that every fact keeps the place it came from.
#include "explain/Replay.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <AcdReader.h>
#include <PicConfig.h>
#include <TarvikException.h>
#include <UT_STR.h>
#include <tarvik/ConstraintsManager.h>

#include <algorithm>

namespace why {

namespace {

constexpr const char* SPI = "spi";
constexpr const char* BASE = "base";

/// What the manager takes for an unknown operation: a row that no table has.
constexpr int NO_ROW = static_cast<int>(TARVIKNS::NO_OPERATION);

int operationRow(const std::string& word) {
    const std::vector<std::string>& keys = vocabulary::operations();
    const auto found = std::find_if(keys.begin(), keys.end(),
                                    [&](const std::string& key) { return sameWithoutCase(key, word); });
    return found == keys.end() ? NO_ROW : static_cast<int>(found - keys.begin());
}

/// The value of an option's word; nothing for a word that the manager does not read.
std::optional<int> optionRow(const std::string& word) {
    try {
        return static_cast<int>(ConstraintsManager::optionString2Type(word.c_str()));
    } catch (const DataMismatchException&) {
        return std::nullopt;
    }
}

/// The permission that a record gives, its output words from field `firstOutput` on.
Permission permission(const Record& record, const std::string& owner, const TableName& table, int row,
                      std::size_t firstOutput) {
    Permission result{record.whole, owner, table, row, "", TARVIKNS::MODE_TYPE::BS, {}};
    for (std::size_t field = firstOutput; field < record.fields.size(); ++field) {
        result.outputWords.push_back(record.fields[field]);
    }
    return result;
}

Permission permissionInMode(const Record& record, const std::string& owner, const TableName& table, int row) {
    Permission result = permission(record, owner, table, row, 2);
    if (const Piece* const mode = record.field(1)) {
        result.modeWord = mode->text;
    }
    result.mode = ConstraintsManager::modeString2Type(result.modeWord.c_str());
    return result;
}

} // namespace

bool Permission::names(TARVIKNS::OUTPUT_TYPE output) const {
    return std::any_of(outputWords.begin(), outputWords.end(), [&](const Piece& word) {
        return ConstraintsManager::cableString2Type(word.text.c_str()) == output;
    });
}

Replay::Replay(const StartUp& facts) : m_facts(facts) {
    if (facts.complete) {
        start();
    }
}

/// The tables of all flashes together are read when the manager starts.
void Replay::start() {
    // Without spi.acd its name is resolved all the same.
    static_cast<void>(operationTable(SPI));
    m_operationsLoaded.insert(SPI);
    try {
        if (hasFamilyFile(SPI)) {
            readOperations(SPI, "spi.acd");
            readBsdlOperations(SPI, "spi.acd");
            readOptions(SPI, "spi.acd");
        }
        m_optionsLoaded.insert(SPI);
    } catch (const UnknownOption&) {
        // The manager reports that and is ready all the same.
    }
}

const Resolution& Replay::resolve(const std::string& device) {
    const std::string base = withoutPackage(device);
    const std::string key = lowerCase(base);
    const auto cached = m_families.find(key);
    if (cached != m_families.end() && !cached->second.family.empty()) {
        return cached->second;
    }
    return m_families.insert_or_assign(key, found(device, base)).first->second;
}

Resolution Replay::found(const std::string& device, const std::string& base) const {
    const auto flash = m_facts.flashes.find(upperCase(device));
    if (flash != m_facts.flashes.end()) {
        return {SPI, Resolution::By::FLASH, flash->second};
    }
    const PicConfig configuration(base.c_str(), 1, PM_PARTNAME_BINDING::BY_NAME);
    if (const char* const module = configuration.get_pm()) {
        return {module, Resolution::By::DATABASE, {}};
    }
    if (sameWithoutCase(device, SPI)) {
        return {SPI, Resolution::By::SPI_NAME, {}};
    }
    return {BASE, Resolution::By::NOBODY, {}};
}

TableName Replay::operationTable(const std::string& name) {
    // The base name decides whether to resolve, the whole name is what is looked up.
    const bool hasOwn = m_facts.supported.count(withoutPackage(name)) != 0;
    const std::string table = hasOwn ? name : resolve(name).family;
    return m_facts.supported.count(table) != 0 ? TableName(table) : std::nullopt;
}

void Replay::load(const std::string& device, const std::string& package) {
    const bool isFamily = m_facts.supported.count(withoutPackage(device)) != 0;
    loadFamily(isFamily ? device : loadDevice(device, package));
}

void Replay::loadForProperties(const std::string& name) {
    if (m_propertiesLoaded.count(name) == 0) {
        load(name, "");
    }
}

void Replay::loadForOperations(const std::string& name) {
    if (m_operationsLoaded.count(name) == 0) {
        load(name, "");
    }
}

void Replay::loadForOptions(const std::string& name, const std::string& device, const std::string& package) {
    if (m_optionsLoaded.count(name) == 0) {
        load(device, package);
    }
}

std::string Replay::loadDevice(const std::string& device, const std::string& package) {
    readProperties(device);
    std::string owner = device + package;
    if (m_facts.packages.count(owner) == 0) {
        owner = resolve(device).family;
    }
    if (m_optionsLoaded.insert(owner).second) {
        readOptions(owner, device);
    }
    return AcdReader(device.c_str()).getPM();
}

void Replay::loadFamily(const std::string& family) {
    readProperties(family);
    if (m_operationsLoaded.insert(family).second) {
        readOperations(family, family);
        readBsdlOperations(family, family);
    }
    if (m_optionsLoaded.insert(family).second) {
        readOptions(family, family);
    }
}

void Replay::readOperations(const std::string& owner, const std::string& database) {
    const TableName table = operationTable(owner);
    for (const Record& record : readRecords(database, "OPERATION").all) {
        m_operations.push_back(
            permissionInMode(record, owner, table, operationRow(record.fields.front().text)));
    }
}

void Replay::readBsdlOperations(const std::string& owner, const std::string& database) {
    const TableName table = operationTable(owner);
    for (const Record& record : readRecords(database, "BSDL_OPERATION").all) {
        m_bsdlOperations.push_back(
            permission(record, owner, table, operationRow(record.fields.front().text), 1));
    }
}

void Replay::readOptions(const std::string& owner, const std::string& database) {
    const TableName table = m_facts.packages.count(owner) != 0 ? TableName(owner) : std::nullopt;
    for (const Record& record : readRecords(database, "PROGRAM_OPTION").all) {
        const Piece& word = record.fields.front();
        const std::optional<int> row = optionRow(word.text);
        if (!row) {
            throw UnknownOption{word, owner};
        }
        m_options.push_back(permissionInMode(record, owner, table, *row));
    }
}

/// PROPERTIES behind PROPERTY; a later record of a name replaces the earlier one whole.
void Replay::readProperties(const std::string& owner) {
    if (!m_propertiesLoaded.insert(owner).second) {
        return;
    }
    const Records single = readRecords(owner, "PROPERTY");
    for (const Record& record : single.all) {
        const Piece* const value = record.field(1);
        keep(owner, record.fields.front().text,
             {{value == nullptr ? "" : value->text}, record.whole, single.ofDevice});
    }
    const Records multiple = readRecords(owner, "PROPERTIES");
    for (const Record& record : multiple.all) {
        PropertyValues found{{}, record.whole, multiple.ofDevice};
        const Piece* const number = record.field(1);
        const long count = UT_STR::AToL(number == nullptr ? nullptr : number->text.c_str());
        for (long index = 0; index < count; ++index) {
            const Piece* const value = record.field(static_cast<std::size_t>(index) + 2);
            found.values.insert(value == nullptr ? "" : value->text);
            if (value == nullptr) {
                break;
            }
        }
        keep(owner, record.fields.front().text, std::move(found));
    }
}

void Replay::keep(const std::string& owner, const std::string& key, PropertyValues found) {
    const auto [known, isNew] = m_properties.try_emplace(owner + "_" + key);
    const Piece& former = known->second.record;
    // One that a layer on top appends stands for the one below.
    if (!isNew && former.origin.layer != found.record.origin.layer) {
        found.record.shadows.insert(found.record.shadows.begin(), {former.origin, former.text});
    }
    known->second = std::move(found);
}

const PropertyValues* Replay::property(const std::string& owner, const std::string& key) const {
    const auto found = m_properties.find(owner + "_" + key);
    return found == m_properties.end() ? nullptr : &found->second;
}

} // namespace why
