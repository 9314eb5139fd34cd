#include "database/FileReading.h"

#include <cerrno>
#include <cstring>
#include <utility>

// Reads files as bytes: they are read, not mapped, since a file that is cut short under a mapping takes the whole process
// down.

namespace acd {

namespace {

[[noreturn]] void raiseTooLarge() { throw ReadError("larger than 1 GiB"); }

} // namespace

FileSource::FileSource(const std::string& path) : FileSource(path, platform::read) {}

FileSource::FileSource(const std::string& path, ReadCall readCall)
    : m_descriptor(platform::openRegularFile(path, m_status)), m_readCall(readCall) {
    if (m_status.size > MAX_FILE_SIZE) {
        platform::close(m_descriptor);
        raiseTooLarge();
    }
    m_size = static_cast<std::size_t>(m_status.size);
}

FileSource::~FileSource() { platform::close(m_descriptor); }

std::size_t FileSource::read(char* buffer, std::size_t size) {
    std::ptrdiff_t count;
    do {
        count = m_readCall(m_descriptor, buffer, size);
    } while (count == -1 && errno == EINTR);
    if (count == -1) {
        platform::raiseSystemError();
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
