#pragma once

#include <algorithm>
#include <cstddef>
#include <string_view>

/// Splits values as the manager's readers do: n separators make n+1 items, nothing is trimmed, and an empty value
/// has no items.
namespace splitter {

inline constexpr char RECORDS = ':'; ///< ends a record
inline constexpr char FIELDS = ',';  ///< ends a field of a record, or an item of a flat list

/// How many items the readers count: they number them with 16 bits, from 0 to 32767.
inline constexpr std::size_t MAX_ITEMS = 32768;

/// Calls `use(item, offset)` for each item that the readers see.
/// @return the offset of the first item that they do not see; `npos` when they see all
template <typename Use>
std::size_t forEachItem(std::string_view text, char separator, Use use) {
    std::size_t count = 0;
    for (std::size_t start = 0; !text.empty() && start <= text.size();) {
        if (count++ == MAX_ITEMS) {
            return start;
        }
        const std::size_t end = std::min(text.find(separator, start), text.size());
        use(text.substr(start, end - start), start);
        start = end + 1;
    }
    return text.npos;
}

/// The fields of one record: an empty record has one empty field.
template <typename Use>
std::size_t forEachField(std::string_view record, Use use) {
    if (record.empty()) {
        use(record, std::size_t{0});
    }
    return forEachItem(record, FIELDS, use);
}

} // namespace splitter
