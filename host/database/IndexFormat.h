#pragma once

#include "database/FileReading.h"
#include "database/LittleEndian.h"
#include "database/PackedStrings.h"

#include <bit>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

// The index of a directory and its form as a file. The library reads it, the tool writes it, and both go through the
// same list of members, so that they cannot disagree.

namespace acd {

/// One database file of a directory.
struct IndexedFile {
    std::string name;
    FileStatus status;      ///< from before it was read
    PackedStrings sections; ///< the names of its sections, in order, repeated ones included
};

/// What the index of a directory records.
struct IndexContents {
    std::uint64_t device = 0;       ///< that the directory is on
    FileTime created;               ///< by the clock of that device, from before the first file was read
    std::vector<IndexedFile> files; ///< in byte order of their names

    /// Whether an equal status proves that the file has not changed. A file as young as the index may have changed
    /// within the same tick of the clock after it was read, and another device has another clock.
    [[nodiscard]] bool isSettled(const IndexedFile& file) const noexcept {
        return file.status.device == device && file.status.changed < created;
    }
};

namespace indexFormat {

/// The name of the file in its directory.
inline constexpr const char* FILE_NAME = "index.acx";

/// The first bytes of an index. The number changes with the format, and with the rules by which the names of sections
/// are found: an index of other rules must not be used.
inline constexpr std::string_view SIGNATURE = "tarvik index 2\n";

/// Lists the members in the order in which they are stored.
template <typename Stream, typename Time>
requires std::same_as<std::remove_const_t<Time>, FileTime>
void transfer(Stream& stream, Time& time) {
    stream.number(time.seconds);
    stream.number(time.nanoseconds);
}

template <typename Stream, typename File>
requires std::same_as<std::remove_const_t<File>, IndexedFile>
void transfer(Stream& stream, File& file) {
    stream.text(file.name);
    stream.number(file.status.device);
    stream.number(file.status.inode);
    stream.number(file.status.size);
    transfer(stream, file.status.modified);
    transfer(stream, file.status.changed);
    stream.strings(file.sections);
}

template <typename Stream, typename Contents>
requires std::same_as<std::remove_const_t<Contents>, IndexContents>
void transfer(Stream& stream, Contents& contents) {
    stream.number(contents.device);
    transfer(stream, contents.created);
    stream.list(contents.files);
}

/// Writes numbers with the lowest byte first, and the length before each text and list.
class Writer {
public:
    template <std::integral Number>
    void number(Number number) {
        appendLittleEndian(m_bytes, number);
    }

    void text(std::string_view text) {
        number(static_cast<std::uint32_t>(text.size()));
        m_bytes += text;
    }

    void strings(const PackedStrings& strings) { text(strings.bytes()); }

    template <typename Item>
    void list(const std::vector<Item>& items) {
        number(static_cast<std::uint32_t>(items.size()));
        for (const Item& item : items) {
            transfer(*this, item);
        }
    }

    [[nodiscard]] std::string& bytes() noexcept { return m_bytes; }

private:
    std::string m_bytes;
};

/// Reads the same. The first thing that does not fit into what is left makes everything after it fail, too.
class Reader {
public:
    /// @param owner of the bytes, for what refers to them
    Reader(std::string_view bytes, std::shared_ptr<const char[]> owner) noexcept
        : m_rest(bytes), m_owner(std::move(owner)) {}

    /// @return whether everything fitted
    [[nodiscard]] bool isValid() const noexcept { return m_isValid; }

    /// @return whether there is nothing left
    [[nodiscard]] bool isAtEnd() const noexcept { return m_rest.empty(); }

    template <std::integral Number>
    void number(Number& number) {
        const std::string_view bytes = take(sizeof number);
        number = bytes.empty() ? 0 : loadLittleEndian<Number>(bytes.data());
    }

    void text(std::string& text) { text = takeText(); }

    void strings(PackedStrings& strings) {
        if (auto packed = PackedStrings::from(m_owner, takeText())) {
            strings = std::move(*packed);
        } else {
            fail();
        }
    }

    template <typename Item>
    void list(std::vector<Item>& items) {
        items.resize(count(MIN_FILE_SIZE));
        for (Item& item : items) {
            transfer(*this, item);
        }
    }

private:
    /// The size of a file's entry without its texts.
    static constexpr std::size_t MIN_FILE_SIZE = 2 * sizeof(std::uint32_t) + 3 * sizeof(std::uint64_t) +
                                                 2 * (sizeof(std::int64_t) + sizeof(std::uint32_t));

    void fail() noexcept {
        m_isValid = false;
        m_rest = {};
    }

    [[nodiscard]] std::string_view take(std::size_t size) noexcept {
        if (size > m_rest.size()) {
            fail();
            return {};
        }
        const std::string_view taken = m_rest.substr(0, size);
        m_rest.remove_prefix(size);
        return taken;
    }

    [[nodiscard]] std::string_view takeText() {
        std::uint32_t size = 0;
        number(size);
        return take(size);
    }

    /// How many items follow. No memory is asked for that the bytes which are left could not fill.
    [[nodiscard]] std::size_t count(std::size_t minItemSize) {
        std::uint32_t count = 0;
        number(count);
        if (count > m_rest.size() / minItemSize) {
            fail();
            return 0;
        }
        return count;
    }

    std::string_view m_rest;
    std::shared_ptr<const char[]> m_owner;
    bool m_isValid = true;
};

/// Every single changed byte changes it, as each step has a different result for each sum and each word. It takes eight
/// bytes a step, since a CRC would take longer than all else that is done with an index.
[[nodiscard]] inline std::uint64_t checksum(std::string_view bytes) noexcept {
    constexpr std::uint64_t FACTOR = 0x9E3779B97F4A7C15;
    const auto step = [](std::uint64_t sum, std::uint64_t word) {
        return std::rotl((sum ^ word) * FACTOR, 32);
    };
    std::uint64_t sum = bytes.size();
    for (; bytes.size() >= sizeof sum; bytes.remove_prefix(sizeof sum)) {
        sum = step(sum, loadLittleEndian<std::uint64_t>(bytes.data()));
    }
    for (const char byte : bytes) {
        sum = step(sum, static_cast<unsigned char>(byte));
    }
    return sum;
}

/// The bytes of an index file: the signature, the contents and a checksum of both.
[[nodiscard]] inline std::string encode(const IndexContents& contents) {
    Writer writer;
    writer.bytes() = SIGNATURE;
    transfer(writer, contents);
    writer.number(checksum(writer.bytes()));
    return std::move(writer.bytes());
}

} // namespace indexFormat

} // namespace acd
