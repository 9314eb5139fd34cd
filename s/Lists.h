#pragma once

// The one way in which keyed values are read: lists of items, and records of fields.

#include <PM_DEVKEY.h>
#include <StringBase.h>

#include <cstddef>
#include <iterator>
#include <limits>
#include <utility>
#include <vector>

/// One record of a value whose records end at ":" and whose fields end at ",".
class Record {
public:
    Record(PM_DEVKEY& accessor, const char* key, int index) noexcept
        : m_accessor(accessor), m_key(key), m_index(index) {}

    /// A field, valid until the next read; null when it, or the whole record, does not exist.
    [[nodiscard]] const char* field(long index) const {
        return isWithinReach(m_index) && isWithinReach(index)
                   ? m_accessor.getstringbykey(m_key, ":", static_cast<short>(m_index), ",",
                                               static_cast<short>(index))
                   : nullptr;
    }

    /// Hands the fields from number `first` on to `action`, up to the first missing one.
    template <typename Action>
    void forEachFieldFrom(long first, Action action) const {
        for (long index = first; const char* const text = field(index); ++index) {
            action(text);
        }
    }

private:
    [[nodiscard]] static bool isWithinReach(long index) noexcept {
        return index <= std::numeric_limits<short>::max();
    }

    PM_DEVKEY& m_accessor;
    const char* m_key;
    int m_index;
};

/// Hands each record and its first field to `action`, up to the first record that does not exist.
template <typename Action>
void forEachRecord(PM_DEVKEY& accessor, const char* key, Action action) {
    for (int index = 0;; ++index) {
        const Record record(accessor, key, index);
        const char* const name = record.field(0);
        if (name == nullptr) {
            return;
        }
        action(record, StringBase(name));
    }
}

/// The items of a list whose items end at ",", exactly as stored.
[[nodiscard]] inline std::vector<StringBase> readList(PM_DEVKEY& accessor, const char* key) {
    std::vector<StringBase> items;
    for (int index = 0; index <= std::numeric_limits<short>::max(); ++index) {
        const char* const item = accessor.getstringbykey(key, ",", static_cast<short>(index), nullptr, 0);
        if (item == nullptr) {
            break;
        }
        items.emplace_back(item);
    }
    return items;
}

/// Sets the value of a key in a map. Lists keep what is alike together, so most keys belong right behind the one that
/// was set before, `latest`, which makes the search for their place short.
/// @return the entry
template <typename Map>
typename Map::iterator setBehind(Map& map, typename Map::iterator latest, StringBase key, const char* value) {
    const std::size_t former = map.size();
    const auto place = latest == map.end() ? latest : std::next(latest);
    const auto entry = map.emplace_hint(place, std::move(key), value);
    if (map.size() == former) {
        entry->second = value;
    }
    return entry;
}
