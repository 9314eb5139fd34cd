#pragma once

#include "StringBase.h"

#include <tarvik/Attributes.h>

/// Operations on NUL-terminated texts. A null text is treated as the empty text; case is that of ASCII alone.
namespace UT_STR {

/// Compares in byte order, as unsigned bytes.
/// @param left may be null
/// @param right may be null
/// @return negative, 0 or positive
[[nodiscard]] TARVIK_HOST_API int Compare(const char* left, const char* right) noexcept;

/// Compares likewise, without regard to case.
/// @param left may be null
/// @param right may be null
/// @return negative, 0 or positive
[[nodiscard]] TARVIK_HOST_API int ICompare(const char* left, const char* right) noexcept;

/// Reads a decimal number: leading blanks and a sign are skipped, reading stops at the first other byte that
/// is no digit.
/// @param text may be null
/// @return the number, saturated at -2147483648 and 2147483647; 0 for a text without digits
[[nodiscard]] TARVIK_HOST_API long AToL(const char* text) noexcept;

/// A text in upper case.
/// @param text may be null
/// @return the copy
[[nodiscard]] TARVIK_HOST_API StringBase Upper(const char* text);

} // namespace UT_STR
