#pragma once

#include "edit/SourceFile.h"

#include <string>
#include <string_view>
#include <vector>

namespace edit {

/// A part of a file and what it becomes.
struct Segment {
    std::string_view before; ///< in the text of the file
    std::string after;
};

/// The canonical form of a file: the same keys in the same order with the same values, and all comments, with aligned
/// `=`, filled lists and one record a line in tables. What is not valid stays as it is.
/// @return segments that are the whole file in order; they refer to its text
[[nodiscard]] std::vector<Segment> formatted(const SourceFile& file);

/// The text that the segments become.
[[nodiscard]] std::string joined(const std::vector<Segment>& segments);

/// Do the readers see the same in both: headers, keys, values and faults in the same order, and the same comments?
[[nodiscard]] bool readsAlike(const AcdLines& left, const AcdLines& right);

} // namespace edit
