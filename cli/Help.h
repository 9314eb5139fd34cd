#pragma once

#include <CLI/CLI.hpp>

/// Lays out the help: descriptions are broken so that every line fits 80 columns.
class HelpFormatter : public CLI::Formatter {
public:
    HelpFormatter();

    std::string make_option_desc(const CLI::Option* option) const override;
    std::string make_subcommand(const CLI::App* command) const override;
};
