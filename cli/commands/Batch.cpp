// `batch`: answers JSON requests, line by line: the methods of the interface, and the commands `show` and `why`.
#include "batch/Batch.h"

#include "commands/Commands.h"
#include "query/Tool.h"
#include "text/Suggest.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace {

/// The name of an argument in a request: "mode" for --mode, "device" for DEVICE.
std::string memberName(const Argument& argument) {
    return lowerCase(argument.isOption() ? argument.name.substr(2) : argument.name);
}

Json description(const Command& command, const ArgumentList& list) {
    Json arguments = Json::array();
    for (const Argument& argument : list) {
        const char* const type = argument.isFlag() ? "boolean" : argument.required ? "text" : "text or null";
        arguments.push_back({{"name", memberName(argument)}, {"type", type}});
    }
    return {{"call", command.name}, {"args", arguments}, {"result", "object"}};
}

/// Stores a value of a request. @return whether the argument takes it
bool store(const Argument& argument, const Json& value) {
    const auto* const optional = std::get_if<std::optional<std::string>*>(&argument.target);
    const auto* const text = std::get_if<std::string*>(&argument.target);
    if (optional != nullptr && (value.is_null() || value.is_string())) {
        **optional = value.is_null() ? std::nullopt : std::optional(value.get<std::string>());
        return true;
    }
    if (argument.isFlag() && value.is_boolean()) {
        *std::get<bool*>(argument.target) = value.get<bool>();
        return true;
    }
    if (text != nullptr && value.is_string()) {
        **text = value.get<std::string>();
        return true;
    }
    return false;
}

/// Stores the members of a request.
/// @throw CommandError that names the arguments of the command
void storeAll(const Command& command, const ArgumentList& list, const Json& members) {
    std::size_t stored = 0;
    bool complete = members.is_object() || members.empty();
    for (const Argument& argument : list) {
        const auto member = members.is_object() ? members.find(memberName(argument)) : members.end();
        if (member != members.end()) {
            complete = complete && store(argument, *member);
            ++stored;
        } else {
            complete = complete && !argument.required;
        }
    }
    if (!complete || stored != members.size()) {
        std::vector<std::string> names;
        std::transform(list.begin(), list.end(), std::back_inserter(names), memberName);
        throw CommandError(ExitCode::FAULT, fmt::format("{} takes an object of texts: {}", command.name,
                                                        fmt::join(names, ", ")));
    }
}

/// The call that answers as a command does with --json.
batch::Handler handlerOf(Tool& tool, const Command& command) {
    ArgumentList declared;
    command.declare(declared);
    const auto answer = [&tool, &command](const Json& members) {
        // Declared for each request, so that none sees the arguments of an earlier one.
        ArgumentList list;
        const Action action = command.declare(list);
        storeAll(command, list, members);
        return tool.answerOf(action);
    };
    return {command.name, description(command, declared), answer};
}

ExitCode run(Tool& tool) {
    return batch::run(tool, {handlerOf(tool, command::SHOW), handlerOf(tool, command::WHY)});
}

} // namespace

const Command command::BATCH{
    "batch",
    "Answer JSON requests for the whole interface, line by line",
    "Reads one JSON object per line and writes one per line. The call \"help\" lists all calls with their "
    "arguments.",
    R"(echo '{"id": 1, "call": "getPartFamily", "args": ["KS50"]}' | tarvik batch)"
    "\n"
    R"(echo '{"call": "help"}' | tarvik batch)",
    [](ArgumentList& /*none*/) -> Action { return run; },
};
