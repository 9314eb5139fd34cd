// Temporary files on Windows.
#include "term/TemporaryFiles.h"

#include "term/windows/Wide.h"

#include <fmt/format.h>

#include <array>
#include <filesystem>
#include <random>
#include <system_error>
#include <windows.h>

namespace {

/// Makes something under a new name.
/// @param make returns whether that worked, otherwise the failure is the system's last one
template <typename Make>
std::string createNamed(const std::string& beginning, Make make) {
    constexpr int MOST_TRIES = 100;
    std::random_device random;
    for (int tries = 1;; ++tries) {
        std::string path = fmt::format("{}{:08x}", beginning, random());
        if (make(toWide(path).c_str())) {
            return path;
        }
        const DWORD failure = ::GetLastError();
        if ((failure != ERROR_FILE_EXISTS && failure != ERROR_ALREADY_EXISTS) || tries == MOST_TRIES) {
            throw std::system_error(std::make_error_code(static_cast<std::errc>(
                                        std::error_code(static_cast<int>(failure), std::system_category())
                                            .default_error_condition()
                                            .value())),
                                    fmt::format("cannot make \"{}\"", path));
        }
    }
}

} // namespace

std::string createTemporaryFile(const std::string& directory, const std::string& beginning) {
    return createNamed(fmt::format("{}/{}", directory, beginning), [](const wchar_t* path) {
        const HANDLE file =
            ::CreateFileW(path, GENERIC_WRITE, 0, nullptr, CREATE_NEW, FILE_ATTRIBUTE_NORMAL, nullptr);
        return file != INVALID_HANDLE_VALUE && ::CloseHandle(file) != 0;
    });
}

std::string createTemporaryDirectory() {
    return createNamed(acd::fromPath(std::filesystem::temp_directory_path() / "tarvik-"),
                       [](const wchar_t* path) { return ::CreateDirectoryW(path, nullptr) != 0; });
}
