#include "database/DeviceIndex.h"

// The map from devices to families. Its names are its own, as the files that they stand in are mostly not
// kept.

namespace acd {

void DeviceIndex::add(const PackedStrings& names, std::uint32_t family) {
    const std::vector<char>& text = m_texts.emplace_back(names.bytes());
    std::uint32_t begin = 0;
    for (const std::uint32_t end : names.ends()) {
        if (m_devices.add({text.data() + begin, end - begin}) == m_families.size()) {
            m_families.push_back(family);
        }
        begin = end;
    }
}

std::uint32_t DeviceIndex::family(std::string_view device) const noexcept {
    const std::uint32_t ordinal = m_devices.find(device);
    return ordinal == CaseInsensitiveNameSet::NONE ? NONE : m_families[ordinal];
}

} // namespace acd
