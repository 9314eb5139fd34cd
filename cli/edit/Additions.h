#pragma once

#include "edit/Draft.h"

#include <string>

namespace edit {

/// An item for a list, or a record for a value, among the family's own keys.
struct Addition {
    std::string key;
    std::string item;
    std::string
        after; ///< the item that is to be before it; empty: where it belongs in a sorted list, or at the end
};

/// Adds an item to a file: to a statement of that key, or in a new one, which appends if the layers below have a value.
/// @param separator before the item
/// @param hasValue whether any layer has a value for the key
void addItem(Draft::File& file, const Addition& addition, char separator, bool hasValue);

/// Adds a statement after the family's own keys.
void addStatement(Draft::File& file, const std::string& statement);

/// Adds a section.
/// @param after the device whose section is to be before it; if the file has no such section, it is the last one
void addSection(Draft::File& file, const std::string& section, const std::string& after);

} // namespace edit
