#pragma once

#include "diff/NaturalLess.h"
#include "diff/Snapshot.h"
#include "text/Json.h"

#include <cstddef>
#include <map>
#include <string>
#include <vector>

namespace diff {

/// A question that two databases answer differently.
struct Change {
    Question question;
    StringSet lost;
    StringSet gained;

    friend auto operator<=>(const Change&, const Change&) = default;
};

/// Devices of a family that change alike.
struct Group {
    std::string family; ///< in the new database
    std::vector<std::string> devices;
    std::vector<std::string> others; ///< of the family in both databases, without these changes
    std::vector<Change> changes;

    /// Are these several devices, and all of the family?
    [[nodiscard]] bool isWhole() const { return devices.size() > 1 && others.empty(); }
};

/// Devices by their families.
using Devices = std::map<std::string, std::vector<std::string>, NaturalLess>;

/// How two databases differ.
struct Comparison {
    Devices onlyInOld;
    Devices onlyInNew;
    std::vector<Change> general;
    std::vector<Group> groups; ///< by family; in it the largest ones first

    /// Devices for which answers are missing in both databases, because the manager raises.
    std::vector<std::string> unanswered;

    /// What an application meets in both databases, as `findApplicationFaults` returns it. It is no difference: answers
    /// are compared as the tool gets them, with exceptions off.
    Json applicationFaults = Json::array();

    [[nodiscard]] bool isEmpty() const;

    /// Does the new database lack an answer that the old one gives? A value that becomes another one is lost, and so
    /// are answers that only the new database fails to give.
    [[nodiscard]] bool hasLosses() const;
};

[[nodiscard]] Comparison compare(const Snapshot& before, const Snapshot& after);

} // namespace diff
