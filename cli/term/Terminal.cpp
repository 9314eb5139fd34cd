// What is written to a terminal: how wide it is, and how to colour a text.
#include "term/Terminal.h"

#include "term/Streams.h"

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <optional>

namespace {

/// A variable of the environment; nothing if it is empty.
std::optional<std::string_view> variable(const char* name) {
    const char* const text = std::getenv(name);
    return text == nullptr || *text == '\0' ? std::nullopt : std::optional<std::string_view>(text);
}

bool isControl(std::string_view text, std::size_t index) {
    const auto byte = static_cast<unsigned char>(text[index]);
    const auto next = index + 1 < text.size() ? static_cast<unsigned char>(text[index + 1]) : 0U;
    return byte < 0x20 || byte == 0x7F || (byte == 0xC2 && next >= 0x80 && next <= 0x9F);
}

/// The width of what has no width: far more than any line needs, and safe to calculate with.
constexpr std::size_t UNLIMITED = std::size_t{1} << 40U;

std::size_t columnsOf(int stream, bool isTerminal) {
    if (const std::optional<std::string_view> columns = variable("COLUMNS")) {
        std::size_t number = 0;
        const char* const end = columns->data() + columns->size();
        const std::from_chars_result read = std::from_chars(columns->data(), end, number);
        if (read.ec == std::errc() && read.ptr == end && number != 0) {
            return number;
        }
    }
    if (!isTerminal) {
        return UNLIMITED;
    }
    const std::size_t columns = streams::columns(stream);
    return columns != 0 ? columns : LINE_WIDTH;
}

bool showsColours(int stream, Terminal::Colours colours) {
    if (colours != Terminal::Colours::AUTOMATIC) {
        return colours == Terminal::Colours::ALWAYS;
    }
    return !variable("NO_COLOR") && streams::hasColours(stream);
}

} // namespace

std::string printable(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\t') {
            result += ' ';
        } else if (isControl(text, i)) {
            result += '?';
            i += text[i] == '\xC2' ? 1U : 0U;
        } else {
            result += text[i];
        }
    }
    return result;
}

std::string printableLines(std::string_view text) {
    std::string result;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find('\n', start), text.size());
        result += printable(text.substr(start, end - start));
        if (end < text.size()) {
            result += '\n';
        }
        start = end + 1;
    }
    return result;
}

Terminal::Terminal(int stream, Colours colours)
    : m_isTerminal(streams::isTerminal(stream)), m_hasColours(showsColours(stream, colours)),
      m_width(columnsOf(stream, m_isTerminal)) {}

std::string Terminal::sanitised(std::string_view text) const {
    return m_isTerminal ? printable(text) : std::string(text);
}

std::string Terminal::marked(const char* colour, std::string_view text) const {
    if (!m_hasColours || text.empty()) {
        return std::string(text);
    }
    return std::string("\x1b[").append(colour).append("m").append(text).append("\x1b[0m");
}
