// `operations`, `options` and `bsdl`: the names that the manager's masks stand for.
#include "commands/Commands.h"

#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <tarvik/ConstraintsManager.h>

#include <CLI/CLI.hpp>

#include <fmt/format.h>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string mode;
    std::string output;
    std::optional<std::string> package;
};

/// The members of a mask.
struct Members {
    Json asked; ///< the arguments, as the JSON object shows them
    const char* kind;
    int mask;
    std::vector<std::string> keys;
    std::vector<std::string> names; ///< display names, empty for options
};

std::string asText(const Members& members, const Terminal& terminal) {
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

Json asJson(const Members& members) {
    Json object = members.asked;
    object["mask"] = members.mask;
    object[members.kind] = members.keys;
    return object;
}

void addOperations(Members& members, const ConstraintsManager& manager) {
    for (const TARVIKNS::OP_TYPE operation : questions::operations(manager, members.mask)) {
        members.keys.push_back(vocabulary::key(operation));
        members.names.push_back(vocabulary::operationNames().at(static_cast<std::size_t>(operation)));
    }
}

void addOptions(Members& members, const ConstraintsManager& manager) {
    for (const TARVIKNS::PROGRAM_OPTION option : questions::options(manager, members.mask)) {
        members.keys.push_back(vocabulary::options().at(static_cast<std::size_t>(option)));
    }
}

/// Shows the members; an empty list says so beside the answer, lest it be taken for a failure.
ExitCode show(Tool& tool, const Arguments& arguments, const Members& members) {
    questions::requireKnown(tool.manager(), arguments.device);
    const ExitCode status = tool.answer(members);
    if (members.keys.empty()) {
        tool.note(fmt::format("\"{}\" offers no {} there", arguments.device, members.kind));
    }
    return status;
}

ExitCode runOperations(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::MODE_TYPE mode = vocabulary::readMode(arguments.mode);
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    ConstraintsManager& manager = tool.manager();
    Members members{
        {{"device", arguments.device}, {"mode", vocabulary::key(mode)}, {"output", vocabulary::key(output)}},
        "operations",
        manager.getDeviceOperations(arguments.device.c_str(), mode, output),
        {},
        {}};
    addOperations(members, manager);
    return show(tool, arguments, members);
}

ExitCode runOptions(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::MODE_TYPE mode = vocabulary::readMode(arguments.mode);
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    const char* const package = arguments.package ? arguments.package->c_str() : nullptr;
    ConstraintsManager& manager = tool.manager();
    Members members{{{"device", arguments.device},
                     {"mode", vocabulary::key(mode)},
                     {"output", vocabulary::key(output)},
                     {"package", arguments.package ? Json(*arguments.package) : Json()}},
                    "options",
                    manager.getProgramOptions(arguments.device.c_str(), mode, output, package),
                    {},
                    {}};
    addOptions(members, manager);
    return show(tool, arguments, members);
}

ExitCode runBsdl(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    ConstraintsManager& manager = tool.manager();
    Members members{{{"device", arguments.device}, {"output", vocabulary::key(output)}},
                    "operations",
                    manager.getBsdlOperations(arguments.device.c_str(), output),
                    {},
                    {}};
    addOperations(members, manager);
    return show(tool, arguments, members);
}

void addDevice(CLI::App& parser, Arguments& arguments) {
    parser.add_option("DEVICE", arguments.device, "The device, or a family")->type_name("")->required();
}
void addMode(CLI::App& parser, Arguments& arguments) {
    parser.add_option("-m,--mode", arguments.mode, "The configuration mode")->type_name("MODE")->required();
}
void addOutput(CLI::App& parser, Arguments& arguments) {
    parser.add_option("-o,--output", arguments.output, "The cable or output file type")
        ->type_name("OUTPUT")
        ->required();
}

} // namespace

Action declareOperations(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    addDevice(parser, *arguments);
    addMode(parser, *arguments);
    addOutput(parser, *arguments);
    return [arguments](Tool& tool) { return runOperations(tool, *arguments); };
}

Action declareOptions(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    addDevice(parser, *arguments);
    addMode(parser, *arguments);
    addOutput(parser, *arguments);
    parser.add_option("-p,--package", arguments->package, "The package")->type_name("PACKAGE");
    return [arguments](Tool& tool) { return runOptions(tool, *arguments); };
}

Action declareBsdl(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    addDevice(parser, *arguments);
    addOutput(parser, *arguments);
    return [arguments](Tool& tool) { return runBsdl(tool, *arguments); };
}
