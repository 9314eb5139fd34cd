#pragma once

#include "database/IndexFormat.h"

#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace acd {

/// The index that `tarvik index` wrote for a directory. It spares reading the files of the directory as long as none
/// of them has changed.
class DirectoryIndex {
public:
    /// Reads the index of a directory.
    /// @return nothing if there is none that can be read as a whole; the reason does not matter, since the files
    ///         answer as well
    [[nodiscard]] static std::optional<DirectoryIndex> read(const std::string& directory);

    /// Decodes the bytes of an index file, and keeps them.
    /// @return nothing unless they are a whole index of this format
    [[nodiscard]] static std::optional<DirectoryIndex> decode(Text text);

    /// Whether the directory has the files that it had when the index was made, each with the same status, and this
    /// process may read them.
    /// @param names of the database files that the directory has now, in byte order
    [[nodiscard]] bool isCurrent(const std::string& directory, std::span<const std::string_view> names) const;

    /// The names of the sections of a file.
    /// @return null if the file has to be read, since its status does not prove that it has not changed
    [[nodiscard]] const PackedStrings* sections(std::string_view fileName) const noexcept;

    [[nodiscard]] const IndexContents& contents() const noexcept { return m_contents; }

private:
    IndexContents m_contents;
};

} // namespace acd
