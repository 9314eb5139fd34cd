// Operations, boundary-scan operations and options: which permission table answers, and which of its records.
#include "explain/Chain.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

namespace why {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

bool isModeWord(const std::string& word) {
    const auto isIn = [&](const std::vector<std::string>& words) {
        return std::any_of(words.begin(), words.end(),
                           [&](const std::string& known) { return sameWithoutCase(known, word); });
    };
    const MODE_TYPE mode = ConstraintsManager::modeString2Type(word.c_str());
    return isIn(vocabulary::modes()) || isIn(vocabulary::otherModeTexts(mode));
}

const char* entryKey(Question::Kind kind) {
    switch (kind) {
    case Question::Kind::OPTION:
        return "PROGRAM_OPTION";
    case Question::Kind::BSDL:
        return "BSDL_OPERATION";
    default:
        return "OPERATION";
    }
}

} // namespace

bool Chain::operation() {
    std::string owner = "spi";
    if (m_question.mode == MODE_TYPE::SPI) {
        add("rule", "in mode SPI the table of \"spi\" answers, whatever the device");
    } else {
        owner = operationOwner(withoutPackage(m_question.device));
        m_replay.loadForOperations(owner);
    }
    if (!hasCell(true)) {
        return false;
    }
    const TableName table = m_replay.operationTable(owner);
    return tableExists(owner, table, m_facts.supported) &&
           allows(m_replay.operations(), *table, static_cast<int>(m_question.operation));
}

bool Chain::bsdl() {
    const std::string owner = operationOwner(m_question.device);
    m_replay.loadForOperations(owner);
    const TableName table = m_replay.operationTable(owner);
    return hasCell(false) && tableExists(owner, table, m_facts.supported) &&
           allows(m_replay.bsdlOperations(), *table, static_cast<int>(m_question.operation));
}

bool Chain::option() {
    std::string owner = "spi";
    if (m_question.mode == MODE_TYPE::SPI) {
        add("rule", "in mode SPI the options of \"spi\" answer, whatever the device");
    } else {
        owner = optionOwner();
    }
    if (!hasCell(true)) {
        return false;
    }
    const TableName table = m_facts.packages.count(owner) != 0 ? TableName(owner) : std::nullopt;
    return tableExists(owner, table, m_facts.packages) &&
           allows(m_replay.options(), *table, static_cast<int>(m_question.option));
}

/// The name whose operation tables answer: the device's own when its base name is listed, else its family.
/// @param resolved the name whose family counts
std::string Chain::operationOwner(const std::string& resolved) {
    const std::string base = withoutPackage(m_question.device);
    const auto own = m_facts.supported.find(base);
    if (own != m_facts.supported.end()) {
        add("name", fmt::format("DEVICE_SUPPORTED lists \"{}\": it has a table of its own", base),
            own->second);
        return m_question.device;
    }
    if (base != m_question.device) {
        add("name", fmt::format("\"{}\" counts as \"{}\", without its package", m_question.device, base));
    }
    return familyNoted(resolved);
}

/// The name whose options answer: device and package in one word when that is listed, else the device when it is
/// listed or a family, else its family. Its options are loaded.
std::string Chain::optionOwner() {
    const std::string& device = m_question.device;
    const std::string package = m_question.package.value_or("");
    std::string joined = device + package;
    const std::string family = m_replay.resolve(device).family;
    std::string owner = device;
    if (family != device) {
        const auto own = m_facts.packages.find(joined);
        if (own != m_facts.packages.end()) {
            add("name", fmt::format("PROGRAM_OPTION_PACKAGE lists \"{}\": it has options of its own", joined),
                own->second);
            m_replay.loadForOptions(joined, device, package);
            return joined;
        }
        if (m_facts.packages.count(device) == 0) {
            owner = family;
        }
    }
    if (joined != device) {
        add("name",
            fmt::format("PROGRAM_OPTION_PACKAGE does not list \"{}\": the package has no say", joined));
    }
    if (owner != device || family == device) {
        familyNoted(device);
    } else {
        add("name", fmt::format("PROGRAM_OPTION_PACKAGE lists \"{}\": it has options of its own", device),
            m_facts.packages.at(device));
    }
    m_replay.loadForOptions(owner, owner, "");
    return owner;
}

