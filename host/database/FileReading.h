#pragma once

#include "platform/Platform.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace acd {

/// The largest file that is read.
inline constexpr std::size_t MAX_FILE_SIZE = std::size_t{1} << 30;

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
    using ReadCall = std::ptrdiff_t (*)(int descriptor, void* buffer, std::size_t size);

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
    FileStatus m_status;
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

/// Reads all that is left of a source.
/// @throw ReadError
[[nodiscard]] Text readAll(ByteSource& source);

} // namespace acd
