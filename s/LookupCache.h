#pragma once

#include <StringBase.h>

#include <cstddef>
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
    [[nodiscard]] const CachedLookup* find(std::string_view device) const noexcept;

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

    [[nodiscard]] static std::size_t hashOf(std::string_view device) noexcept;
    static Slot& slotFor(std::vector<Slot>& slots, std::size_t hash) noexcept;
    void grow();

    std::vector<Slot> m_slots; ///< a power of two of them, of which a quarter is free at least; or none
    std::size_t m_size = 0;
};
