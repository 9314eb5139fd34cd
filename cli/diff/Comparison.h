#pragma once

#include "Json.h"
#include "Terminal.h"
#include "diff/Answers.h"

#include <cstddef>
#include <string>
#include <vector>

namespace diff {

/// A question that two databases answer differently.
struct Change {
    std::string question;
    Texts lost;
    Texts gained;

    friend auto operator<=>(const Change&, const Change&) = default;
};

/// Devices that change alike.
struct Group {
    std::string family; ///< in the new database
    std::vector<std::string> devices;
    bool isWhole; ///< all devices that the family has in both databases, and several of them
    std::vector<Change> changes;
};

/// How two databases differ.
struct Comparison {
    std::vector<std::string> onlyInOld; ///< devices
    std::vector<std::string> onlyInNew;
    std::vector<Change> general;
    std::vector<Group> groups;

    [[nodiscard]] bool isEmpty() const;
};

/// The names that both databases know, with the packages that either speaks of.
[[nodiscard]] Names commonNames(const Names& oldNames, const Names& newNames);

/// @param oldFacts,newFacts the answers about the names that both know
[[nodiscard]] Comparison compare(const Names& oldNames, const Names& newNames, const Facts& oldFacts,
                                 const Facts& newFacts);

[[nodiscard]] std::string asText(const Comparison& comparison, const Terminal& terminal);
[[nodiscard]] Json asJson(const Comparison& comparison);

} // namespace diff
