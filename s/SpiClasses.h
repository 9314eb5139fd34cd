#pragma once

// The classes of configuration flash, and the search in a list of flashes.

#include "Implementation.h"

#include <UT_STR.h>

#include <algorithm>
#include <vector>

/// A class of flash, the key of its device list, and the member that holds the list.
struct ConstraintsManager::Implementation::SpiClass {
    const char* name;
    const char* key;
    std::vector<StringBase> Implementation::*devices;
};

[[nodiscard]] inline bool containsIgnoreCase(const std::vector<StringBase>& devices, const char* device) {
    return std::any_of(devices.begin(), devices.end(),
                       [&](const StringBase& entry) { return UT_STR::ICompare(entry.c_str(), device) == 0; });
}
