#pragma once

#include "generate/Facts.h"

#include <string>

namespace bench {

/// The masks of a family as a document: {"operations": [...], "options": [...]}.
[[nodiscard]] std::string familyDocument(const Family& family);

/// A device of a family as a document: {"family": "...", "properties": {"KEY": "value", ...}}.
[[nodiscard]] std::string deviceDocument(const Family& family, const Device& device);

/// All of it: {"families": {...}, "devices": {...}}.
[[nodiscard]] std::string wholeDocument(const Facts& facts);

} // namespace bench
