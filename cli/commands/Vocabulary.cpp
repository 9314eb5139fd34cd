// `vocabulary`: the modes, outputs, operations and options with all texts that stand for them.
#include "commands/Commands.h"

#include "model/Vocabulary.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/ranges.h>

namespace {

struct Mode {
    std::string key;
    std::vector<std::string> others;
};

/// An output or an option: a database can name some of them only.
struct Named {
    std::string key;
    bool inDatabases;
};

struct Operation {
    std::string key;
    std::string name;
};

struct Words {
    std::vector<Mode> modes;
    std::vector<Named> outputs;
    std::vector<Operation> operations;
    std::vector<Named> options;
};

bool readsOption(const std::string& key) {
    try {
        static_cast<void>(ConstraintsManager::optionString2Type(key.c_str()));
        return true;
    } catch (const DataMismatchException&) {
        return false;
    }
}

Words words() {
    Words words;
    for (const std::string& key : vocabulary::modes()) {
        words.modes.push_back(
            {key, vocabulary::otherModeTexts(static_cast<TARVIKNS::MODE_TYPE>(words.modes.size()))});
    }
    for (const std::string& key : vocabulary::outputs()) {
        const auto output = static_cast<TARVIKNS::OUTPUT_TYPE>(words.outputs.size());
        const bool read = output != TARVIKNS::OUTPUT_TYPE::NONE &&
                          ConstraintsManager::cableString2Type(key.c_str()) == output;
        words.outputs.push_back({key, read});
    }
    for (const std::string& key : vocabulary::operations()) {
        words.operations.push_back({key, vocabulary::operationNames().at(words.operations.size())});
    }
    for (const std::string& key : vocabulary::options()) {
        words.options.push_back({key, readsOption(key)});
    }
    return words;
}

std::string asText(const std::vector<Named>& all, const char* heading, const Terminal& terminal) {
    Table table({"", heading, "IN DATABASES"});
    for (std::size_t value = 0; value < all.size(); ++value) {
        table.add({std::to_string(value), all[value].key, all[value].inDatabases ? "yes" : "no"});
    }
    return table.text(terminal);
}

std::string asText(const Words& words, const Terminal& terminal) {
    Table modes({"", "MODE", "ALSO"});
    for (std::size_t value = 0; value < words.modes.size(); ++value) {
        const Mode& mode = words.modes[value];
        modes.add({std::to_string(value), mode.key, fmt::format("{}", fmt::join(mode.others, " "))});
    }
    Table operations({"", "OPERATION", "DISPLAY NAME"});
    for (std::size_t value = 0; value < words.operations.size(); ++value) {
        const Operation& operation = words.operations[value];
        operations.add({std::to_string(value), operation.key, operation.name});
    }
    return modes.text(terminal) + '\n' + asText(words.outputs, "OUTPUT", terminal) + '\n' +
           operations.text(terminal) + '\n' + asText(words.options, "OPTION", terminal);
}

Json asJson(const std::vector<Named>& all) {
    Json list = Json::array();
    for (const Named& one : all) {
        list.push_back({{"value", list.size()}, {"key", one.key}, {"inDatabases", one.inDatabases}});
    }
    return list;
}

Json asJson(const Words& words) {
    Json modes = Json::array();
    for (const Mode& mode : words.modes) {
        modes.push_back({{"value", modes.size()}, {"key", mode.key}, {"also", mode.others}});
    }
    Json operations = Json::array();
    for (const Operation& operation : words.operations) {
        operations.push_back(
            {{"value", operations.size()}, {"key", operation.key}, {"name", operation.name}});
    }
    return {{"modes", modes},
            {"outputs", asJson(words.outputs)},
            {"operations", operations},
            {"options", asJson(words.options)}};
}

ExitCode run(Tool& tool) { return tool.answer(words()); }

} // namespace

const Command command::VOCABULARY{
    "vocabulary",        "List modes, outputs, operations and options",        "",
    "tarvik vocabulary", [](ArgumentList& /*none*/) -> Action { return run; },
};
