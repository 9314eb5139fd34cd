// `why`: the answer of a command that answers yes or no, and the records that lead to it.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "commands/QuestionArguments.h"
#include "explain/Explanation.h"
#include "explain/Inquiry.h"
#include "query/ApplicationFault.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <memory>

namespace {

using explanation::Conclusion;

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

/// Puts a step for each skipped check in front, unless the explanation itself names it.
void addSkippedChecks(explanation::Answer& answer) {
    std::vector<explanation::Step>& steps = answer.explanation.steps;
    for (auto check = answer.skipped.rbegin(); check != answer.skipped.rend(); ++check) {
        if (std::ranges::find(steps, *check, &explanation::Step::text) == steps.end()) {
            steps.insert(steps.begin(), {"skipped", *check});
        }
    }
}

/// A step about what an application gets, if that is something else.
void addApplicationFault(explanation::Answer& answer) {
    const std::optional<ApplicationFault> fault = findApplicationFault([&](ConstraintsManager& manager) {
        return inWords(explanation::isAllowed(manager, answer.question));
    });
    if (fault) {
        answer.explanation.steps.push_back({"fault",
                                            (fault->record ? "" : reasonOf(*fault) + ": ") +
                                                effectOf(*fault, inWords(answer.verdict == Conclusion::YES)),
                                            fault->record});
    }
}

ExitCode run(Tool& tool, const QuestionArguments& arguments) {
    const AskedQuestion asked = readQuestion(tool, arguments, QuestionScope::ALL, "why");
    const explanation::Question& question = asked.question;
    const explanation::Inquiry inquiry(question);
    if (arguments.device && !tool.isLiteral() && !inquiry.manager->isKorvelDevice(question.device.c_str())) {
        throw catalogue::unknownDevice(question.device);
    }

    // Further questions serve the explanation: what the manager reports about them is not about the user's question.
    const std::size_t issued = tool.messages().count();
    explanation::Answer answer{question, inquiry.verdict, explanation::explain(question), asked.skipped};
    addApplicationFault(answer);
    if (inquiry.verdict == Conclusion::NO) {
        for (explanation::Step& step : explanation::alternatives(question)) {
            answer.explanation.steps.push_back(std::move(step));
        }
    }
    addSkippedChecks(answer);
    if (!asked.reading.empty()) {
        answer.explanation.steps.insert(answer.explanation.steps.begin(), {"name", asked.reading});
    }
    tool.messages().truncate(issued);
    const ExitCode result = tool.answer(answer, status(inquiry.verdict));
    if (!answer.agrees()) {
        tool.note("these steps lead to another answer than the manager gives: that is a bug of tarvik");
    }
    return result;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<QuestionArguments>();
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
        {.name = "--operation-options",
         .value = "OPERATION",
         .description = "The operation whose options are asked for, as in the command operation-options",
         .kind = ValueKind::OPERATION,
         .target = &arguments->operationOptions},
        {.name = "--property",
         .value = "KEY",
         .description = "The property, as in the command property",
         .kind = ValueKind::PROPERTY,
         .target = &arguments->property},
        {.name = "--value",
         .value = "VALUE",
         .description = "A value of the property, or an option of the operation",
         .target = &arguments->value},
    };
    declareMultiboot(list, *arguments, false);
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
    "tarvik why KS50 --mode BS --operation-options PROGRAM\n"
    "tarvik why KS50 --property FLASH --value TRUE\n"
    "tarvik why OVD16 --multiboot MB_SPI --width NONE --lead",
    declare,
};
