// `why`: the answer of `check`, `options`, `bsdl` or `property`, and the records that lead to it.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "explain/Explanation.h"
#include "explain/Inquiry.h"
#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <memory>
#include <optional>

namespace {

using explanation::Conclusion;
using explanation::Question;

struct Arguments {
    std::optional<std::string> device;
    std::optional<std::string> mode;
    std::optional<std::string> output;
    std::optional<std::string> package;
    std::optional<std::string> operation;
    std::optional<std::string> option;
    std::optional<std::string> bsdl;
    std::optional<std::string> property;
    std::optional<std::string> value;
};

/// Which arguments a kind of question takes.
struct Form {
    Question::Kind kind;
    std::vector<std::optional<std::string> Arguments::*> needed;
    std::vector<std::optional<std::string> Arguments::*> possible;
    const char* usage;
};

const std::vector<std::optional<std::string> Arguments::*> ALL{
    &Arguments::device, &Arguments::mode, &Arguments::output,   &Arguments::package, &Arguments::operation,
    &Arguments::option, &Arguments::bsdl, &Arguments::property, &Arguments::value};

const std::vector<Form>& forms() {
    using A = Arguments;
    using Kind = Question::Kind;
    static const std::vector<Form> all{
        {Kind::OUTPUT, {&A::mode, &A::output}, {}, "--mode M --output O"},
        {Kind::DEVICE, {&A::device, &A::mode}, {&A::package}, "DEVICE --mode M [--package P]"},
        {Kind::DEVICE_THROUGH,
         {&A::device, &A::mode, &A::output},
         {&A::package},
         "DEVICE --mode M --output O [--package P]"},
        {Kind::OPERATION,
         {&A::device, &A::mode, &A::output, &A::operation},
         {},
         "DEVICE --mode M --output O --operation OP"},
        {Kind::OPERATION_IN_MODE,
         {&A::device, &A::mode, &A::operation},
         {},
         "DEVICE --mode M --operation OP"},
        {Kind::OPTION,
         {&A::device, &A::mode, &A::output, &A::option},
         {&A::package},
         "DEVICE --mode M --output O --option X [--package P]"},
        {Kind::BSDL, {&A::device, &A::output, &A::bsdl}, {}, "DEVICE --output O --bsdl OP"},
        {Kind::PROPERTY, {&A::device, &A::property}, {&A::value}, "DEVICE --property KEY [--value V]"},
    };
    return all;
}

/// Are these arguments all that the form needs, and none that it does not take?
bool fits(const Form& form, const Arguments& arguments) {
    return std::all_of(ALL.begin(), ALL.end(), [&](auto member) {
        const auto holds = [member](const auto& members) {
            return std::find(members.begin(), members.end(), member) != members.end();
        };
        return (arguments.*member).has_value() ? holds(form.needed) || holds(form.possible)
                                               : !holds(form.needed);
    });
}

Question::Kind kindOf(const Arguments& arguments) {
    std::string usage = "why takes one of";
    for (const Form& form : forms()) {
        if (fits(form, arguments)) {
            return form.kind;
        }
        usage += std::string("\n  ") + form.usage;
    }
    throw CommandError(ExitCode::FAULT, usage);
}

Question read(const Arguments& arguments) {
    Question question;
    question.kind = kindOf(arguments);
    question.device = arguments.device.value_or("");
    question.package = arguments.package;
    question.property = arguments.property.value_or("");
    question.value = arguments.value;
    if (arguments.mode) {
        question.mode = vocabulary::readMode(*arguments.mode);
    }
    if (arguments.output) {
        question.output = vocabulary::readOutput(*arguments.output);
    }
    if (arguments.operation || arguments.bsdl) {
        question.operation =
            vocabulary::readOperation(arguments.operation ? *arguments.operation : *arguments.bsdl);
    }
    if (arguments.option) {
        question.option = vocabulary::readOption(*arguments.option);
    }
    return question;
}

ExitCode status(Conclusion verdict) {
    switch (verdict) {
    case Conclusion::YES:
        return ExitCode::YES;
    case Conclusion::NO:
        return ExitCode::NO;
    case Conclusion::FAULT:
        break;
    }
    return ExitCode::FAULT;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const Question question = read(arguments);
    tool.openDatabase();
    const explanation::Inquiry asked(question);
    const bool isKnown = !arguments.device || asked.manager->isKorvelDevice(question.device.c_str());

    // Further questions serve the explanation: what the manager reports about them is not about the user's question.
    const std::size_t issued = tool.messages().count();
    explanation::Answer answer{question, asked.verdict, explanation::explain(question)};
    if (asked.verdict == Conclusion::NO) {
        for (explanation::Step& step : explanation::alternatives(question)) {
            answer.explanation.steps.push_back(std::move(step));
        }
    }
    tool.messages().truncate(issued);
    const ExitCode result = tool.answer(answer, status(asked.verdict));
    if (!isKnown) {
        tool.note(catalogue::unknownDevice(question.device).what());
    }
    if (!answer.agrees()) {
        tool.note("these steps lead to another answer than the manager gives: that is a bug of tarvik");
    }
    return result;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device, false),
        argument::mode(&arguments->mode, false),
        argument::output(&arguments->output, false),
        argument::package(&arguments->package),
        argument::operation(&arguments->operation, "The operation, as in the command check"),
        {.name = "--option",
         .value = "OPTION",
         .description = "The programming option, as in the command options",
         .kind = ValueKind::OPTION,
         .target = &arguments->option},
        {.name = "--bsdl",
         .value = "OPERATION",
         .description = "The boundary-scan operation, as in the command bsdl",
         .kind = ValueKind::OPERATION,
         .target = &arguments->bsdl},
        {.name = "--property",
         .value = "KEY",
         .description = "The property, as in the command property",
         .kind = ValueKind::PROPERTY,
         .target = &arguments->property},
        {.name = "--value",
         .value = "VALUE",
         .description = "The value that the property may have",
         .target = &arguments->value},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::WHY{
    "why",
    "Explain an answer",
    "Shows the records that lead to the answer, or those that prevent it and what is allowed instead.",
    "tarvik why KS50 --mode BS --output USB2 --operation VERIFY\n"
    "tarvik why KS50 --mode SM --package TQ144\n"
    "tarvik why KS50 --mode BS --output USB2 --option PROG --package PQ208\n"
    "tarvik why KS50 --output STAPL --bsdl DOPRELOAD\n"
    "tarvik why KS50 --property FLASH --value TRUE",
    declare,
};
