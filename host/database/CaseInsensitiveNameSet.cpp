#include "database/CaseInsensitiveNameSet.h"

#include <AcdText.h>

#include <algorithm>

// Look-up of names without regard to ASCII case: files, sections and the devices of the index all go by it, so
// that what is the same name is decided in one place.

namespace acd {

namespace {

constexpr std::size_t MIN_TABLE_SIZE = 8;

/// FNV-1a of the lower-case name, folded so that the low bits depend on all of it.
[[nodiscard]] std::uint32_t hashOf(std::string_view name) noexcept {
    std::uint64_t hash = 0xCBF29CE484222325;
    for (const char byte : name) {
        hash = (hash ^ static_cast<unsigned char>(AcdText::toLower(byte))) * 0x100000001B3;
    }
    return static_cast<std::uint32_t>(hash ^ (hash >> 32));
}

} // namespace

std::uint32_t CaseInsensitiveNameSet::add(std::string_view name) {
    // At most three quarters of the slots are taken, so that every search ends.
    if (m_names.size() + 1 > m_slots.size() / 4 * 3) {
        grow();
    }
    const std::uint32_t hash = hashOf(name);
    Slot& slot = m_slots[slotOf(hash, name)];
    if (slot.ordinal == NONE) {
        m_names.push_back(name);
        slot = {hash, size() - 1};
    }
    return slot.ordinal;
}

std::uint32_t CaseInsensitiveNameSet::find(std::string_view name) const noexcept {
    return m_slots.empty() ? NONE : m_slots[slotOf(hashOf(name), name)].ordinal;
}

/// The slot that holds `name`, or the free one where it belongs.
std::size_t CaseInsensitiveNameSet::slotOf(std::uint32_t hash, std::string_view name) const noexcept {
    const std::size_t mask = m_slots.size() - 1;
    std::size_t index = hash & mask;
    while (
        m_slots[index].ordinal != NONE &&
        (m_slots[index].hash != hash || !AcdText::equalsIgnoreCase(m_names[m_slots[index].ordinal], name))) {
        index = (index + 1) & mask;
    }
    return index;
}

void CaseInsensitiveNameSet::grow() {
    std::vector<Slot> larger(std::max(MIN_TABLE_SIZE, m_slots.size() * 2), Slot{0, NONE});
    const std::size_t mask = larger.size() - 1;
    for (const Slot& slot : m_slots) {
        if (slot.ordinal != NONE) {
            std::size_t index = slot.hash & mask;
            while (larger[index].ordinal != NONE) {
                index = (index + 1) & mask;
            }
            larger[index] = slot;
        }
    }
    m_slots.swap(larger);
}

} // namespace acd
