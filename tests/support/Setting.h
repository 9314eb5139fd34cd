#pragma once

#include <cstdint>
#include <cstdlib>

/// A number of the environment, such as that of random databases.
inline std::uint64_t setting(const char* name, std::uint64_t usual) {
    const char* const text = std::getenv(name);
    return text == nullptr ? usual : std::strtoull(text, nullptr, 10);
}
