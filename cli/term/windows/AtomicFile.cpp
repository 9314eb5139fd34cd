// Replaces a file as a whole, so that a reader never finds half a file and a run that fails keeps the former one.
#include "term/AtomicFile.h"

#include "database/FileNames.h"
#include "term/ExitCode.h"
#include "term/Streams.h"
#include "term/TemporaryFiles.h"
#include "term/windows/Wide.h"

#include <fmt/format.h>

#include <algorithm>
#include <cerrno>
#include <io.h>
#include <optional>
#include <system_error>
#include <windows.h>

namespace {

[[noreturn]] void raise(const std::string& path, const std::error_condition& failure) {
    throw CommandError(ExitCode::FAULT, fmt::format("can't write \"{}\": {}", path, failure.message()));
}

[[noreturn]] void raiseLastError(const std::string& path) {
    raise(path, std::error_code(static_cast<int>(::GetLastError()), std::system_category())
                    .default_error_condition());
}

/// An open file, or none.
class File {
public:
    File(const std::wstring& path, DWORD access, DWORD creation)
        : m_handle(::CreateFileW(path.c_str(), access, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                 nullptr, creation, FILE_ATTRIBUTE_NORMAL, nullptr)) {}
    ~File() {
        if (isOpen()) {
            ::CloseHandle(m_handle);
        }
    }
    File(const File&) = delete;
    File& operator=(const File&) = delete;

    [[nodiscard]] bool isOpen() const noexcept { return m_handle != INVALID_HANDLE_VALUE; }
    [[nodiscard]] HANDLE handle() const noexcept { return m_handle; }

    [[nodiscard]] bool write(std::string_view text) const {
        constexpr std::size_t MOST = std::size_t{1} << 20;
        while (!text.empty()) {
            DWORD written = 0;
            if (::WriteFile(m_handle, text.data(), static_cast<DWORD>(std::min(text.size(), MOST)), &written,
                            nullptr) == 0) {
                return false;
            }
            text.remove_prefix(written);
        }
        return true;
    }

private:
    HANDLE m_handle;
};

/// What the system has on a file.
/// @return nothing unless it is a file on a disk
std::optional<BY_HANDLE_FILE_INFORMATION> informationOn(HANDLE file) {
    BY_HANDLE_FILE_INFORMATION information{};
    return ::GetFileType(file) == FILE_TYPE_DISK && ::GetFileInformationByHandle(file, &information) != 0
               ? std::optional(information)
               : std::nullopt;
}

/// The path of an open file, with no links in it.
std::wstring finalPath(HANDLE file, const std::wstring& path) {
    std::wstring found(::GetFinalPathNameByHandleW(file, nullptr, 0, FILE_NAME_NORMALIZED), L'\0');
    found.resize(::GetFinalPathNameByHandleW(file, found.data(), static_cast<DWORD>(found.size()),
                                             FILE_NAME_NORMALIZED));
    return found.empty() ? path : found;
}

void writeInPlace(const std::string& path, std::string_view text) {
    const File file(toWide(path), GENERIC_WRITE, TRUNCATE_EXISTING);
    if (!file.isOpen() || !file.write(text)) {
        raiseLastError(path);
    }
}

} // namespace

void writeFile(const std::string& path, std::string_view text) {
    std::wstring target = toWide(path);
    bool exists = false;
    {
        const File former(target, GENERIC_READ, OPEN_EXISTING);
        exists = former.isOpen();
        const auto information = exists ? informationOn(former.handle()) : std::nullopt;
        if (exists && (!information || information->nNumberOfLinks != 1)) {
            writeInPlace(path, text);
            return;
        }
        if (exists) {
            target = finalPath(former.handle(), target);
        } else if (::GetFileAttributesW(target.c_str()) != INVALID_FILE_ATTRIBUTES) {
            raise(path, std::errc::permission_denied); // a directory, or a file of others
        }
    }
    const std::string directory(acd::directoryOf(path));
    std::wstring beside;
    try {
        beside = toWide(createTemporaryFile(directory.empty() ? "." : directory, TEMPORARY_FILE));
    } catch (const std::system_error& failure) {
        if (!exists) {
            raise(path, failure.code().default_error_condition());
        }
        writeInPlace(path, text);
        return;
    }
    bool isDone = false;
    {
        const File file(beside, GENERIC_WRITE, OPEN_EXISTING);
        isDone = file.isOpen() && file.write(text);
    }
    // A replaced file keeps its owner and permissions.
    isDone = isDone && (exists ? ::ReplaceFileW(target.c_str(), beside.c_str(), nullptr, 0, nullptr, nullptr)
                               : ::MoveFileExW(beside.c_str(), target.c_str(), MOVEFILE_WRITE_THROUGH)) != 0;
    if (!isDone) {
        const DWORD failure = ::GetLastError();
        ::DeleteFileW(beside.c_str());
        ::SetLastError(failure);
        raiseLastError(path);
    }
}

std::error_code accessFailure(const std::string& path) {
    constexpr int WRITING = 2;
    return ::_waccess(toWide(path).c_str(), WRITING) == 0 ? std::error_code()
                                                          : std::error_code(errno, std::generic_category());
}

bool isStandardOutput(const std::string& path) {
    const File file(toWide(path), GENERIC_READ, OPEN_EXISTING);
    const auto named = file.isOpen() ? informationOn(file.handle()) : std::nullopt;
    const auto output = informationOn(reinterpret_cast<HANDLE>(::_get_osfhandle(streams::OUTPUT)));
    return named && output && named->dwVolumeSerialNumber == output->dwVolumeSerialNumber &&
           named->nFileIndexHigh == output->nFileIndexHigh && named->nFileIndexLow == output->nFileIndexLow;
}
