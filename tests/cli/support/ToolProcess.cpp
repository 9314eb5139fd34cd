// Starts the tool as a process of its own, as its users do.
#include "ToolProcess.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <stdexcept>
#include <string_view>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>
#include <utility>

extern char** environ;

namespace {

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

struct Pipe {
    int reading;
    int writing;

    Pipe() {
        std::array<int, 2> ends{};
        check(::pipe2(ends.data(), O_CLOEXEC));
        reading = ends[0];
        writing = ends[1];
    }
};

/// A terminal: what is written to one end comes out of the other as it is.
Pipe terminal(unsigned short columns) {
    Pipe ends;
    closeOnce(ends.reading);
    closeOnce(ends.writing);
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

std::vector<std::string> environmentOf(const ProcessOptions& start) {
    std::vector<std::string> variables;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        const std::string_view text(*variable);
        const std::string_view name = text.substr(0, text.find('='));
        if (!name.starts_with("TARVIK_") && name != "COLUMNS" && name != "NO_COLOR" && name != "TERM") {
            variables.emplace_back(text);
        }
    }
    for (const auto& [name, value] : start.environment) {
        variables.push_back(name + "=" + value);
    }
    return variables;
}

std::vector<char*> pointers(std::vector<std::string>& texts) {
    std::vector<char*> all;
    for (std::string& text : texts) {
        all.push_back(text.data());
    }
    all.push_back(nullptr);
    return all;
}

/// Starts the tool on the given descriptors.
pid_t spawn(const ProcessOptions& start, int input, int output, int error) {
    std::vector<std::string> arguments{TARVIK_TOOL};
    arguments.insert(arguments.end(), start.arguments.begin(), start.arguments.end());
    std::vector<std::string> environment = environmentOf(start);
    const std::vector<char*> argumentPointers = pointers(arguments);
    const std::vector<char*> environmentPointers = pointers(environment);
    const pid_t process = check(::fork());
    if (process == 0) {
        ::dup2(input, STDIN_FILENO);
        ::dup2(output, STDOUT_FILENO);
        ::dup2(error, STDERR_FILENO);
        ::execve(TARVIK_TOOL, argumentPointers.data(), environmentPointers.data());
        ::_exit(127);
    }
    return process;
}

int waitFor(pid_t process) {
    int status = 0;
    check(::waitpid(process, &status, 0));
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

/// Appends what there is to read; closes the descriptor at the end.
void drain(int& descriptor, std::string& text) {
    std::array<char, 65536> bytes{};
    ssize_t count = ::read(descriptor, bytes.data(), bytes.size());
    // A terminal reports in this way that its last writer is gone.
    count = count < 0 && errno == EIO ? 0 : check(static_cast<int>(count));
    text.append(bytes.data(), static_cast<std::size_t>(count));
    if (count == 0) {
        closeOnce(descriptor);
    }
}

/// Writes some of the text; closes the descriptor at its end, or when it has no reader any more.
void feed(int& descriptor, std::string_view& text) {
    const ssize_t count = ::write(descriptor, text.data(), std::min<std::size_t>(text.size(), 4096));
    text.remove_prefix(count < 0 ? 0 : static_cast<std::size_t>(count));
    if (count < 0 || text.empty()) {
        closeOnce(descriptor);
    }
}

} // namespace

std::ostream& operator<<(std::ostream& out, const ProcessResult& outcome) {
    return out << "status " << outcome.status << "\noutput:\n"
               << outcome.output << "error:\n"
               << outcome.error;
}

ProcessResult runTool(const ProcessOptions& start) {
    ::signal(SIGPIPE, SIG_IGN);
    Pipe input;
    Pipe output;
    Pipe error;
    if (!start.outputPath.empty()) {
        closeOnce(output.writing);
        output.writing = check(::open(start.outputPath.c_str(), O_WRONLY | O_CLOEXEC));
    }
    if (start.terminalColumns != 0) {
        closeOnce(output.reading);
        closeOnce(output.writing);
        output = terminal(start.terminalColumns);
    }
    const pid_t process = spawn(start, input.reading, output.writing,
                                start.terminalColumns != 0 ? output.writing : error.writing);
    closeOnce(input.reading);
    closeOnce(output.writing);
    closeOnce(error.writing);
    ProcessResult outcome{};
    std::string_view unwritten = start.input;
    if (unwritten.empty()) {
        closeOnce(input.writing);
    }
    while (output.reading >= 0 || error.reading >= 0) {
        std::array<pollfd, 3> waiting{pollfd{output.reading, POLLIN, 0}, pollfd{error.reading, POLLIN, 0},
                                      pollfd{input.writing, POLLOUT, 0}};
        check(::poll(waiting.data(), waiting.size(), -1));
        if (waiting[0].revents != 0) {
            drain(output.reading, outcome.output);
        }
        if (waiting[1].revents != 0) {
            drain(error.reading, outcome.error);
        }
        if (waiting[2].revents != 0) {
            feed(input.writing, unwritten);
        }
    }
    closeOnce(input.writing);
    outcome.status = waitFor(process);
    return outcome;
}

ProcessResult runTool(const std::vector<std::string>& arguments) {
    return runTool(ProcessOptions{arguments, {}, {}, {}, 0});
}

InteractiveProcess::InteractiveProcess(const ProcessOptions& start) {
    ::signal(SIGPIPE, SIG_IGN);
    Pipe input;
    Pipe output;
    m_process = spawn(start, input.reading, output.writing, STDERR_FILENO);
    closeOnce(input.reading);
    closeOnce(output.writing);
    m_input = input.writing;
    m_output = output.reading;
}

InteractiveProcess::~InteractiveProcess() {
    closeInput();
    closeOutput();
    if (m_process > 0) {
        ::waitpid(m_process, nullptr, 0);
    }
}

void InteractiveProcess::write(const std::string& text) {
    for (std::string_view rest = text; !rest.empty();) {
        const ssize_t count = ::write(m_input, rest.data(), rest.size());
        if (count < 0) {
            throw std::runtime_error(std::strerror(errno));
        }
        rest.remove_prefix(static_cast<std::size_t>(count));
    }
}

std::string InteractiveProcess::readLine() {
    while (m_read.find('\n') == std::string::npos) {
        if (m_output < 0) {
            throw std::runtime_error("the tool's output ended");
        }
        drain(m_output, m_read);
    }
    const std::size_t end = m_read.find('\n');
    std::string line = m_read.substr(0, end);
    m_read.erase(0, end + 1);
    return line;
}

void InteractiveProcess::closeInput() { closeOnce(m_input); }
void InteractiveProcess::closeOutput() { closeOnce(m_output); }

int InteractiveProcess::wait() { return waitFor(std::exchange(m_process, 0)); }
