#pragma once

#include "database/IndexFormat.h"

#include <string>
#include <vector>

// What the tool makes and checks indexes with. Only the static twin has it: the shared library reads indexes, no more.

namespace acd {

/// The names of the database files of a directory, in byte order.
/// @throw ReadError
[[nodiscard]] std::vector<std::string> databaseFiles(const std::string& directory);

/// Reads all database files of a directory.
/// @param device that the directory is on
/// @param created the time by that device's clock, from before this call
/// @throw ReadError which names the file that can't be read
[[nodiscard]] IndexContents describeDirectory(const std::string& directory, std::uint64_t device,
                                              FileTime created);

/// Whether the index of a directory can be used.
enum class IndexState {
    MISSING, ///< the directory has no index
    INVALID, ///< it cannot be read, is damaged or of another version
    STALE,   ///< the files have changed since it was made
    CURRENT,
};

struct CheckedIndex {
    IndexState state;
    IndexContents contents; ///< without files if there is no valid index
};

/// Compares the index of a directory with its files.
/// @throw ReadError if the directory cannot be listed
[[nodiscard]] CheckedIndex checkIndex(const std::string& directory);

} // namespace acd
