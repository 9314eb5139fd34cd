#pragma once

#include <cstddef>
#include <initializer_list>
#include <string>
#include <string_view>

/// Texts joined into one for a look-up. Up to 127 bytes take no memory from the heap.
class JoinedText {
public:
    JoinedText(std::initializer_list<std::string_view> pieces) {
        std::size_t length = 0;
        for (const std::string_view piece : pieces) {
            length += piece.size();
        }
        char* text = m_short;
        if (length > sizeof m_short) {
            m_long.resize(length);
            text = m_long.data();
        }
        m_view = {text, length};
        for (const std::string_view piece : pieces) {
            text += piece.copy(text, piece.size());
        }
    }
    JoinedText(const JoinedText&) = delete;
    JoinedText& operator=(const JoinedText&) = delete;

    /// @return the joined text, valid as long as this object
    [[nodiscard]] std::string_view view() const noexcept { return m_view; }

private:
    char m_short[127];
    std::string m_long;
    std::string_view m_view;
};
