#pragma once

#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <fmt/format.h>

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
[[nodiscard]] inline MaskMembers operationMembers(const ConstraintsManager& manager, std::string device,
                                                  Json asked, int mask) {
    MaskMembers members{std::move(device), std::move(asked), "operations", mask, {}, {}};
    for (const TARVIKNS::OP_TYPE operation : questions::operations(manager, mask)) {
        members.keys.push_back(vocabulary::key(operation));
        members.names.push_back(vocabulary::displayName(operation));
    }
    return members;
}

/// " in mode SS through SVF"
[[nodiscard]] inline std::string circumstances(const Json& asked) {
    std::string text;
    if (asked.contains("mode")) {
        text += " in mode " + asked["mode"].get<std::string>();
    }
    return text + " through " + asked["output"].get<std::string>();
}

/// Shows the members. An empty answer is a no, with a note so that it is not taken for a failure.
[[nodiscard]] inline ExitCode showMembers(Tool& tool, const MaskMembers& members) {
    questions::requireKnown(tool, members.device);
    const ExitCode status = tool.answer(members, members.keys.empty() ? ExitCode::NO : ExitCode::YES);
    if (members.keys.empty()) {
        tool.note(
            fmt::format("{} allows no {}{}", members.device, members.kind, circumstances(members.asked)));
    }
    return status;
}
