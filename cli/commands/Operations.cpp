// `operations`: the operations that a device allows in a mode through an output.
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
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::MODE_TYPE mode = vocabulary::readMode(arguments.mode);
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    const std::string device = askedDevice(tool, arguments.device).name;
    Json asked{{"device", device}, {"mode", vocabulary::key(mode)}, {"output", vocabulary::key(output)}};
    const auto ask = [&](ConstraintsManager& manager) {
        return manager.getDeviceOperations(device.c_str(), mode, output);
    };
    return showMembers(tool, {device, std::move(asked), "operations", ask, addOperations});
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device),
        argument::mode(&arguments->mode),
        argument::output(&arguments->output),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::OPERATIONS{
    "operations", "List the operations that a device allows",
    "",           "tarvik operations KS50 --mode BS --output USB2",
    declare,
};
