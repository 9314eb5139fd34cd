#pragma once

#include <Formatting.h>
#include <HostCall.h>

#include <algorithm>
#include <cstdint>
#include <string>

/// A byte string with length.
class [[gnu::visibility("default")]] StringBase {
public:
    static constexpr std::size_t NOT_FOUND = std::string::npos;

    StringBase() noexcept = default;
    StringBase(const char* text) { assign(text == nullptr ? "" : text); }
    StringBase(const char* bytes, std::size_t length) { assign({bytes, length}); }
    StringBase(const StringBase& other) { assign(other.m_text); }
    StringBase(StringBase &&) noexcept = default;
    ~StringBase() = default;

    StringBase& operator=(const StringBase& other) { return assign(other.m_text); }
    StringBase& operator=(StringBase&&) noexcept = default;
    StringBase& operator+=(const StringBase& other) { return assign(m_text + other.m_text); }

    [[nodiscard]] const char* c_str() const noexcept { return m_text.c_str(); }
    [[nodiscard]] std::size_t GetLength() const noexcept { return m_text.size(); }

    /// Takes a finished text, or a printf format with its arguments.
    template <typename... Arguments>
    void Format(const char* format, Arguments... arguments) {
        assign(memory_host::formatted(format, arguments...));
    }

    void MakeUpper() noexcept { std::transform(m_text.begin(), m_text.end(), m_text.begin(), upper); }
    void MakeLower() noexcept { std::transform(m_text.begin(), m_text.end(), m_text.begin(), lower); }

    [[nodiscard]] std::size_t GetIndexOfFirstChar(char wanted, std::size_t from = 0) const noexcept {
        return m_text.find(wanted, from);
    }
    void Truncate(std::size_t length) noexcept { m_text.erase(std::min(length, m_text.size())); }

    [[nodiscard]] int Compare(const StringBase& other) const noexcept { return m_text.compare(other.m_text); }
    [[nodiscard]] int ICompare(const StringBase& other) const noexcept;

    [[nodiscard]] std::uint32_t CRC32() const noexcept { return CRC32(m_text.data(), m_text.size()); }
    [[nodiscard]] static std::uint32_t CRC32(const char* bytes, std::size_t length,
                                             std::uint32_t former = 0) noexcept;

    /// ASCII case.
    [[nodiscard]] static char upper(char byte) noexcept {
        return byte >= 'a' && byte <= 'z' ? static_cast<char>(byte - 'a' + 'A') : byte;
    }
    [[nodiscard]] static char lower(char byte) noexcept {
        return byte >= 'A' && byte <= 'Z' ? static_cast<char>(byte - 'A' + 'a') : byte;
    }

private:
    StringBase& assign(std::string text) {
        hostCall("StringBase");
        m_text = std::move(text);
        return *this;
    }

    std::string m_text;
};

[[nodiscard]] inline bool operator==(const StringBase& left, const StringBase& right) noexcept {
    return left.Compare(right) == 0;
}
[[nodiscard]] inline bool operator!=(const StringBase& left, const StringBase& right) noexcept {
    return left.Compare(right) != 0;
}
