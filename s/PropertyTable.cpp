#include "PropertyTable.h"

#include "Text.h"

#include <StringBase.h>

#include <algorithm>
#include <array>
#include <utility>

// The hash table of the properties. Keys are compared piece by piece, so that nobody has to join them for a question.

namespace {

constexpr std::size_t FIRST_BUCKETS = 193;

bool isJoined(std::string_view key, std::string_view owner, std::string_view property) noexcept {
    return key.size() == owner.size() + 1 + property.size() && key.substr(0, owner.size()) == owner &&
           key[owner.size()] == '_' && key.substr(owner.size() + 1) == property;
}

} // namespace

PropertyTable::PropertyTable() : m_buckets(FIRST_BUCKETS, NONE) { m_links.reserve(FIRST_BUCKETS); }

const PropertyValues* PropertyTable::find(std::string_view owner, std::string_view property) const noexcept {
    const Entry* const found = search(checksumOf(owner, property), owner, property);
    return found == nullptr ? nullptr : &found->values;
}

void PropertyTable::assign(std::string_view owner, std::vector<Found> found) {
    // Each search would wait for its bucket; so the buckets of several are asked for at once.
    std::array<std::uint32_t, 32> checksums{};
    for (std::size_t first = 0; first < found.size(); first += checksums.size()) {
        const std::size_t count = std::min(checksums.size(), found.size() - first);
        for (std::size_t place = 0; place != count; ++place) {
            checksums[place] = checksumOf(owner, view(found[first + place].name));
            __builtin_prefetch(&m_buckets[bucketOf(checksums[place])]);
        }
        for (std::size_t place = 0; place != count; ++place) {
            assign(checksums[place], owner, found[first + place]);
        }
    }
}

void PropertyTable::assign(std::uint32_t checksum, std::string_view owner, Found& found) {
    const std::string_view property = view(found.name);
    if (Entry* const known = search(checksum, owner, property)) {
        known->values = std::move(found.values);
        return;
    }
    if (m_links.size() == m_buckets.size()) {
        grow();
    }
    Entry& entry = m_entries.emplace_back(Entry{keep(owner, property), std::move(found.values)});
    Ordinal& first = m_buckets[bucketOf(checksum)];
    m_links.push_back({checksum, std::exchange(first, static_cast<Ordinal>(m_links.size())), &entry});
}

std::uint32_t PropertyTable::checksumOf(std::string_view owner, std::string_view property) noexcept {
    const std::uint32_t start = StringBase::CRC32("_", 1, StringBase::CRC32(owner.data(), owner.size()));
    return StringBase::CRC32(property.data(), property.size(), start);
}

PropertyTable::Entry* PropertyTable::search(std::uint32_t checksum, std::string_view owner,
                                            std::string_view property) const noexcept {
    for (Ordinal place = m_buckets[bucketOf(checksum)]; place != NONE; place = m_links[place].next) {
        const Link& link = m_links[place];
        if (link.checksum == checksum && isJoined(link.entry->key, owner, property)) {
            return link.entry;
        }
    }
    return nullptr;
}

/// Puts "owner_property" where it stays.
std::string_view PropertyTable::keep(std::string_view owner, std::string_view property) {
    const std::size_t length = owner.size() + 1 + property.size();
    auto* const text = static_cast<char*>(m_keys.allocate(length, alignof(char)));
    owner.copy(text, owner.size());
    text[owner.size()] = '_';
    property.copy(text + owner.size() + 1, property.size());
    return {text, length};
}

/// Doubles the buckets. Their count stays odd, so that all of a checksum tells them apart.
void PropertyTable::grow() {
    std::vector<Ordinal> more(2 * m_buckets.size() + 1, NONE);
    m_links.reserve(more.size());
    m_buckets.swap(more);
    for (Ordinal place = 0; place != m_links.size(); ++place) {
        Link& link = m_links[place];
        link.next = std::exchange(m_buckets[bucketOf(link.checksum)], place);
    }
}
