// The manager can't be renewed within a process; a copy of the process is how to ask it something without a trace.
#include "why/Apart.h"

#include "Status.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <string_view>
#include <sys/wait.h>
#include <unistd.h>

namespace why {

namespace {

[[noreturn]] void fail(const char* what) {
    throw Failure(Status::FAULT, std::string(what) + ": " + std::strerror(errno));
}

class Descriptor {
public:
    explicit Descriptor(int number) : m_number(number) {}
    ~Descriptor() { close(); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    void close() {
        if (m_number >= 0) {
            ::close(m_number);
            m_number = -1;
        }
    }
    [[nodiscard]] int number() const { return m_number; }

private:
    int m_number;
};

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
    std::array<char, 4096> buffer{};
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

std::string apart(const std::function<std::string()>& work) {
    std::array<int, 2> ends{};
    if (::pipe(ends.data()) != 0) {
        fail("can't make a pipe");
    }
    const Descriptor input(ends[0]);
    Descriptor output(ends[1]);
    const pid_t child = ::fork();
    if (child < 0) {
        fail("can't start a process");
    }
    if (child == 0) {
        workAndExit(output.number(), work);
    }
    output.close();
    std::string result = readAll(input.number());
    int status = 0;
    while (::waitpid(child, &status, 0) < 0) {
        if (errno != EINTR) {
            fail("can't wait for a process");
        }
    }
    if (!WIFEXITED(status) || WEXITSTATUS(status) != EXIT_SUCCESS) {
        throw Failure(Status::FAULT, "the database can't be read");
    }
    return result;
}

} // namespace why