/// The tables are narrower than the vocabulary.
bool Chain::hasCell(bool withMode) {
    if (withMode && m_question.mode > MODE_TYPE::SPI) {
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

/// @param listed the list that makes tables
bool Chain::tableExists(const std::string& owner, const TableName& table, const Names& listed) {
    const char* const list = &listed == &m_facts.packages ? "PROGRAM_OPTION_PACKAGE" : "DEVICE_SUPPORTED";
    if (table) {
        add("table", fmt::format("{} of {}", entryKey(m_question.kind), *table), listed.at(*table));
        return true;
    }
    const std::string base = withoutPackage(owner);
    const bool hidden = &listed == &m_facts.supported && base != owner && listed.count(base) != 0;
    add("absent", hidden
                      ? fmt::format("{} lists \"{}\", but what is looked up is the whole name \"{}\", which "
                                    "has no table",
                                    list, base, owner)
                      : fmt::format("{} does not list \"{}\", so it has no table", list, owner));
    return false;
}

bool Chain::allows(const Replay::Permissions& permissions, const std::string& table, int row) {
    const bool withMode = m_question.kind != Question::Kind::BSDL;
    const std::string& word = m_question.kind == Question::Kind::OPTION
                                  ? vocabulary::options().at(static_cast<std::size_t>(row))
                                  : vocabulary::operations().at(static_cast<std::size_t>(row));
    std::vector<const Permission*> others;
    for (const Permission& permission : permissions) {
        if (permission.table != table || permission.row != row) {
            continue;
        }
        if ((!withMode || permission.mode == m_question.mode) && permission.names(m_question.output)) {
            if (withMode && !isModeWord(permission.modeWord)) {
                add("note",
                    fmt::format("\"{}\" is no mode, and counts as Boundary Scan", permission.modeWord));
            }
            add("record",
                fmt::format("{} is allowed{} through {}", word,
                            withMode ? " in mode " + vocabulary::key(m_question.mode) : "",
                            vocabulary::key(m_question.output)),
                permission.record);
            return true;
        }
        others.push_back(&permission);
    }
    const std::string where = (withMode ? " in mode " + vocabulary::key(m_question.mode) : "") + " through " +
                              vocabulary::key(m_question.output);
    if (others.empty()) {
        add("absent", fmt::format("no record of {} names {}", table, word));
        noteShadowed(table == "spi" ? "spi.acd" : table, entryKey(m_question.kind), word);
    } else if (others.size() == 1) {
        add("absent", fmt::format("the one record for {} does not allow it{}", word, where),
            others.front()->record);
    } else {
        add("absent", fmt::format("none of the {} records for {} allows it{}", others.size(), word, where));
    }
    if (m_question.kind == Question::Kind::OPTION &&
        m_question.option > TARVIKNS::PROGRAM_OPTION::SECTOR_LOCKDOWN) {
        add("note", fmt::format("no database can name the option {}", word));
    }
    for (const Permission* const permission : others) {
        noteOddities(*permission);
    }
    return false;
}

/// Tells records that a layer on top took away by setting their key anew.
void Chain::noteShadowed(const std::string& database, const std::string& key, const std::string& word) {
    for (const Record& record : readShadowedRecords(database, key)) {
        if (sameWithoutCase(record.fields.front().text, word)) {
            add("note", fmt::format("a layer on top sets {} anew, without this record", key), record.whole);
        }
    }
}

/// Tells words of a record that allow nothing, or something else than they seem to.
void Chain::noteOddities(const Permission& permission) {
    const bool withMode = m_question.kind != Question::Kind::BSDL;
    if (withMode && !isModeWord(permission.modeWord)) {
        add("note", fmt::format("\"{}\" is no mode, and counts as Boundary Scan", permission.modeWord),
            permission.record);
    }
    for (const Piece& word : permission.outputWords) {
        const OUTPUT_TYPE output = ConstraintsManager::cableString2Type(word.text.c_str());
        if (output == OUTPUT_TYPE::NONE) {
            add("note", fmt::format("\"{}\" is no output, and allows nothing", word.text), word);
        } else if (output > OUTPUT_TYPE::STAPL) {
            add("note", fmt::format("{} has no cell in the tables, so its word allows nothing", word.text),
                word);
        }
    }
}

} // namespace why
