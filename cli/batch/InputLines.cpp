// Buffered reading by hand: streams cannot report whether a read would wait, and then answers must be flushed.
#include "batch/InputLines.h"

#include "term/ExitCode.h"
#include "term/Output.h"
#include "term/Streams.h"

#include <cerrno>
#include <cstring>

namespace {

constexpr std::size_t READ_SIZE = std::size_t{64} * 1024;

} // namespace

std::optional<InputLines::Line> InputLines::next() {
    bool tooLong = false;
    for (;;) {
        const std::size_t end = m_buffer.find('\n', m_scanned);
        if (end != std::string::npos) {
            const std::string_view text = std::string_view(m_buffer).substr(m_start, end - m_start);
            tooLong = tooLong || text.size() > MAX_LENGTH;
            m_start = m_scanned = end + 1;
            return Line{tooLong ? std::string_view() : text, tooLong};
        }
        m_scanned = m_buffer.size();
        if (m_scanned - m_start > MAX_LENGTH) {
            tooLong = true;
            m_start = m_scanned;
        }
        if (!fill()) {
            if (m_output.closed()) {
                return std::nullopt;
            }
            const std::string_view rest = std::string_view(m_buffer).substr(m_start);
            m_start = m_buffer.size();
            return rest.empty() && !tooLong ? std::nullopt : std::optional(Line{rest, tooLong});
        }
    }
}

bool InputLines::fill() {
    m_buffer.erase(0, m_start);
    m_scanned -= m_start;
    m_start = 0;
    if (m_ended) {
        return false;
    }
    if (streams::isInputWaiting()) {
        m_output.flush();
        if (m_output.closed()) {
            return false;
        }
    }
    const std::size_t kept = m_buffer.size();
    m_buffer.resize(kept + READ_SIZE);
    const std::ptrdiff_t count = streams::readInput(m_buffer.data() + kept, READ_SIZE);
    m_buffer.resize(kept + static_cast<std::size_t>(count < 0 ? 0 : count));
    if (count < 0) {
        throw CommandError(ExitCode::FAULT,
                           std::string("cannot read standard input: ") + std::strerror(errno));
    }
    m_ended = count == 0;
    return !m_ended;
}
