#include "database/Fault.h"

#include <cstddef>

// How a fault is put into words. Apart from the reading, so that whoever gathers faults can word them alike.

namespace acd {

namespace {

constexpr std::size_t LONGEST_EXCERPT = 60;

[[nodiscard]] bool continuesCharacter(char byte) noexcept {
    return (static_cast<unsigned char>(byte) & 0xC0) == 0x80;
}

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

[[nodiscard]] std::string whatIsWrong(const Fault& fault) {
    std::string quoted = '\'' + fault.fragment + '\'';
    switch (fault.kind) {
    case FaultKind::NO_EQUALS_SIGN:
        return "no '=' in " + quoted;
    case FaultKind::EMPTY_KEY:
        return "no key before the '=' of " + quoted;
    case FaultKind::BLANK_IN_KEY:
        return "blank in the key " + quoted;
    case FaultKind::NUL_BYTE:
        return "NUL byte in " + quoted;
    case FaultKind::LINE_TOO_LONG:
        return "line of more than 16 MiB: " + quoted;
    case FaultKind::CONTINUED_AT_END:
        return "the file ends where this line should go on: " + quoted;
    case FaultKind::UNCLOSED_HEADER:
        return "header without ']': " + quoted;
    case FaultKind::EMPTY_NAME:
        return "header without a name: " + quoted;
    case FaultKind::BLANK_IN_NAME:
        return "blank in the name of a header: " + quoted;
    case FaultKind::TEXT_BEHIND_HEADER:
        return "text behind a header: " + quoted;
    case FaultKind::VALUE_TOO_LONG:
        break;
    }
    return "the value would grow over 1 GiB by " + quoted;
}

} // namespace

std::string describe(const Fault& fault) {
    std::string text = whatIsWrong(fault);
    if (fault.closesSection) {
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
    if (text.size() <= LONGEST_EXCERPT) {
        return printable(text);
    }
    std::size_t length = LONGEST_EXCERPT;
    while (length > LONGEST_EXCERPT - 4 && continuesCharacter(text[length])) {
        --length;
    }
    return printable(text.substr(0, length)) + "...";
}

} // namespace acd
