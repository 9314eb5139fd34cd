#pragma once

#include "diff/Snapshot.h"

#include <cstddef>
#include <map>
#include <string>
#include <vector>

namespace diff {

/// A question that two databases answer differently.
struct Change {
    Question question;
    Texts lost;
    Texts gained;

    friend auto operator<=>(const Change&, const Change&) = default;
};

/// Devices of a family that change alike.
struct Group {
    std::string family; ///< in the new database
    std::vector<std::string> devices;
    std::vector<std::string> others; ///< that the family has in both databases and that don't change so
    std::vector<Change> changes;

    /// Does the whole family change so, and does it have several devices?
    [[nodiscard]] bool isWhole() const { return devices.size() > 1 && others.empty(); }
};

/// Devices by their families.
using Devices = std::map<std::string, std::vector<std::string>>;

/// How two databases differ.
struct Comparison {
    Devices onlyInOld;
    Devices onlyInNew;
    std::vector<Change> general;
    std::vector<Group> groups; ///< by family; in it the largest ones first

    [[nodiscard]] bool isEmpty() const;
};

[[nodiscard]] Comparison compare(const Facts& oldFacts, const Facts& newFacts);

} // namespace diff
