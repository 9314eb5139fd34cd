// `options`: the programming options that a device allows in a mode through an output.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "commands/MaskMembers.h"
#include "query/AskedDevice.h"

#include <tarvik/ConstraintsManager.h>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string mode;
    std::string output;
    std::optional<std::string> package;
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::MODE_TYPE mode = vocabulary::readMode(arguments.mode);
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    const AskedDevice asked = askedDevice(tool, arguments.device, arguments.package, PackageUse::TAKEN);
    const char* const package = asked.package ? asked.package->c_str() : nullptr;
    ConstraintsManager& manager = tool.manager();
    const int mask = manager.getProgramOptions(asked.name.c_str(), mode, output, package);
    Json question{{"device", asked.name},
                  {"mode", vocabulary::key(mode)},
                  {"output", vocabulary::key(output)},
                  {"package", asked.package ? Json(*asked.package) : Json()}};
    MaskMembers members{asked.name, std::move(question), "options", mask, {}, {}};
    for (const TARVIKNS::PROGRAM_OPTION option : questions::options(manager, mask)) {
        members.keys.push_back(vocabulary::key(option));
    }
    return showMembers(tool, members);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device),
        argument::mode(&arguments->mode),
        argument::output(&arguments->output),
        argument::package(&arguments->package),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::OPTIONS{
    "options", "List the programming options that a device allows",
    "",        "tarvik options KS50 --mode BS --output USB2 --package TQ144",
    declare,
};
