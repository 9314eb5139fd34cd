// What can stand at a place of the command line: the one vocabulary of the completions of all shells.
#include "app/completion/Completion.h"

#include "app/LongOptions.h"
#include "app/completion/PartialCommandLine.h"
#include "lint/Rule.h"
#include "model/Catalogue.h"
#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "query/Demonstration.h"
#include "term/Messages.h"
#include "term/Output.h"
#include "text/Json.h"
#include "text/Suggest.h"

#include <TarvikException.h>
#include <UT_STR.h>
#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <functional>
#include <map>
#include <set>

namespace completion {

namespace {

struct Candidate {
    std::string word;
    std::string description;
};

using Words = std::vector<std::string>;

Words joined(Words left, const Words& right) {
    left.insert(left.end(), right.begin(), right.end());
    return left;
}

Words modes() {
    Words all = vocabulary::modes();
    for (std::size_t mode = 0; mode < vocabulary::modes().size(); ++mode) {
        all = joined(std::move(all), vocabulary::otherModeTexts(static_cast<TARVIKNS::MODE_TYPE>(mode)));
    }
    return all;
}

std::string device(const CommandLineSoFar& line) {
    return line.operands.empty() ? std::string() : line.operands.front();
}

void addKeys(std::set<std::string>& keys, const std::string& owner, const std::string& list) {
    for (const auto& [key, entry] : catalogue::entries(owner, list)) {
        keys.insert(key);
    }
}

ConstraintsManager& manager() {
    ConstraintsManager& made = *ConstraintsManager::getConstraintsManager();
    made.setExceptions(false);
    return made;
}

/// The properties of a device and its family, or of all families when there is no device.
Words properties(const CommandLineSoFar& line) {
    const Words owners = line.operands.empty()
                             ? catalogue::families()
                             : Words{device(line), plain(manager().getPartFamily(device(line).c_str()))};
    std::set<std::string> keys;
    for (const std::string& owner : owners) {
        addKeys(keys, owner, "PROPERTY");
        addKeys(keys, owner, "PROPERTIES");
        addKeys(keys, "spi.acd", plain(UT_STR::Upper(owner.c_str())) + "_PROPERTY");
    }
    return {keys.begin(), keys.end()};
}

Words propertiesToSet(const CommandLineSoFar& line) {
    Words keys = properties(line);
    for (std::string& key : keys) {
        key += '=';
    }
    return keys;
}

Words packages(const CommandLineSoFar& line) {
    Words all;
    for (const StringBase& package : manager().getDeviceStringProperties(device(line).c_str(), "PACKAGES")) {
        all.push_back(plain(package));
    }
    return all;
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

/// What can stand for an argument, by the name under which the help shows it. Where a file can stand there is no
/// entry.
Words valuesOf(const CommandLineSoFar& line, const std::string& name) {
    using Values = std::function<Words(const CommandLineSoFar&)>;
    static const std::map<std::string, Values> all{
        {"CODE", [](const auto&) { return codes(); }},
        {"DEVICE",
         [](const auto& so) { return so.command->get_name() == "spi" ? flashes() : catalogue::names(); }},
        {"FAMILY", [](const auto&) { return catalogue::families(); }},
        {"FORMAT",
         [](const auto&) {
             return Words{"text", "json", "sarif"};
         }},
        {"GLOB", [](const auto&) { return catalogue::names(); }},
        {"KEY", properties},
        {"KEY=VALUE", propertiesToSet},
        {"MODE", [](const auto&) { return modes(); }},
        {"OPERATION", [](const auto&) { return vocabulary::operations(); }},
        {"OPTION", [](const auto&) { return vocabulary::options(); }},
        {"OUTPUT", [](const auto&) { return vocabulary::outputs(); }},
        {"PACKAGE", packages},
        {"TABLE",
         [](const auto&) {
             return Words{"operations", "bsdl", "options", "families", "multiboot"};
         }},
        {"TYPE", [](const auto&) { return multiboot::TYPES; }},
        {"VALUE", [](const auto&) { return Words{}; }},
        {"WHEN",
         [](const auto&) {
             return Words{"auto", "always", "never"};
         }},
        {"WIDTH", [](const auto&) { return multiboot::WIDTHS; }},
    };
    const auto found = all.find(name);
    if (found == all.end()) {
        throw CommandError(ExitCode::NO, "a file's name");
    }
    return found->second(line);
}

std::vector<Candidate> commandsOf(const CLI::App& parser) {
    std::vector<Candidate> all;
    for (const CLI::App* const command : parser.get_subcommands({})) {
        all.push_back({command->get_name(), command->get_description()});
    }
    return all;
}

std::vector<Candidate> optionsOf(const CLI::App& parser, const CLI::App* command) {
    std::vector<Candidate> all;
    for (OptionName& option : optionNames(parser, command)) {
        all.push_back({std::move(option.name), std::move(option.description)});
    }
    return all;
}

/// Opens the database without a word: this is no place to complain about it.
void openDatabase(const CommandLineSoFar& line) {
    if (!line.databases.empty()) {
        AcdStore::setSearchPath(line.databases);
    } else if (AcdStore::searchPath().empty()) {
        AcdStore::setMemoryFiles(demonstrationFiles());
    }
}

std::vector<Candidate> argumentsOf(const CommandLineSoFar& line) {
    const CLI::Option& option = *line.argument;
    openDatabase(line);
    std::vector<Candidate> all;
    const std::string name = option.get_positional() ? option.get_name(true) : option.get_type_name();
    // Behind the name may stand what is accepted: "FORMAT:{text,json,sarif}".
    for (std::string& word : valuesOf(line, name.substr(0, name.find(':')))) {
        all.push_back({line.prefix + word, ""});
    }
    return all;
}

std::vector<Candidate> candidates(const CLI::App& parser, const CommandLineSoFar& line) {
    if (line.isOptionName) {
        return optionsOf(parser, line.command);
    }
    if (line.argument != nullptr) {
        return argumentsOf(line);
    }
    return line.command == nullptr && line.prefix.empty() ? commandsOf(parser) : std::vector<Candidate>{};
}

bool beginsWith(const std::string& word, const std::string& begun) {
    return word.size() >= begun.size() && sameWithoutCase(word.substr(0, begun.size()), begun);
}

} // namespace

ExitCode complete(const CLI::App& parser, const std::vector<std::string>& words) {
    const Messages unheard;
    const CommandLineSoFar line(parser, words);
    Output output;
    try {
        std::set<std::string> written;
        for (const Candidate& candidate : candidates(parser, line)) {
            if (beginsWith(candidate.word, line.prefix + line.begun) &&
                written.insert(candidate.word).second) {
                const std::string tab = candidate.description.empty() ? "" : "\t";
                output.write(candidate.word + tab + candidate.description + '\n');
            }
        }
        output.flush();
    } catch (const CommandError& failure) {
        return failure.status();
    } catch (const TarvikException&) {
        return ExitCode::FAULT;
    }
    return ExitCode::YES;
}

} // namespace completion
