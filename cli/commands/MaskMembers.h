#pragma once

#include "model/Vocabulary.h"
#include "query/ApplicationFault.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <functional>

/// The names of the members of a mask: the answer of `operations`, `options` and `bsdl`.
struct MaskMembers {
    std::string device;
    Json asked; ///< the arguments, as the JSON object shows them
    const char* kind;
    int mask;
    std::vector<std::string> keys;
    std::vector<std::string> names; ///< display names, empty for options
};

[[nodiscard]] inline std::string asText(const MaskMembers& members, const Terminal& terminal) {
    Table table;
    for (std::size_t i = 0; i < members.keys.size(); ++i) {
        Table::Row row{members.keys[i]};
        if (i < members.names.size()) {
            row.push_back(members.names[i]);
        }
        table.add(std::move(row));
    }
    return table.text(terminal);
}

[[nodiscard]] inline Json asJson(const MaskMembers& members) {
    Json object = members.asked;
    object["mask"] = members.mask;
    object[members.kind] = members.keys;
    return object;
}

/// The operations of a mask, by key and display name.
inline void addOperations(const ConstraintsManager& manager, MaskMembers& members) {
    for (const TARVIKNS::OP_TYPE operation : questions::operations(manager, members.mask)) {
        members.keys.push_back(vocabulary::key(operation));
        members.names.push_back(vocabulary::displayName(operation));
    }
}

inline void addOptions(const ConstraintsManager& manager, MaskMembers& members) {
    for (const TARVIKNS::PROGRAM_OPTION option : questions::options(manager, members.mask)) {
        members.keys.push_back(vocabulary::key(option));
    }
}

/// A question that is answered by a mask.
struct MaskQuestion {
    std::string device;
    Json asked;
    const char* kind;
    std::function<int(ConstraintsManager&)> ask;
    void (*addMembers)(const ConstraintsManager& manager, MaskMembers& members);
};

/// " in mode SS through SVF"
[[nodiscard]] inline std::string circumstances(const Json& asked) {
    std::string text;
    if (asked.contains("mode")) {
        text += " in mode " + asked["mode"].get<std::string>();
    }
    return text + " through " + asked["output"].get<std::string>();
}

/// Asks the question, and shows the members. An empty answer is a no, with a note so that it is not taken for a
/// failure.
[[nodiscard]] inline ExitCode showMembers(Tool& tool, const MaskQuestion& question) {
    const auto membersOf = [&](ConstraintsManager& manager) {
        MaskMembers members{question.device, question.asked, question.kind, question.ask(manager), {}, {}};
        question.addMembers(manager, members);
        return members;
    };
    const MaskMembers members = membersOf(tool.manager());
    questions::requireKnown(tool, members.device);
    noteApplicationFault(
        tool, [&](ConstraintsManager& manager) { return inWords(membersOf(manager).keys); },
        inWords(members.keys));
    if (members.asked.contains("mode") &&
        members.asked["mode"] == vocabulary::key(TARVIKNS::MODE_TYPE::SPI)) {
        tool.note(questions::SPI_MODE_RULE);
    }
    const ExitCode status = tool.answer(members, members.keys.empty() ? ExitCode::NO : ExitCode::YES);
    if (members.keys.empty()) {
        tool.note(
            fmt::format("{} allows no {}{}", members.device, members.kind, circumstances(members.asked)));
    }
    return status;
}
