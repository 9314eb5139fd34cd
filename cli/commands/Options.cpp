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
    const AskedDevice device = askedDevice(tool, arguments.device, arguments.package, PackageUse::TAKEN);
    const char* const package = device.package ? device.package->c_str() : nullptr;
    Json asked{{"device", device.name},
               {"mode", vocabulary::key(mode)},
               {"output", vocabulary::key(output)},
               {"package", device.package ? Json(*device.package) : Json()}};
    const auto ask = [&](ConstraintsManager& manager) {
        return manager.getProgramOptions(device.name.c_str(), mode, output, package);
    };
    return showMembers(tool, {device.name, std::move(asked), "options", ask, addOptions});
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
