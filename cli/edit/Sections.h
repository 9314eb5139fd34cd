#pragma once

#include "edit/SourceFile.h"

#include <cstddef>
#include <string_view>
#include <vector>

namespace edit {

/// A part of a file that belongs together: the family's own keys, or a header with its keys and the comments that are
/// directly above it.
struct Block {
    std::size_t first;       ///< element of the file
    std::size_t last;        ///< the one after the end
    std::string_view device; ///< whose section it is; empty for the own keys, and after a malformed header
};

/// The parts of a file in order; the first one has the own keys and may be empty.
[[nodiscard]] std::vector<Block> blocksOf(const SourceFile& source);

/// Do the own keys, or those of a section, end at this line?
[[nodiscard]] bool opensBlock(const AcdLines::Line& line);

/// Does an item of a value begin a line of the file?
[[nodiscard]] bool beginsLine(const AcdLines::Line& line, std::size_t offset);

} // namespace edit
