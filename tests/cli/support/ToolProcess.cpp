// Starts the tool as a process of its own, as its users do.
#include "ToolProcess.h"

#include "Processes.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <stdexcept>
#include <string_view>
#include <thread>
#include <unistd.h>
#include <utility>

using processes::check;
using processes::closeOnce;
using processes::Pipe;

namespace {

std::vector<std::string> environmentOf(const ProcessOptions& start) {
    std::vector<std::string> variables;
    for (const std::string& variable : processes::environment()) {
        const std::string_view name = std::string_view(variable).substr(0, variable.find('='));
        if (!name.starts_with("TARVIK_") && name != "COLUMNS" && name != "NO_COLOR" && name != "TERM") {
            variables.push_back(variable);
        }
    }
    for (const auto& [name, value] : start.environment) {
        variables.push_back(name + "=" + value);
    }
    return variables;
}

std::intptr_t spawn(const ProcessOptions& start, int input, int output, int error) {
    std::vector<std::string> arguments{TARVIK_TOOL};
    arguments.insert(arguments.end(), start.arguments.begin(), start.arguments.end());
    return processes::spawn(arguments, environmentOf(start), input, output, error);
}

/// Appends what there is to read; closes the descriptor at the end.
void drain(int& descriptor, std::string& text) {
    std::array<char, 65536> bytes{};
    auto count = ::read(descriptor, bytes.data(), bytes.size());
    // A terminal reports in this way that its last writer is gone.
    count = count < 0 && errno == EIO ? 0 : check(static_cast<int>(count));
    text.append(bytes.data(), static_cast<std::size_t>(count));
    if (count == 0) {
        closeOnce(descriptor);
    }
}

void drainToTheEnd(int& descriptor, std::string& text) {
    while (descriptor >= 0) {
        drain(descriptor, text);
    }
}

/// Writes a text to its end, or until it has no reader any more; closes the descriptor.
void feed(int& descriptor, std::string_view text) {
    while (!text.empty()) {
        const auto count =
            ::write(descriptor, text.data(), static_cast<unsigned>(std::min<std::size_t>(text.size(), 4096)));
        text.remove_prefix(count < 0 ? text.size() : static_cast<std::size_t>(count));
    }
    closeOnce(descriptor);
}

} // namespace

std::ostream& operator<<(std::ostream& out, const ProcessResult& outcome) {
    return out << "status " << outcome.status << "\noutput:\n"
               << outcome.output << "error:\n"
               << outcome.error;
}

ProcessResult runTool(const ProcessOptions& start) {
    processes::ignoreClosedPipes();
    Pipe input = processes::makePipe();
    Pipe output = processes::makePipe();
    Pipe error = processes::makePipe();
    if (!start.outputPath.empty()) {
        closeOnce(output.writing);
        output.writing = processes::openForWriting(start.outputPath);
    }
    if (start.terminalColumns != 0) {
        closeOnce(output.reading);
        closeOnce(output.writing);
        output = processes::makeTerminal(start.terminalColumns);
    }
    const std::intptr_t process = spawn(start, input.reading, output.writing,
                                        start.terminalColumns != 0 ? output.writing : error.writing);
    closeOnce(input.reading);
    closeOnce(output.writing);
    closeOnce(error.writing);
    ProcessResult outcome{};
    {
        const std::jthread feeding([&] { feed(input.writing, start.input); });
        const std::jthread listening([&] { drainToTheEnd(error.reading, outcome.error); });
        drainToTheEnd(output.reading, outcome.output);
    }
    outcome.status = processes::waitFor(process);
    return outcome;
}

ProcessResult runTool(const std::vector<std::string>& arguments) {
    return runTool(ProcessOptions{arguments, {}, {}, {}, 0});
}

InteractiveProcess::InteractiveProcess(const ProcessOptions& start) {
    processes::ignoreClosedPipes();
    Pipe input = processes::makePipe();
    Pipe output = processes::makePipe();
    m_process = spawn(start, input.reading, output.writing, STDERR_FILENO);
    closeOnce(input.reading);
    closeOnce(output.writing);
    m_input = input.writing;
    m_output = output.reading;
}

InteractiveProcess::~InteractiveProcess() {
    closeInput();
    closeOutput();
    if (m_process != 0) {
        static_cast<void>(wait());
    }
}

void InteractiveProcess::write(const std::string& text) {
    for (std::string_view rest = text; !rest.empty();) {
        rest.remove_prefix(static_cast<std::size_t>(
            check(static_cast<int>(::write(m_input, rest.data(), static_cast<unsigned>(rest.size()))))));
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

int InteractiveProcess::wait() { return processes::waitFor(std::exchange(m_process, 0)); }
