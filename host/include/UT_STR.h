#pragma once

#include "StringBase.h"

/// Operations on NUL-terminated texts. A null text counts as the empty text; case is that of ASCII alone.
namespace UT_STR {

/// Byte order, as unsigned bytes: negative, 0 or positive.
[[nodiscard, gnu::visibility("default")]] int Compare(const char* left, const char* right) noexcept;

/// As `Compare`, without regard to case.
[[nodiscard, gnu::visibility("default")]] int ICompare(const char* left, const char* right) noexcept;

/// Reads a decimal number: leading blanks and a sign are skipped, reading stops at the first other byte that
/// is no digit, a text without digits is 0. Saturates at -2147483648 and 2147483647.
[[nodiscard, gnu::visibility("default")]] long AToL(const char* text) noexcept;

/// The text in upper case.
[[nodiscard, gnu::visibility("default")]] StringBase Upper(const char* text);

} // namespace UT_STR
