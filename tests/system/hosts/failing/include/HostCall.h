#pragma once

/// Stands before the in-memory host's header of this name: counts each call of the host, and raises at the one
/// that is to fail.
void hostCall(const char* service, const char* database = "", const char* key = "");

/// Stands before it likewise: notes that a reader is closed.
void hostClosed(const char* database) noexcept;
