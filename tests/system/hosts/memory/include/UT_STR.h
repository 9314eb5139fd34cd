#pragma once

#include <StringBase.h>

/// Operations on NUL-terminated texts; null is the empty text.
namespace UT_STR {

[[nodiscard, gnu::visibility("default")]] int Compare(const char* left, const char* right) noexcept;
[[nodiscard, gnu::visibility("default")]] int ICompare(const char* left, const char* right) noexcept;
[[nodiscard, gnu::visibility("default")]] long AToL(const char* text) noexcept;
[[nodiscard, gnu::visibility("default")]] StringBase Upper(const char* text);

} // namespace UT_STR
