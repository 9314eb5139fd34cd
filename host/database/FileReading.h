#pragma once

#include <cstddef>
#include <exception>
#include <memory>
#include <string>
#include <string_view>
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

/// The bytes of a regular file. Nothing else is waited for: a pipe or a device is refused, and never blocks.
class FileSource final : public ByteSource {
public:
    /// The system's `read`, or what stands in for it in a test.
    using ReadCall = ssize_t (*)(int descriptor, void* buffer, std::size_t size);

    /// @throw ReadError
    explicit FileSource(const std::string& path);
    FileSource(const std::string& path, ReadCall readCall);
    ~FileSource() override;
    FileSource(const FileSource&) = delete;
    FileSource& operator=(const FileSource&) = delete;

    [[nodiscard]] std::size_t expectedSize() const noexcept override { return m_size; }
    [[nodiscard]] std::size_t read(char* buffer, std::size_t size) override;

private:
    void requireRegularFile();

    int m_descriptor;
    ReadCall m_readCall;
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

/// Reads all that is left of a source.
/// @throw ReadError
[[nodiscard]] Text readAll(ByteSource& source);

} // namespace acd
