#pragma once

#include "lint/Model.h"

#include <array>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

/// The keys that fill the permission tables and the properties of a family.
inline constexpr std::array<std::string_view, 5> FAMILY_KEYS{"OPERATION", "BSDL_OPERATION", "PROGRAM_OPTION",
                                                             "PROPERTY", "PROPERTIES"};

/// The classes of flashes. A flash in several has the properties of the last one.
inline constexpr std::array<std::string_view, 6> CLASSES{"AT1", "ST1", "ST2", "BPI1", "BPI2", "BPI3"};

inline constexpr std::string_view DEVICES_ENDING = "_DEVICES";
inline constexpr std::string_view PROPERTY_ENDING = "_PROPERTY";

[[nodiscard]] bool isClass(std::string_view name);

/// The shape of a family's own key: `NONE` for a key that nobody reads.
[[nodiscard]] Shape shapeOf(Family::Kind kind, std::string_view key);

/// The shape of a key of a device's section.
[[nodiscard]] Shape shapeInSection(std::string_view key);

/// The keys that are read in a family's file, those of its sections left out.
[[nodiscard]] std::vector<std::string> knownKeys(const Model& model, Family::Kind kind);

} // namespace lint
