// Reads a command line with CLI11, which no other file includes: it takes seconds to compile.
#include "app/Parser.h"

#include "term/ExitCode.h"
#include "text/Suggest.h"

#include <CLI/CLI.hpp>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace {

template <class... Functions>
struct Overloaded : Functions... {
    using Functions::operator()...;
};
template <class... Functions>
Overloaded(Functions...) -> Overloaded<Functions...>;

std::string namesOf(const Argument& argument) {
    return argument.letter == '\0' ? argument.name : fmt::format("-{},{}", argument.letter, argument.name);
}

void declare(CLI::App& parser, const Argument& argument) {
    const std::string names = namesOf(argument);
    CLI::Option* const option =
        std::visit(Overloaded{
                       [&](bool* flag) { return parser.add_flag(names, *flag); },
                       [&](auto* text) { return parser.add_option(names, *text); },
                       [&](std::vector<std::string>* texts) {
                           CLI::Option* const many = parser.add_option(names, *texts);
                           return argument.isOption() ? many->allow_extra_args(false) : many;
                       },
                   },
                   argument.target);
    option->required(argument.required);
    if (argument.isCommaSeparated) {
        option->delimiter(',');
    }
}

/// Refuses a text that is not among an argument's choices.
void requireChoice(const Argument& argument, const std::string& text) {
    const std::vector<std::string>& choices = argument.choices;
    if (argument.kind == ValueKind::CHOICE &&
        std::find(choices.begin(), choices.end(), text) == choices.end()) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("{} cannot be \"{}\"{}\naccepted: {}", argument.name, text,
                                       didYouMean(text, choices), fmt::join(choices, ", ")));
    }
}

void requireChoices(const ArgumentList& arguments) {
    for (const Argument& argument : arguments) {
        if (const auto* const text = std::get_if<std::string*>(&argument.target)) {
            requireChoice(argument, **text);
        }
    }
}

/// What was not understood.
std::string unexpected(const CommandLine& line, const DeclaredCommand* command, const std::string& word) {
    if (word.starts_with('-')) {
        std::vector<std::string> names;
        for (const Argument* const option : line.optionsOf(command)) {
            names.push_back(option->name);
        }
        return fmt::format("unknown option \"{}\"{}", word, didYouMean(word, names));
    }
    return command == nullptr
               ? fmt::format("unknown command \"{}\"{}", word, didYouMean(word, line.commandNames()))
               : fmt::format("unexpected argument \"{}\"", word);
}

/// What is wrong with the command line, and which help to read.
CommandError explained(const CommandLine& line, const DeclaredCommand* command, const CLI::App& parser,
                       const std::vector<std::string>& words, const CLI::ParseError& fault) {
    const std::vector<std::string> rest = parser.remaining(true);
    std::string explanation = fault.what();
    const auto hidden =
        std::find_if(std::find(words.begin(), words.end(), "--"), words.end(), [](const std::string& word) {
            return word.size() > 1 && word.starts_with('-') && word != "--";
        });
    // A mistyped option is more likely at fault than what is missing instead.
    const bool isUnexpected = !rest.empty() && (command == nullptr || rest.front().starts_with('-') ||
                                                dynamic_cast<const CLI::ExtrasError*>(&fault) != nullptr);
    if (hidden != words.end()) {
        explanation = fmt::format("\"{}\" comes after \"--\", so it is not read as an option", *hidden);
    } else if (isUnexpected) {
        explanation = unexpected(line, command, rest.front());
    } else if (command == nullptr && dynamic_cast<const CLI::RequiredError*>(&fault) != nullptr) {
        explanation = "a command is required";
    }
    return {ExitCode::FAULT, fmt::format("{}\nsee: tarvik {}--help", explanation,
                                         command == nullptr ? "" : command->command.name + std::string(" "))};
}

} // namespace

const DeclaredCommand* parse(CommandLine& line, const std::vector<std::string>& words) {
    CLI::App parser("", "tarvik");
    parser.require_subcommand(1);
    parser.set_help_flag();
    const DeclaredCommand* chosen = nullptr;
    for (const Argument& argument : line.options) {
        declare(parser, argument);
    }
    for (const CommandLine::Group& group : line.groups) {
        for (const DeclaredCommand& command : group.commands) {
            CLI::App* const subparser = parser.add_subcommand(command.command.name);
            subparser->set_help_flag();
            subparser->fallthrough();
            subparser->preparse_callback([&chosen, &command](std::size_t) { chosen = &command; });
            for (const Argument& argument : command.arguments) {
                declare(*subparser, argument);
            }
        }
    }
    try {
        parser.parse(std::vector<std::string>(words.rbegin(), words.rend()));
    } catch (const CLI::ParseError& fault) {
        // Who asks for help may leave out what is required.
        if (!line.help && !line.version) {
            throw explained(line, chosen, parser, words, fault);
        }
        return chosen;
    }
    requireChoices(line.options);
    requireChoices(chosen->arguments);
    return chosen;
}
