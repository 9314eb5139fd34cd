#pragma once

#include "commands/Command.h"
#include "query/Tool.h"

#include <string>
#include <vector>

/// A command with its arguments.
struct DeclaredCommand {
    Command command;
    ArgumentList arguments;
    Action action;
};

/// Everything that a command line may hold: the parser, the help, the manual page and the completions of the shells
/// are made from it. Parsing stores the values here.
struct CommandLine {
    /// Commands that belong together.
    struct Group {
        const char* title;
        std::vector<DeclaredCommand> commands;
    };

    CommandLine();
    CommandLine(const CommandLine&) = delete;
    CommandLine& operator=(const CommandLine&) = delete;

    /// The command of this name; null if there is none.
    [[nodiscard]] const DeclaredCommand* find(const std::string& name) const;

    /// The names of all commands.
    [[nodiscard]] std::vector<std::string> commandNames() const;

    /// The options that may follow a command, which may be null: its own, then those of the tool.
    [[nodiscard]] std::vector<const Argument*> optionsOf(const DeclaredCommand* command) const;

    Tool::Settings settings;
    std::string colours = "auto";
    bool help = false;
    bool version = false;
    ArgumentList options; ///< those of the tool itself
    std::vector<Group> groups;

private:
    /// The one command that needs to know all others.
    [[nodiscard]] DeclaredCommand declaredHelp();

    std::string m_helpTopic; ///< the command whose help is wanted; empty for the tool
};
