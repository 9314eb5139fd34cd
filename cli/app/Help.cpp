// The layout of the help texts.
#include "app/Help.h"

#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <sstream>

namespace {

/// Where the descriptions of options begin, and those of commands: their names are shorter.
constexpr std::size_t OPTION_COLUMN = 28;
constexpr std::size_t COMMAND_COLUMN = 21;

/// What the descriptions have at least.
constexpr std::size_t LEAST_WIDTH = 20;

} // namespace

HelpFormatter::HelpFormatter(std::size_t width) : m_width(width) {
    column_width(OPTION_COLUMN);
    label("SUBCOMMAND", "COMMAND");
    label("REQUIRED", "(required)");
}

std::string HelpFormatter::make_option_desc(const CLI::Option* option) const {
    return broken(CLI::Formatter::make_option_desc(option), OPTION_COLUMN);
}

std::string HelpFormatter::make_subcommand(const CLI::App* command) const {
    std::ostringstream text;
    CLI::detail::format_help(text, command->get_display_name(true),
                             broken(command->get_description(), COMMAND_COLUMN), COMMAND_COLUMN);
    return text.str();
}

std::string HelpFormatter::broken(const std::string& description, std::size_t column) const {
    const std::size_t room = std::max(m_width, column + LEAST_WIDTH) - column;
    return fmt::format("{}", fmt::join(lines(wordsOf(description), room, ""), "\n"));
}
