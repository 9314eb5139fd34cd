// The sections of the manual page that are made from the tables of commands and arguments.
#include "app/ManualPage.h"

#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace {

constexpr std::size_t WIDTH = 78;

/// A line of text with the bytes escaped that mdoc would interpret.
std::string escaped(const std::string& line) {
    std::string text = line.starts_with('.') || line.starts_with('\'') ? "\\&" : "";
    for (const char byte : line) {
        text += byte == '\\' ? "\\e" : std::string(1, byte);
    }
    return text + '\n';
}

/// Sentences, each on lines of its own as mdoc wants it.
std::string sentences(const std::string& text) {
    std::string result;
    std::vector<std::string> words;
    for (const std::string& word : wordsOf(text)) {
        words.push_back(word);
        if (word.ends_with('.')) {
            for (const std::string& line : lines(words, WIDTH, "")) {
                result += escaped(line);
            }
            words.clear();
        }
    }
    for (const std::string& line : lines(words, WIDTH, "")) {
        result += escaped(line);
    }
    return result;
}

/// An option with its value, or an argument's place.
std::string nameOf(const Argument& argument) {
    if (!argument.isOption()) {
        return "Ar " + argument.name + (argument.isRepeatable() ? " ..." : "");
    }
    const std::string name = "Fl Fl " + argument.name.substr(2);
    return argument.isFlag() ? name : name + " Ar " + argument.value;
}

std::string descriptionOf(const Argument& argument) {
    std::string text = argument.description;
    if (!argument.choices.empty()) {
        text += fmt::format(": {}", fmt::join(argument.choices, ", "));
    }
    return text + '.';
}

std::string list(const ArgumentList& arguments) {
    if (arguments.empty()) {
        return {};
    }
    std::string text = ".Bl -tag -width Ds\n";
    for (const Argument& argument : arguments) {
        const std::string letter = argument.letter == '\0' ? "" : fmt::format("Fl {} , ", argument.letter);
        text += fmt::format(".It {}{}\n{}", letter, nameOf(argument), sentences(descriptionOf(argument)));
    }
    return text + ".El\n";
}

/// The command with all its arguments; those that may be absent are in brackets.
std::string synopsis(const DeclaredCommand& declared) {
    std::string text = std::string("Ic ") + declared.command.name;
    for (const Argument& argument : declared.arguments) {
        const char* const form = argument.required ? " {}" : " Oo {} Oc";
        text += fmt::format(fmt::runtime(form), nameOf(argument));
    }
    return text;
}

} // namespace

std::string manualSections(const CommandLine& line) {
    std::string text =
        ".Sh OPTIONS\nEvery command accepts these options, too.\n" + list(line.options) + ".Sh COMMANDS\n";
    for (const CommandLine::Group& group : line.groups) {
        text += fmt::format(".Ss {}\n.Bl -tag -width Ds\n", group.title);
        for (const DeclaredCommand& declared : group.commands) {
            const Command& command = declared.command;
            text += fmt::format(".It {}\n{}{}{}", synopsis(declared),
                                sentences(command.summary + std::string(".")), sentences(command.details),
                                list(declared.arguments));
        }
        text += ".El\n";
    }
    return text;
}
