#pragma once

/// Every service of the host passes here first. This host does nothing at it; one that is to fail on demand
/// brings a header of this name that stands before this one.
/// @param service which one is called
/// @param database the name of the database that is read; empty for other services
/// @param key the key that is read, likewise
inline void hostCall(const char* /*service*/, const char* /*database*/ = "", const char* /*key*/ = "") {}

/// The same for a reader that is closed, which cannot fail.
inline void hostClosed(const char* /*database*/) noexcept {}
