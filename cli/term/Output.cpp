// Standard output and standard error: nothing is lost silently, and a reader that leaves early is no fault.
#include "term/Output.h"

#include "term/ExitCode.h"

#include <cerrno>
#include <cstring>
#include <poll.h>
#include <unistd.h>
#include <utility>

namespace {

constexpr std::size_t MUCH = std::size_t{64} * 1024;

/// Writes some of the text, waiting where the descriptor can't take any now.
/// @return the number of bytes written; negative for a fault, which `errno` tells
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

/// @return false for a fault, which `errno` tells
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
    m_kept += text;
    if (m_kept.size() >= MUCH) {
        flush();
    }
}

void Output::flush() {
    const std::string text = std::exchange(m_kept, {});
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
    std::string text(line);
    if (!text.ends_with('\n')) {
        text += '\n';
    }
    writePiece(text);
}

void writePiece(std::string_view text) {
    // There is nowhere left to report a fault of standard error.
    static_cast<void>(writeAll(STDERR_FILENO, text));
}
