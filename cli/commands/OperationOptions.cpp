// `operation-options`: the options that an operation of a device has in a mode.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Vocabulary.h"
#include "query/ApplicationFault.h"
#include "query/AskedDevice.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string operation;
    std::string mode;
};

struct OperationOptions {
    std::string device;
    std::string operation;
    std::string mode;
    std::vector<std::string> options;
};

std::string asText(const OperationOptions& answer, const Terminal& terminal) {
    std::string text;
    for (const std::string& option : answer.options) {
        text += terminal.sanitised(option) + '\n';
    }
    return text;
}

Json asJson(const OperationOptions& answer) {
    return {{"device", answer.device},
            {"operation", answer.operation},
            {"mode", answer.mode},
            {"options", answer.options}};
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const TARVIKNS::MODE_TYPE mode = vocabulary::readMode(arguments.mode);
    // Properties are named by the key of an operation, not by the text that was given.
    const std::string& operation = vocabulary::key(vocabulary::readOperation(arguments.operation));
    const std::string device = askedDevice(tool, arguments.device).name;
    const auto ask = [&](ConstraintsManager& manager) {
        std::vector<std::string> options;
        for (const StringBase& option :
             manager.getDeviceOperationOptions(device.c_str(), operation.c_str(), mode)) {
            options.push_back(toStdString(option));
        }
        return options;
    };
    const OperationOptions answer{device, operation, vocabulary::key(mode), ask(tool.manager())};
    questions::requireKnown(tool, device);
    noteApplicationFault(
        tool, [&](ConstraintsManager& manager) { return inWords(ask(manager)); }, inWords(answer.options));
    const ExitCode status = tool.answer(answer, answer.options.empty() ? ExitCode::NO : ExitCode::YES);
    if (answer.options.empty()) {
        tool.note(fmt::format("{} of {} has no options in mode {}", operation, device, answer.mode));
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device),
        {.name = "OPERATION",
         .description = "The operation",
         .kind = ValueKind::OPERATION,
         .required = true,
         .target = &arguments->operation},
        argument::mode(&arguments->mode),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::OPERATION_OPTIONS{
    "operation-options",
    "List the options of an operation",
    "",
    "tarvik operation-options KS50 PROGRAM --mode BS",
    declare,
};
