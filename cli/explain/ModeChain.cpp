// What a mode can use, and what can be configured in it: the mode tables of the base database.
#include "explain/Chain.h"

#include "model/Vocabulary.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

namespace why {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

std::string outputsOf(const StartUp::Mode& mode) {
    std::vector<std::string> keys;
    for (const auto& [output, word] : mode.outputs) {
        keys.push_back(vocabulary::key(output));
    }
    return listed(keys);
}

std::string familiesOf(const StartUp::Mode& mode) {
    std::vector<std::string> names;
    for (const auto& [name, word] : mode.families) {
        names.push_back(name);
    }
    return listed(names);
}

bool databasesName(OUTPUT_TYPE output) {
    return ConstraintsManager::cableString2Type(vocabulary::key(output).c_str()) == output;
}

} // namespace

bool Chain::output() {
    const std::string& mode = vocabulary::key(m_question.mode);
    const std::string& output = vocabulary::key(m_question.output);
    if (m_question.mode == MODE_TYPE::PFF) {
        add("rule", "the PROM file formatter accepts every output, whatever the database lists for it");
        return true;
    }
    const StartUp::Mode& table = m_facts.mode(m_question.mode);
    const auto word = table.outputs.find(m_question.output);
    if (word != table.outputs.end()) {
        if (m_question.output == OUTPUT_TYPE::NONE) {
            add("note", fmt::format("\"{}\" is no output that a database can name, and counts as NONE",
                                    word->second.text));
        }
        add("record", fmt::format("mode {} lists {}", mode, output), word->second);
        return true;
    }
    if (!databasesName(m_question.output)) {
        add("note", fmt::format("no database can name {}: that word counts as NONE", output));
    }
    const std::string absent = fmt::format("mode {} can use {}, not {}", mode, outputsOf(table), output);
    if (table.outputRecord) {
        add("absent", absent, *table.outputRecord);
    } else {
        add("absent", absent + fmt::format(": base.acd has no key {}", mode));
    }
    return false;
}

bool Chain::device() {
    if (m_question.mode == MODE_TYPE::PFF || m_question.mode == MODE_TYPE::SPI) {
        add("rule", fmt::format("asked without an output, mode {} takes every device unseen",
                                vocabulary::key(m_question.mode)));
        return true;
    }
    return modeTakesDevice();
}

bool Chain::deviceThrough() {
    const bool takesOutput = output();
    return modeTakesDevice() && takesOutput;
}

bool Chain::modeTakesDevice() {
    const std::string& key = vocabulary::key(m_question.mode);
    std::string name = withoutPackageNoted(m_question.device);
    if (m_question.mode == MODE_TYPE::SPI) {
        name = "spi";
        add("name", "in mode SPI every device counts as \"spi\"");
    }
    if (isExcluded(name)) {
        return false;
    }
    const std::string family = familyNoted(name);
    const StartUp::Mode& table = m_facts.mode(m_question.mode);
    const auto word = table.families.find(family);
    if (word != table.families.end()) {
        add("record", fmt::format("mode {} lists the family {}", key, family), word->second);
        return true;
    }
    const std::string absent =
        fmt::format("mode {} takes the families {}, not {}", key, familiesOf(table), family);
    if (table.familyRecord) {
        add("absent", absent, *table.familyRecord);
    } else {
        add("absent", absent + fmt::format(": base.acd lists none under {}", key));
    }
    return false;
}

bool Chain::isExcluded(const std::string& device) {
    if (!m_question.package) {
        return false;
    }
    const std::string part = vocabulary::key(m_question.mode) + "_" + device + "_" + *m_question.package;
    const auto item = m_facts.excludedParts.find(part);
    if (item == m_facts.excludedParts.end()) {
        add("table", fmt::format("NOT_SUPPORTED_PART_IN_MODE does not hold {}", part));
        return false;
    }
    add("record", "NOT_SUPPORTED_PART_IN_MODE excludes the part from the mode", item->second);
    return true;
}

} // namespace why
