// Processes on POSIX systems.
#include "cli/support/Processes.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <pty.h>
#include <stdexcept>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>
#include <utility>

namespace processes {

namespace {

std::vector<char*> pointers(const std::vector<std::string>& texts) {
    std::vector<char*> all;
    for (const std::string& text : texts) {
        all.push_back(const_cast<char*>(text.c_str()));
    }
    all.push_back(nullptr);
    return all;
}

} // namespace

int check(int result) {
    if (result < 0) {
        throw std::runtime_error(std::strerror(errno));
    }
    return result;
}

void closeOnce(int& descriptor) {
    if (descriptor >= 0) {
        ::close(std::exchange(descriptor, -1));
    }
}

Pipe makePipe() {
    std::array<int, 2> ends{};
    check(::pipe2(ends.data(), O_CLOEXEC));
    return {ends[0], ends[1]};
}

Pipe makeTerminal(unsigned short columns) {
    Pipe ends{};
    winsize size{};
    size.ws_col = columns;
    size.ws_row = 24;
    check(::openpty(&ends.reading, &ends.writing, nullptr, nullptr, &size));
    check(::fcntl(ends.reading, F_SETFD, FD_CLOEXEC));
    check(::fcntl(ends.writing, F_SETFD, FD_CLOEXEC));
    termios settings{};
    check(::tcgetattr(ends.writing, &settings));
    settings.c_oflag &= ~static_cast<tcflag_t>(OPOST);
    check(::tcsetattr(ends.writing, TCSANOW, &settings));
    return ends;
}

int openForWriting(const std::string& path) { return check(::open(path.c_str(), O_WRONLY | O_CLOEXEC)); }

void ignoreClosedPipes() { ::signal(SIGPIPE, SIG_IGN); }

std::vector<std::string> environment() {
    std::vector<std::string> all;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        all.emplace_back(*variable);
    }
    return all;
}

std::intptr_t spawn(const std::vector<std::string>& arguments, const std::vector<std::string>& environment,
                    int input, int output, int error) {
    const std::vector<char*> argumentPointers = pointers(arguments);
    const std::vector<char*> environmentPointers = pointers(environment);
    const pid_t process = check(::fork());
    if (process == 0) {
        ::dup2(input, STDIN_FILENO);
        ::dup2(output, STDOUT_FILENO);
        ::dup2(error, STDERR_FILENO);
        ::execve(argumentPointers.front(), argumentPointers.data(), environmentPointers.data());
        ::_exit(127);
    }
    return process;
}

int waitFor(std::intptr_t process) {
    int status = 0;
    check(::waitpid(static_cast<pid_t>(process), &status, 0));
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

} // namespace processes
