// Texts of the database on their way into a page: nothing in them is ever markup.
#include "report/HtmlEscape.h"

#include <algorithm>
#include <cctype>
#include <cstddef>

#include <fmt/format.h>

namespace report {

namespace {

constexpr const char* REPLACEMENT = "\xEF\xBF\xBD";

constexpr unsigned char byteOf(char character) { return static_cast<unsigned char>(character); }

constexpr bool isPlain(char character) { return character >= ' ' && character <= '~'; }

/// Does it stand for itself in JSON too?
constexpr bool isHarmless(char character) {
    return isPlain(character) && character != '"' && character != '\\' && character != '<';
}

struct Sequence {
    std::size_t length; ///< of the character, or of what is to be replaced as one
    bool isValid;
};

/// What the bytes of a character may be, by its first one.
struct Form {
    unsigned char first;
    unsigned char last;
    std::size_t length;
    unsigned char secondFirst; ///< keeps out long forms, surrogates, and what lies above U+10FFFF
    unsigned char secondLast;
};

constexpr Form FORMS[] = {
    {0xC2, 0xDF, 2, 0x80, 0xBF}, {0xE0, 0xE0, 3, 0xA0, 0xBF}, {0xE1, 0xEC, 3, 0x80, 0xBF},
    {0xED, 0xED, 3, 0x80, 0x9F}, {0xEE, 0xEF, 3, 0x80, 0xBF}, {0xF0, 0xF0, 4, 0x90, 0xBF},
    {0xF1, 0xF3, 4, 0x80, 0xBF}, {0xF4, 0xF4, 4, 0x80, 0x8F},
};

/// The character, or the broken beginning of one, that a text of at least one byte starts with.
Sequence firstSequence(std::string_view text) {
    const unsigned char first = byteOf(text[0]);
    if (first < 0x80) {
        return {1, isPlain(text[0]) || text[0] == '\t'};
    }
    const auto* const form = std::find_if(std::begin(FORMS), std::end(FORMS), [&](const Form& candidate) {
        return candidate.first <= first && first <= candidate.last;
    });
    if (form == std::end(FORMS)) {
        return {1, false};
    }
    std::size_t length = 1;
    for (; length < form->length && length < text.size(); ++length) {
        const unsigned char byte = byteOf(text[length]);
        if (byte < (length == 1 ? form->secondFirst : 0x80) ||
            byte > (length == 1 ? form->secondLast : 0xBF)) {
            break;
        }
    }
    // U+0080 to U+009F are control characters too.
    return {length, length == form->length && !(first == 0xC2 && byteOf(text[1]) < 0xA0)};
}

} // namespace

std::string displayable(std::string_view text) {
    if (std::all_of(text.begin(), text.end(), isPlain)) {
        return std::string(text);
    }
    std::string shown;
    while (!text.empty()) {
        const Sequence sequence = firstSequence(text);
        shown += sequence.isValid ? text.substr(0, sequence.length) : std::string_view(REPLACEMENT);
        text.remove_prefix(sequence.length);
    }
    return shown;
}

std::string escaped(std::string_view text) {
    std::string html;
    for (const char character : displayable(text)) {
        switch (character) {
        case '&':
            html += "&amp;";
            break;
        case '<':
            html += "&lt;";
            break;
        case '>':
            html += "&gt;";
            break;
        case '"':
            html += "&quot;";
            break;
        case '\'':
            html += "&#39;";
            break;
        default:
            html += character;
        }
    }
    return html;
}

std::string jsonString(std::string_view text) {
    std::string json = "\"";
    if (std::all_of(text.begin(), text.end(), isHarmless)) {
        json += text;
        return json += '"';
    }
    for (const char character : displayable(text)) {
        if (character == '"' || character == '\\') {
            json += '\\';
        }
        switch (character) {
        case '<': // Ends the script, or begins a comment in it.
            json += "\\u003c";
            break;
        case '\t':
            json += "\\t";
            break;
        default:
            json += character;
        }
    }
    return json + '"';
}

std::string urlFragment(std::string_view text) {
    // As encodeURIComponent.
    constexpr std::string_view UNRESERVED = "-_.!~*'()";
    std::string encoded;
    for (const char character : displayable(text)) {
        if (std::isalnum(byteOf(character)) != 0 || UNRESERVED.find(character) != std::string_view::npos) {
            encoded += character;
        } else {
            encoded += fmt::format("%{:02X}", byteOf(character));
        }
    }
    return encoded;
}

} // namespace report
