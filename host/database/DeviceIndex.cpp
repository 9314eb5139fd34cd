#include "database/DeviceIndex.h"

#include <AcdText.h>

#include <utility>

// The map from devices to families. It keeps the names, since the files that contain them are mostly not kept.

namespace acd {

void DeviceIndex::add(PackedStrings names, std::uint32_t family) {
    m_devices.push_back({std::move(names), family});
}

std::uint32_t DeviceIndex::family(std::string_view device) {
    if (m_searches < SEARCHES) {
        ++m_searches;
        return search(device);
    }
    if (m_table.families.empty()) {
        m_table = makeTable();
    }
    const std::uint32_t ordinal = m_table.devices.find(device);
    return ordinal == CaseInsensitiveNameSet::NONE ? NONE : m_table.families[ordinal];
}

std::uint32_t DeviceIndex::search(std::string_view device) const noexcept {
    for (const Devices& each : m_devices) {
        if (each.names.containsIgnoreCase(device)) {
            return each.family;
        }
    }
    return NONE;
}

DeviceIndex::Table DeviceIndex::makeTable() const {
    Table table;
    for (const Devices& each : m_devices) {
        each.names.forEach([&](std::string_view name) {
            if (table.devices.add(name) == table.families.size()) {
                table.families.push_back(each.family);
            }
        });
    }
    return table;
}

} // namespace acd
