#pragma once

#include "database/CaseInsensitiveNameSet.h"
#include "database/SectionScanner.h"

#include <cstdint>
#include <string_view>
#include <vector>

namespace acd {

/// Which family a device belongs to. Of several that have a section for it, the one added first has it.
class DeviceIndex {
public:
    static constexpr std::uint32_t NONE = CaseInsensitiveNameSet::NONE;

    /// Adds the devices of a family; the names are copied.
    void add(const PackedStrings& names, std::uint32_t family);

    /// The family of a device, `NONE` when no family has it.
    [[nodiscard]] std::uint32_t family(std::string_view device) const noexcept;

private:
    std::vector<std::vector<char>> m_texts; ///< what the table's names point into
    CaseInsensitiveNameSet m_devices;
    std::vector<std::uint32_t> m_families; ///< by the device's ordinal
};

} // namespace acd
