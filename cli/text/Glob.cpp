// The patterns of shells, alike on all systems.
#include "text/Glob.h"

#include <AcdText.h>

#include <cstddef>
#include <optional>

namespace {

/// What a pattern begins with: one element that matches one byte.
struct Element {
    bool isMatch;     ///< of the byte that was asked about
    std::size_t size; ///< in the pattern
};

unsigned char lower(char byte) { return static_cast<unsigned char>(AcdText::toLower(byte)); }

/// A backslash makes the next byte literal. @return nothing at the end of the pattern
std::optional<char> takeByte(std::string_view pattern, std::size_t& position) {
    position += pattern[position] == '\\' ? 1U : 0U;
    return position < pattern.size() ? std::optional(pattern[position++]) : std::nullopt;
}

/// @param pattern begins with `[`
/// @return nothing if the bracket is not closed, so that it matches itself
std::optional<Element> matchBracket(std::string_view pattern, char byte) {
    std::size_t position = 1;
    const bool isNegated =
        position < pattern.size() && (pattern[position] == '!' || pattern[position] == '^');
    position += isNegated ? 1U : 0U;
    bool isMatch = false;
    for (const std::size_t first = position; position < pattern.size();) {
        if (pattern[position] == ']' && position != first) {
            return Element{isMatch != isNegated, position + 1};
        }
        const std::optional<char> from = takeByte(pattern, position);
        std::optional<char> to = from;
        if (position + 1 < pattern.size() && pattern[position] == '-' && pattern[position + 1] != ']') {
            to = takeByte(pattern, ++position);
        }
        if (!from || !to) {
            break;
        }
        isMatch = isMatch || (lower(*from) <= lower(byte) && lower(byte) <= lower(*to));
    }
    return std::nullopt;
}

Element matchElement(std::string_view pattern, char byte) {
    if (pattern.front() == '?') {
        return {true, 1};
    }
    if (pattern.front() == '[') {
        if (const std::optional<Element> bracket = matchBracket(pattern, byte)) {
            return *bracket;
        }
    }
    std::size_t size = 0;
    const std::optional<char> wanted = takeByte(pattern, size);
    return {wanted && lower(*wanted) == lower(byte), size};
}

} // namespace

bool matchesGlob(std::string_view pattern, std::string_view text) {
    // Where to go on after a mismatch: the latest `*` takes one byte more.
    std::optional<std::string_view> afterStar;
    std::string_view textAfterStar;
    for (;;) {
        if (!pattern.empty() && pattern.front() == '*') {
            pattern.remove_prefix(1);
            afterStar = pattern;
            textAfterStar = text;
            continue;
        }
        if (text.empty() && pattern.empty()) {
            return true;
        }
        if (!text.empty() && !pattern.empty()) {
            if (const Element element = matchElement(pattern, text.front()); element.isMatch) {
                pattern.remove_prefix(element.size);
                text.remove_prefix(1);
                continue;
            }
        }
        if (!afterStar || textAfterStar.empty()) {
            return false;
        }
        textAfterStar.remove_prefix(1);
        pattern = *afterStar;
        text = textAfterStar;
    }
}
