#pragma once

#include "TarvikAbi.h"

#include <tarvik/Attributes.h>

#include <cstddef>
#include <cstdint>
#include <iosfwd>
#include <string>
#include <string_view>
#include <type_traits>

/// A byte string with length: the text type of every interface and container of the system.
///
/// It may contain any byte, NUL included; nothing is ever interpreted as a character encoding. Case is that
/// of ASCII alone: bytes over 127 have none. A null text is treated as the empty text everywhere.
class TARVIK_HOST_API StringBase {
    /// Takes part if `Text` is a text, but not a `StringBase`.
    template <typename Text>
    using IfOther = std::enable_if_t<std::is_convertible_v<const Text&, std::string_view> &&
                                     !std::is_base_of_v<StringBase, Text>>;

public:
    /// What `GetIndexOfFirstChar` answers for an absent character: all bits set.
    static constexpr std::size_t NOT_FOUND = static_cast<std::size_t>(-1);

    /// The empty text.
    StringBase() noexcept = default;

    /// Copies a NUL-terminated text.
    /// @param text null gives the empty text
    StringBase(const char* text) : m_text(text == nullptr ? "" : text) {}

    /// Copies bytes, NULs included.
    /// @param bytes may be null when `length` is 0
    /// @param length how many
    StringBase(const char* bytes, std::size_t length) : m_text(std::string_view(bytes, length)) {}

    /// Copies a text of the standard library, NULs included.
    /// @param text any text
    explicit StringBase(std::string_view text) : m_text(text) {}

    /// Becomes a copy.
    /// @param text NUL-terminated; null is the empty text
    /// @return this text
    StringBase& operator=(const char* text) {
        m_text = text == nullptr ? "" : text;
        return *this;
    }
    /// Appends a text.
    /// @param text NUL-terminated; null is the empty text
    /// @return this text
    StringBase& operator+=(const char* text) {
        m_text += text == nullptr ? "" : text;
        return *this;
    }
    /// Appends a text.
    /// @param text any text, this one too
    /// @return this text
    StringBase& operator+=(const StringBase& text) {
        m_text += text.m_text;
        return *this;
    }

    /// @return the bytes, NUL-terminated; valid until this object is changed or destroyed
    [[nodiscard]] const char* c_str() const noexcept { return m_text.c_str(); }

    /// @return the number of bytes, without the terminator
    [[nodiscard]] std::size_t GetLength() const noexcept { return m_text.size(); }

    /// @return the bytes; valid until this object is changed or destroyed
    [[nodiscard]] operator std::string_view() const noexcept { return m_text; }

    /// @return whether there are no bytes
    [[nodiscard]] bool empty() const noexcept { return m_text.empty(); }

    /// @return the first byte; valid until this object is changed or destroyed
    [[nodiscard]] const char* begin() const noexcept { return m_text.data(); }
    /// @return the end of the bytes, likewise
    [[nodiscard]] const char* end() const noexcept { return m_text.data() + m_text.size(); }

    /// Becomes a finished text.
    /// @param text `%%` in it gives `%`, any other `%` stays as it is
    void Format(const char* text);

    /// Becomes what printf would print. A null text formats as `(null)`. A template only so that overload
    /// resolution prefers the finished text where there are no further arguments.
    /// @param format as of printf, as are the arguments after it
    template <typename Formatted = void>
    TARVIK_PRINTF(2, 3)
    void Format(const char* format, ...);

    /// Turns a to z into A to Z.
    void MakeUpper() noexcept;

    /// Turns A to Z into a to z.
    void MakeLower() noexcept;

    /// Looks for a character.
    /// @param wanted the character
    /// @param from the index to start at
    /// @return the index of the first one at or after `from`; `NOT_FOUND` when there is none
    [[nodiscard]] std::size_t GetIndexOfFirstChar(char wanted, std::size_t from = 0) const noexcept {
        return m_text.find(wanted, from);
    }

    /// Keeps the first bytes.
    /// @param length how many; a text that is no longer than that stays as it is
    void Truncate(std::size_t length) noexcept;

    /// Compares in byte order, as unsigned bytes, the shorter first on a tie.
    /// @param other any text
    /// @return negative, 0 or positive
    [[nodiscard]] int Compare(const StringBase& other) const noexcept { return m_text.compare(other.m_text); }

    /// Compares likewise, without regard to ASCII case.
    /// @param other any text
    /// @return negative, 0 or positive
    [[nodiscard]] int ICompare(const StringBase& other) const noexcept;

    /// @return the CRC-32 (the one of Ethernet and zip) of the bytes
    [[nodiscard]] std::uint32_t CRC32() const noexcept { return CRC32(m_text.data(), m_text.size()); }

    /// The CRC-32 of a text taken piece by piece, without joining the pieces.
    /// @param bytes of the piece
    /// @param length of the piece
    /// @param former the checksum of the pieces before it
    /// @return the checksum of all by now
    [[nodiscard]] static std::uint32_t CRC32(const char* bytes, std::size_t length,
                                             std::uint32_t former = 0) noexcept;
    /// @{
    /// Compares bytes as unsigned, the shorter first on a tie. Never considered without a StringBase. @param left a text
    /// @param right a text; null is the empty text, as for left @return the result of the comparison
    friend bool operator==(const StringBase& left, const StringBase& right) noexcept {
        return left.m_text == right.m_text;
    }
    friend bool operator!=(const StringBase& left, const StringBase& right) noexcept {
        return !(left == right);
    }
    friend bool operator<(const StringBase& left, const StringBase& right) noexcept {
        return left.m_text < right.m_text;
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator==(const StringBase& left, const Text& right) noexcept {
        return left.m_text == view(right);
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator==(const Text& left, const StringBase& right) noexcept {
        return view(left) == right.m_text;
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator!=(const StringBase& left, const Text& right) noexcept {
        return left.m_text != view(right);
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator!=(const Text& left, const StringBase& right) noexcept {
        return view(left) != right.m_text;
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator<(const StringBase& left, const Text& right) noexcept {
        return left.m_text < view(right);
    }
    template <typename Text, typename = IfOther<Text>>
    friend bool operator<(const Text& left, const StringBase& right) noexcept {
        return view(left) < right.m_text;
    }
    /// @}
private:
    static std::string_view view(const char* text) noexcept {
        return text == nullptr ? std::string_view() : std::string_view(text);
    }
    static std::string_view view(std::string_view text) noexcept { return text; }

    std::string m_text;
};

/// Writes the bytes of a text. Include <ostream> to use it.
/// @param stream of bytes
/// @param text any text
/// @return the stream
template <typename Traits>
std::basic_ostream<char, Traits>& operator<<(std::basic_ostream<char, Traits>& stream,
                                             const StringBase& text) {
    return stream << std::basic_string_view<char, Traits>(text.c_str(), text.GetLength());
}

/// Hashes the bytes of a text, as those of a `std::string_view`.
template <>
struct std::hash<StringBase> {
    /// @param text any text
    /// @return its hash
    [[nodiscard]] std::size_t operator()(const StringBase& text) const noexcept {
        return std::hash<std::string_view>()(text);
    }
};
