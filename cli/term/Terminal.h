#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// What a line of text should not exceed if no width is known.
inline constexpr std::size_t LINE_WIDTH = 80;

/// The text with its control characters as `?`, each as one column, so that it does no harm on a terminal.
[[nodiscard]] std::string printable(std::string_view text);

/// The same for a text of several lines: line ends stay.
[[nodiscard]] std::string printableLines(std::string_view text);

/// What a text is written to: whether it is a terminal, how wide it is, and whether it shows colours.
class Terminal {
public:
    /// When to use colours.
    enum class Colours { AUTOMATIC, ALWAYS, NEVER };

    /// What a stream leads to (Streams.h). Its width is `COLUMNS`, otherwise that of the terminal; anything but a terminal
    /// has no limit. Automatic colours are those of a terminal, unless the environment has `NO_COLOR` or says that the
    /// terminal is dumb.
    Terminal(int stream, Colours colours);

    [[nodiscard]] bool isTerminal() const noexcept { return m_isTerminal; }
    [[nodiscard]] std::size_t width() const noexcept { return m_width; }

    /// A text of the database or the command line: printable on a terminal, otherwise as it is.
    [[nodiscard]] std::string sanitised(std::string_view text) const;

    /// The text as one of these kinds of words; without colours as it is.
    [[nodiscard]] std::string heading(std::string_view text) const { return marked("1", text); }
    [[nodiscard]] std::string good(std::string_view text) const { return marked("32", text); }
    [[nodiscard]] std::string bad(std::string_view text) const { return marked("31", text); }
    [[nodiscard]] std::string warning(std::string_view text) const { return marked("33", text); }
    [[nodiscard]] std::string dim(std::string_view text) const { return marked("36", text); }

private:
    [[nodiscard]] std::string marked(const char* colour, std::string_view text) const;

    bool m_isTerminal;
    bool m_hasColours;
    std::size_t m_width;
};
