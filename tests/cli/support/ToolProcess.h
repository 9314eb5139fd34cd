#pragma once

#include <cstdint>
#include <map>
#include <ostream>
#include <string>
#include <vector>

/// How the tool is started.
struct ProcessOptions {
    std::vector<std::string> arguments;
    std::string input;
    /// Variables of the tests' own that the tool heeds are not handed on.
    std::map<std::string, std::string> environment;
    std::string outputPath; ///< where standard output goes in place of a pipe
    /// Standard output and standard error lead to one terminal of that many columns; what it gets is the outcome's
    /// output. 0: they are pipes.
    unsigned short terminalColumns = 0;
};

/// The result of a run of the tool.
struct ProcessResult {
    int status; ///< the exit status; 128 and more: ended by a signal
    std::string output;
    std::string error;
};

std::ostream& operator<<(std::ostream& out, const ProcessResult& outcome);

/// Runs the tool to its end.
[[nodiscard]] ProcessResult runTool(const ProcessOptions& start);

/// Runs the tool with just these arguments.
[[nodiscard]] ProcessResult runTool(const std::vector<std::string>& arguments);

/// A running tool that is talked to line by line. Waits for it at the end.
class InteractiveProcess {
public:
    explicit InteractiveProcess(const ProcessOptions& start);
    ~InteractiveProcess();
    InteractiveProcess(const InteractiveProcess&) = delete;
    InteractiveProcess& operator=(const InteractiveProcess&) = delete;

    void write(const std::string& text);

    /// The next line of the answer, without its end; waits for it.
    [[nodiscard]] std::string readLine();

    void closeInput();
    void closeOutput();

    /// Waits for the tool's end. @return its exit status
    [[nodiscard]] int wait();

private:
    std::intptr_t m_process;
    int m_input;
    int m_output;
    std::string m_read;
};
