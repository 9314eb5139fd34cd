// Standard output and standard error: a failing write is reported, except that a reader may leave early.
#include "term/Output.h"

#include "term/ExitCode.h"
#include "term/Terminal.h"

#include <cerrno>
#include <cstring>
#include <poll.h>
#include <unistd.h>
#include <utility>

namespace {

constexpr std::size_t FULL = std::size_t{64} * 1024;

/// Writes some of the text, waiting while the descriptor accepts none.
/// @return the number of bytes written; negative for an error, which is in `errno`
ssize_t writeSome(int descriptor, std::string_view text) {
    for (;;) {
        const ssize_t written = ::write(descriptor, text.data(), text.size());
        if (written >= 0) {
            return written;
        }
        if (errno == EAGAIN) {
            pollfd waiting{descriptor, POLLOUT, 0};
            ::poll(&waiting, 1, -1);
        } else if (errno != EINTR) {
            return written;
        }
    }
}

/// @return false for an error, which is in `errno`
bool writeAll(int descriptor, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = writeSome(descriptor, text);
        if (written < 0) {
            return false;
        }
        text.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

} // namespace

void Output::write(std::string_view text) {
    m_buffer += text;
    if (m_buffer.size() >= FULL) {
        flush();
    }
}

void Output::flush() {
    const std::string text = std::exchange(m_buffer, {});
    if (m_closed || writeAll(STDOUT_FILENO, text)) {
        return;
    }
    if (errno != EPIPE) {
        throw CommandError(ExitCode::FAULT,
                           std::string("can't write to standard output: ") + std::strerror(errno));
    }
    m_closed = true;
}

void writeError(std::string_view line) {
    std::string text = ::isatty(STDERR_FILENO) == 1 ? printableLines(line) : std::string(line);
    if (!text.ends_with('\n')) {
        text += '\n';
    }
    writeErrorRaw(text);
}

void writeErrorRaw(std::string_view text) {
    // There is nowhere to report a failure of standard error.
    static_cast<void>(writeAll(STDERR_FILENO, text));
}
