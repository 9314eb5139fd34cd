// `check`: may it be done? Answered by exactly the one check of the manager that takes what was given.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/Tool.h"
#include "term/Verdict.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <memory>
#include <optional>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

struct Arguments {
    std::optional<std::string> device;
    std::string mode;
    std::optional<std::string> output;
    std::optional<std::string> package;
    std::optional<std::string> operation;
};

/// The arguments, read.
struct Question {
    const std::optional<std::string>& device;
    MODE_TYPE mode;
    std::optional<OUTPUT_TYPE> output;
    const std::optional<std::string>& package;
    std::optional<OP_TYPE> operation;
};

Question read(const Arguments& arguments) {
    Question question{arguments.device, vocabulary::readMode(arguments.mode), {}, arguments.package, {}};
    if (arguments.output) {
        question.output = vocabulary::readOutput(*arguments.output);
    }
    if (arguments.operation) {
        question.operation = vocabulary::readOperation(*arguments.operation);
    }
    return question;
}

const char* textOrNull(const std::optional<std::string>& text) { return text ? text->c_str() : nullptr; }

/// Is there a check that takes just these?
void requireCheck(const Question& question) {
    const bool possible = question.device ? !question.operation || !question.package
                                          : question.output && !question.operation && !question.package;
    if (possible) {
        return;
    }
    throw CommandError(ExitCode::FAULT, "check takes one of these:\n"
                                        "  --mode M --output O\n"
                                        "  DEVICE --mode M [--package P]\n"
                                        "  DEVICE --mode M --output O [--package P]\n"
                                        "  DEVICE --mode M --output O --operation OP\n"
                                        "  DEVICE --mode M --operation OP");
}

/// The one check that takes what was given.
bool ask(ConstraintsManager& manager, const Question& question) {
    const auto& [device, mode, output, package, operation] = question;
    if (!device) {
        return manager.checkConstraints(mode, output.value());
    }
    if (operation) {
        return output ? manager.checkConstraints(mode, *output, device->c_str(), *operation, nullptr)
                      : manager.checkConstraints(device->c_str(), mode, *operation, nullptr);
    }
    return output ? manager.checkConstraints(mode, *output, device->c_str(), textOrNull(package))
                  : manager.checkConstraints(mode, device->c_str(), textOrNull(package));
}

std::string inWords(const Question& question) {
    std::string words;
    if (question.operation) {
        words += vocabulary::key(*question.operation) + " of ";
    }
    if (question.device) {
        words += *question.device;
        words += question.package ? " in package " + *question.package : "";
        words += " in ";
    }
    words += "mode " + vocabulary::key(question.mode);
    if (question.output) {
        words += " through " + vocabulary::key(*question.output);
    }
    return words;
}

template <typename Type>
Json keyOrNull(const std::optional<Type>& value) {
    return value ? Json(vocabulary::key(*value)) : Json();
}

Json jsonOrNull(const std::optional<std::string>& text) { return text ? Json(*text) : Json(); }

Json inJson(const Question& question) {
    return {{"device", jsonOrNull(question.device)},
            {"mode", vocabulary::key(question.mode)},
            {"output", keyOrNull(question.output)},
            {"package", jsonOrNull(question.package)},
            {"operation", keyOrNull(question.operation)}};
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const Question question = read(arguments);
    requireCheck(question);
    ConstraintsManager& manager = tool.manager();
    const bool allowed = ask(manager, question);
    const bool known = !question.device || manager.isKorvelDevice(question.device->c_str());
    const ExitCode status = tool.answer(Verdict{allowed, inWords(question), inJson(question)},
                                        allowed ? ExitCode::YES : ExitCode::NO);
    if (!known) {
        tool.note(catalogue::unknownDevice(*question.device).what());
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device, false),
        argument::mode(&arguments->mode),
        argument::output(&arguments->output, false),
        argument::package(&arguments->package),
        argument::operation(&arguments->operation, "The operation"),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::CHECK{
    "check",
    "Check whether something is allowed",
    "",
    "tarvik check --mode BS --output USB2\n"
    "tarvik check KS50 --mode SS --package TQ144\n"
    "tarvik check KS50 --mode BS --output USB2 --operation VERIFY",
    declare,
};
