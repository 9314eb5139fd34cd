#pragma once

#include <algorithm>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// How the device database treats texts: case, characters and the splitting of values. For tools that must agree
/// with the readers.
namespace AcdText {

/// @param letter any byte
/// @return its upper case if it is an ASCII letter, otherwise the byte
[[nodiscard]] constexpr char toUpper(char letter) noexcept {
    return letter >= 'a' && letter <= 'z' ? static_cast<char>(letter - 'a' + 'A') : letter;
}

/// @param letter any byte
/// @return its lower case if it is an ASCII letter, otherwise the byte
[[nodiscard]] constexpr char toLower(char letter) noexcept {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

/// @param text any text
/// @return the text with its ASCII letters in lower case
[[nodiscard]] inline std::string lowerCase(std::string_view text) {
    std::string lower(text);
    std::transform(lower.begin(), lower.end(), lower.begin(), toLower);
    return lower;
}

/// Compares without regard to ASCII case: the lower-cased texts as unsigned bytes, the shorter first on a tie.
/// @param left any text
/// @param right any text
/// @return negative, 0 or positive
[[nodiscard]] constexpr int compareIgnoreCase(std::string_view left, std::string_view right) noexcept {
    const std::size_t common = left.size() < right.size() ? left.size() : right.size();
    for (std::size_t index = 0; index < common; ++index) {
        const int difference = static_cast<unsigned char>(toLower(left[index])) -
                               static_cast<unsigned char>(toLower(right[index]));
        if (difference != 0) {
            return difference;
        }
    }
    return static_cast<int>(left.size() > right.size()) - static_cast<int>(left.size() < right.size());
}

/// @param left any text
/// @param right any text
/// @return whether they differ in ASCII case at most
[[nodiscard]] constexpr bool equalsIgnoreCase(std::string_view left, std::string_view right) noexcept {
    return left.size() == right.size() && compareIgnoreCase(left, right) == 0;
}

/// @param byte of a UTF-8 text
/// @return whether it continues a character
[[nodiscard]] constexpr bool continuesCharacter(char byte) noexcept {
    return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U;
}

/// The length of the UTF-8 character that a text starts with.
/// @param text any bytes
/// @return 1 to 4; 0 when the text is empty or starts with no well-formed character (overlong forms, surrogates
///         and values above U+10FFFF are not well-formed)
[[nodiscard]] constexpr std::size_t characterLength(std::string_view text) noexcept {
    const auto byte = [text](std::size_t index) { return static_cast<unsigned char>(text[index]); };
    if (text.empty()) {
        return 0;
    }
    const unsigned char first = byte(0);
    if (first < 0x80) {
        return 1;
    }
    const std::size_t length = first >= 0xC2 && first <= 0xDF   ? 2
                               : first >= 0xE0 && first <= 0xEF ? 3
                               : first >= 0xF0 && first <= 0xF4 ? 4
                                                                : 0;
    if (length == 0 || length > text.size()) {
        return 0;
    }
    // The second byte excludes overlong forms, surrogates and what is above U+10FFFF.
    const unsigned char least = first == 0xE0 ? 0xA0 : first == 0xF0 ? 0x90 : 0x80;
    const unsigned char most = first == 0xED ? 0x9F : first == 0xF4 ? 0x8F : 0xBF;
    if (byte(1) < least || byte(1) > most) {
        return 0;
    }
    for (std::size_t index = 2; index < length; ++index) {
        if (!continuesCharacter(text[index])) {
            return 0;
        }
    }
    return length;
}

/// @param text any bytes
/// @return the offset of the first byte that is not part of a well-formed UTF-8 character; the size of the text
///         when there is none
[[nodiscard]] constexpr std::size_t findInvalidUtf8(std::string_view text) noexcept {
    std::size_t offset = 0;
    while (offset < text.size()) {
        const std::size_t length = characterLength(text.substr(offset));
        if (length == 0) {
            break;
        }
        offset += length;
    }
    return offset;
}

/// A part of a value: an item, or a field of an item.
struct Part {
    std::size_t offset;    ///< of its first byte in the text that was split
    std::string_view text; ///< lives as long as that text
};

/// Walks over the parts of a text as `PM_DEVKEY::getstringbykey` counts them: n separators make n+1 parts and
/// nothing is trimmed; an empty separator separates nothing. An empty text has one empty part (an item has at
/// least one field; that an empty value has no items is up to the caller).
class PartCursor {
public:
    /// Goes to the first part.
    /// @param text to be split; the same one has to be passed to all other methods
    /// @param separator likewise
    void start(std::string_view text, std::string_view separator) noexcept {
        m_index = 0;
        m_begin = 0;
        findEnd(text, separator);
    }

    /// Goes to a part. Going on costs time linear in the bytes passed, going back starts again.
    /// @param wanted its index, counted from 0
    /// @param text as passed to `start`
    /// @param separator as passed to `start`
    /// @return whether it exists; otherwise the cursor is at the last part
    bool moveTo(std::size_t wanted, std::string_view text, std::string_view separator) noexcept {
        if (wanted < m_index) {
            start(text, separator);
        }
        while (m_index != wanted && m_end != text.size()) {
            ++m_index;
            m_begin = m_end + separator.size();
            findEnd(text, separator);
        }
        return m_index == wanted;
    }

    /// @return the index of the current part
    [[nodiscard]] std::size_t index() const noexcept { return m_index; }

    /// @return the offset of its first byte
    [[nodiscard]] std::size_t offset() const noexcept { return m_begin; }

    /// @param text as passed to `start`
    /// @return the current part
    [[nodiscard]] std::string_view part(std::string_view text) const noexcept {
        return text.substr(m_begin, m_end - m_begin);
    }

private:
    void findEnd(std::string_view text, std::string_view separator) noexcept {
        if (separator.size() == 1) {
            m_end = std::min(text.find(separator.front(), m_begin), text.size());
        } else {
            // An empty separator would be found everywhere.
            m_end = separator.empty() ? text.size() : std::min(text.find(separator, m_begin), text.size());
        }
    }

    std::size_t m_index = 0;
    std::size_t m_begin = 0;
    std::size_t m_end = 0;
};

/// How many items of a value, or fields of an item, can be read: indexes are 0 to 32767.
inline constexpr std::size_t MAX_PARTS = 32768;

/// The parts of a text.
/// @param text an item, or a value that is not empty
/// @param separator where the parts end
/// @param maxParts after so many parts the rest is left out
/// @return the parts in order; one at least
[[nodiscard]] inline std::vector<Part> split(std::string_view text, std::string_view separator,
                                             std::size_t maxParts = MAX_PARTS) {
    std::size_t count = 0;
    PartCursor cursor;
    cursor.start(text, separator);
    while (count < maxParts && cursor.moveTo(count, text, separator)) {
        ++count;
    }
    std::vector<Part> parts;
    parts.reserve(count);
    cursor.start(text, separator);
    for (std::size_t index = 0; index != count; ++index) {
        cursor.moveTo(index, text, separator);
        parts.push_back({cursor.offset(), cursor.part(text)});
    }
    return parts;
}

} // namespace AcdText
