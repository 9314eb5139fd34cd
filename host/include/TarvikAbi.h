#pragma once

// Makes it a link error to build an application against other containers or texts than the libraries have: sizes and
// layouts of `std::string` and of all containers change with the standard library, its string ABI and its debug mode.

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
extern "C" __attribute__((visibility("default"))) const char TARVIK_ABI;

namespace {

// Kept by linkers that drop unused sections, too.
#if defined(__ELF__) && defined(__has_attribute)
#if __has_attribute(retain)
#define TARVIK_RETAIN __attribute__((retain))
#endif
#endif
#ifndef TARVIK_RETAIN
#define TARVIK_RETAIN
#endif

/// Asks for that name in every file that includes a host header.
// NOLINTNEXTLINE(misc-definitions-in-headers): deliberately one in each file
TARVIK_RETAIN __attribute__((used)) const char* const tarvikAbi = &TARVIK_ABI;

#undef TARVIK_RETAIN

} // namespace
