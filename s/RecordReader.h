#pragma once

// How keyed values are read: lists of items, and records of fields.

#include <PM_DEVKEY.h>
#include <StringBase.h>

#include <cstddef>
#include <limits>
#include <vector>

/// One record of a value whose records end at ":" and whose fields end at ",".
class Record {
public:
    Record(PM_DEVKEY& accessor, const char* key, int index) noexcept
        : m_accessor(accessor), m_key(key), m_index(index) {}

    /// A field, valid until the next read; null when it, or the whole record, does not exist.
    [[nodiscard]] const char* field(long index) const {
        return isIndex(m_index) && isIndex(index)
                   ? m_accessor.getstringbykey(m_key, ":", static_cast<short>(m_index), ",",
                                               static_cast<short>(index))
                   : nullptr;
    }

    /// Calls `action` for each field from number `first`, up to the first missing one.
    template <typename Action>
    void forEachFieldFrom(long first, Action action) const {
        for (long index = first; const char* const text = field(index); ++index) {
            action(text);
        }
    }

private:
    /// Readers take 16 bits.
    [[nodiscard]] static bool isIndex(long index) noexcept {
        return index <= std::numeric_limits<short>::max();
    }

    PM_DEVKEY& m_accessor;
    const char* m_key;
    int m_index;
};

/// Calls `action` for each record and its first field, up to the first record that does not exist.
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
