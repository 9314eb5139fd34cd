// Operations, boundary-scan operations and options: which permission table answers, and which of its records.
#include "explain/ExplanationBuilder.h"

#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "text/Suggest.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

namespace explanation {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using Kind = Question::Kind;

namespace {

bool isModeWord(const std::string& word) {
    const auto isIn = [&](const std::vector<std::string>& words) {
        return std::any_of(words.begin(), words.end(),
                           [&](const std::string& known) { return sameWithoutCase(known, word); });
    };
    const MODE_TYPE mode = ConstraintsManager::modeString2Type(word.c_str());
    return isIn(vocabulary::modes()) || isIn(vocabulary::otherModeTexts(mode));
}

/// The text of a field as the manager's converters get it.
const char* textOf(const ReadLog::Item& record, int field) {
    const ReadLog::Text* const found = record.field(field);
    return found == nullptr ? nullptr : found->text.c_str();
}

/// What a record of each kind of question is called, and which words it has before its outputs.
struct Table {
    const char* key;
    const char* list; ///< of the names that have a table
    const char* rows;
    bool hasModes;
    int firstOutput;
};

const Table& tableOf(Kind kind) {
    static constexpr Table OPERATIONS{schema::OPERATION, schema::DEVICE_SUPPORTED, "operations", true, 2};
    static constexpr Table BSDL{schema::BSDL_OPERATION, schema::DEVICE_SUPPORTED, "operations", false, 1};
    static constexpr Table OPTIONS{schema::PROGRAM_OPTION, schema::PROGRAM_OPTION_PACKAGE, "options", true,
                                   2};
    return kind == Kind::OPTION ? OPTIONS : kind == Kind::BSDL ? BSDL : OPERATIONS;
}

/// Does the record name the operation, or option, that is asked for?
bool isAbout(const Question& question, const ReadLog::Item& record) {
    const char* const word = textOf(record, 0);
    if (question.kind != Kind::OPTION) {
        return ConstraintsManager::operationString2Type(word) == question.operation;
    }
    try {
        return ConstraintsManager::optionString2Type(word) == question.option;
    } catch (const DataMismatchException&) {
        return false;
    }
}

} // namespace

bool ExplanationBuilder::permission() {
    const Table& table = tableOf(m_question.kind);
    std::string owner = "spi";
    if (table.hasModes && m_question.mode == MODE_TYPE::SPI) {
        add("rule", fmt::format("{}: the {} of \"spi\" answer", questions::SPI_MODE_RULE, table.rows));
    } else {
        owner = m_question.kind == Kind::OPTION ? optionOwner() : operationOwner();
    }
    return hasCell() && hasTable(owner) && isAllowedIn(owner);
}

/// The name whose operation tables answer: the device's own when its base name is listed, else its family.
std::string ExplanationBuilder::operationOwner() {
    const std::string& device = m_question.device;
    const std::string base = withoutPackage(device);
    if (const Match own = m_asked.startUp.findItem(schema::DEVICE_SUPPORTED, base)) {
        add("name", fmt::format("DEVICE_SUPPORTED lists \"{}\": it has a table of its own", base), own);
        return device;
    }
    if (base != device) {
        add("name", fmt::format("\"{}\" is treated as \"{}\", without its package", device, base));
    }
    return addFamilyStep(m_question.kind == Kind::OPERATION ? base : device);
}

/// The name whose options answer: device and package in one word when that is listed, else the device when it is
/// listed or a family, else its family.
std::string ExplanationBuilder::optionOwner() {
    const std::string& device = m_question.device;
    std::string joined = device + m_question.package.value_or("");
    const bool isFamily = m_asked.familyOf(device) == device;
    const auto isListed = [&](const std::string& name) {
        const Match listing = m_asked.startUp.findItem(schema::PROGRAM_OPTION_PACKAGE, name);
        if (listing) {
            add("name", fmt::format("PROGRAM_OPTION_PACKAGE lists \"{}\": it has options of its own", name),
                listing);
        }
        return static_cast<bool>(listing);
    };
    if (!isFamily && isListed(joined)) {
        return joined;
    }
    if (joined != device) {
        add("name",
            fmt::format("PROGRAM_OPTION_PACKAGE does not list \"{}\": the package makes no difference",
                        joined));
    }
    return !isFamily && isListed(device) ? device : addFamilyStep(device);
}

/// The tables are narrower than the vocabulary.
bool ExplanationBuilder::hasCell() {
    if (tableOf(m_question.kind).hasModes && m_question.mode > MODE_TYPE::SPI) {
        add("rule", fmt::format("the tables have rows for the modes BS to SPI: {} has none",
                                vocabulary::key(m_question.mode)));
        return false;
    }
    if (m_question.output > OUTPUT_TYPE::STAPL) {
        add("rule", fmt::format("the tables have cells for the outputs PARALLEL to STAPL: {} has none, so "
                                "nothing is allowed through it",
                                vocabulary::key(m_question.output)));
        return false;
    }
    return true;
}

/// @param owner becomes the name of its table
bool ExplanationBuilder::hasTable(std::string& owner) {
    const Table& table = tableOf(m_question.kind);
    const std::string base = withoutPackage(owner);
    const bool isFound = m_question.kind == Kind::OPTION || m_asked.startUp.findItem(table.list, base);
    const std::string name = isFound ? owner : m_asked.familyOf(owner);
    if (const Match listing = m_asked.startUp.findItem(table.list, name)) {
        std::string text = fmt::format("{} of {}", table.key, name);
        const ReadLog::Value* const records = consulted();
        if (records == nullptr || records->items.empty()) {
            add("table", std::move(text), listing);
        } else {
            if ((records->fromSection ? records->device : records->family) != name) {
                text += records->fromSection ? fmt::format(", read from [{}]", records->device)
                                             : ", read from " + records->family;
            }
            add("table", std::move(text), {records, &records->items.front().whole});
        }
        owner = name;
        return true;
    }
    add("absent", m_question.kind != Kind::OPTION && isFound
                      ? fmt::format("{} lists \"{}\", but what is looked up is the whole name \"{}\", which "
                                    "has no table",
                                    table.list, base, owner)
                      : fmt::format("{} does not list \"{}\", so it has no table", table.list, name));
    return false;
}

/// The records that fill a table. A question reads those of the owner first, and then maybe those of its family, which
/// go to another table. Those of "spi" are read before the first question.
std::vector<ExplanationBuilder::Permission>
ExplanationBuilder::permissionsOf(const std::string& table) const {
    const char* const key = tableOf(m_question.kind).key;
    std::vector<Permission> found;
    const auto addAll = [&](const ReadLog& log) {
        if (const ReadLog::Value* const value = log.find(key)) {
            for (const ReadLog::Item& record : value->items) {
                if (isAbout(m_question, record)) {
                    found.push_back({value, &record});
                }
            }
        }
    };
    addAll(m_asked.reads);
    if (sameWithoutCase(table, "spi")) {
        addAll(m_asked.startUp);
    }
    return found;
}

bool ExplanationBuilder::isAllowedBy(const ReadLog::Item& record) const {
    const Table& table = tableOf(m_question.kind);
    if (table.hasModes && ConstraintsManager::modeString2Type(textOf(record, 1)) != m_question.mode) {
        return false;
    }
    return std::any_of(record.fields.begin(), record.fields.end(), [&](const ReadLog::Field& field) {
        return field.number >= table.firstOutput && field.text &&
               ConstraintsManager::cableString2Type(field.text->text.c_str()) == m_question.output;
    });
}

bool ExplanationBuilder::isAllowedIn(const std::string& table) {
    const bool isOption = m_question.kind == Kind::OPTION;
    const bool withMode = tableOf(m_question.kind).hasModes;
    const std::string& word = isOption ? vocabulary::options().at(static_cast<std::size_t>(m_question.option))
                                       : vocabulary::key(m_question.operation);
    const std::string where = (withMode ? " in mode " + vocabulary::key(m_question.mode) : "") + " through " +
                              vocabulary::key(m_question.output);
    if (isOption && table != m_question.device) {
        // What is loaded is a device that has tables of its own, by its own name alone.
        const std::string base = withoutPackage(m_question.device);
        const Match own = m_asked.startUp.findItem(schema::DEVICE_SUPPORTED, base);
        if (own && table == m_question.device + m_question.package.value_or("")) {
            add("rule",
                fmt::format("DEVICE_SUPPORTED lists \"{}\", so options are read for \"{}\" alone, and \"{}\" "
                            "has none",
                            base, m_question.device, table),
                own);
            return false;
        }
    }
    const std::vector<Permission> permissions = permissionsOf(table);
    for (const Permission& permission : permissions) {
        if (isAllowedBy(*permission.record)) {
            addUnknownMode(permission);
            add("record", word + " is allowed" + where, {permission.value, &permission.record->whole});
            return true;
        }
    }
    if (permissions.empty()) {
        addNoRecord(table, word);
    } else {
        add("absent",
            permissions.size() == 1
                ? fmt::format("the one record for {} does not allow it{}", word, where)
                : fmt::format("none of the {} records for {} allows it{}", permissions.size(), word, where),
            {permissions.front().value, &permissions.front().record->whole});
    }
    addMisspelledRecords(word);
    if (isOption && m_question.option > TARVIKNS::PROGRAM_OPTION::SECTOR_LOCKDOWN) {
        add("note", fmt::format("no database can name the option {}", word));
    }
    for (const Permission& permission : permissions) {
        addUnknownMode(permission);
        addUnusedWords(permission);
    }
    return false;
}

/// The value whose records answer: that of the owner, or that of "spi", which was read before.
const ReadLog::Value* ExplanationBuilder::consulted() const {
    const char* const key = tableOf(m_question.kind).key;
    const ReadLog::Value* const own = m_asked.reads.find(key);
    return own != nullptr ? own : m_asked.startUp.find(key);
}

void ExplanationBuilder::addNoRecord(const std::string& table, const std::string& word) {
    const ReadLog::Value* const value = consulted();
    const std::string text = fmt::format("no record of {} names {}", table, word);
    if (value != nullptr && !value->items.empty()) {
        add("absent", text, {value, &value->items.front().whole});
    } else if (value != nullptr && !value->family.empty()) {
        add("absent", fmt::format("{}: {}.acd has no {}", text, value->family, value->key));
    } else {
        add("absent", fmt::format("{}: there is no section [{}]", text, table));
    }
    if (value != nullptr) {
        addShadowedRecords(value->accessorName(), value->key, word);
    }
}

/// Notes the records that a layer on top removed by setting their key.
void ExplanationBuilder::addShadowedRecords(const std::string& database, const std::string& key,
                                            const std::string& word) {
    const catalogue::Records records = catalogue::readRecords(database, key);
    for (const catalogue::Record& record : records.shadowed) {
        if (sameWithoutCase(record.fields.front().text, word)) {
            const std::string where =
                records.all.empty() ? "a layer on top" : catalogue::asText(records.all.front().whole.origin);
            m_steps.push_back(
                {"note", fmt::format("{} replaces {}, without this record", where, key), record.whole});
        }
    }
}

/// Notes the records that would be about the operation that is asked for if their word were not mistyped.
void ExplanationBuilder::addMisspelledRecords(const std::string& word) {
    const ReadLog::Value* const value = consulted();
    if (m_question.kind == Kind::OPTION || value == nullptr) {
        return;
    }
    for (const ReadLog::Item& record : value->items) {
        const char* const text = textOf(record, 0);
        const bool isUnknown =
            text != nullptr && ConstraintsManager::operationString2Type(text) == TARVIKNS::NO_OPERATION;
        if (isUnknown && suggest(text, vocabulary::operations()) == word) {
            add("note", fmt::format("\"{}\" is not an operation; is {} meant?", text, word),
                {value, &record.whole});
        }
    }
}

void ExplanationBuilder::addUnknownMode(const Permission& permission) {
    const char* const word = textOf(*permission.record, 1);
    if (tableOf(m_question.kind).hasModes && (word == nullptr || !isModeWord(word))) {
        add("note",
            fmt::format("\"{}\" is not a mode, and is read as Boundary Scan", word == nullptr ? "" : word),
            {permission.value, &permission.record->whole});
    }
}

/// Notes words of a record that allow nothing.
void ExplanationBuilder::addUnusedWords(const Permission& permission) {
    for (const ReadLog::Field& field : permission.record->fields) {
        if (field.number < tableOf(m_question.kind).firstOutput || !field.text) {
            continue;
        }
        const std::string& word = field.text->text;
        const OUTPUT_TYPE output = ConstraintsManager::cableString2Type(word.c_str());
        const Match place{permission.value, &*field.text};
        if (output == OUTPUT_TYPE::NONE) {
            add("note", fmt::format("\"{}\" is not an output, and allows nothing", word), place);
        } else if (output > OUTPUT_TYPE::STAPL) {
            add("note", fmt::format("{} has no cell in the tables, so its word allows nothing", word), place);
        }
    }
}

} // namespace explanation
