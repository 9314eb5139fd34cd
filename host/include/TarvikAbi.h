#pragma once

// Makes it a link error to build an application against other containers or texts than the libraries have: sizes and
// layouts of `std::string` and of all containers change with the standard library, its string ABI and its debug mode.

#include <tarvik/Attributes.h>

#include <cstddef> // the standard library's own macros

#if defined(_LIBCPP_VERSION)
#define TARVIK_ABI tarvik_libraries_are_built_with_libcxx
#elif !defined(__GLIBCXX__)
#define TARVIK_ABI tarvik_libraries_are_built_with_this_standard_library
#elif defined(_GLIBCXX_DEBUG) && _GLIBCXX_USE_CXX11_ABI
#define TARVIK_ABI tarvik_libraries_are_built_with_GLIBCXX_DEBUG
#elif defined(_GLIBCXX_DEBUG)
#define TARVIK_ABI tarvik_libraries_are_built_with_GLIBCXX_DEBUG_and_old_strings
#elif _GLIBCXX_USE_CXX11_ABI
#define TARVIK_ABI tarvik_libraries_are_built_with_libstdcxx
#else
#define TARVIK_ABI tarvik_libraries_are_built_with_old_strings
#endif

/// Defined by the library under the name that fits how it was built: no other name can be linked.
extern "C" TARVIK_HOST_API const char TARVIK_ABI;

namespace {

/// Asks for that name in every file that includes a host header, and is kept by linkers that drop unused sections.
// NOLINTNEXTLINE(misc-definitions-in-headers): deliberately one in each file
TARVIK_RETAIN TARVIK_USED const char* const tarvikAbi = &TARVIK_ABI;

} // namespace
