// The manager can't be renewed within a process; a copy of the process is how to ask it something without a trace.
#include "query/Apart.h"

#include "term/ExitCode.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <string_view>
#include <sys/wait.h>
#include <unistd.h>

namespace why {

namespace {

[[noreturn]] void fail(const char* what) {
    throw CommandError(ExitCode::FAULT, std::string(what) + ": " + std::strerror(errno));
}

[[noreturn]] void workAndExit(int output, const std::function<std::string()>& work) {
    int status = EXIT_FAILURE;
    try {
        const std::string result = work();
        std::string_view rest = result;
        while (!rest.empty()) {
            const ssize_t written = ::write(output, rest.data(), rest.size());
            if (written < 0 && errno != EINTR) {
                break;
            }
            rest.remove_prefix(written < 0 ? 0 : static_cast<std::size_t>(written));
        }
        status = rest.empty() ? EXIT_SUCCESS : EXIT_FAILURE;
    } catch (...) {
        // The status says so.
    }
    // Nothing that the original holds is to be flushed or destroyed a second time.
    ::_exit(status);
}

std::string readAll(int input) {
    std::string text;
    std::array<char, 65536> buffer{};
    for (;;) {
        const ssize_t got = ::read(input, buffer.data(), buffer.size());
        if (got == 0) {
            return text;
        }
        if (got > 0) {
            text.append(buffer.data(), static_cast<std::size_t>(got));
        } else if (errno != EINTR) {
            fail("can't read from a process");
        }
    }
}

} // namespace

Apart::Apart(const std::function<std::string()>& work) {
    std::array<int, 2> ends{};
    if (::pipe2(ends.data(), O_CLOEXEC) != 0) {
        fail("can't make a pipe");
    }
    m_input = ends[0];
    m_child = ::fork();
    if (m_child == 0) {
        // Else the copy would wait for itself to listen once nobody else does.
        ::close(ends[0]);
        workAndExit(ends[1], work);
    }
    ::close(ends[1]);
    if (m_child < 0) {
        ::close(m_input);
        fail("can't start a process");
    }
}

Apart::~Apart() {
    if (m_child > 0) {
        static_cast<void>(end());
    }
}

std::string Apart::result() {
    std::string text = readAll(m_input);
    const int status = end();
    if (!WIFEXITED(status) || WEXITSTATUS(status) != EXIT_SUCCESS) {
        throw CommandError(ExitCode::FAULT, "the database can't be read");
    }
    return text;
}

/// Stops listening and waits. @return the status that the copy ended with
int Apart::end() noexcept {
    ::close(m_input);
    int status = -1;
    while (::waitpid(m_child, &status, 0) < 0 && errno == EINTR) {
    }
    m_child = -1;
    return status;
}

std::string apart(const std::function<std::string()>& work) { return Apart(work).result(); }

} // namespace why
