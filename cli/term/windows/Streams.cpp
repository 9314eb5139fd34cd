// The standard streams on Windows.
#include "term/Streams.h"

#include "term/windows/Wide.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <io.h>
#include <memory>
#include <windows.h>

#include <shellapi.h>

namespace streams {

namespace {

HANDLE handleOf(int stream) { return reinterpret_cast<HANDLE>(::_get_osfhandle(stream)); }

/// Writes to a terminal in the system's own texts: the terminal's code page need not be UTF-8.
bool writeToTerminal(int stream, std::string_view text) {
    const std::wstring wide = toWide(text);
    for (std::wstring_view rest = wide; !rest.empty();) {
        DWORD written = 0;
        if (::WriteConsoleW(handleOf(stream), rest.data(), static_cast<DWORD>(rest.size()), &written,
                            nullptr) == 0) {
            errno = EIO;
            return false;
        }
        rest.remove_prefix(written);
    }
    return true;
}

} // namespace

std::vector<std::string> prepare(int /*argc*/, char** /*argv*/) {
    for (const int stream : {INPUT, OUTPUT, ERRORS}) {
        ::_setmode(stream, _O_BINARY);
    }
    // Not those of main, which are in the system's code page.
    int count = 0;
    const std::unique_ptr<LPWSTR, decltype([](LPWSTR* words) { ::LocalFree(words); })> words(
        ::CommandLineToArgvW(::GetCommandLineW(), &count));
    std::vector<std::string> arguments;
    for (int word = 1; word < count; ++word) {
        arguments.push_back(toUtf8(words.get()[word]));
    }
    return arguments;
}

bool isTerminal(int stream) {
    DWORD mode = 0;
    return ::GetConsoleMode(handleOf(stream), &mode) != 0;
}

bool hasColours(int stream) {
    DWORD mode = 0;
    return ::GetConsoleMode(handleOf(stream), &mode) != 0 &&
           ::SetConsoleMode(handleOf(stream), mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING) != 0;
}

std::size_t columns(int stream) {
    CONSOLE_SCREEN_BUFFER_INFO screen{};
    return ::GetConsoleScreenBufferInfo(handleOf(stream), &screen) != 0
               ? static_cast<std::size_t>(screen.srWindow.Right - screen.srWindow.Left + 1)
               : 0;
}

bool write(int stream, std::string_view text) {
    if (isTerminal(stream)) {
        return writeToTerminal(stream, text);
    }
    constexpr std::size_t MOST = std::size_t{1} << 20;
    while (!text.empty()) {
        const int written = ::_write(stream, text.data(), static_cast<unsigned>(std::min(text.size(), MOST)));
        if (written < 0) {
            // A pipe without a reader shows in several ways.
            const DWORD failure = ::GetLastError();
            if (failure == ERROR_NO_DATA || failure == ERROR_BROKEN_PIPE ||
                failure == ERROR_PIPE_NOT_CONNECTED) {
                errno = EPIPE;
            }
            return false;
        }
        text.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

bool isInputWaiting() {
    DWORD available = 0;
    // Fails for anything but a pipe, and for one that has ended: reading a file does not wait.
    return isTerminal(INPUT) ||
           (::PeekNamedPipe(handleOf(INPUT), nullptr, 0, nullptr, &available, nullptr) != 0 &&
            available == 0);
}

std::ptrdiff_t readInput(char* buffer, std::size_t size) {
    return ::_read(INPUT, buffer, static_cast<unsigned>(size));
}

} // namespace streams
