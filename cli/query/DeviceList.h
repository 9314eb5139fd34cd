#pragma once

#include <string>
#include <vector>

namespace why {

/// A device of the database, a flash included, and what asking for it may do to the answers for others.
struct Member {
    std::string name;
    std::string family; ///< whose tables answer unless the device has tables of its own; "spi" for a flash
    bool isEntangled;   ///< what it leaves behind in the manager may change the answer for another one
    bool isFaulty;      ///< the manager may raise when it reads the options of the family
};

/// All devices, each once: the first family that has a device is the one that answers for it.
[[nodiscard]] std::vector<Member> members();

} // namespace why
