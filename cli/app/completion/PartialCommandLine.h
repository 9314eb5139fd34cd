#pragma once

#include <CLI/CLI.hpp>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace completion {

/// What an unfinished command line says, as far as completing its last word needs it.
struct CommandLineSoFar {
    /// @param words the last one is what is to be completed
    CommandLineSoFar(const CLI::App& tool, const std::vector<std::string>& words);

    const CLI::App* command = nullptr; ///< null as long as there is none
    const CLI::Option* argument =
        nullptr;                       ///< what the last word belongs to; null: a command, or too many words
    bool isOptionName = false;         ///< the last word begins the name of an option
    std::string prefix;                ///< "--mode=", where the last word goes on with its value
    std::string begun;                 ///< the last word without that
    std::vector<std::string> operands; ///< of the command, so far
    std::vector<std::string> databases;

private:
    /// What belongs to the word behind this one; null for none.
    [[nodiscard]] const CLI::Option* read(const CLI::App& tool, const std::string& word);
    void take(const CLI::Option& option, const std::string& value);
    [[nodiscard]] const CLI::Option* find(const CLI::App& tool, const std::string& name) const;
    [[nodiscard]] const CLI::Option* nextOperand() const;
};

} // namespace completion
