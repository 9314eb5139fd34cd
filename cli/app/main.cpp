// Reads the command line and runs one command.
#include "app/Help.h"
#include "app/LongOptions.h"
#include "app/completion/Completion.h"
#include "commands/Command.h"
#include "query/Tool.h"
#include "text/Suggest.h"

#include <TarvikException.h>

#include <CLI/CLI.hpp>

#include <fmt/format.h>

#include <algorithm>
#include <csignal>
#include <sstream>
#include <unistd.h>

namespace {

struct CommandLine {
    Tool::Settings settings;
    std::string colours = "auto";
    Action action;
};

Terminal::Colours coloursOf(const std::string& when) {
    if (when == "auto") {
        return Terminal::Colours::AUTOMATIC;
    }
    return when == "always" ? Terminal::Colours::ALWAYS : Terminal::Colours::NEVER;
}

std::string examples(const Command& command) {
    std::string text = "Examples:\n";
    std::istringstream lines(command.examples);
    for (std::string line; std::getline(lines, line);) {
        text += "  " + line + '\n';
    }
    return text + "\nThe options of tarvik itself (tarvik --help) may stand here too.";
}

void declare(CLI::App& parser, CommandLine& line) {
    parser.require_subcommand(1);
    parser.formatter(
        std::make_shared<HelpFormatter>(Terminal(STDOUT_FILENO, Terminal::Colours::NEVER).width()));
    parser.set_version_flag("--version", "tarvik " TARVIK_VERSION);
    parser
        .add_option("--database", line.settings.databases,
                    "A directory of .acd files; given again, a layer below the former ones. Without it "
                    "TARVIK_DATABASE counts, else the installed database, else a built-in demonstration")
        ->type_name("DIR")
        ->allow_extra_args(false);
    parser.add_flag("--json", line.settings.json, "Answer with one JSON object");
    parser.add_flag("--verbose", line.settings.verbose, "Show the manager's debug messages");
    parser
        .add_option("--color", line.colours,
                    "Whether to use colours: auto (on a terminal, unless NO_COLOR is set), always or never")
        ->check(CLI::IsMember({"auto", "always", "never"}))
        ->type_name("WHEN");
    for (const Command& command : commands()) {
        CLI::App* const subparser = parser.add_subcommand(command.name, command.summary);
        subparser->fallthrough();
        subparser->group("Commands");
        subparser->footer(examples(command));
        subparser->callback([&line, action = command.declare(*subparser)] { line.action = action; });
    }
}

std::vector<std::string> commandNames() {
    std::vector<std::string> names;
    for (const Command& command : commands()) {
        names.emplace_back(command.name);
    }
    return names;
}

/// What was not understood.
std::string unexpected(const CLI::App& parser, const CLI::App* command, const std::string& word) {
    if (word.starts_with('-')) {
        std::vector<std::string> names;
        for (OptionName& option : optionNames(parser, command)) {
            names.push_back(std::move(option.name));
        }
        return fmt::format("unknown option \"{}\"{}", word, didYouMean(word, names));
    }
    return command == nullptr
               ? fmt::format("unknown command \"{}\"{}", word, didYouMean(word, commandNames()))
               : fmt::format("\"{}\" is one argument too many", word);
}

/// What is wrong with the command line, and where to read on.
std::string explained(const CLI::App& parser, const CLI::ParseError& fault) {
    const std::vector<const CLI::App*> chosen =
        parser.get_subcommands([](const CLI::App* command) { return command->parsed(); });
    const CLI::App* const command = chosen.empty() ? nullptr : chosen.front();
    const std::vector<std::string> rest = parser.remaining(true);
    std::string explanation = fault.what();
    // A mistyped option is more likely at fault than what is missing instead.
    if (!rest.empty() && (command == nullptr || rest.front().starts_with('-') ||
                          dynamic_cast<const CLI::ExtrasError*>(&fault) != nullptr)) {
        explanation = unexpected(parser, command, rest.front());
    } else if (command == nullptr && dynamic_cast<const CLI::RequiredError*>(&fault) != nullptr) {
        explanation = "a command is required";
    }
    return fmt::format("{}\nsee: tarvik {}--help", explanation,
                       command == nullptr ? "" : command->get_name() + ' ');
}

ExitCode run(int argc, char** argv) {
    CLI::App parser("Answers what a device-programming application may offer its user for a device.",
                    "tarvik");
    CommandLine line;
    declare(parser, line);
    const std::vector<std::string> words(argv + std::min(argc, 1), argv + argc);
    // Asked by the shells' completions. The words behind it are those of an unfinished command line, so they are
    // not parsed with the rest.
    if (!words.empty() && words.front() == "complete") {
        return completion::complete(parser, {words.begin() + 1, words.end()});
    }
    try {
        parser.parse(argc, argv);
    } catch (const CLI::ParseError& fault) {
        std::ostringstream text;
        if (fault.get_exit_code() != 0) {
            // What stands behind the fault was not parsed.
            line.settings.json = std::find(words.begin(), words.end(), "--json") != words.end();
            return Tool(line.settings).fail({ExitCode::FAULT, explained(parser, fault)});
        }
        parser.exit(fault, text, text);
        Output output;
        output.write(text.str());
        output.flush();
        return ExitCode::YES;
    }
    line.settings.colours = coloursOf(line.colours);
    Tool tool(line.settings);
    try {
        return line.action(tool);
    } catch (const CommandError& failure) {
        return tool.fail(failure);
    } catch (const TarvikException& fault) {
        return tool.fail({ExitCode::FAULT, fmt::format("the database can't be read: {}", fault.typeName())});
    }
}

} // namespace

int main(int argc, char** argv) {
    // A reader that closes its end shows as a failing write, which ends the run quietly.
    std::signal(SIGPIPE, SIG_IGN);
    ExitCode status = ExitCode::FAULT;
    try {
        status = run(argc, argv);
    } catch (const std::exception& fault) {
        writeError(std::string("tarvik: ") + fault.what());
    }
    return static_cast<int>(status);
}
