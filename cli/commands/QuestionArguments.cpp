// Reads the questions of `check`, `multiboot` and `why`: which arguments make a question, and which question.
#include "commands/QuestionArguments.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "query/AskedDevice.h"
#include "query/Tool.h"

#include <algorithm>
#include <span>

namespace {

using explanation::Question;
using Kind = Question::Kind;
using Member = std::optional<std::string> QuestionArguments::*;

/// Which arguments a kind of question takes.
struct Form {
    Kind kind;
    std::vector<Member> needed;
    std::vector<Member> possible;
    const char* usage;
};

/// Those of `check` first.
constexpr std::size_t CHECK_FORMS = 6;

const std::vector<Form>& allForms() {
    using A = QuestionArguments;
    static const std::vector<Form> forms{
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
         {&A::package},
         "DEVICE --mode M --operation OP [--package P]"},
        {Kind::COMPLETE,
         {&A::device, &A::mode, &A::output, &A::package, &A::operation},
         {},
         "DEVICE --mode M --output O --package P --operation OP"},
        {Kind::OPTION,
         {&A::device, &A::mode, &A::output, &A::option},
         {&A::package},
         "DEVICE --mode M --output O --option X [--package P]"},
        {Kind::BSDL, {&A::device, &A::output, &A::bsdl}, {}, "DEVICE --output O --bsdl OP"},
        {Kind::OPERATION_OPTIONS,
         {&A::device, &A::mode, &A::operationOptions},
         {&A::value},
         "DEVICE --mode M --operation-options OP [--value X]"},
        {Kind::PROPERTY, {&A::device, &A::property}, {&A::value}, "DEVICE --property KEY [--value V]"},
        {Kind::MULTIBOOT,
         {&A::device, &A::multiboot, &A::width},
         {},
         "DEVICE --multiboot TYPE --width W (--lead or --chain)"},
    };
    return forms;
}

/// Are these arguments all that the form needs, and none that it does not take?
bool fits(const Form& form, const QuestionArguments& arguments) {
    using A = QuestionArguments;
    constexpr Member ALL[]{&A::device,    &A::mode,   &A::output,    &A::package,
                           &A::operation, &A::option, &A::bsdl,      &A::operationOptions,
                           &A::property,  &A::value,  &A::multiboot, &A::width};
    const bool hasPosition = form.kind == Kind::MULTIBOOT ? arguments.lead != arguments.chain
                                                          : !arguments.lead && !arguments.chain;
    return hasPosition && std::ranges::all_of(ALL, [&](Member member) {
               const bool isNeeded = std::ranges::count(form.needed, member) != 0;
               const bool isPossible = isNeeded || std::ranges::count(form.possible, member) != 0;
               return (arguments.*member).has_value() ? isPossible : !isNeeded;
           });
}

Kind kindOf(const QuestionArguments& arguments, QuestionScope scope, const char* command) {
    const std::span forms(allForms());
    std::string usage = std::string(command) + " takes one of these:";
    for (const Form& form : scope == QuestionScope::ALL ? forms : forms.first(CHECK_FORMS)) {
        if (fits(form, arguments)) {
            return form.kind;
        }
        usage += std::string("\n  ") + form.usage;
    }
    throw CommandError(ExitCode::FAULT, usage);
}

/// Reads all but the device and its package.
Question read(const QuestionArguments& arguments, Kind kind) {
    Question question;
    question.kind = kind;
    question.property = arguments.property.value_or("");
    question.value = arguments.value;
    question.isLead = arguments.lead;
    if (arguments.mode) {
        question.mode = vocabulary::readMode(*arguments.mode);
    }
    if (arguments.output) {
        question.output = vocabulary::readOutput(*arguments.output);
    }
    for (const Member operation :
         {&QuestionArguments::operation, &QuestionArguments::bsdl, &QuestionArguments::operationOptions}) {
        if (arguments.*operation) {
            question.operation = vocabulary::readOperation(*(arguments.*operation));
        }
    }
    if (arguments.option) {
        question.option = vocabulary::readOption(*arguments.option);
    }
    if (arguments.multiboot) {
        question.multibootType = multiboot::readType(*arguments.multiboot);
    }
    if (arguments.width) {
        question.width = multiboot::readWidth(*arguments.width);
    }
    return question;
}

} // namespace

AskedQuestion readQuestion(Tool& tool, const QuestionArguments& arguments, QuestionScope scope,
                           const char* command) {
    AskedQuestion asked{read(arguments, kindOf(arguments, scope, command)), {}, {}};
    Question& question = asked.question;
    if (arguments.device) {
        const bool takesPackage = question.takesPackage();
        AskedDevice device = askedDevice(tool, *arguments.device, arguments.package,
                                         takesPackage ? PackageUse::TAKEN : PackageUse::IGNORED);
        question.device = std::move(device.name);
        asked.reading = std::move(device.reading);
        if (takesPackage) {
            question.package = std::move(device.package);
        }
        // Operations themselves do not depend on the package; whether the mode takes the part does.
        if (question.package && question.kind == Kind::OPERATION) {
            question.kind = Kind::COMPLETE;
        } else if (question.package && question.kind == Kind::OPERATION_IN_MODE) {
            question.kind = Kind::COMPLETE_IN_MODE;
        }
    }
    tool.openDatabase();
    asked.skipped = explanation::skippedChecks(question);
    return asked;
}

void declareMultiboot(ArgumentList& list, QuestionArguments& arguments, bool isRequired) {
    const ArgumentList added{
        {.name = isRequired ? "--type" : "--multiboot",
         .value = "TYPE",
         .description = isRequired ? "The arrangement, with or without TYPE_"
                                   : "The multiboot arrangement, as --type of the command multiboot",
         .choices = multiboot::TYPES,
         .required = isRequired,
         .target = &arguments.multiboot},
        {.name = "--width",
         .value = "WIDTH",
         .description = "The data width",
         .choices = multiboot::WIDTHS,
         .required = isRequired,
         .target = &arguments.width},
        {.name = "--lead", .description = "The device is the first of the chain", .target = &arguments.lead},
        {.name = "--chain",
         .description = "The device is a later one of the chain",
         .target = &arguments.chain},
    };
    list.insert(list.end(), added.begin(), added.end());
}
