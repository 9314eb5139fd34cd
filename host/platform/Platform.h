#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>
#include <utility>
#include <vector>

// Everything that the host layer asks of the operating system. `posix/` and `windows/` each implement it in one file.
//
// Paths and names are UTF-8 on Windows, and bytes elsewhere.

namespace acd {

/// A file can't be read. Raised and caught inside this library only.
class ReadError : public std::exception {
public:
    explicit ReadError(std::string reason) : m_reason(std::move(reason)) {}
    [[nodiscard]] const char* what() const noexcept override { return m_reason.c_str(); }

private:
    std::string m_reason;
};

/// A time as the file system records it.
struct FileTime {
    std::int64_t seconds = 0;
    std::uint32_t nanoseconds = 0;

    friend bool operator==(const FileTime&, const FileTime&) = default;
    friend bool operator<(const FileTime& left, const FileTime& right) noexcept {
        return std::tie(left.seconds, left.nanoseconds) < std::tie(right.seconds, right.nanoseconds);
    }
};

/// What identifies a file and one state of it: every change of the content changes the status, unless two changes
/// happen within one tick of the file system's clock.
struct FileStatus {
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::uint64_t size = 0;
    FileTime modified; ///< programs can set it to any value
    FileTime changed;  ///< programs cannot set it

    friend bool operator==(const FileStatus&, const FileStatus&) = default;
};

/// Looks at the files of one directory without reading them.
class DirectoryStatus {
public:
    /// @throw ReadError
    explicit DirectoryStatus(const std::string& path);
    ~DirectoryStatus();
    DirectoryStatus(const DirectoryStatus&) = delete;
    DirectoryStatus& operator=(const DirectoryStatus&) = delete;

    /// The status of a file.
    /// @return nothing if there is no such file, or this process has no permission to read it
    [[nodiscard]] std::optional<FileStatus> ofReadableFile(const std::string& name) const;

private:
    std::string m_path;
    int m_descriptor = -1; ///< where the system can look a name up in an open directory
};

/// The names of all entries of a directory, "." and ".." included, in no particular order.
/// @throw ReadError
[[nodiscard]] std::vector<std::string> listDirectory(const std::string& path);

namespace platform {

/// Opens a regular file for reading, as bytes. Other programs can read, change, rename and remove it meanwhile. A pipe
/// or a device is refused, and never waited for.
/// @param status receives the status of the file
/// @return a descriptor for `read` and `close`
/// @throw ReadError
[[nodiscard]] int openRegularFile(const std::string& path, FileStatus& status);

/// The system's call: puts up to `size` bytes into `buffer`.
/// @return how many, 0 at the end; -1 for a failure, which is in `errno`
std::ptrdiff_t read(int descriptor, void* buffer, std::size_t size);

void close(int descriptor) noexcept;

/// Raises what is in `errno`.
/// @throw ReadError, or std::bad_alloc if memory ran out
[[noreturn]] void raiseSystemError();

/// The file that this code was loaded from: the library, or the program that it is linked into.
/// @return its path, absolute; empty if it is unknown
[[nodiscard]] std::string findOwnFile();

/// The same, as it was when the code was loaded.
[[nodiscard]] std::string ownFile();

/// A variable of the environment.
/// @return nothing if it is not set, or if this process has more rights than its user and must not trust it
[[nodiscard]] std::optional<std::string> trustedVariable(const char* name);

/// Whether a path means the same in every working directory.
[[nodiscard]] bool isAbsolute(std::string_view path) noexcept;

/// The characters that separate the names of a path; the first one is used to join them.
[[nodiscard]] std::string_view pathSeparators() noexcept;

/// The character that separates the directories of a search path.
[[nodiscard]] char listSeparator() noexcept;

} // namespace platform

/// A path of the standard library from one of ours.
[[nodiscard]] std::filesystem::path toPath(std::string_view path);

/// The reverse. Names are separated by `/` on every system.
[[nodiscard]] std::string fromPath(const std::filesystem::path& path);

} // namespace acd
