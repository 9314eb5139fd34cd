#pragma once

#include "model/Catalogue.h"

#include <cstddef>
#include <string>
#include <vector>

namespace catalogue {

/// A text of the database and where it is written.
struct SourceText {
    std::string text;
    Origin origin;
};

/// One record of a value, and its fields.
struct Record {
    SourceText whole;
    std::vector<SourceText> fields; ///< never empty: an empty record has one empty field

    /// A field; null when the record is too short.
    [[nodiscard]] const SourceText* field(std::size_t index) const {
        return index < fields.size() ? &fields[index] : nullptr;
    }
};

/// The records of one key, as the manager's readers see them.
struct Records {
    bool isSet = false;           ///< false: there is no such key, and nothing below is filled
    bool ofDevice = false;        ///< the value is from a device's section, not from its family's own keys
    std::vector<Record> all;      ///< in order; none when the value is empty
    std::vector<Record> shadowed; ///< of the values in lower layers that are replaced, upper layers first
    Shadows shadows;              ///< these values as a whole
};

/// Reads a key whose value is "field,...:field,...".
/// @param database as an `AcdReader` is opened by: a file, a family or a device
/// @throw DataNotFoundException when the family's file cannot be read
[[nodiscard]] Records readRecords(const std::string& database, const std::string& key);

/// Reads a key whose value is a flat list "item,...".
/// @return its items; none when there is no such key
/// @throw DataNotFoundException when the family's file cannot be read
[[nodiscard]] std::vector<SourceText> readList(const std::string& database, const std::string& key);

/// Does a family have a file? In any case of its name.
[[nodiscard]] bool hasFamilyFile(const std::string& name);

} // namespace catalogue
