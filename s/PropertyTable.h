#pragma once

#include "PropertyValues.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory_resource>
#include <string_view>
#include <vector>

/// The properties that were loaded, by "owner_property": a hash table whose buckets are numbered by the CRC-32 of that
/// text modulo their count, of which there are never fewer than properties.
///
/// Callers hold on to texts and sets within, so an entry never moves. Beside the entries stands the little of each that a
/// search goes through: in a large database that stays near the processor, while each entry is a wait for memory.
class PropertyTable {
public:
    /// A property and its values.
    struct Entry {
        std::string_view key; ///< "owner_property"
        PropertyValues values;
    };

    /// No properties, in 193 buckets: enough for the usual session.
    PropertyTable();

    /// The values of an owner's property; null when there are none.
    [[nodiscard]] const PropertyValues* find(std::string_view owner,
                                             std::string_view property) const noexcept;

    /// A property of an owner on its way into the table.
    struct Found {
        StringBase name;
        PropertyValues values;
    };

    /// Adds properties of one owner, or replaces their values, in order. Those that stand before the one for which memory
    /// runs out are in the table.
    void assign(std::string_view owner, std::vector<Found> found);

    [[nodiscard]] std::size_t size() const noexcept { return m_entries.size(); }
    [[nodiscard]] bool empty() const noexcept { return m_entries.empty(); }
    [[nodiscard]] std::size_t bucketCount() const noexcept { return m_buckets.size(); }

    /// The number of the bucket in which the property is looked for.
    [[nodiscard]] std::size_t bucket(std::string_view owner, std::string_view property) const noexcept {
        return bucketOf(checksumOf(owner, property));
    }

    // The entries, in the order in which they came.
    [[nodiscard]] auto begin() const noexcept { return m_entries.begin(); }
    [[nodiscard]] auto end() const noexcept { return m_entries.end(); }

private:
    using Ordinal = std::uint32_t;
    static constexpr Ordinal NONE = 0xFFFFFFFF;

    /// What a search goes through.
    struct Link {
        std::uint32_t checksum; ///< of the entry's key
        Ordinal next;           ///< entry in the same bucket; `NONE` for the last
        Entry* entry;
    };

    [[nodiscard]] static std::uint32_t checksumOf(std::string_view owner, std::string_view property) noexcept;
    [[nodiscard]] std::uint32_t bucketOf(std::uint32_t checksum) const noexcept {
        return checksum % static_cast<std::uint32_t>(m_buckets.size());
    }
    [[nodiscard]] Entry* search(std::uint32_t checksum, std::string_view owner,
                                std::string_view property) const noexcept;
    void assign(std::uint32_t checksum, std::string_view owner, Found& found);
    [[nodiscard]] std::string_view keep(std::string_view owner, std::string_view property);
    void grow();

    std::vector<Ordinal> m_buckets; ///< the first entry of each
    std::vector<Link> m_links;      ///< of each entry; has room for one a bucket
    std::deque<Entry> m_entries;
    std::pmr::monotonic_buffer_resource m_keys; ///< the keys' texts, one behind the other
};
