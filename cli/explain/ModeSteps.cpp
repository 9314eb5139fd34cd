// What a mode can use, and what can be configured in it: the mode tables of the base database.
#include "explain/ExplanationBuilder.h"

#include "model/Catalogue.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

namespace explanation {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

/// The records of a mode's key.
constexpr int OUTPUTS = 0;
constexpr int FAMILIES = 1;

bool isOutputWord(OUTPUT_TYPE output) {
    return ConstraintsManager::cableString2Type(vocabulary::key(output).c_str()) == output;
}

} // namespace

/// The words of a mode's record, without the label in front of them, which is not read.
std::vector<ReadLog::Match> ExplanationBuilder::modeWords(int record) const {
    std::vector<Match> words;
    const std::string& key = vocabulary::key(m_question.mode);
    if (const ReadLog::Value* const value = m_asked.startUp.findWithItem(key, record)) {
        for (const ReadLog::Field& field : value->item(record)->fields) {
            if (field.text) {
                words.push_back({value, &*field.text});
            }
        }
    }
    return words;
}

/// Notes that a mode's record lacks something, or that there is no record.
void ExplanationBuilder::addAbsentFromMode(int record, const std::string& absent,
                                           const std::string& noRecord) {
    const std::string& key = vocabulary::key(m_question.mode);
    if (const ReadLog::Value* const value = m_asked.startUp.findWithItem(key, record)) {
        add("absent", absent, {value, &value->item(record)->whole});
    } else {
        add("absent", absent + ": " + noRecord);
    }
}

/// Notes the words of a mode's record that would be the one that is asked for if they were not mistyped.
void ExplanationBuilder::addMisspelledWords(int record, const char* kind, const std::string& word,
                                            const std::function<bool(const std::string&)>& isKnown) {
    for (const Match& match : modeWords(record)) {
        const std::string& text = match.text->text;
        if (!isKnown(text) && suggest(text, {word})) {
            add("note", fmt::format("\"{}\" is not {}; is {} meant?", text, kind, word), match);
        }
    }
}

bool ExplanationBuilder::output() {
    const std::string& mode = vocabulary::key(m_question.mode);
    const std::string& output = vocabulary::key(m_question.output);
    if (m_question.mode == MODE_TYPE::PFF) {
        add("rule", "PFF mode accepts every output");
        return true;
    }
    std::set<OUTPUT_TYPE> outputs;
    for (const Match& word : modeWords(OUTPUTS)) {
        const OUTPUT_TYPE listed = ConstraintsManager::cableString2Type(word.text->text.c_str());
        if (listed == m_question.output) {
            if (listed == OUTPUT_TYPE::NONE) {
                add("note",
                    fmt::format("\"{}\" is not an output that a database can name, and is read as NONE",
                                word.text->text));
            }
            add("record", fmt::format("mode {} lists {}", mode, output), word);
            return true;
        }
        outputs.insert(listed);
    }
    if (!isOutputWord(m_question.output)) {
        add("note", fmt::format("no database can name {}: that word is read as NONE", output));
    }
    std::vector<std::string> keys;
    keys.reserve(outputs.size());
    for (const OUTPUT_TYPE listed : outputs) {
        keys.push_back(vocabulary::key(listed));
    }
    addAbsentFromMode(OUTPUTS, fmt::format("mode {} can use {}, not {}", mode, listed(keys), output),
                      fmt::format("base.acd has no key {}", mode));
    addMisspelledWords(OUTPUTS, "an output", output, [](const std::string& word) {
        return ConstraintsManager::cableString2Type(word.c_str()) != OUTPUT_TYPE::NONE;
    });
    return false;
}

bool ExplanationBuilder::device() {
    if (m_question.mode == MODE_TYPE::PFF || m_question.mode == MODE_TYPE::SPI) {
        add("rule",
            fmt::format("without --output, {} mode accepts every device", vocabulary::key(m_question.mode)));
        return true;
    }
    return modeAllowsDevice();
}

bool ExplanationBuilder::modeAllowsDevice() {
    const std::string& mode = vocabulary::key(m_question.mode);
    std::string name = addNameStep();
    if (m_question.mode == MODE_TYPE::SPI) {
        name = "spi";
        add("name", questions::SPI_MODE_RULE);
    }
    if (isExcluded(name)) {
        return false;
    }
    const std::string family = addFamilyStep(name);
    std::set<std::string> families;
    for (const Match& word : modeWords(FAMILIES)) {
        if (word.text->text == family) {
            add("record", fmt::format("mode {} lists the family {}", mode, family), word);
            return true;
        }
        families.insert(word.text->text);
    }
    addAbsentFromMode(FAMILIES,
                      fmt::format("mode {} takes the families {}, not {}", mode, listed(families), family),
                      fmt::format("base.acd lists no families under {}", mode));
    const std::vector<std::string> known = catalogue::families();
    addMisspelledWords(FAMILIES, "a family", family, [&known](const std::string& word) {
        return std::ranges::find(known, word) != known.end();
    });
    return false;
}

bool ExplanationBuilder::isExcluded(const std::string& device) {
    if (!m_question.package) {
        return false;
    }
    const std::string part = vocabulary::key(m_question.mode) + "_" + device + "_" + *m_question.package;
    const Match excluded = m_asked.startUp.findItem(schema::NOT_SUPPORTED_PART_IN_MODE, part);
    if (!excluded) {
        add("table", fmt::format("NOT_SUPPORTED_PART_IN_MODE does not list {}", part));
        return false;
    }
    add("record", "NOT_SUPPORTED_PART_IN_MODE excludes the part from the mode", excluded);
    return true;
}

} // namespace explanation
