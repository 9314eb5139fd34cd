#pragma once

#include "diff/Comparison.h"

#include <string>

namespace diff {

/// The format in which a process writes the answers of one database for the process that compares them: an argument of
/// the command `diff` that is not offered to people. Before the answers is a block: what an application meets, in JSON.
inline constexpr const char* SNAPSHOT_FORMAT = "snapshot";

/// The start of a text that such a process writes to say why there are no answers.
inline constexpr char FAULT_MARK = '!';

/// Asks two databases everything, each in a process of its own.
/// @param oldDatabase its directories, the uppermost layer first, separated by ":"
/// @param newDatabase likewise
/// @param renamed what names of the old one are called in the new one
/// @throw CommandError (FAULT) if one of them cannot be read
[[nodiscard]] Comparison compareDatabases(const std::string& oldDatabase, const std::string& newDatabase,
                                          const Renaming& renamed = {});

} // namespace diff
