// `check`: may it be done? Answered by exactly the check of the manager that takes what was given, or by several.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "commands/QuestionArguments.h"
#include "model/Vocabulary.h"
#include "query/ApplicationFault.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Verdict.h"

#include <tarvik/ConstraintsManager.h>

#include <memory>

namespace {

using explanation::Question;

/// The answer, with those to the parts of a complete question.
struct Answer {
    const AskedQuestion& asked;
    bool isAllowed = true;
    std::vector<Verdict> parts{};
};

std::string asText(const Answer& answer, const Terminal& terminal) {
    std::string text =
        asText(Verdict{answer.isAllowed, explanation::inWords(answer.asked.question), {}}, terminal);
    for (const Verdict& part : answer.parts) {
        text += "  " + asText(part, terminal);
    }
    return text;
}

Json asJson(const Answer& answer) {
    const Question& question = answer.asked.question;
    const Json asked = explanation::inJson(question);
    Json object{{"allowed", answer.isAllowed}};
    for (const char* const member : {"device", "mode", "output", "package", "operation"}) {
        object[member] = asked.value(member, Json());
    }
    if (!answer.parts.empty()) {
        object["parts"] = Json::array();
        for (const Verdict& part : answer.parts) {
            object["parts"].push_back(asJson(part));
        }
    }
    object["skipped"] = answer.asked.skipped;
    return object;
}

Answer ask(ConstraintsManager& manager, const AskedQuestion& asked) {
    const std::vector<Question> parts = explanation::partsOf(asked.question);
    if (parts.empty()) {
        return {asked, explanation::isAllowed(manager, asked.question)};
    }
    Answer answer{asked};
    for (const Question& part : parts) {
        const bool isAllowed = explanation::isAllowed(manager, part);
        answer.isAllowed = answer.isAllowed && isAllowed;
        answer.parts.push_back({isAllowed, explanation::inWords(part), explanation::inJson(part)});
    }
    return answer;
}

ExitCode run(Tool& tool, const QuestionArguments& arguments) {
    const AskedQuestion asked = readQuestion(tool, arguments, QuestionScope::CHECKS, "check");
    const Answer answer = ask(tool.manager(), asked);
    if (arguments.device) {
        questions::requireKnown(tool, asked.question.device);
    }
    noteApplicationFault(
        tool,
        [&](ConstraintsManager& manager) { return inWords(explanation::isAllowed(manager, asked.question)); },
        inWords(answer.isAllowed));
    const ExitCode status = tool.answer(answer, answer.isAllowed ? ExitCode::YES : ExitCode::NO);
    for (const std::string& check : asked.skipped) {
        tool.note(check);
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<QuestionArguments>();
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
    "With device, mode, output, package and operation, it checks all of it and shows the verdict of each "
    "part. With "
    "fewer of them it asks the one check that takes what is given, and notes what that check leaves out.",
    "tarvik check --mode BS --output USB2\n"
    "tarvik check KS50 --mode SS --package TQ144\n"
    "tarvik check KS50 --mode BS --output USB2 --operation VERIFY\n"
    "tarvik check KS50 --mode BS --output USB2 --package TQ144 --operation VERIFY",
    declare,
};
