#pragma once

#include "database/PackedStrings.h"

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

// Packed names for tests.

[[nodiscard]] inline acd::PackedStrings pack(std::initializer_list<std::string_view> names) {
    acd::StringPacker packer;
    for (const std::string_view name : names) {
        packer.add(name);
    }
    return packer.pack();
}

[[nodiscard]] inline std::vector<std::string> namesOf(const acd::PackedStrings& packed) {
    std::vector<std::string> names;
    packed.forEach([&names](std::string_view name) { names.emplace_back(name); });
    return names;
}
