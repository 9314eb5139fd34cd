#pragma once

#include "database/CaseInsensitiveNameSet.h"
#include "database/PackedStrings.h"

#include <cstdint>
#include <string_view>
#include <vector>

namespace acd {

/// Which family a device belongs to. Of several that have a section for it, the one added first has it.
class DeviceIndex {
public:
    static constexpr std::uint32_t NONE = CaseInsensitiveNameSet::NONE;

    /// Adds the devices of a family.
    void add(PackedStrings names, std::uint32_t family);

    /// The family of a device, `NONE` when no family has it. The first look-ups go through all names: many processes ask
    /// about one device and end, for which a table would take longer.
    [[nodiscard]] std::uint32_t family(std::string_view device);

private:
    struct Devices {
        PackedStrings names;
        std::uint32_t family;
    };

    /// A look-up in the table.
    struct Table {
        CaseInsensitiveNameSet devices;      ///< points into the names of `m_devices`
        std::vector<std::uint32_t> families; ///< by the device's ordinal
    };

    static constexpr int SEARCHES = 6; ///< take about as long as making the table of a large database

    [[nodiscard]] std::uint32_t search(std::string_view device) const noexcept;
    [[nodiscard]] Table makeTable() const;

    std::vector<Devices> m_devices;
    int m_searches = 0;
    Table m_table; ///< empty until there were so many searches
};

} // namespace acd
