// The help texts, made from the tables of commands and arguments.
#include "app/Help.h"

#include "model/Vocabulary.h"
#include "term/Streams.h"
#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <sstream>

namespace {

/// Where the descriptions of arguments begin, and those of commands: their names are shorter.
constexpr std::size_t ARGUMENT_COLUMN = 28;
constexpr std::size_t COMMAND_COLUMN = 21;

/// Narrower descriptions are harder to read than lines that are too long.
constexpr std::size_t MINIMUM_WIDTH = 20;

std::string paragraph(const std::string& text, std::size_t width) {
    return fmt::format("{}\n", fmt::join(lines(wordsOf(text), width, ""), "\n"));
}

/// A name, and its description in a column of its own.
std::string entry(const std::string& name, const std::string& description, std::size_t column,
                  std::size_t width) {
    std::string text = "  " + name;
    // A name that reaches into the column has its line to itself.
    if (text.size() + 1 > column) {
        text += '\n' + std::string(column, ' ');
    } else {
        text.append(column - text.size(), ' ');
    }
    const std::string indented = '\n' + std::string(column, ' ');
    const std::size_t room = std::max(width, column + MINIMUM_WIDTH) - column;
    return fmt::format("{}{}\n", text, fmt::join(lines(wordsOf(description), room, ""), indented));
}

std::string nameOf(const Argument& argument) {
    if (!argument.isOption()) {
        return argument.name;
    }
    const std::string letter = argument.letter == '\0' ? "    " : std::string{'-', argument.letter, ',', ' '};
    return letter + argument.name + (argument.isFlag() ? "" : ' ' + argument.value);
}

std::string descriptionOf(const Argument& argument) {
    std::string text = argument.description;
    if (!argument.choices.empty()) {
        text += fmt::format(": {}", fmt::join(argument.choices, ", "));
    }
    return argument.required ? text + " (required)" : text;
}

std::string section(const char* title, const ArgumentList& arguments, bool options, std::size_t width) {
    std::string text;
    for (const Argument& argument : arguments) {
        if (argument.isOption() == options) {
            text += entry(nameOf(argument), descriptionOf(argument), ARGUMENT_COLUMN, width);
        }
    }
    return text.empty() ? text : fmt::format("\n{}:\n{}", title, text);
}

/// The words of a kind of value, the same in every database; none for the other kinds.
const std::vector<std::string>& wordsOf(ValueKind kind) {
    static const std::vector<std::string> none;
    switch (kind) {
    case ValueKind::MODE:
        return vocabulary::modes();
    case ValueKind::OUTPUT:
        return vocabulary::outputs();
    case ValueKind::OPERATION:
        return vocabulary::operations();
    case ValueKind::OPTION:
        return vocabulary::options();
    default:
        return none;
    }
}

/// The words of each kind that a command takes, once for a kind.
std::string possibleValues(const ArgumentList& arguments, std::size_t width) {
    std::string text;
    std::vector<ValueKind> shown;
    for (const Argument& argument : arguments) {
        const std::vector<std::string>& words = wordsOf(argument.kind);
        if (!words.empty() && std::find(shown.begin(), shown.end(), argument.kind) == shown.end()) {
            shown.push_back(argument.kind);
            text +=
                entry(argument.valueName(), fmt::format("{}", fmt::join(words, ", ")), COMMAND_COLUMN, width);
        }
    }
    return text.empty() ? text : "\nPossible values, in any case (more texts: tarvik vocabulary):\n" + text;
}

std::string examples(const Command& command) {
    std::string text = "\nExamples:\n";
    std::istringstream all(command.examples);
    for (std::string line; std::getline(all, line);) {
        text += "  " + line + '\n';
    }
    return text;
}

std::string commandHelp(const DeclaredCommand& declared, std::size_t width) {
    const Command& command = declared.command;
    const std::string details = command.details;
    return fmt::format("{}.\n\nUsage: tarvik {}\n", command.summary, usageOf(declared)) +
           (details.empty() ? details : '\n' + paragraph(details, width)) +
           section("Arguments", declared.arguments, false, width) +
           section("Options", declared.arguments, true, width) + possibleValues(declared.arguments, width) +
           examples(command) + "\nGlobal options are accepted here, too; see: tarvik --help\n";
}

std::string toolHelp(const CommandLine& line, std::size_t width) {
    std::string text = paragraph("Shows which operations, options and properties a programmable device "
                                 "supports, and why.",
                                 width);
    text += "\nUsage: tarvik [OPTIONS] COMMAND\n" + section("Options", line.options, true, width) +
            "\nCommands:\n";
    for (const CommandLine::Group& group : line.groups) {
        for (const DeclaredCommand& declared : group.commands) {
            text += entry(declared.command.name, declared.command.summary, COMMAND_COLUMN, width);
        }
    }
    return text;
}

} // namespace

std::string helpText(const CommandLine& line, const DeclaredCommand* command) {
    const Terminal terminal(streams::OUTPUT, Terminal::Colours::NEVER);
    // Prose is read by people in a pipe, too.
    const std::size_t width = terminal.isTerminal() ? terminal.width() : LINE_WIDTH;
    return command == nullptr ? toolHelp(line, width) : commandHelp(*command, width);
}

std::string usageOf(const DeclaredCommand& declared) {
    std::string places;
    std::string required;
    bool hasOptional = false;
    for (const Argument& argument : declared.arguments) {
        if (!argument.isOption()) {
            const std::string name = argument.name + (argument.isRepeatable() ? "..." : "");
            places += argument.required ? ' ' + name : " [" + name + ']';
        } else if (argument.required) {
            required += ' ' + argument.name + ' ' + argument.value;
        } else {
            hasOptional = true;
        }
    }
    return declared.command.name + places + required + (hasOptional ? " [OPTIONS]" : "");
}
