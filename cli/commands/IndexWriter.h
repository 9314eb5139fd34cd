#pragma once

#include "database/IndexFormat.h"

#include <string>

/// The path of the index of a directory.
[[nodiscard]] std::string indexPath(const std::string& directory);

/// Writes the index of a directory, whole or not at all.
/// @return what it contains
/// @throw CommandError (FAULT) if a database file can't be read or the index can't be written; an index that was there
///        before stays
acd::IndexContents writeIndex(const std::string& directory);
