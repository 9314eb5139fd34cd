#pragma once

#include "StringViews.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <functional>
#include <string_view>
#include <vector>

/// What the look-up of a device came to.
struct CachedLookup {
    const StringBase* family; ///< becomes the family resolved last; null when the look-up resolves none
    std::size_t block;        ///< of a permission table
};

/// Look-ups by device name as it was asked for: a hash table with open addressing, so that a hit touches one place in
/// memory. It holds a limited number, however many names are asked for.
class LookupCache {
public:
    /// @return the look-up of a device, valid until the next change; null when there is none
    [[nodiscard]] const CachedLookup* find(std::string_view device) const noexcept {
        if (m_size == 0) {
            return nullptr;
        }
        const std::size_t hash = hashOf(device);
        const Slot* const slots = m_slots.data();
        const std::size_t last = m_slots.size() - 1;
        for (const Slot* slot = slots + (hash & last); slot->hash != FREE;) {
            if (slot->hash == hash && view(slot->device) == device) {
                return &slot->lookup;
            }
            slot = slot == slots + last ? slots : slot + 1;
        }
        return nullptr;
    }

    /// Adds the look-up of a device that has none yet.
    /// @param limit how many look-ups there may be; when there are as many, all of them are dropped first
    void add(const StringBase& device, CachedLookup lookup, std::size_t limit);

    /// Drops all look-ups, and keeps their memory for the next ones.
    void clear() noexcept;

    [[nodiscard]] std::size_t size() const noexcept { return m_size; }

private:
    struct Slot {
        std::size_t hash = FREE;
        StringBase device;
        CachedLookup lookup{};
    };
    static constexpr std::size_t FREE = 0;

    /// Mixes the first and the last bytes of a short name, which are all of it, without a call: the hash of the standard
    /// library is a fifth of the work of a look-up.
    [[nodiscard]] static std::size_t hashOf(std::string_view device) noexcept {
        constexpr std::uint64_t FACTOR = 0x9E3779B97F4A7C15;
        constexpr std::size_t WORD = sizeof(std::uint64_t);
        std::uint64_t first = device.size();
        std::uint64_t last = 0;
        if (device.size() > 2 * WORD) {
            first = std::hash<std::string_view>()(device);
        } else if (device.size() >= WORD) {
            std::memcpy(&first, device.data(), WORD);
            std::memcpy(&last, device.data() + device.size() - WORD, WORD);
        } else {
            for (const char byte : device) {
                last = last << 8 | static_cast<unsigned char>(byte);
            }
        }
        const std::uint64_t mixed = (first * FACTOR ^ last) * FACTOR;
        const auto hash = static_cast<std::size_t>(mixed ^ mixed >> 32);
        return hash == FREE ? 1 : hash;
    }
    static Slot& slotFor(std::vector<Slot>& slots, std::size_t hash) noexcept;
    void grow();

    std::vector<Slot> m_slots; ///< a power of two of them, of which at least half are free; or none
    std::size_t m_size = 0;
};
