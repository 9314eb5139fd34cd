#include "platform/Platform.h"

#include "platform/ReservedNames.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <memory>
#include <new>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <io.h>

#include <windows.h>

// The host layer on Windows. All names go through the wide calls.

namespace acd {

namespace {

/// Raises the last failure of the system.
[[noreturn]] void raiseLastError() {
    const std::error_condition failure =
        std::error_code(static_cast<int>(::GetLastError()), std::system_category()).default_error_condition();
    if (failure == std::errc::not_enough_memory) {
        throw std::bad_alloc();
    }
    throw ReadError(failure.message());
}

/// @return empty for what is not UTF-8
[[nodiscard]] std::wstring toWide(std::string_view text) {
    const auto convert = [text](wchar_t* wide, int size) {
        return ::MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, text.data(),
                                     static_cast<int>(text.size()), wide, size);
    };
    std::wstring wide(static_cast<std::size_t>(text.empty() ? 0 : convert(nullptr, 0)), L'\0');
    convert(wide.data(), static_cast<int>(wide.size()));
    return wide;
}

[[nodiscard]] std::string toUtf8(std::wstring_view wide) {
    const auto convert = [wide](char* text, int size) {
        return ::WideCharToMultiByte(CP_UTF8, 0, wide.data(), static_cast<int>(wide.size()), text, size,
                                     nullptr, nullptr);
    };
    std::string text(static_cast<std::size_t>(wide.empty() ? 0 : convert(nullptr, 0)), '\0');
    convert(text.data(), static_cast<int>(text.size()));
    return text;
}

/// A time of the system, which counts units of 100 ns.
[[nodiscard]] FileTime toFileTime(std::int64_t ticks) noexcept {
    constexpr std::int64_t TICKS_PER_SECOND = 10'000'000;
    return {ticks / TICKS_PER_SECOND, static_cast<std::uint32_t>(ticks % TICKS_PER_SECOND * 100)};
}

/// An open file.
class Handle {
public:
    explicit Handle(HANDLE handle) noexcept : m_handle(handle) {}
    ~Handle() {
        if (isOpen()) {
            ::CloseHandle(m_handle);
        }
    }
    Handle(const Handle&) = delete;
    Handle& operator=(const Handle&) = delete;

