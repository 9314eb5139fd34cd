// The standard streams on POSIX systems.
#include "term/Streams.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace streams {

namespace {

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

} // namespace

std::vector<std::string> prepare(int argc, char** argv) {
    std::signal(SIGPIPE, SIG_IGN);
    return {argv + std::min(argc, 1), argv + argc};
}

bool isTerminal(int stream) { return ::isatty(stream) == 1; }

bool hasColours(int stream) {
    const char* const kind = std::getenv("TERM");
    return isTerminal(stream) && kind != nullptr && *kind != '\0' && std::string_view(kind) != "dumb";
}

std::size_t columns(int stream) {
    winsize size{};
    return ::ioctl(stream, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

bool write(int stream, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = writeSome(stream, text);
        if (written < 0) {
            return false;
        }
        text.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

bool isInputWaiting() {
    pollfd input{INPUT, POLLIN, 0};
    return ::poll(&input, 1, 0) == 0;
}

std::ptrdiff_t readInput(char* buffer, std::size_t size) {
    ssize_t count = ::read(INPUT, buffer, size);
    while (count < 0 && (errno == EINTR || errno == EAGAIN)) {
        pollfd input{INPUT, POLLIN, 0};
        ::poll(&input, 1, -1);
        count = ::read(INPUT, buffer, size);
    }
    return count;
}

} // namespace streams
