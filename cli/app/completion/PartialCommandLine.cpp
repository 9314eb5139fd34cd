// Reads a command line that is not finished, which the parser proper would refuse.
#include "app/completion/PartialCommandLine.h"

namespace completion {

namespace {

bool takesValue(const CLI::Option* option) {
    return option != nullptr && option->get_items_expected_max() != 0;
}

} // namespace

CommandLineSoFar::CommandLineSoFar(const CLI::App& tool, const std::vector<std::string>& words) {
    const CLI::Option* waiting = nullptr;
    for (std::size_t i = 0; i + 1 < words.size(); ++i) {
        if (waiting != nullptr) {
            take(*waiting, words[i]);
            waiting = nullptr;
        } else {
            waiting = read(tool, words[i]);
        }
    }
    begun = words.empty() ? "" : words.back();
    if (waiting != nullptr) {
        argument = waiting;
        return;
    }
    const std::size_t equals = begun.find('=');
    if (begun.starts_with("--") && equals != std::string::npos) {
        argument = find(tool, begun.substr(0, equals));
        prefix = begun.substr(0, equals + 1);
        begun.erase(0, equals + 1);
        return;
    }
    isOptionName = begun.starts_with('-');
    if (!isOptionName && command != nullptr) {
        argument = nextOperand();
    }
}

const CLI::Option* CommandLineSoFar::read(const CLI::App& tool, const std::string& word) {
    if (word.starts_with('-')) {
        const std::size_t equals = std::min(word.find('='), word.size());
        const CLI::Option* const option = find(tool, word.substr(0, equals));
        if (!takesValue(option)) {
            return nullptr;
        }
        if (equals == word.size()) {
            return option;
        }
        take(*option, word.substr(equals + 1));
    } else if (command == nullptr) {
        const std::vector<const CLI::App*> named =
            tool.get_subcommands([&word](const CLI::App* one) { return one->get_name() == word; });
        command = named.empty() ? nullptr : named.front();
    } else {
        operands.push_back(word);
    }
    return nullptr;
}

void CommandLineSoFar::take(const CLI::Option& option, const std::string& value) {
    if (option.check_name("--database")) {
        databases.push_back(value);
    }
}

const CLI::Option* CommandLineSoFar::find(const CLI::App& tool, const std::string& name) const {
    const CLI::Option* const own = command == nullptr ? nullptr : command->get_option_no_throw(name);
    return own != nullptr ? own : tool.get_option_no_throw(name);
}

const CLI::Option* CommandLineSoFar::nextOperand() const {
    const CLI::Option* last = nullptr;
    std::size_t count = 0;
    for (const CLI::Option* const option :
         command->get_options([](const CLI::Option* one) { return one->get_positional(); })) {
        last = option;
        if (count++ == operands.size()) {
            return option;
        }
    }
    // The last one may take any number of words.
    return last != nullptr && last->get_items_expected_max() > 1 ? last : nullptr;
}

} // namespace completion