    [[nodiscard]] bool isOpen() const noexcept { return m_handle != INVALID_HANDLE_VALUE; }
    [[nodiscard]] HANDLE get() const noexcept { return m_handle; }
    [[nodiscard]] HANDLE release() noexcept { return std::exchange(m_handle, INVALID_HANDLE_VALUE); }

private:
    HANDLE m_handle;
};

/// Opens a file so that others can do with it what they like.
[[nodiscard]] HANDLE openShared(const std::string& path) {
    const std::size_t name = path.find_last_of(platform::pathSeparators()) + 1;
    if (platform::isReservedName(std::string_view(path).substr(name))) {
        ::SetLastError(ERROR_FILE_NOT_FOUND);
        return INVALID_HANDLE_VALUE;
    }
    return ::CreateFileW(toWide(path).c_str(), GENERIC_READ,
                         FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr, OPEN_EXISTING,
                         FILE_ATTRIBUTE_NORMAL, nullptr);
}

/// @return nothing if the file has none
[[nodiscard]] std::optional<FileStatus> statusOf(HANDLE file) noexcept {
    BY_HANDLE_FILE_INFORMATION identity{};
    FILE_BASIC_INFO times{};
    if (::GetFileInformationByHandle(file, &identity) == 0 ||
        ::GetFileInformationByHandleEx(file, FileBasicInfo, &times, sizeof times) == 0) {
        return std::nullopt;
    }
    const auto join = [](DWORD high, DWORD low) { return std::uint64_t{high} << 32 | low; };
    return FileStatus{identity.dwVolumeSerialNumber, join(identity.nFileIndexHigh, identity.nFileIndexLow),
                      join(identity.nFileSizeHigh, identity.nFileSizeLow),
                      toFileTime(times.LastWriteTime.QuadPart), toFileTime(times.ChangeTime.QuadPart)};
}

[[nodiscard]] bool isDirectory(const std::string& path) {
    const DWORD attributes = ::GetFileAttributesW(toWide(path).c_str());
    return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

/// Raises the last failure, unless something that is no directory is in its place.
[[noreturn]] void raiseNoDirectory(const std::string& path) {
    const DWORD failure = ::GetLastError();
    if (::GetFileAttributesW(toWide(path).c_str()) != INVALID_FILE_ATTRIBUTES && !isDirectory(path)) {
        throw ReadError(std::generic_category().message(ENOTDIR));
    }
    ::SetLastError(failure);
    raiseLastError();
}

} // namespace

DirectoryStatus::DirectoryStatus(const std::string& path) : m_path(path) {
    if (!isDirectory(path)) {
        raiseNoDirectory(path);
    }
}

DirectoryStatus::~DirectoryStatus() = default;

std::optional<FileStatus> DirectoryStatus::ofReadableFile(const std::string& name) const {
    const Handle file(openShared(m_path + '/' + name));
    return file.isOpen() ? statusOf(file.get()) : std::nullopt;
}

std::vector<std::string> listDirectory(const std::string& path) {
    WIN32_FIND_DATAW entry{};
    const std::wstring pattern = toWide(path);
    const std::unique_ptr<void, decltype([](HANDLE search) { ::FindClose(search); })> search(
        pattern.empty() ? nullptr : ::FindFirstFileW((pattern + L"/*").c_str(), &entry));
    if (search == nullptr) {
        throw ReadError(std::generic_category().message(ENOENT));
    }
    if (search.get() == INVALID_HANDLE_VALUE) {
        raiseNoDirectory(path);
    }
    std::vector<std::string> names;
    do {
        names.push_back(toUtf8(entry.cFileName));
    } while (::FindNextFileW(search.get(), &entry) != 0);
    if (::GetLastError() != ERROR_NO_MORE_FILES) {
        raiseLastError();
    }
    return names;
}

namespace platform {

int openRegularFile(const std::string& path, FileStatus& status) {
    Handle file(openShared(path));
    if (!file.isOpen()) {
        if (isDirectory(path)) {
            throw ReadError("not a regular file");
        }
        raiseLastError();
    }
    const std::optional<FileStatus> found =
        ::GetFileType(file.get()) == FILE_TYPE_DISK ? statusOf(file.get()) : std::nullopt;
    if (!found) {
        throw ReadError("not a regular file");
    }
    status = *found;
    const int descriptor =
        ::_open_osfhandle(reinterpret_cast<std::intptr_t>(file.get()), _O_RDONLY | _O_BINARY | _O_NOINHERIT);
    if (descriptor == -1) {
        raiseSystemError();
    }
    static_cast<void>(file.release()); // it is closed with the descriptor
    return descriptor;
}

std::ptrdiff_t read(int descriptor, void* buffer, std::size_t size) {
    return ::_read(descriptor, buffer, static_cast<unsigned>(std::min<std::size_t>(size, INT_MAX)));
}

void close(int descriptor) noexcept { ::_close(descriptor); }

std::string findOwnFile() {
    static const char anchor = 0;
    HMODULE module = nullptr;
    if (::GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS |
                                 GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                             reinterpret_cast<LPCWSTR>(&anchor), &module) == 0) {
        return {};
    }
    // A name that does not fit is cut, which shows as a full buffer.
    std::wstring file(MAX_PATH, L'\0');
    DWORD size = 0;
    while ((size = ::GetModuleFileNameW(module, file.data(), static_cast<DWORD>(file.size()))) ==
           file.size()) {
        file.resize(file.size() * 2);
    }
    return toUtf8(std::wstring_view(file).substr(0, size));
}

// The system remembers the file by its full path.
std::string ownFile() { return findOwnFile(); }

std::optional<std::string> trustedVariable(const char* name) {
    // The system's own, since the C library has a copy that the application may not have changed.
    const std::wstring wideName = toWide(name);
    std::wstring value;
    for (;;) {
        ::SetLastError(ERROR_SUCCESS);
        const DWORD size =
            ::GetEnvironmentVariableW(wideName.c_str(), value.data(), static_cast<DWORD>(value.size()));
        if (size == 0 && ::GetLastError() == ERROR_ENVVAR_NOT_FOUND) {
            return std::nullopt;
        }
        const bool isWhole = size < value.size() || size == 0;
        value.resize(size);
        if (isWhole) {
            return toUtf8(value);
        }
    }
}

bool isAbsolute(std::string_view path) noexcept {
    return path.starts_with('/') || path.starts_with('\\') || (path.size() > 1 && path[1] == ':');
}

std::string_view pathSeparators() noexcept { return "/\\"; }

char listSeparator() noexcept { return ';'; }

} // namespace platform

std::filesystem::path toPath(std::string_view path) { return std::u8string(path.begin(), path.end()); }

std::string fromPath(const std::filesystem::path& path) {
    const std::u8string text = path.generic_u8string();
    return {text.begin(), text.end()};
}

} // namespace acd
