#pragma once

#include "diff/Comparison.h"
#include "lint/Findings.h"

#include <set>
#include <string>

namespace edit {

/// The names that a finding concerns.
struct Scope {
    bool isWhole = false; ///< the whole database, such as the outputs of a mode
    std::set<std::string>
        names; ///< of families, devices and flashes, in lower case; a family has its devices

    void add(const Scope& other);
};

/// The names that a finding concerns: the device of its section, the family of its file, the name of its item or key.
/// @param model in which it was found
[[nodiscard]] Scope scopeOf(const lint::Finding& finding, const lint::Model& model);

/// The names about which answers differ without being in the scope.
[[nodiscard]] std::set<std::string> namesOutside(const Scope& scope, const diff::Comparison& comparison);

} // namespace edit
