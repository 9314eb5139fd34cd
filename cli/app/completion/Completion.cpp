// Finds the words that may continue a command line, for the completions of all shells.
#include "app/completion/Completion.h"

#include "app/completion/PartialCommandLine.h"
#include "lint/Rule.h"
#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/AskedDevice.h"
#include "query/Database.h"
#include "query/Demonstration.h"
#include "query/Properties.h"
#include "term/Messages.h"
#include "term/Output.h"
#include "text/Json.h"
#include "text/Suggest.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <set>

namespace completion {

namespace {

struct Candidate {
    std::string word;
    std::string description;
};

using Words = std::vector<std::string>;

Words modes() {
    Words all = vocabulary::modes();
    for (const vocabulary::Word& word : vocabulary::words(vocabulary::Kind::MODE)) {
        all.insert(all.end(), word.others.begin(), word.others.end());
    }
    return all;
}

ConstraintsManager& manager() {
    ConstraintsManager& made = *ConstraintsManager::getConstraintsManager();
    made.setExceptions(false);
    return made;
}

/// The device that the line is about, as the database spells it; an empty text if there is none.
std::string device(const PartialCommandLine& line) {
    return line.operands.empty() ? std::string() : deviceNamed(line.operands.front()).value_or("");
}

/// The properties of a device that have a value.
void addKeys(std::set<std::string>& keys, const std::string& name) {
    for (const Property& property : manager().isSpiDevice(name.c_str()) ? flashProperties(manager(), name)
                                                                        : deviceProperties(manager(), name)) {
        if (!property.values.empty()) {
            keys.insert(property.key);
        }
    }
}

/// The properties of the line's device, or those that any device has.
Words properties(const PartialCommandLine& line) {
    std::set<std::string> keys;
    if (const std::string name = device(line); !name.empty()) {
        addKeys(keys, name);
    } else if (line.operands.empty()) {
        for (const std::string& any : catalogue::names()) {
            addKeys(keys, any);
        }
    }
    return {keys.begin(), keys.end()};
}

/// The values that any device has for a property.
std::set<std::string> valuesOfProperty(const std::string& key) {
    std::set<std::string> values;
    for (const std::string& any : catalogue::names()) {
        if (manager().isSpiDevice(any.c_str())) {
            values.insert(manager().getSpiDeviceStringProperty(any.c_str(), key.c_str()));
        } else {
            for (std::string& value : propertyValues(manager(), any, key)) {
                values.insert(std::move(value));
            }
        }
    }
    values.erase("");
    return values;
}

/// "VENDOR=" for each property; after "VENDOR=" its values.
Words assignments(const PartialCommandLine& line) {
    const std::size_t equals = line.partialWord.find('=');
    if (equals != std::string::npos) {
        Words all;
        for (const std::string& value : valuesOfProperty(line.partialWord.substr(0, equals))) {
            all.push_back(line.partialWord.substr(0, equals + 1) + value);
        }
        return all;
    }
    Words keys = properties(line);
    for (std::string& key : keys) {
        key += '=';
    }
    return keys;
}

Words flashes() {
    Words names;
    for (const catalogue::Flash& flash : catalogue::flashes()) {
        names.push_back(flash.name);
    }
    return names;
}

Words codes() {
    Words all{"all"};
    for (const lint::Rule* const rule : lint::rules()) {
        all.emplace_back(rule->code);
    }
    return all;
}

/// The words that an argument can have.
/// @throw CommandError (NO) where a file's name is expected
Words valuesOf(const CommandLine& all, const PartialCommandLine& line, const Argument& argument) {
    switch (argument.kind) {
    case ValueKind::PATH:
        throw CommandError(ExitCode::NO, "a file's name");
    case ValueKind::COMMAND:
        return all.commandNames();
    case ValueKind::DEVICE:
        return catalogue::names();
    case ValueKind::FLASH:
        return flashes();
    case ValueKind::FAMILY:
        return catalogue::families();
    case ValueKind::PACKAGE:
        return packagesOf(device(line));
    case ValueKind::MODE:
        return modes();
    case ValueKind::OUTPUT:
        return vocabulary::outputs();
    case ValueKind::OPERATION:
        return vocabulary::operations();
    case ValueKind::OPTION:
        return vocabulary::options();
    case ValueKind::PROPERTY:
        return properties(line);
    case ValueKind::PROPERTY_VALUE:
        return assignments(line);
    case ValueKind::LINT_CODE:
        return codes();
    case ValueKind::TEXT:
    case ValueKind::CHOICE:
        break;
    }
    return argument.choices;
}

std::vector<Candidate> commandsOf(const CommandLine& line) {
    std::vector<Candidate> all;
    for (const CommandLine::Group& group : line.groups) {
        for (const DeclaredCommand& declared : group.commands) {
            all.push_back({declared.command.name, declared.command.summary});
        }
    }
    return all;
}

std::vector<Candidate> optionsOf(const CommandLine& line, const DeclaredCommand* command) {
    std::vector<Candidate> all;
    for (const Argument* const option : line.optionsOf(command)) {
        all.push_back({option->name, option->description});
    }
    return all;
}

/// Opens the database without a message: a mistake in it is reported when the command runs.
void openDatabase(const PartialCommandLine& partial) {
    if (!partial.databases.empty()) {
        AcdStore::setSearchPath(directoriesOf(partial.databases));
    } else if (AcdStore::searchPath().empty()) {
        AcdStore::setMemoryFiles(demonstrationFiles());
    }
}

std::vector<Candidate> argumentsOf(const CommandLine& line, const PartialCommandLine& partial) {
    openDatabase(partial);
    std::vector<Candidate> all;
    for (const std::string& word : valuesOf(line, partial, *partial.argument)) {
        all.push_back({partial.prefix + word, ""});
    }
    return all;
}

std::vector<Candidate> candidates(const CommandLine& line, const PartialCommandLine& partial) {
    if (partial.isOptionName) {
        return optionsOf(line, partial.command);
    }
    if (partial.argument != nullptr) {
        return argumentsOf(line, partial);
    }
    return partial.command == nullptr && partial.prefix.empty() ? commandsOf(line) : std::vector<Candidate>{};
}

bool startsWith(const std::string& word, const std::string& partialWord) {
    return word.size() >= partialWord.size() &&
           sameWithoutCase(word.substr(0, partialWord.size()), partialWord);
}

} // namespace

ExitCode complete(const CommandLine& line, const std::vector<std::string>& words) {
    // Messages are gathered here and dropped.
    const Messages messages;
    const PartialCommandLine partial(line, words);
    Output output;
    try {
        std::set<std::string> written;
        for (const Candidate& candidate : candidates(line, partial)) {
            if (startsWith(candidate.word, partial.prefix + partial.partialWord) &&
                written.insert(candidate.word).second) {
                const std::string tab = candidate.description.empty() ? "" : "\t";
                output.write(candidate.word + tab + candidate.description + '\n');
            }
        }
        output.flush();
    } catch (const CommandError& error) {
        return error.status();
    } catch (const TarvikException&) {
        return ExitCode::FAULT;
    }
    return ExitCode::YES;
}

} // namespace completion
