// Reads a command line that is not finished, which the parser would refuse.
#include "app/completion/PartialCommandLine.h"

#include <algorithm>

namespace completion {

namespace {

bool hasName(const Argument& argument, const std::string& name) {
    return argument.isOption() && (argument.name == name || (argument.letter != '\0' && name.size() == 2 &&
                                                             name == std::string{'-', argument.letter}));
}

const Argument* findIn(const ArgumentList& arguments, const std::string& name) {
    const auto found = std::find_if(arguments.begin(), arguments.end(),
                                    [&name](const Argument& argument) { return hasName(argument, name); });
    return found == arguments.end() ? nullptr : &*found;
}

} // namespace

PartialCommandLine::PartialCommandLine(const CommandLine& line, const std::vector<std::string>& words)
    : m_line(line) {
    const Argument* waiting = nullptr;
    for (std::size_t i = 0; i + 1 < words.size(); ++i) {
        if (waiting != nullptr) {
            take(*waiting, words[i]);
            waiting = nullptr;
        } else {
            waiting = read(words[i]);
        }
    }
    partialWord = words.empty() ? "" : words.back();
    if (waiting != nullptr) {
        argument = waiting;
        return;
    }
    const std::size_t equals = partialWord.find('=');
    if (partialWord.starts_with("--") && equals != std::string::npos) {
        argument = findOption(partialWord.substr(0, equals));
        prefix = partialWord.substr(0, equals + 1);
        partialWord.erase(0, equals + 1);
        return;
    }
    isOptionName = partialWord.starts_with('-');
    if (!isOptionName && command != nullptr) {
        argument = nextOperand();
    }
}

const Argument* PartialCommandLine::read(const std::string& word) {
    if (word.starts_with('-')) {
        const std::size_t equals = std::min(word.find('='), word.size());
        const Argument* const option = findOption(word.substr(0, equals));
        if (option == nullptr || option->isFlag()) {
            return nullptr;
        }
        if (equals == word.size()) {
            return option;
        }
        take(*option, word.substr(equals + 1));
    } else if (command == nullptr) {
        command = m_line.find(word);
    } else {
        operands.push_back(word);
    }
    return nullptr;
}

void PartialCommandLine::take(const Argument& option, const std::string& value) {
    if (option.name == "--database") {
        databases.push_back(value);
    }
}

const Argument* PartialCommandLine::findOption(const std::string& name) const {
    const Argument* const own = command == nullptr ? nullptr : findIn(command->arguments, name);
    return own != nullptr ? own : findIn(m_line.options, name);
}

const Argument* PartialCommandLine::nextOperand() const {
    const Argument* last = nullptr;
    std::size_t count = 0;
    for (const Argument& candidate : command->arguments) {
        if (candidate.isOption()) {
            continue;
        }
        last = &candidate;
        if (count++ == operands.size()) {
            return last;
        }
    }
    return last != nullptr && last->isRepeatable() ? last : nullptr;
}

} // namespace completion
