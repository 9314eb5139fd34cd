// Processes on Windows.
#include "term/Subprocess.h"

#include "term/ExitCode.h"
#include "term/windows/Wide.h"

#include <array>
#include <fcntl.h>
#include <io.h>
#include <memory>
#include <system_error>
#include <utility>
#include <windows.h>

namespace {

[[noreturn]] void fail(const std::string& what) {
    const std::error_code failure(static_cast<int>(::GetLastError()), std::system_category());
    throw CommandError(ExitCode::FAULT, what + ": " + failure.default_error_condition().message());
}

/// Appends a word to a command line, so that the program reads it as one word again.
void appendWord(std::wstring& line, const std::wstring& word) {
    if (!line.empty()) {
        line += L' ';
    }
    line += L'"';
    std::size_t backslashes = 0;
    for (const wchar_t character : word) {
        if (character == L'"') {
            line.append(backslashes + 1, L'\\'); // the quote and all backslashes before it are literal
        }
        backslashes = character == L'\\' ? backslashes + 1 : 0;
        line += character;
    }
    line.append(backslashes, L'\\');
    line += L'"';
}

/// Where a program is: in PATH, but not in the working directory, where anybody may have put one of that name.
std::wstring findProgram(const std::string& name) {
    const std::optional<std::string> path = acd::platform::trustedVariable("PATH");
    std::wstring found(32768, L'\0');
    const DWORD size = ::SearchPathW(toWide(path.value_or("")).c_str(), toWide(name).c_str(), L".exe",
                                     static_cast<DWORD>(found.size()), found.data(), nullptr);
    if (size == 0) {
        fail("can't start " + name);
    }
    found.resize(size);
    return found;
}

} // namespace

std::vector<std::string> environmentVariables() {
    const std::unique_ptr<wchar_t, decltype([](wchar_t* block) { ::FreeEnvironmentStringsW(block); })> block(
        ::GetEnvironmentStringsW());
    std::vector<std::string> all;
    for (const wchar_t* variable = block.get(); *variable != L'\0';) {
        const std::wstring_view text = variable;
        all.push_back(toUtf8(text));
        variable += text.size() + 1;
    }
    return all;
}

Subprocess::Subprocess(const std::vector<std::string>& arguments, bool isSilent) {
    std::vector<std::string> command{"tarvik"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    // This code is linked into the program itself.
    start(acd::platform::ownFile(), command, environmentVariables(), isSilent);
}

Subprocess::Subprocess(const std::vector<std::string>& command, const std::vector<std::string>& environment,
                       bool isSilent) {
    start(toUtf8(findProgram(command.front())), command, environment, isSilent);
}

void Subprocess::start(const std::string& program, const std::vector<std::string>& command,
                       const std::vector<std::string>& environment, bool isSilent) {
    std::wstring line;
    for (const std::string& word : command) {
        appendWord(line, toWide(word));
    }
    std::wstring variables;
    for (const std::string& variable : environment) {
        variables += toWide(variable) + L'\0';
    }
    SECURITY_ATTRIBUTES inherited{sizeof inherited, nullptr, TRUE};
    HANDLE reading = nullptr;
    HANDLE writing = nullptr;
    if (::CreatePipe(&reading, &writing, &inherited, 0) == 0) {
        fail("can't make a pipe");
    }
    ::SetHandleInformation(reading, HANDLE_FLAG_INHERIT, 0);
    const HANDLE nothing = isSilent ? ::CreateFileW(L"NUL", GENERIC_WRITE, FILE_SHARE_WRITE, &inherited,
                                                    OPEN_EXISTING, 0, nullptr)
                                    : INVALID_HANDLE_VALUE;
    STARTUPINFOW startup{};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESTDHANDLES;
    startup.hStdInput = ::GetStdHandle(STD_INPUT_HANDLE);
    startup.hStdOutput = writing;
    startup.hStdError = isSilent ? nothing : ::GetStdHandle(STD_ERROR_HANDLE);
    PROCESS_INFORMATION process{};
    const BOOL isStarted =
        ::CreateProcessW(toWide(program).c_str(), line.data(), nullptr, nullptr, TRUE,
                         CREATE_UNICODE_ENVIRONMENT, variables.data(), nullptr, &startup, &process);
    const DWORD failure = ::GetLastError();
    ::CloseHandle(writing);
    if (isSilent) {
        ::CloseHandle(nothing);
    }
    if (isStarted == 0) {
        ::CloseHandle(reading);
        ::SetLastError(failure);
        fail("can't start " + command.front());
    }
    ::CloseHandle(process.hThread);
    m_process = reinterpret_cast<std::intptr_t>(process.hProcess);
    m_output = ::_open_osfhandle(reinterpret_cast<std::intptr_t>(reading), _O_RDONLY | _O_BINARY);
}

bool Subprocess::succeeds(std::string& text) {
    std::array<char, 65536> buffer{};
    int count = 0;
    while ((count = ::_read(m_output, buffer.data(), static_cast<unsigned>(buffer.size()))) > 0) {
        text.append(buffer.data(), static_cast<std::size_t>(count));
    }
    return wait() == EXIT_SUCCESS;
}

/// Stops reading and waits. @return the status with which the process ended
int Subprocess::wait() noexcept {
    ::_close(std::exchange(m_output, -1));
    const HANDLE process = reinterpret_cast<HANDLE>(std::exchange(m_process, -1));
    ::WaitForSingleObject(process, INFINITE);
    DWORD status = EXIT_FAILURE;
    ::GetExitCodeProcess(process, &status);
    ::CloseHandle(process);
    return static_cast<int>(status);
}
