#pragma once

#include <map>
#include <string>

namespace reference {

/// Databases that are a base database alone.
[[nodiscard]] inline std::map<std::string, std::string> baseOnly(const std::string& text = "") {
    return {{"base.acd", text}};
}

} // namespace reference
