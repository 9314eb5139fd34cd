#pragma once

#include "app/CommandLine.h"

#include <string>
#include <vector>

namespace completion {

/// What an unfinished command line contains, as far as completing its last word needs it.
struct PartialCommandLine {
    /// @param words the last one is to be completed
    PartialCommandLine(const CommandLine& line, const std::vector<std::string>& words);

    const DeclaredCommand* command = nullptr; ///< null as long as there is none

    /// What the last word belongs to; null for a command, or if there are too many words.
    const Argument* argument = nullptr;

    bool isOptionName = false;         ///< the last word is the beginning of an option's name
    std::string prefix;                ///< "--mode=", if the last word continues with the option's value
    std::string partialWord;           ///< the last word without the prefix
    std::vector<std::string> operands; ///< the command's arguments so far that are no options
    std::vector<std::string> databases;

private:
    /// Reads one word. @return the option whose value is the next word; null if there is none
    [[nodiscard]] const Argument* read(const std::string& word);
    void take(const Argument& option, const std::string& value);
    [[nodiscard]] const Argument* findOption(const std::string& name) const;
    [[nodiscard]] const Argument* nextOperand() const;

    const CommandLine& m_line;
};

} // namespace completion
