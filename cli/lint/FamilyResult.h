#pragma once

#include "lint/Findings.h"

#include <array>
#include <bitset>
#include <cstddef>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

/// What the rules about one family need of the rest of the database. Results of a family stay valid while it is equal.
struct FamilyContext {
    using Names = std::set<std::string, std::less<>>;

    /// The lists of a mode in base.acd. A list that is missing is unknown, not empty.
    struct ModeLists {
        std::optional<Names> outputs;
        std::optional<Names> families;

        friend bool operator==(const ModeLists&, const ModeLists&) = default;
    };

    std::vector<ModeLists> modes; ///< by mode
    Names supported;
    Names optionPackages;

    FamilyContext() = default;
    explicit FamilyContext(const Model& model);

    friend bool operator==(const FamilyContext&, const FamilyContext&) = default;
};

/// A set of modes by their values.
using Modes = std::bitset<16>;

/// How the sections of a family, or the property keys of the flashes, use properties.
struct PropertyUses {
    /// The single values of a property that are of one kind, such as numbers, and those that are not.
    struct Kind {
        std::size_t matching = 0;
        std::vector<const Token*> others;
    };

    struct Property {
        std::vector<std::size_t> sections; ///< that use it, in order
        std::vector<const Token*> names;   ///< each use
        std::array<Kind, 2> kinds;
    };

    /// A property that a section lacks, though all its siblings have it.
    struct Missing {
        std::string_view name;
        const Token* key; ///< where to report it
        std::size_t section;
        std::size_t siblings;
    };

    std::map<std::string_view, Property> properties;
    std::vector<Missing> missing;
};

/// What the rules found in one family, and what the rules about all families need of it.
struct FamilyResult {
    /// Families are many, so that one which is full of unknown names must not take as long as a whole database.
    static constexpr std::size_t MAX_COMPARISONS = 200'000;

    Findings findings{MAX_COMPARISONS};
    Modes usedModes; ///< in which the family offers something
    PropertyUses uses;
    std::map<std::string_view, std::vector<const Token*>> packages; ///< by spelling
};

/// The results of a model's families.
using FamilyResults = std::map<std::shared_ptr<const FamilyData>, FamilyResult>;

} // namespace lint
