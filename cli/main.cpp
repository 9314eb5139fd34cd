// Reads the command line and runs one command.
#include "Command.h"
#include "Help.h"
#include "Nearest.h"
#include "Tool.h"

#include <TarvikException.h>

#include <CLI/CLI.hpp>

#include <fmt/format.h>

#include <csignal>
#include <sstream>

namespace {

struct CommandLine {
    Tool::Settings settings;
    Action action;
};

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
    parser.formatter(std::make_shared<HelpFormatter>());
    parser.set_version_flag("--version", "tarvik " TARVIK_VERSION);
    parser
        .add_option("--database", line.settings.databases,
                    "A directory of .acd files; given again, a layer below the former ones. Without it "
                    "TARVIK_DATABASE counts, else the installed database, else a built-in demonstration")
        ->type_name("DIR")
        ->allow_extra_args(false);
    parser.add_flag("--json", line.settings.json, "Answer with one JSON object");
    parser.add_flag("--verbose", line.settings.verbose, "Show the manager's debug messages");
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

/// What is wrong with the command line, and where to read on.
std::string explained(const CLI::App& parser, const CLI::ParseError& fault) {
    const std::vector<const CLI::App*> chosen =
        parser.get_subcommands([](const CLI::App* command) { return command->parsed(); });
    if (!chosen.empty()) {
        return fmt::format("{}\nsee: tarvik {} --help", fault.what(), chosen.front()->get_name());
    }
    const std::vector<std::string> unexpected = parser.remaining();
    std::string explanation = fault.what();
    if (!unexpected.empty()) {
        const bool option = unexpected.front().starts_with('-');
        explanation = fmt::format("unknown {} \"{}\"{}", option ? "option" : "command", unexpected.front(),
                                  option ? "" : didYouMean(unexpected.front(), commandNames()));
    } else if (dynamic_cast<const CLI::RequiredError*>(&fault) != nullptr) {
        explanation = "a command is required";
    }
    return explanation + "\nsee: tarvik --help";
}

Status run(int argc, char** argv) {
    CLI::App parser("Answers what a device-programming application may offer its user for a device.",
                    "tarvik");
    CommandLine line;
    declare(parser, line);
    try {
        parser.parse(argc, argv);
    } catch (const CLI::ParseError& fault) {
        std::ostringstream text;
        if (fault.get_exit_code() != 0) {
            throw Failure(Status::FAULT, explained(parser, fault));
        }
        parser.exit(fault, text, text);
        Output output;
        output.write(text.str());
        output.flush();
        return Status::YES;
    }
    Tool tool(line.settings);
    try {
        return line.action(tool);
    } catch (const Failure& failure) {
        return tool.fail(failure);
    } catch (const TarvikException& fault) {
        return tool.fail({Status::FAULT, fmt::format("the database can't be read: {}", fault.what())});
    }
}

} // namespace

int main(int argc, char** argv) {
    // A reader that closes its end shows as a failing write, which ends the run quietly.
    std::signal(SIGPIPE, SIG_IGN);
    Status status = Status::FAULT;
    try {
        status = run(argc, argv);
    } catch (const std::exception& fault) {
        writeError(std::string("tarvik: ") + fault.what());
    }
    return static_cast<int>(status);
}
