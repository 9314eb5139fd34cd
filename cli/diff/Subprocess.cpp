// Runs this program again, by POSIX means.
#include "diff/Subprocess.h"

#include "term/ExitCode.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

namespace diff {

namespace {

[[noreturn]] void fail(const char* what, int error) {
    throw CommandError(ExitCode::FAULT, std::string(what) + ": " + std::strerror(error));
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
            fail("can't read from a process", errno);
        }
    }
}

} // namespace

Subprocess::Subprocess(const std::vector<std::string>& arguments, bool isSilent) {
    std::vector<char*> words{const_cast<char*>("tarvik")};
    for (const std::string& argument : arguments) {
        words.push_back(const_cast<char*>(argument.c_str()));
    }
    words.push_back(nullptr);
    std::array<int, 2> ends{};
    if (::pipe2(ends.data(), O_CLOEXEC) != 0) {
        fail("can't make a pipe", errno);
    }
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    if (isSilent) {
        ::posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
    }
    const int error = ::posix_spawn(&m_process, "/proc/self/exe", &actions, nullptr, words.data(), environ);
    ::posix_spawn_file_actions_destroy(&actions);
    ::close(ends[1]);
    m_output = ends[0];
    if (error != 0) {
        ::close(m_output);
        fail("can't start a process", error);
    }
}

Subprocess::~Subprocess() {
    if (m_process > 0) {
        static_cast<void>(wait());
    }
}

std::string Subprocess::output() {
    std::string text = readAll(m_output);
    const int status = wait();
    if (!WIFEXITED(status) || WEXITSTATUS(status) != EXIT_SUCCESS) {
        throw CommandError(ExitCode::FAULT, "a process that reads a database failed");
    }
    return text;
}

/// Stops reading and waits. @return the status with which the process ended
int Subprocess::wait() noexcept {
    ::close(m_output);
    int status = -1;
    while (::waitpid(m_process, &status, 0) < 0 && errno == EINTR) {
    }
    m_process = -1;
    return status;
}

} // namespace diff
