#pragma once

/// @file
/// What compilers and systems spell differently: exports, checked formats, and hints.

/// @def TARVIK_EXPORT
/// Marks what a library exports while it is built. Applications need no mark: linkers find functions by the import
/// library.

/// @def TARVIK_HIDDEN
/// Marks a private member of an exported class.

/// @def TARVIK_HOST_API
/// Marks what the host layer's library exports.

/// @def TARVIK_MANAGER_API
/// Marks what the manager's library exports.

/// @def TARVIK_PRINTF(format_, first_)
/// Has the compiler check the arguments of a printf-like function: which parameters are the format, and the first
/// argument (0 for a `va_list`).

/// @def TARVIK_PREFETCH(address_)
/// Fetches memory that is needed soon.

/// @def TARVIK_USED
/// Keeps what nothing refers to.

/// @def TARVIK_RETAIN
/// Has the linker keep what nothing refers to, too, if the linker drops unused sections.

#if defined(_WIN32)
#define TARVIK_EXPORT __declspec(dllexport)
#define TARVIK_HIDDEN
#elif defined(__GNUC__)
#define TARVIK_EXPORT __attribute__((visibility("default")))
#define TARVIK_HIDDEN __attribute__((visibility("hidden")))
#else
#define TARVIK_EXPORT
#define TARVIK_HIDDEN
#endif

#if defined(_WIN32) && !defined(TARVIK_BUILDING_HOST)
#define TARVIK_HOST_API
#else
#define TARVIK_HOST_API TARVIK_EXPORT
#endif

#if defined(_WIN32) && !defined(TARVIK_BUILDING_MANAGER)
#define TARVIK_MANAGER_API
#else
#define TARVIK_MANAGER_API TARVIK_EXPORT
#endif

#if defined(__MINGW32__) && !defined(__clang__)
#define TARVIK_PRINTF(format_, first_) __attribute__((format(gnu_printf, format_, first_)))
#elif defined(__GNUC__)
#define TARVIK_PRINTF(format_, first_) __attribute__((format(printf, format_, first_)))
#else
#define TARVIK_PRINTF(format_, first_)
#endif

#if defined(__GNUC__)
#define TARVIK_PREFETCH(address_) __builtin_prefetch(address_)
#define TARVIK_USED __attribute__((used))
#else
#define TARVIK_PREFETCH(address_) static_cast<void>(address_)
#define TARVIK_USED
#endif

#if defined(__ELF__) && defined(__has_attribute)
#if __has_attribute(retain)
#define TARVIK_RETAIN __attribute__((retain))
#endif
#endif
#ifndef TARVIK_RETAIN
#define TARVIK_RETAIN
#endif
