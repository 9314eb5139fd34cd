// The options of the tool and the table of its commands.
#include "app/CommandLine.h"

#include "app/Help.h"
#include "commands/Commands.h"
#include "text/Suggest.h"

#include <fmt/format.h>

namespace {

DeclaredCommand declared(const Command& command) {
    DeclaredCommand result{command, {}, {}};
    result.action = command.declare(result.arguments);
    return result;
}

std::vector<DeclaredCommand> declared(std::initializer_list<const Command*> commands) {
    std::vector<DeclaredCommand> all;
    for (const Command* const command : commands) {
        all.push_back(declared(*command));
    }
    return all;
}

} // namespace

CommandLine::CommandLine() {
    options = {
        {.name = "--help", .letter = 'h', .description = "Show this help", .target = &help},
        {.name = "--version", .letter = 'V', .description = "Show the version", .target = &version},
        {.name = "--database",
         .value = "DIR",
         .description = "The directory of the database. Repeat to stack directories, or separate them as in "
                        "TARVIK_DATABASE; "
                        "earlier ones win. Default: "
                        "TARVIK_DATABASE, the installed database or a built-in demonstration",
         .kind = ValueKind::PATH,
         .target = &settings.databases},
        {.name = "--json", .description = "Answer with one JSON object", .target = &settings.json},
        {.name = "--verbose",
         .description = "Show the manager's debug messages, too",
         .target = &settings.verbose},
        {.name = "--literal",
         .description = "Pass device and package names to the manager exactly as typed",
         .target = &settings.literal},
        {.name = "--color",
         .value = "WHEN",
         .description = "Use colours (auto: on a terminal, unless NO_COLOR is set)",
         .kind = ValueKind::CHOICE,
         .choices = {"auto", "always", "never"},
         .target = &colours},
    };
    groups = {
        {"Devices", declared({&command::DEVICES, &command::IDENTIFY, &command::FAMILIES, &command::VOCABULARY,
                              &command::SHOW, &command::SPI, &command::REPORT})},
        {"Questions", declared({&command::CHECK, &command::OPERATIONS, &command::OPTIONS, &command::BSDL,
                                &command::OPERATION_OPTIONS, &command::PROPERTY, &command::MULTIBOOT,
                                &command::WHY, &command::WHICH})},
        {"Databases", declared({&command::LINT, &command::FORMAT, &command::DIFF, &command::NEW,
                                &command::RENAME, &command::REMOVE, &command::INDEX})},
        {"Programs", declared({&command::BATCH, &command::LSP, &command::DUMP})},
        {"Help", {declaredHelp()}},
    };
}

DeclaredCommand CommandLine::declaredHelp() {
    DeclaredCommand result{
        {"help", "Show the help of the tool or of a command", "", "tarvik help check", nullptr}, {}, {}};
    result.arguments = {{.name = "COMMAND",
                         .description = "The command",
                         .kind = ValueKind::COMMAND,
                         .target = &m_helpTopic}};
    result.action = [this](Tool& tool) {
        const DeclaredCommand* const topic = m_helpTopic.empty() ? nullptr : find(m_helpTopic);
        if (topic == nullptr && !m_helpTopic.empty()) {
            throw CommandError(ExitCode::FAULT,
                               fmt::format("unknown command \"{}\"{}\nsee: tarvik help", m_helpTopic,
                                           didYouMean(m_helpTopic, commandNames())));
        }
        tool.output().write(helpText(*this, topic));
        tool.output().flush();
        return ExitCode::YES;
    };
    return result;
}

const DeclaredCommand* CommandLine::find(const std::string& name) const {
    for (const Group& group : groups) {
        for (const DeclaredCommand& declared : group.commands) {
            if (declared.command.name == name) {
                return &declared;
            }
        }
    }
    return nullptr;
}

std::vector<std::string> CommandLine::commandNames() const {
    std::vector<std::string> names;
    for (const Group& group : groups) {
        for (const DeclaredCommand& declared : group.commands) {
            names.emplace_back(declared.command.name);
        }
    }
    return names;
}

std::vector<const Argument*> CommandLine::optionsOf(const DeclaredCommand* command) const {
    std::vector<const Argument*> all;
    const auto append = [&all](const ArgumentList& arguments) {
        for (const Argument& argument : arguments) {
            if (argument.isOption()) {
                all.push_back(&argument);
            }
        }
    };
    if (command != nullptr) {
        append(command->arguments);
    }
    append(options);
    return all;
}
