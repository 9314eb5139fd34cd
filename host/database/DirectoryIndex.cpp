#include "database/DirectoryIndex.h"

#include "database/FileNames.h"

#include <algorithm>
#include <utility>

// Reads the index of a directory and decides whether it can be trusted. Every doubt means that it is not used: a stale
// index would give wrong answers, no index only costs time.

namespace acd {

namespace {

/// The largest index that is read: ten times what the largest database needs.
constexpr std::size_t MAX_INDEX_SIZE = std::size_t{256} << 20;

} // namespace

std::optional<DirectoryIndex> DirectoryIndex::read(const std::string& directory) {
    try {
        FileSource source(joinPath(directory, indexFormat::FILE_NAME));
        if (source.expectedSize() > MAX_INDEX_SIZE) {
            return std::nullopt;
        }
        return decode(readAll(source));
    } catch (const ReadError&) {
        return std::nullopt;
    }
}

std::optional<DirectoryIndex> DirectoryIndex::decode(Text text) {
    const std::string_view bytes(text.bytes.get(), text.size);
    std::uint64_t checksum = 0;
    if (!bytes.starts_with(indexFormat::SIGNATURE) ||
        bytes.size() < indexFormat::SIGNATURE.size() + sizeof checksum) {
        return std::nullopt;
    }
    const std::string_view covered = bytes.substr(0, bytes.size() - sizeof checksum);
    indexFormat::Reader(bytes.substr(covered.size()), nullptr).number(checksum);
    if (checksum != indexFormat::checksum(covered)) {
        return std::nullopt;
    }
    DirectoryIndex index;
    indexFormat::Reader reader(covered.substr(indexFormat::SIGNATURE.size()), std::move(text.bytes));
    indexFormat::transfer(reader, index.m_contents);
    if (!reader.isValid() || !reader.isAtEnd()) {
        return std::nullopt;
    }
    return index;
}

bool DirectoryIndex::isCurrent(const std::string& directory, std::span<const std::string_view> names) const {
    const bool isListed =
        std::equal(m_contents.files.begin(), m_contents.files.end(), names.begin(), names.end(),
                   [](const IndexedFile& file, std::string_view name) { return file.name == name; });
    if (!isListed) {
        return false;
    }
    try {
        const DirectoryStatus status(directory);
        return std::all_of(
            m_contents.files.begin(), m_contents.files.end(),
            [&status](const IndexedFile& file) { return status.ofReadableFile(file.name) == file.status; });
    } catch (const ReadError&) {
        return false;
    }
}

const PackedStrings* DirectoryIndex::sections(std::string_view fileName) const noexcept {
    const auto file =
        std::lower_bound(m_contents.files.begin(), m_contents.files.end(), fileName,
                         [](const IndexedFile& each, std::string_view name) { return each.name < name; });
    if (file == m_contents.files.end() || file->name != fileName || !m_contents.isSettled(*file)) {
        return nullptr;
    }
    return &file->sections;
}

} // namespace acd
