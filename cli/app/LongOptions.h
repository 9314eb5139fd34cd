#pragma once

#include <CLI/CLI.hpp>

#include <string>
#include <vector>

/// An option by its long name.
struct OptionName {
    std::string name; ///< with its dashes
    std::string description;
};

/// The options that may stand in a command line: those of its command, null when there is none yet, and the tool's.
[[nodiscard]] inline std::vector<OptionName> optionNames(const CLI::App& tool, const CLI::App* command) {
    std::vector<OptionName> names;
    for (const CLI::App* const app : {command, &tool}) {
        if (app == nullptr) {
            continue;
        }
        for (const CLI::Option* const option : app->get_options()) {
            for (const std::string& name : option->get_lnames()) {
                names.push_back({"--" + name, option->get_description()});
            }
        }
    }
    return names;
}
