#include "platform/Platform.h"

#include <array>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <memory>
#include <new>
#include <system_error>

#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

// The host layer on POSIX systems.

namespace acd {

namespace {

static_assert(sizeof(ssize_t) == sizeof(std::ptrdiff_t));

[[nodiscard]] FileTime toFileTime(const timespec& time) noexcept {
    return {time.tv_sec, static_cast<std::uint32_t>(time.tv_nsec)};
}

[[nodiscard]] FileStatus toFileStatus(const struct stat& status) noexcept {
    return {status.st_dev, status.st_ino, static_cast<std::uint64_t>(status.st_size),
            toFileTime(status.st_mtim), toFileTime(status.st_ctim)};
}

/// The file of this code; empty while it is unknown. Memory that needs no release: the library may be unloaded, and
/// databases may be looked for at exit.
std::array<char, PATH_MAX> rememberedFile{};

/// Looks for it when the library is loaded: a relative name loses its meaning when the program changes its
/// directory.
[[gnu::constructor]] void rememberOwnFile() {
    try {
        const std::string file = platform::findOwnFile();
        if (file.size() < rememberedFile.size()) {
            file.copy(rememberedFile.data(), file.size());
        }
    } catch (const std::bad_alloc&) {
        return; // There is no installed database then.
    }
}

} // namespace

DirectoryStatus::DirectoryStatus(const std::string& path)
    : m_descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_DIRECTORY)) {
    if (m_descriptor == -1) {
        platform::raiseSystemError();
    }
}

DirectoryStatus::~DirectoryStatus() { ::close(m_descriptor); }

std::optional<FileStatus> DirectoryStatus::ofReadableFile(const std::string& name) const {
    struct stat status {};
    // The permissions of others than this process say nothing about what it may read, so the system is asked.
    if (::fstatat(m_descriptor, name.c_str(), &status, 0) != 0 ||
        ::faccessat(m_descriptor, name.c_str(), R_OK, AT_EACCESS) != 0) {
        return std::nullopt;
    }
    return toFileStatus(status);
}

std::vector<std::string> listDirectory(const std::string& path) {
    // Not the standard library's iterator, which ends the process when memory runs out.
    const std::unique_ptr<DIR, decltype([](DIR* stream) { ::closedir(stream); })> directory(
        ::opendir(path.c_str()));
    if (directory == nullptr) {
        platform::raiseSystemError();
    }
    std::vector<std::string> names;
    errno = 0;
    while (const dirent* const entry = ::readdir(directory.get())) {
        names.emplace_back(entry->d_name);
        errno = 0;
    }
    if (errno != 0) {
        platform::raiseSystemError();
    }
    return names;
}

namespace platform {

int openRegularFile(const std::string& path, FileStatus& status) {
    // Not blocking, as a pipe without a writer would, and not taking a terminal for one's own.
    const int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY);
    if (descriptor == -1) {
        raiseSystemError();
    }
    try {
        struct stat found {};
        if (::fstat(descriptor, &found) != 0) {
            raiseSystemError();
        }
        if (!S_ISREG(found.st_mode)) {
            throw ReadError("not a regular file");
        }
        status = toFileStatus(found);
    } catch (...) {
        ::close(descriptor);
        throw;
    }
    return descriptor;
}

std::ptrdiff_t read(int descriptor, void* buffer, std::size_t size) {
    return ::read(descriptor, buffer, size);
}

void close(int descriptor) noexcept { ::close(descriptor); }

std::string findOwnFile() {
    static const char anchor = 0;
    Dl_info information{};
    if (dladdr(&anchor, &information) == 0 || information.dli_fname == nullptr) {
        return {};
    }
    const std::filesystem::path file = information.dli_fname;
    std::error_code error;
    // A bare name is the program's own, as it was typed: the loader names libraries by their paths.
    return (file.has_parent_path() ? std::filesystem::absolute(file, error)
                                   : std::filesystem::read_symlink("/proc/self/exe", error))
        .string();
}

std::string ownFile() { return rememberedFile.data(); }

std::optional<std::string> trustedVariable(const char* name) {
    const char* const value = secure_getenv(name);
    return value == nullptr ? std::nullopt : std::optional<std::string>(value);
}

bool isAbsolute(std::string_view path) noexcept { return path.starts_with('/'); }

std::string_view pathSeparators() noexcept { return "/"; }

char listSeparator() noexcept { return ':'; }

} // namespace platform

std::filesystem::path toPath(std::string_view path) { return path; }

std::string fromPath(const std::filesystem::path& path) { return path.string(); }

} // namespace acd
