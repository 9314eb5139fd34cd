#pragma once

// The calls of POSIX that the tests use and Windows lacks. This header is included before all others.

#include <cstdlib>
#include <filesystem>
#include <string>

inline int setenv(const char* name, const char* value, int /*overwrite*/) { return ::_putenv_s(name, value); }

inline int unsetenv(const char* name) { return ::_putenv_s(name, ""); }

using uid_t = int;

/// Nobody is the superuser.
inline uid_t geteuid() { return 1; }

inline int seteuid(uid_t /*user*/) { return -1; }

/// There are no pipes in folders: a directory is no more of a regular file.
inline int mkfifo(const char* path, int /*mode*/) { return std::filesystem::create_directory(path) ? 0 : -1; }

/// Makes a directory of a name that ends with "XXXXXX", which are replaced by digits.
inline char* mkdtemp(char* name) {
    std::string path = name;
    for (int number = 100000; number < 1000000; ++number) {
        path.replace(path.size() - 6, 6, std::to_string(number));
        if (std::filesystem::create_directory(path)) {
            path.copy(name, path.size());
            return name;
        }
    }
    return nullptr;
}
