#pragma once

#include "edit/Draft.h"
#include "lint/Model.h"

#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace edit {

/// What a database has of a name.
struct KnownName {
    std::string name; ///< as the database spells it
    bool isDevice = false;
    bool isFamily = false; ///< has a file
    bool isFlash = false;
    bool isFlashFamily = false;
};

/// A name in any case; nothing if the database has no such device, family, flash or family of flashes.
[[nodiscard]] std::optional<KnownName> findName(const lint::Model& model, const std::string& name);

/// Is it a name that devices, families and flashes can have: 1 to 15 letters, digits, "-", "." and "+", of which the
/// first one is a letter or a digit? Every place of a database can hold such a name.
[[nodiscard]] bool isUsableName(std::string_view name);

/// An item of a list, or a record, in the value of a statement.
struct NamedItem {
    std::size_t begin; ///< in the value
    std::size_t end;
    std::size_t nameBegin; ///< of the name in it
    std::size_t nameEnd;   ///< equal to the start if the name is missing
};

/// A statement before the first section of base.acd or spi.acd whose value can contain names.
struct NamedStatement {
    const AcdLines::Line& line;
    schema::NamePlaces places;
    std::vector<NamedItem> items; ///< all of the value; in mode keys those of the second record

    [[nodiscard]] std::string_view text(const NamedItem& item) const {
        return line.value.substr(item.begin, item.end - item.begin);
    }
};

/// Says which names a database has, and where they are written.
class NameIndex {
public:
    explicit NameIndex(const lint::Model& model);

    /// The name of an item, which may be joined with a package; empty if it has no name.
    [[nodiscard]] std::string_view nameOf(const NamedStatement& statement, const NamedItem& item) const;

    /// Is it the same name at this place?
    [[nodiscard]] static bool isSame(schema::NamePlaces places, std::string_view left,
                                     std::string_view right);

private:
    [[nodiscard]] std::string_view ownerOf(std::string_view joined) const;

    const lint::Model& m_model;
    std::set<std::string, std::less<>> m_names;
};

/// Finds the statements that can contain names.
class StatementReader {
public:
    /// Those of a file. Files are read in the order in which the readers merge them, since a statement may continue a
    /// value of the file before.
    [[nodiscard]] std::vector<NamedStatement> read(const AcdLines& file);

private:
    [[nodiscard]] std::vector<NamedItem> items(const AcdLines::Line& line, schema::NamePlaces places);

    std::map<std::string, std::size_t, std::less<>> m_records; ///< how many separators each value has so far
};

/// Where a name, in any case, is written already: "file:line:column"; empty if nowhere.
[[nodiscard]] std::string placeOf(const lint::Model& model, const std::string& name);

/// Checks that a name can be given to something new.
/// @param isFamily whether it is for a family of devices, which is in lower case; all others are in upper case
/// @param former that has the name in another case, if it is renamed
/// @throw CommandError (FAULT) if it is not usable, or something has it
void requireNewName(const lint::Model& model, const std::string& name, bool isFamily,
                    const std::string& former);

/// Checks that a name is not one of those that the manager looks up itself.
/// @throw CommandError (FAULT) if it is
void requireChangeable(const std::string& name);

/// The name in the key of a statement of spi.acd: that of a flash, a family or a class. Empty for other keys.
[[nodiscard]] std::string_view nameInKey(const AcdLines::Line& line);

/// Where a part of a statement's value is in the text of the file.
[[nodiscard]] TextChange changeOfValue(const SourceFile& source, const AcdLines::Line& line,
                                       std::size_t begin, std::size_t end, std::string text);

} // namespace edit
