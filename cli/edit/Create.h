#pragma once

#include "edit/Draft.h"
#include "edit/Guard.h"

#include <string>
#include <vector>

namespace edit {

/// What is to be created.
struct Creation {
    enum class Kind { DEVICE, FAMILY, FLASH };

    Kind kind = Kind::DEVICE;
    std::string name;
    std::string family;                ///< of a device or a flash; empty: that of `like`
    std::string like;                  ///< whose records are copied; may be empty
    std::string idcode;                ///< of a device
    std::vector<std::string> packages; ///< of a device or a flash; none: those of `like`
    std::vector<std::string> modes;    ///< of a family, by their keys
    std::vector<std::string> outputs;  ///< of a family
    std::vector<std::string> operations;
    std::size_t layer = 0; ///< that is written to
    std::string directory; ///< of that layer
};

/// Writes the records of a new device, family or flash into one layer of a draft of the open database.
/// @return what changes by that
/// @throw CommandError (FAULT) if the arguments do not fit, (NO) if a name is unknown
[[nodiscard]] Intention create(Draft& draft, const Creation& creation);

} // namespace edit
