// Standard output and standard error: a failing write is reported, except that a reader may leave early.
#include "term/Output.h"

#include "term/ExitCode.h"
#include "term/Streams.h"
#include "term/Terminal.h"

#include <cerrno>
#include <cstring>
#include <utility>

namespace {

constexpr std::size_t FULL = std::size_t{64} * 1024;

} // namespace

void Output::write(std::string_view text) {
    m_buffer += text;
    if (m_buffer.size() >= FULL) {
        flush();
    }
}

void Output::flush() {
    const std::string text = std::exchange(m_buffer, {});
    if (m_closed || streams::write(streams::OUTPUT, text)) {
        return;
    }
    if (errno != EPIPE) {
        throw CommandError(ExitCode::FAULT,
                           std::string("can't write to standard output: ") + std::strerror(errno));
    }
    m_closed = true;
}

void writeError(std::string_view line) {
    std::string text = streams::isTerminal(streams::ERRORS) ? printableLines(line) : std::string(line);
    if (!text.ends_with('\n')) {
        text += '\n';
    }
    writeErrorRaw(text);
}

void writeErrorRaw(std::string_view text) {
    // There is nowhere to report a failure of standard error.
    static_cast<void>(streams::write(streams::ERRORS, text));
}
