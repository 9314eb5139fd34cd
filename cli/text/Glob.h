#pragma once

#include <string_view>

/// Whether a text matches a shell's pattern, whatever case its ASCII letters have: `*` matches any bytes, `?` matches one,
/// `[a-z]` matches one of these, `[!a-z]` one of the others, and a backslash takes the next byte as it is.
[[nodiscard]] bool matchesGlob(std::string_view pattern, std::string_view text);
