#include "database/FileReading.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <new>
#include <system_error>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

// Everything that touches files and directories on disk: files are read, not mapped, since a file that is cut
// short under a mapping takes the whole process down.

namespace acd {

namespace {

[[noreturn]] void raiseSystemError() {
    if (errno == ENOMEM) {
        throw std::bad_alloc();
    }
    throw ReadError(std::generic_category().message(errno));
}

[[noreturn]] void raiseTooLarge() { throw ReadError("larger than 1 GiB"); }

[[nodiscard]] FileTime toFileTime(const timespec& time) noexcept {
    return {time.tv_sec, static_cast<std::uint32_t>(time.tv_nsec)};
}

[[nodiscard]] FileStatus toFileStatus(const struct stat& status) noexcept {
    return {status.st_dev, status.st_ino, static_cast<std::uint64_t>(status.st_size),
            toFileTime(status.st_mtim), toFileTime(status.st_ctim)};
}

} // namespace

FileSource::FileSource(const std::string& path) : FileSource(path, ::read) {}

FileSource::FileSource(const std::string& path, ReadCall readCall)
    // Not blocking, as a pipe without a writer would, and not taking a terminal for one's own.
    : m_descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY)), m_readCall(readCall) {
    if (m_descriptor == -1) {
        raiseSystemError();
    }
    try {
        requireRegularFile();
    } catch (...) {
        ::close(m_descriptor);
        throw;
    }
}

FileSource::~FileSource() { ::close(m_descriptor); }

void FileSource::requireRegularFile() {
    struct stat status {};
    if (::fstat(m_descriptor, &status) != 0) {
        raiseSystemError();
    }
    if (!S_ISREG(status.st_mode)) {
        throw ReadError("not a regular file");
    }
    m_status = toFileStatus(status);
    m_size = static_cast<std::size_t>(status.st_size);
    if (m_size > MAX_FILE_SIZE) {
        raiseTooLarge();
    }
}

std::size_t FileSource::read(char* buffer, std::size_t size) {
    ssize_t count;
    do {
        count = m_readCall(m_descriptor, buffer, size);
    } while (count == -1 && errno == EINTR);
    if (count == -1) {
        raiseSystemError();
    }
    m_readSoFar += static_cast<std::size_t>(count);
    if (m_readSoFar > MAX_FILE_SIZE) {
        raiseTooLarge(); // it has grown since it was examined
    }
    return static_cast<std::size_t>(count);
}

MemorySource::MemorySource(std::string_view text) : m_rest(text) {
    if (m_rest.size() > MAX_FILE_SIZE) {
        raiseTooLarge();
    }
}

std::size_t MemorySource::read(char* buffer, std::size_t size) {
    const std::size_t count = m_rest.copy(buffer, size);
    m_rest.remove_prefix(count);
    return count;
}

std::vector<std::string> listDirectory(const std::string& path) {
    // Not the standard library's iterator, which ends the process when memory runs out.
    const std::unique_ptr<DIR, decltype([](DIR* stream) { ::closedir(stream); })> directory(
        ::opendir(path.c_str()));
    if (directory == nullptr) {
        raiseSystemError();
    }
    std::vector<std::string> names;
    errno = 0;
    while (const dirent* const entry = ::readdir(directory.get())) {
        names.emplace_back(entry->d_name);
        errno = 0;
    }
    if (errno != 0) {
        raiseSystemError();
    }
    return names;
}

DirectoryStatus::DirectoryStatus(const std::string& path)
    : m_descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_DIRECTORY)) {
    if (m_descriptor == -1) {
        raiseSystemError();
    }
}

DirectoryStatus::~DirectoryStatus() { ::close(m_descriptor); }

std::optional<FileStatus> DirectoryStatus::ofReadableFile(const std::string& name) const noexcept {
    struct stat status {};
    // The permissions of others than this process say nothing about what it may read, so the system is asked.
    if (::fstatat(m_descriptor, name.c_str(), &status, 0) != 0 ||
        ::faccessat(m_descriptor, name.c_str(), R_OK, AT_EACCESS) != 0) {
        return std::nullopt;
    }
    return toFileStatus(status);
}

Text readAll(ByteSource& source) {
    // One byte more than expected, so that the end is met without asking for more memory.
    std::size_t capacity = source.expectedSize() + 1;
    Text text{makeBuffer(capacity), 0};
    while (const std::size_t count = source.read(text.bytes.get() + text.size, capacity - text.size)) {
        text.size += count;
        if (text.size == capacity) {
            capacity *= 2;
            auto larger = makeBuffer(capacity);
            std::memcpy(larger.get(), text.bytes.get(), text.size);
            text.bytes = std::move(larger);
        }
    }
    return text;
}

} // namespace acd
