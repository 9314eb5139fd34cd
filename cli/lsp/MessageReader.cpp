// The framing of messages, which must survive any bytes.
#include "lsp/MessageReader.h"

#include "text/Suggest.h"
#include "text/Trimmed.h"

#include <algorithm>
#include <charconv>

namespace lsp {

namespace {

constexpr std::string_view LENGTH = "Content-Length";
constexpr std::string_view LINE_END = "\r\n";
constexpr std::string_view HEADERS_END = "\r\n\r\n";

/// The length that a block of headers gives; nothing if it has none, several or an invalid one.
std::optional<std::size_t> lengthIn(std::string_view headers) {
    std::optional<std::size_t> length;
    while (!headers.empty()) {
        const std::string_view line = headers.substr(0, headers.find(LINE_END));
        headers.remove_prefix(std::min(headers.size(), line.size() + LINE_END.size()));
        const std::size_t colon = line.find(':');
        if (colon == line.npos) {
            return std::nullopt;
        }
        if (!sameWithoutCase(trimmed(line.substr(0, colon)), LENGTH)) {
            continue;
        }
        const std::string_view value = trimmed(line.substr(colon + 1));
        std::size_t number = 0;
        const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), number);
        if (length || error != std::errc() || end != value.data() + value.size() ||
            number > MessageReader::MAX_CONTENT) {
            return std::nullopt;
        }
        length = number;
    }
    return length;
}

} // namespace

std::optional<MessageReader::Message> MessageReader::next() {
    if (!m_length) {
        if (std::optional<Message> fault = readHeaders()) {
            return fault;
        }
    }
    if (!m_length || m_buffer.size() - m_start < *m_length) {
        return std::nullopt;
    }
    Message message{m_buffer.substr(m_start, *m_length), {}};
    drop(*m_length);
    m_length.reset();
    return message;
}

/// @return a fault, if there is one; otherwise the length is set once the headers are complete
std::optional<MessageReader::Message> MessageReader::readHeaders() {
    if (m_isSkipping) {
        if (std::optional<Message> fault = skip(m_start, "")) {
            return fault;
        }
        if (m_isSkipping) {
            return std::nullopt;
        }
    }
    const std::string_view rest = std::string_view(m_buffer).substr(m_start);
    const std::size_t end = rest.substr(0, MAX_HEADERS).find(HEADERS_END);
    if (end == rest.npos) {
        return rest.size() < MAX_HEADERS ? std::nullopt : skip(m_start + 1, "the headers do not end");
    }
    m_length = lengthIn(rest.substr(0, end));
    if (!m_length) {
        return skip(m_start + 1, "no valid Content-Length in the headers");
    }
    drop(end + HEADERS_END.size());
    return std::nullopt;
}

/// Skips up to the next header that may begin a message.
/// @return the fault, if there is one to report
std::optional<MessageReader::Message> MessageReader::skip(std::size_t from, const char* fault) {
    const auto begin = m_buffer.begin() + static_cast<std::ptrdiff_t>(from);
    const auto found = std::search(begin, m_buffer.end(), LENGTH.begin(), LENGTH.end());
    m_isSkipping = found == m_buffer.end();
    // The header may be there in part.
    const std::size_t kept = m_isSkipping ? std::min<std::size_t>(LENGTH.size() - 1, m_buffer.size() - from)
                                          : static_cast<std::size_t>(m_buffer.end() - found);
    drop(m_buffer.size() - kept - m_start);
    return *fault == '\0' ? std::nullopt : std::optional(Message{{}, fault});
}

void MessageReader::drop(std::size_t count) {
    m_start += count;
    // Many short messages come in one piece: the rest moves only when that is cheap.
    if (m_start > m_buffer.size() / 2) {
        m_buffer.erase(0, m_start);
        m_start = 0;
    }
}

} // namespace lsp
