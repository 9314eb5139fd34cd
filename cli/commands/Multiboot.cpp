// `multiboot`: does a device support a multiboot arrangement?
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "commands/QuestionArguments.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Verdict.h"

#include <tarvik/ConstraintsManager.h>

#include <memory>

namespace {

ExitCode run(Tool& tool, const QuestionArguments& arguments) {
    if (arguments.lead == arguments.chain) {
        throw CommandError(ExitCode::FAULT,
                           "multiboot takes either --lead or --chain\nsee: tarvik multiboot --help");
    }
    const explanation::Question question =
        readQuestion(tool, arguments, QuestionScope::ALL, "multiboot").question;
    const bool supported = explanation::isAllowed(tool.manager(), question);
    if (!supported) {
        questions::requireKnown(tool, question.device);
    }
    return tool.answer(Verdict{supported, explanation::inWords(question), explanation::inJson(question)},
                       supported ? ExitCode::YES : ExitCode::NO);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<QuestionArguments>();
    list = {argument::device(&arguments->device)};
    declareMultiboot(list, *arguments, true);
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::MULTIBOOT{
    "multiboot", "Check whether a device supports a multiboot arrangement",
    "",          "tarvik multiboot OVD16 --type MB_SPI --width NONE --lead",
    declare,
};
