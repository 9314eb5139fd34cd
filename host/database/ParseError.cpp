#include "database/ParseError.h"

#include <AcdText.h>

#include <cstddef>

// How an error is put into words. Apart from the reading, so that whoever gathers errors can word them alike.

namespace acd {

namespace {

constexpr std::size_t MAX_EXCERPT_LENGTH = 60;

/// C0 controls and DEL; C1 controls as UTF-8 writes them, which a terminal obeys as well.
[[nodiscard]] bool isControl(std::string_view text, std::size_t index) noexcept {
    const auto byte = static_cast<unsigned char>(text[index]);
    const auto next = index + 1 < text.size() ? static_cast<unsigned char>(text[index + 1]) : 0;
    return byte < 0x20 || byte == 0x7F || (byte == 0xC2 && next >= 0x80 && next <= 0x9F);
}

void appendEscaped(std::string& text, char byte) {
    constexpr const char* DIGITS = "0123456789abcdef";
    const auto value = static_cast<unsigned char>(byte);
    text += "\\x";
    text += DIGITS[value >> 4];
    text += DIGITS[value & 0xF];
}

[[nodiscard]] std::string whatIsWrong(const ParseError& error) {
    std::string quoted = '\'' + error.excerpt + '\'';
    switch (error.kind) {
    case ParseErrorKind::NO_EQUALS_SIGN:
        return "no '=' in " + quoted;
    case ParseErrorKind::EMPTY_KEY:
        return "no key before the '=' of " + quoted;
    case ParseErrorKind::BLANK_IN_KEY:
        return "blank in the key " + quoted;
    case ParseErrorKind::NUL_BYTE:
        return "NUL byte in " + quoted;
    case ParseErrorKind::LINE_TOO_LONG:
        return "line of more than 16 MiB: " + quoted;
    case ParseErrorKind::CONTINUED_AT_END:
        return "the file ends where this line should go on: " + quoted;
    case ParseErrorKind::UNCLOSED_HEADER:
        return "header without ']': " + quoted;
    case ParseErrorKind::EMPTY_NAME:
        return "header without a name: " + quoted;
    case ParseErrorKind::BLANK_IN_NAME:
        return "blank in the name of a header: " + quoted;
    case ParseErrorKind::TEXT_BEHIND_HEADER:
        return "text behind a header: " + quoted;
    case ParseErrorKind::VALUE_TOO_LONG:
        break;
    }
    return "the value would grow over 1 GiB by " + quoted;
}

} // namespace

std::string describe(const ParseError& error) {
    std::string text = whatIsWrong(error);
    if (error.closesSection) {
        text += "; the keys up to the next header are dropped";
    }
    return text;
}

std::string printable(std::string_view text) {
    std::string result;
    result.reserve(text.size());
    for (std::size_t index = 0; index < text.size(); ++index) {
        if (!isControl(text, index)) {
            result += text[index];
            continue;
        }
        appendEscaped(result, text[index]);
        if (static_cast<unsigned char>(text[index]) == 0xC2) {
            appendEscaped(result, text[++index]);
        }
    }
    return result;
}

std::string excerpt(std::string_view text) {
    if (text.size() <= MAX_EXCERPT_LENGTH) {
        return printable(text);
    }
    std::size_t length = MAX_EXCERPT_LENGTH;
    while (length > MAX_EXCERPT_LENGTH - 4 && AcdText::continuesCharacter(text[length])) {
        --length;
    }
    return printable(text.substr(0, length)) + "...";
}

} // namespace acd
