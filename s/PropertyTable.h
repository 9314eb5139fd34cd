#pragma once

#include "PropertyValues.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <string_view>
#include <vector>

/// A property of an owner that was read and not stored yet.
struct ParsedProperty {
    StringBase name;
    PropertyValues values;
};

/// The loaded properties by "owner_property". A hash table: bucket = CRC-32 of the key % bucket count; load factor at
/// most 1.
///
/// Callers keep texts and sets from it, so an entry neither moves nor changes. A key whose values are replaced leads to
/// a new entry, and the old one stays. Links (checksum, next, pointer) are in a separate compact array, so that probes
/// stay in the processor's cache.
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

    /// Adds properties of one owner, or replaces their values, in order. If memory runs out, those before the failing one
    /// are in the table.
    void assign(std::string_view owner, std::vector<ParsedProperty> parsed);

    [[nodiscard]] std::size_t size() const noexcept { return m_links.size(); }
    [[nodiscard]] bool empty() const noexcept { return m_links.empty(); }
    [[nodiscard]] std::size_t bucketCount() const noexcept { return m_buckets.size(); }

    /// The number of the bucket in which the property is looked up.
    [[nodiscard]] std::size_t bucket(std::string_view owner, std::string_view property) const noexcept {
        return bucketOf(checksumOf(owner, property));
    }

private:
    using Ordinal = std::uint32_t;
    static constexpr Ordinal NONE = 0xFFFFFFFF;

    /// What a search reads.
    struct Link {
        std::uint32_t checksum; ///< of the entry's key
        Ordinal next;           ///< link in the same bucket; `NONE` for the last
        const Entry* entry;
    };

public:
    /// Goes through the current entries.
    class Iterator {
    public:
        explicit Iterator(const Link* link) noexcept : m_link(link) {}
        const Entry& operator*() const noexcept { return *m_link->entry; }
        Iterator& operator++() noexcept {
            ++m_link;
            return *this;
        }
        bool operator!=(const Iterator& other) const noexcept { return m_link != other.m_link; }

    private:
        const Link* m_link;
    };

    // The current entries, in the order in which their keys were added.
    [[nodiscard]] Iterator begin() const noexcept { return Iterator(m_links.data()); }
    [[nodiscard]] Iterator end() const noexcept { return Iterator(m_links.data() + m_links.size()); }

private:
    [[nodiscard]] static std::uint32_t checksumOf(std::string_view owner, std::string_view property) noexcept;
    [[nodiscard]] std::uint32_t bucketOf(std::uint32_t checksum) const noexcept {
        return checksum % static_cast<std::uint32_t>(m_buckets.size());
    }
    [[nodiscard]] Ordinal search(std::uint32_t checksum, std::string_view owner,
                                 std::string_view property) const noexcept;
    void assign(std::uint32_t checksum, std::string_view owner, ParsedProperty& parsed);
    [[nodiscard]] std::string_view internKey(std::string_view owner, std::string_view property);
    void grow();

    std::vector<Ordinal> m_buckets; ///< the first link of each
    std::vector<Link> m_links;      ///< one for each key; there is room for as many as there are buckets
    std::deque<Entry> m_entries;    ///< replaced ones included
    std::vector<std::unique_ptr<char[]>> m_keyBlocks;
    char* m_keyEnd = nullptr;  ///< after the last key of the last block
    std::size_t m_keyRoom = 0; ///< bytes that are free there
};
