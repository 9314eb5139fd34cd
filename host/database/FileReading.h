#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>
#include <utility>
#include <vector>

#include <sys/types.h>

namespace acd {

/// The largest file that is read.
inline constexpr std::size_t MAX_FILE_SIZE = std::size_t{1} << 30;

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

/// Bytes that come one portion after the other.
class ByteSource {
public:
    virtual ~ByteSource() = default;

    /// How many bytes there will be, as far as can be told before.
    [[nodiscard]] virtual std::size_t expectedSize() const noexcept = 0;

    /// Puts up to `size` bytes into `buffer`.
    /// @return how many; 0 at the end only
    /// @throw ReadError
    [[nodiscard]] virtual std::size_t read(char* buffer, std::size_t size) = 0;
};

/// The bytes of a regular file. A pipe or a device is refused, and never waited for.
class FileSource final : public ByteSource {
public:
    /// The system's `read`, or its replacement in a test.
    using ReadCall = ssize_t (*)(int descriptor, void* buffer, std::size_t size);

    /// @throw ReadError
    explicit FileSource(const std::string& path);
    FileSource(const std::string& path, ReadCall readCall);
    ~FileSource() override;
    FileSource(const FileSource&) = delete;
    FileSource& operator=(const FileSource&) = delete;

    [[nodiscard]] std::size_t expectedSize() const noexcept override { return m_size; }
    [[nodiscard]] std::size_t read(char* buffer, std::size_t size) override;

    /// The status that the file had when it was opened.
    [[nodiscard]] const FileStatus& status() const noexcept { return m_status; }

private:
    void requireRegularFile();

    int m_descriptor;
    ReadCall m_readCall;
    FileStatus m_status;
    std::size_t m_size = 0;
    std::size_t m_readSoFar = 0;
};

/// The bytes of a text, which must outlive the source.
class MemorySource final : public ByteSource {
public:
    /// @throw ReadError when the text is larger than a file may be
    explicit MemorySource(std::string_view text);

    [[nodiscard]] std::size_t expectedSize() const noexcept override { return m_rest.size(); }
    [[nodiscard]] std::size_t read(char* buffer, std::size_t size) override;

private:
    std::string_view m_rest;
};

/// Memory for so many bytes, which have no values yet: clearing what is read into next would take time.
[[nodiscard]] inline std::unique_ptr<char[]> makeBuffer(std::size_t size) {
    return std::unique_ptr<char[]>(new char[size]);
}

/// A text in memory of its own.
struct Text {
    std::unique_ptr<char[]> bytes;
    std::size_t size = 0;
};

/// The names of all entries of a directory, "." and ".." included, in no particular order.
/// @throw ReadError
[[nodiscard]] std::vector<std::string> listDirectory(const std::string& path);

/// Looks at the files of one directory without opening them.
class DirectoryStatus {
public:
    /// @throw ReadError
    explicit DirectoryStatus(const std::string& path);
    ~DirectoryStatus();
    DirectoryStatus(const DirectoryStatus&) = delete;
    DirectoryStatus& operator=(const DirectoryStatus&) = delete;

    /// The status of a file.
    /// @return nothing if there is no such file, or this process has no permission to read it
    [[nodiscard]] std::optional<FileStatus> ofReadableFile(const std::string& name) const noexcept;

private:
    int m_descriptor;
};

/// Reads all that is left of a source.
/// @throw ReadError
[[nodiscard]] Text readAll(ByteSource& source);

} // namespace acd
