// Processes on Windows.
#include "cli/support/Processes.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <io.h>
#include <stdexcept>
#include <utility>
#include <windows.h>

namespace processes {

namespace {

std::wstring toWide(const std::string& text) {
    return std::filesystem::path(std::u8string(text.begin(), text.end())).wstring();
}

/// A word of a command line, which the program reads as one word again.
std::wstring quoted(const std::string& word) {
    std::wstring text = L"\"";
    std::size_t backslashes = 0;
    for (const wchar_t character : toWide(word)) {
        if (character == L'"') {
            text.append(backslashes + 1, L'\\');
        }
        backslashes = character == L'\\' ? backslashes + 1 : 0;
        text += character;
    }
    return text.append(backslashes, L'\\') + L"\" ";
}

/// A handle of a descriptor for the started process; closed at the end.
class Inherited {
public:
    explicit Inherited(int descriptor) {
        const HANDLE own = reinterpret_cast<HANDLE>(::_get_osfhandle(descriptor));
        ::DuplicateHandle(::GetCurrentProcess(), own, ::GetCurrentProcess(), &m_handle, 0, TRUE,
                          DUPLICATE_SAME_ACCESS);
    }
    ~Inherited() { ::CloseHandle(m_handle); }
    Inherited(const Inherited&) = delete;
    Inherited& operator=(const Inherited&) = delete;

    [[nodiscard]] HANDLE get() const { return m_handle; }

private:
    HANDLE m_handle = nullptr;
};

} // namespace

int check(int result) {
    if (result < 0) {
        throw std::runtime_error(std::strerror(errno));
    }
    return result;
}

void closeOnce(int& descriptor) {
    if (descriptor >= 0) {
        ::_close(std::exchange(descriptor, -1));
    }
}

Pipe makePipe() {
    int ends[2];
    check(::_pipe(ends, 65536, _O_BINARY | _O_NOINHERIT));
    return {ends[0], ends[1]};
}

Pipe makeTerminal(unsigned short /*columns*/) {
    throw std::runtime_error("programs can't make terminals here");
}

int openForWriting(const std::string& path) {
    return check(::_wopen(toWide(path).c_str(), _O_WRONLY | _O_BINARY | _O_NOINHERIT));
}

void ignoreClosedPipes() {}

std::vector<std::string> environment() {
    std::vector<std::string> all;
    for (char** variable = _environ; *variable != nullptr; ++variable) {
        all.emplace_back(*variable);
    }
    return all;
}

std::intptr_t spawn(const std::vector<std::string>& arguments, const std::vector<std::string>& environment,
                    int input, int output, int error) {
    std::wstring line;
    for (const std::string& argument : arguments) {
        line += quoted(argument);
    }
    std::wstring variables;
    for (const std::string& variable : environment) {
        variables += toWide(variable) + L'\0';
    }
    const Inherited in(input);
    const Inherited out(output);
    const Inherited errors(error);
    STARTUPINFOW startup{};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESTDHANDLES;
    startup.hStdInput = in.get();
    startup.hStdOutput = out.get();
    startup.hStdError = errors.get();
    PROCESS_INFORMATION process{};
    if (::CreateProcessW(toWide(arguments.front()).c_str(), line.data(), nullptr, nullptr, TRUE,
                         CREATE_UNICODE_ENVIRONMENT, variables.data(), nullptr, &startup, &process) == 0) {
        throw std::runtime_error("can't start " + arguments.front());
    }
    ::CloseHandle(process.hThread);
    return reinterpret_cast<std::intptr_t>(process.hProcess);
}

int waitFor(std::intptr_t process) {
    const HANDLE handle = reinterpret_cast<HANDLE>(process);
    ::WaitForSingleObject(handle, INFINITE);
    DWORD status = 0;
    ::GetExitCodeProcess(handle, &status);
    ::CloseHandle(handle);
    return static_cast<int>(status);
}

} // namespace processes
