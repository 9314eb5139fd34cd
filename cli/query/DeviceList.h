#pragma once

#include <string>
#include <vector>

/// A name that questions are asked about: a device, a flash or a family.
struct ListedName {
    std::string name;
    std::string file;   ///< the family whose file has its section; "spi" for a flash without one
    std::string family; ///< whose tables answer unless the device has its own; "spi" for a flash

    /// Questions about it may change the answers for other names, or the other way round.
    bool isOrderDependent;
};

/// All devices and flashes, each once: the first family that has a device is the one that answers for it.
[[nodiscard]] std::vector<ListedName> deviceList();

/// The families, and those of flashes, as names of their own; with "base", which answers for every unknown name, and
/// "spi".
/// @param devices the list of all devices
[[nodiscard]] std::vector<ListedName> familyList(const std::vector<ListedName>& devices);
