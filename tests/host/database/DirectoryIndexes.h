#pragma once

#include "DatabaseFixtures.h"

#include "database/DirectoryIndex.h"
#include "database/IndexMaintenance.h"

#include <limits>
#include <optional>
#include <string_view>

// Indexes for tests: as the tool writes them, but with any contents.

/// Later than every file of a test.
inline constexpr acd::FileTime MUCH_LATER{std::numeric_limits<std::int64_t>::max(), 0};

/// What the index of a directory of a test says if its files are not new.
[[nodiscard]] inline acd::IndexContents describe(const TemporaryDirectory& directory,
                                                 const std::string& subdirectory = {}) {
    acd::IndexContents contents = acd::describeDirectory(directory.path(subdirectory), 0, MUCH_LATER);
    contents.device = contents.files.empty() ? 0 : contents.files.front().status.device;
    return contents;
}

/// What the bytes of an index file mean.
[[nodiscard]] inline std::optional<acd::DirectoryIndex> decodeIndex(std::string_view bytes) {
    acd::MemorySource source(bytes);
    return acd::DirectoryIndex::decode(acd::readAll(source));
}

/// Adds a section to what an index says about a file: who finds it has not looked into the file.
inline void addGhost(acd::IndexContents& contents, const std::string& file, std::string_view name = "GHOST") {
    for (acd::IndexedFile& each : contents.files) {
        if (each.name == file) {
            acd::StringPacker names;
            each.sections.forEach([&names](std::string_view section) { names.add(section); });
            names.add(name);
            each.sections = names.pack();
        }
    }
}
