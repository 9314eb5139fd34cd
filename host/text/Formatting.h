#pragma once

// The one place that turns a format and its arguments into a text.

#include <tarvik/Attributes.h>

#include <cstdarg>
#include <string>

namespace formatting {

/// The text of a format without arguments: `%%` gives `%`, any other `%` stays
/// as it is. Null is the empty text.
[[nodiscard]] std::string unescapePercent(const char* text);

/// What printf would print; a null text shows `(null)`, or nothing where the precision is less than that takes.
/// Null is the empty format. A format that can't be printed (a result of over 2 GiB) is returned as it is.
[[nodiscard]] TARVIK_PRINTF(1, 0) std::string vformat(const char* format, std::va_list arguments);

} // namespace formatting
