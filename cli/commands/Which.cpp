// `which`: the inverse of `check` and `property`: the devices for which it holds.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Vocabulary.h"
#include "query/Census.h"
#include "query/Tool.h"
#include "term/Progress.h"
#include "term/Table.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <memory>
#include <optional>

namespace {

using why::Question;
using why::Verdict;

struct Arguments {
    std::optional<std::string> operation;
    std::optional<std::string> mode;
    std::optional<std::string> output;
    std::optional<std::string> property;
};

struct Holders {
    Json asked; ///< the arguments, as the JSON object shows them
    std::vector<why::Entry> devices;
    std::vector<std::string> faults; ///< devices at which the manager raises
};

std::string asText(const Holders& holders, const Terminal& terminal) {
    if (holders.devices.empty()) {
        return {};
    }
    Table table({"DEVICE", "FAMILY"});
    for (const why::Entry& device : holders.devices) {
        table.add({device.name, device.family});
    }
    return table.text(terminal);
}

Json asJson(const Holders& holders) {
    Json object = holders.asked;
    Json list = Json::array();
    for (const why::Entry& device : holders.devices) {
        list.push_back({{"name", device.name}, {"family", device.family}});
    }
    object["devices"] = std::move(list);
    object["faults"] = holders.faults;
    return object;
}

CommandError usage() {
    return {ExitCode::FAULT, "which takes one of\n"
                             "  --operation OP --mode M --output O\n"
                             "  --operation OP --mode M\n"
                             "  --property KEY=VALUE"};
}

Question readProperty(const Arguments& arguments) {
    if (arguments.operation || arguments.mode || arguments.output) {
        throw usage();
    }
    const std::string& text = *arguments.property;
    const std::size_t equals = text.find('=');
    if (equals == std::string::npos || equals == 0) {
        throw usage();
    }
    Question question;
    question.kind = Question::Kind::PROPERTY;
    question.property = text.substr(0, equals);
    question.value = text.substr(equals + 1);
    return question;
}

Question read(const Arguments& arguments) {
    if (arguments.property) {
        return readProperty(arguments);
    }
    if (!arguments.operation || !arguments.mode) {
        throw usage();
    }
    Question question;
    question.kind = Question::Kind::OPERATION_IN_MODE;
    question.operation = vocabulary::readOperation(*arguments.operation);
    question.mode = vocabulary::readMode(*arguments.mode);
    if (arguments.output) {
        question.kind = Question::Kind::OPERATION;
        question.output = vocabulary::readOutput(*arguments.output);
    }
    return question;
}

Json asked(const Question& question) {
    Json object = why::inJson(question);
    object.erase("device");
    return object;
}

/// Asks without the message that a device lacks the property: who asks for all devices knows that some do.
/// What the host layer says when it reads the device is kept.
Verdict askForProperty(Tool& tool, ConstraintsManager& manager, const Question& question) {
    try {
        static_cast<void>(
            manager.getDeviceStringProperties(question.device.c_str(), question.property.c_str()));
    } catch (const DataMismatchException&) {
        return Verdict::FAULT;
    }
    const std::size_t issued = tool.messages().count();
    const Verdict verdict = why::ask(manager, question);
    tool.messages().truncate(issued);
    return verdict;
}

std::vector<why::Entry> askAll(Tool& tool, const Question& question) {
    Progress progress("asking for each device");
    const auto ask = [&tool](ConstraintsManager& manager, const Question& one) {
        return one.kind == Question::Kind::PROPERTY ? askForProperty(tool, manager, one)
                                                    : why::ask(manager, one);
    };
    return why::askForAll(tool.manager(), question, ask,
                          [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); });
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const Question question = read(arguments);
    Holders holders{asked(question), {}, {}};
    for (why::Entry& entry : askAll(tool, question)) {
        if (entry.verdict == Verdict::YES) {
            holders.devices.push_back(std::move(entry));
        } else if (entry.verdict == Verdict::FAULT) {
            holders.faults.push_back(std::move(entry.name));
        }
    }
    const ExitCode status = tool.answer(holders, holders.devices.empty() ? ExitCode::NO : ExitCode::YES);
    if (!holders.faults.empty()) {
        tool.note(fmt::format("no answer for {} devices, the first \"{}\": see tarvik why",
                              holders.faults.size(), holders.faults.front()));
    }
    if (holders.devices.empty()) {
        tool.note("there is no such device");
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::operation(&arguments->operation, "The operation that the devices allow"),
        argument::mode(&arguments->mode, false),
        argument::output(&arguments->output, false),
        {.name = "--property",
         .value = "KEY=VALUE",
         .description = "The property that the devices have",
         .kind = ValueKind::PROPERTY_VALUE,
         .target = &arguments->property},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::WHICH{
    "which",
    "List the devices that allow an operation or have a property",
    "",
    "tarvik which --operation ERASE --mode BS --output USB2\n"
    "tarvik which --property VENDOR=Korvel",
    declare,
};
