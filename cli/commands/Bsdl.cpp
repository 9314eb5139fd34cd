// `bsdl`: the boundary-scan operations that a device allows through an output.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "commands/MaskMembers.h"
#include "query/AskedDevice.h"

#include <tarvik/ConstraintsManager.h>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string output;
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::OUTPUT_TYPE output = vocabulary::readOutput(arguments.output);
    const std::string device = askedDevice(tool, arguments.device).name;
    Json asked{{"device", device}, {"output", vocabulary::key(output)}};
    const auto ask = [&](ConstraintsManager& manager) {
        return manager.getBsdlOperations(device.c_str(), output);
    };
    return showMembers(tool, {device, std::move(asked), "operations", ask, addOperations});
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {argument::device(&arguments->device), argument::output(&arguments->output)};
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::BSDL{
    "bsdl",  "List the boundary-scan operations that a device allows", "", "tarvik bsdl KS50 --output SVF",
    declare,
};
