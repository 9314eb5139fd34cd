#pragma once

#include <CLI/CLI.hpp>

#include <cstddef>
#include <string>

/// Lays out the help: descriptions are broken so that lines fit a width.
class HelpFormatter : public CLI::Formatter {
public:
    explicit HelpFormatter(std::size_t width);

    std::string make_option_desc(const CLI::Option* option) const override;
    std::string make_subcommand(const CLI::App* command) const override;

private:
    [[nodiscard]] std::string broken(const std::string& description, std::size_t column) const;

    std::size_t m_width;
};
