#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace lsp {

/// Splits a stream into messages: headers, a blank line, and as many bytes as `Content-Length` says.
///
/// What is not a message is skipped up to the next header of that name, so that one fault costs little.
class MessageReader {
public:
    static constexpr std::size_t MAX_CONTENT = std::size_t{1} << 30; ///< as large as a database file
    static constexpr std::size_t MAX_HEADERS = 4096;

    /// A message, or the bytes between two that are none.
    struct Message {
        std::string content; ///< empty if `fault` is set
        std::string fault;   ///< what is wrong, in words
    };

    /// Adds the next bytes of the stream.
    void append(std::string_view bytes) { m_buffer += bytes; }

    /// Takes the next message from what was added; nothing while it is not complete.
    [[nodiscard]] std::optional<Message> next();

private:
    [[nodiscard]] std::optional<Message> readHeaders();
    [[nodiscard]] std::optional<Message> skip(std::size_t from, const char* fault);
    void drop(std::size_t count);

    std::string m_buffer;
    std::size_t m_start = 0;               ///< of what was not taken yet
    std::optional<std::size_t> m_length{}; ///< of the content, once its headers were taken
    bool m_isSkipping = false;             ///< a fault was reported, and the next header is not there yet
};

} // namespace lsp
