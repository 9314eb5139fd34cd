#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// What a line of text should not exceed where nothing else is known.
inline constexpr std::size_t LINE_WIDTH = 80;

/// The text with its control bytes as `?`, each as one column, so that it does no harm on a terminal.
[[nodiscard]] std::string printable(std::string_view text);

/// What shows a text: how wide it is, and how it tells one kind of words from another.
class Terminal {
public:
    /// When to use colours.
    enum class Colours { AUTOMATIC, ALWAYS, NEVER };

    /// What an open file leads to. Its width is `COLUMNS`, else that of the terminal, else 80. Colours are
    /// automatic on a terminal, unless the environment has `NO_COLOR` or says that the terminal is dumb.
    Terminal(int descriptor, Colours colours);

    [[nodiscard]] bool isTerminal() const noexcept { return m_isTerminal; }
    [[nodiscard]] std::size_t width() const noexcept { return m_width; }

    /// A text of the database: on a terminal it is printable, elsewhere as it is.
    [[nodiscard]] std::string shown(std::string_view text) const;

    /// The text as one of these kinds of words; without colours as it is.
    [[nodiscard]] std::string heading(std::string_view text) const { return marked("1", text); }
    [[nodiscard]] std::string good(std::string_view text) const { return marked("32", text); }
    [[nodiscard]] std::string bad(std::string_view text) const { return marked("31", text); }
    [[nodiscard]] std::string doubtful(std::string_view text) const { return marked("33", text); }
    [[nodiscard]] std::string aside(std::string_view text) const { return marked("36", text); }

private:
    [[nodiscard]] std::string marked(const char* colour, std::string_view text) const;

    bool m_isTerminal;
    bool m_hasColours;
    std::size_t m_width;
};
