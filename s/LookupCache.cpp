#include "LookupCache.h"

#include "StringViews.h"

#include <utility>

// The table of look-ups that were made before.

void LookupCache::add(const StringBase& device, CachedLookup lookup, std::size_t limit) {
    if (m_size >= limit) {
        clear();
    }
    if (2 * (m_size + 1) > m_slots.size()) {
        grow();
    }
    const std::size_t hash = hashOf(view(device));
    Slot& slot = slotFor(m_slots, hash);
    slot.device = device;
    slot.lookup = lookup;
    slot.hash = hash;
    ++m_size;
}

void LookupCache::clear() noexcept {
    if (m_size != 0) {
        for (Slot& slot : m_slots) {
            slot.hash = FREE;
        }
        m_size = 0;
    }
}

/// The first free slot for a hash, of which there has to be one.
LookupCache::Slot& LookupCache::slotFor(std::vector<Slot>& slots, std::size_t hash) noexcept {
    const std::size_t last = slots.size() - 1;
    std::size_t place = hash & last;
    while (slots[place].hash != FREE) {
        place = (place + 1) & last;
    }
    return slots[place];
}

void LookupCache::grow() {
    constexpr std::size_t FEWEST = 64;
    std::vector<Slot> more(m_slots.empty() ? FEWEST : 2 * m_slots.size());
    for (Slot& slot : m_slots) {
        if (slot.hash != FREE) {
            slotFor(more, slot.hash) = std::move(slot);
        }
    }
    m_slots.swap(more);
}
