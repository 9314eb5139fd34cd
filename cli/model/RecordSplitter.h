#pragma once

#include <AcdText.h>

#include <cstddef>
#include <string_view>

/// Splits whole values as the manager's readers do: an empty value has no items.
namespace splitter {

inline constexpr char RECORDS = ':'; ///< ends a record
inline constexpr char FIELDS = ',';  ///< ends a field of a record, or an item of a flat list

/// Calls `use(field, offset)` for each field of a record that the readers see; an empty record has one empty field.
/// @return the offset of the first field that they do not see; `npos` when they see all
template <typename Use>
std::size_t forEachField(std::string_view record, char separator, Use use) {
    AcdText::PartCursor cursor;
    const std::string_view text(&separator, 1);
    cursor.start(record, text);
    for (std::size_t index = 0; cursor.moveTo(index, record, text); ++index) {
        if (index == AcdText::MAX_PARTS) {
            return cursor.offset();
        }
        use(cursor.part(record), cursor.offset());
    }
    return record.npos;
}

/// Calls `use(item, offset)` for each item of a value, likewise.
template <typename Use>
std::size_t forEachItem(std::string_view value, char separator, Use use) {
    return value.empty() ? value.npos : forEachField(value, separator, use);
}

} // namespace splitter
