#pragma once

#include "model/Catalogue.h"

#include <cstddef>
#include <string>
#include <vector>

namespace why {

using catalogue::Origin;

/// A text of the database, and where it stands.
struct Piece {
    std::string text;
    Origin origin;
    catalogue::Shadows
        shadows{}; ///< what layers below say in its place: whole values, or a property of its name
};

/// One record of a value whose records end at ":" and whose fields end at ",".
struct Record {
    Piece whole;
    std::vector<Piece> fields; ///< never empty

    /// A field, or null when the record is too short.
    [[nodiscard]] const Piece* field(std::size_t index) const {
        return index < fields.size() ? &fields[index] : nullptr;
    }
};

/// The records of one key.
struct Records {
    bool ofDevice = false; ///< the value stands in a section, not among a family's own keys
    std::vector<Record> all;
};

/// The records of the key that the accessor called `database` gives; none when it has no such key.
[[nodiscard]] Records readRecords(const std::string& database, const std::string& key);

/// The records of the values that this key has in layers below and that are replaced on top.
[[nodiscard]] std::vector<Record> readShadowedRecords(const std::string& database, const std::string& key);

/// The items of a list whose items end at ",".
[[nodiscard]] std::vector<Piece> readList(const std::string& database, const std::string& key);

/// Is there a family file of this name, in any case?
[[nodiscard]] bool hasFamilyFile(const std::string& name);

} // namespace why
