// Processes on POSIX systems.
#include "term/Subprocess.h"

#include "term/ExitCode.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

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

std::vector<std::string> environmentVariables() {
    std::vector<std::string> all;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        all.emplace_back(*variable);
    }
    return all;
}

Subprocess::Subprocess(const std::vector<std::string>& arguments, bool isSilent) {
    std::vector<std::string> command{"tarvik"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    start("/proc/self/exe", command, environmentVariables(), isSilent);
}

Subprocess::Subprocess(const std::vector<std::string>& command, const std::vector<std::string>& environment,
                       bool isSilent) {
    start(command.front(), command, environment, isSilent);
}

void Subprocess::start(const std::string& program, const std::vector<std::string>& command,
                       const std::vector<std::string>& environment, bool isSilent) {
    const auto pointers = [](const std::vector<std::string>& texts) {
        std::vector<char*> all;
        all.reserve(texts.size() + 1);
        for (const std::string& text : texts) {
            all.push_back(const_cast<char*>(text.c_str()));
        }
        all.push_back(nullptr);
        return all;
    };
    const std::vector<char*> words = pointers(command);
    const std::vector<char*> variables = pointers(environment);
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
    pid_t process = -1;
    const int error =
        ::posix_spawnp(&process, program.c_str(), &actions, nullptr, words.data(), variables.data());
    ::posix_spawn_file_actions_destroy(&actions);
    ::close(ends[1]);
    if (error != 0) {
        ::close(m_output = ends[0]);
        fail(("can't start " + command.front()).c_str(), error);
    }
    m_output = ends[0];
    m_process = process;
}

bool Subprocess::succeeds(std::string& text) {
    text = readAll(m_output);
    const int status = wait();
    return WIFEXITED(status) && WEXITSTATUS(status) == EXIT_SUCCESS;
}

/// Stops reading and waits. @return the status with which the process ended
int Subprocess::wait() noexcept {
    ::close(m_output);
    int status = -1;
    while (::waitpid(static_cast<pid_t>(m_process), &status, 0) < 0 && errno == EINTR) {
    }
    m_process = -1;
    return status;
}
