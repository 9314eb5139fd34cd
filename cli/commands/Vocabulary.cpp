// `vocabulary`: the modes, outputs, operations and options with all their spellings.
#include "commands/Commands.h"

#include "model/Vocabulary.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/ranges.h>

namespace {

using vocabulary::Kind;
using vocabulary::Word;

struct Words {};

/// Does a database name the value by its key? Some outputs and options are written only.
bool isReadFromDatabases(Kind kind, int value) {
    const std::string& key = vocabulary::keys(kind).at(static_cast<std::size_t>(value));
    if (kind == Kind::OUTPUT) {
        const auto output = static_cast<TARVIKNS::OUTPUT_TYPE>(value);
        return output != TARVIKNS::OUTPUT_TYPE::NONE &&
               ConstraintsManager::cableString2Type(key.c_str()) == output;
    }
    try {
        static_cast<void>(ConstraintsManager::optionString2Type(key.c_str()));
        return true;
    } catch (const DataMismatchException&) {
        return false;
    }
}

std::string tableOf(Kind kind, Table::Row headings, const Terminal& terminal) {
    Table table(std::move(headings));
    int value = 0;
    for (const Word& word : vocabulary::words(kind)) {
        Table::Row row{std::to_string(value), word.key};
        if (kind == Kind::OUTPUT || kind == Kind::OPTION) {
            row.emplace_back(isReadFromDatabases(kind, value) ? "yes" : "no");
        }
        if (kind == Kind::MODE) {
            row.push_back(fmt::format("{}", fmt::join(word.others, " ")));
        }
        if (kind != Kind::OPTION) {
            row.push_back(word.name);
        }
        table.add(std::move(row));
        ++value;
    }
    return table.text(terminal);
}

std::string asText(const Words& /*all*/, const Terminal& terminal) {
    return tableOf(Kind::MODE, {"", "MODE", "ALSO", "DISPLAY NAME"}, terminal) + '\n' +
           tableOf(Kind::OUTPUT, {"", "OUTPUT", "IN DATABASES", "DISPLAY NAME"}, terminal) + '\n' +
           tableOf(Kind::OPERATION, {"", "OPERATION", "DISPLAY NAME"}, terminal) + '\n' +
           tableOf(Kind::OPTION, {"", "OPTION", "IN DATABASES"}, terminal);
}

Json listOf(Kind kind) {
    Json list = Json::array();
    for (const Word& word : vocabulary::words(kind)) {
        const int value = static_cast<int>(list.size());
        Json object{{"value", value}, {"key", word.key}};
        if (kind == Kind::MODE) {
            object["also"] = word.others;
        }
        if (kind == Kind::OUTPUT || kind == Kind::OPTION) {
            object["inDatabases"] = isReadFromDatabases(kind, value);
        }
        if (kind != Kind::OPTION) {
            object["name"] = word.name;
        }
        list.push_back(std::move(object));
    }
    return list;
}

Json asJson(const Words& /*all*/) {
    return {{"modes", listOf(Kind::MODE)},
            {"outputs", listOf(Kind::OUTPUT)},
            {"operations", listOf(Kind::OPERATION)},
            {"options", listOf(Kind::OPTION)}};
}

ExitCode run(Tool& tool) { return tool.answer(Words{}); }

} // namespace

const Command command::VOCABULARY{
    "vocabulary",        "List modes, outputs, operations and options",        "",
    "tarvik vocabulary", [](ArgumentList& /*none*/) -> Action { return run; },
};
