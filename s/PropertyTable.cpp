#include "PropertyTable.h"

#include "StringViews.h"

#include <StringBase.h>
#include <tarvik/Attributes.h>

#include <algorithm>
#include <array>
#include <utility>

// The hash table of the properties. Keys are compared in two parts, so that no question has to join them.

namespace {

constexpr std::size_t FIRST_BUCKETS = 193;

bool matchesCompositeKey(std::string_view key, std::string_view owner, std::string_view property) noexcept {
    return key.size() == owner.size() + 1 + property.size() && key.substr(0, owner.size()) == owner &&
           key[owner.size()] == '_' && key.substr(owner.size() + 1) == property;
}

} // namespace

PropertyTable::PropertyTable() : m_buckets(FIRST_BUCKETS, NONE) { m_links.reserve(FIRST_BUCKETS); }

const PropertyValues* PropertyTable::find(std::string_view owner, std::string_view property) const noexcept {
    const Ordinal found = search(checksumOf(owner, property), owner, property);
    return found == NONE ? nullptr : &m_links[found].entry->values;
}

void PropertyTable::assign(std::string_view owner, std::vector<ParsedProperty> parsed) {
    // Each search would wait for its bucket, so the buckets of several are fetched at once.
    std::array<std::uint32_t, 32> checksums{};
    for (std::size_t first = 0; first < parsed.size(); first += checksums.size()) {
        const std::size_t count = std::min(checksums.size(), parsed.size() - first);
        for (std::size_t place = 0; place != count; ++place) {
            checksums[place] = checksumOf(owner, view(parsed[first + place].name));
            TARVIK_PREFETCH(&m_buckets[bucketOf(checksums[place])]);
        }
        for (std::size_t place = 0; place != count; ++place) {
            assign(checksums[place], owner, parsed[first + place]);
        }
    }
}

void PropertyTable::assign(std::uint32_t checksum, std::string_view owner, ParsedProperty& parsed) {
    const std::string_view property = view(parsed.name);
    const Ordinal known = search(checksum, owner, property);
    if (known != NONE) {
        const std::string_view key = m_links[known].entry->key;
        m_links[known].entry = &m_entries.emplace_back(Entry{key, std::move(parsed.values)});
        return;
    }
    if (m_links.size() == m_buckets.size()) {
        grow();
    }
    const Entry& entry = m_entries.emplace_back(Entry{internKey(owner, property), std::move(parsed.values)});
    Ordinal& first = m_buckets[bucketOf(checksum)];
    m_links.push_back({checksum, std::exchange(first, static_cast<Ordinal>(m_links.size())), &entry});
}

std::uint32_t PropertyTable::checksumOf(std::string_view owner, std::string_view property) noexcept {
    const std::uint32_t start = StringBase::CRC32("_", 1, StringBase::CRC32(owner.data(), owner.size()));
    return StringBase::CRC32(property.data(), property.size(), start);
}

PropertyTable::Ordinal PropertyTable::search(std::uint32_t checksum, std::string_view owner,
                                             std::string_view property) const noexcept {
    Ordinal place = m_buckets[bucketOf(checksum)];
    while (place != NONE) {
        const Link& link = m_links[place];
        if (link.checksum == checksum && matchesCompositeKey(link.entry->key, owner, property)) {
            break;
        }
        place = link.next;
    }
    return place;
}

/// Stores "owner_property" where it stays.
std::string_view PropertyTable::internKey(std::string_view owner, std::string_view property) {
    constexpr std::size_t BLOCK = 4096;
    const std::size_t length = owner.size() + 1 + property.size();
    if (length > m_keyRoom) {
        const std::size_t size = std::max(length, BLOCK);
        std::unique_ptr<char[]> block(new char[size]);
        m_keyEnd = m_keyBlocks.emplace_back(std::move(block)).get();
        m_keyRoom = size;
    }
    char* const text = m_keyEnd;
    owner.copy(text, owner.size());
    text[owner.size()] = '_';
    property.copy(text + owner.size() + 1, property.size());
    m_keyEnd += length;
    m_keyRoom -= length;
    return {text, length};
}

/// Doubles the buckets. Their count stays odd, so that every bit of a checksum takes part in choosing one.
void PropertyTable::grow() {
    std::vector<Ordinal> more(2 * m_buckets.size() + 1, NONE);
    m_links.reserve(more.size());
    m_buckets.swap(more);
    for (Ordinal place = 0; place != m_links.size(); ++place) {
        Link& link = m_links[place];
        link.next = std::exchange(m_buckets[bucketOf(link.checksum)], place);
    }
}
