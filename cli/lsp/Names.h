#pragma once

#include "lsp/View.h"

#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace lsp {

enum class NameKind { FAMILY, DEVICE, FLASH, PACKAGE };

/// A name that files of a database have in common. Case does not matter.
struct Name {
    NameKind kind;
    std::string text;
};

/// One place where a name is written.
struct NameUse {
    NameKind kind;
    lint::Token token; ///< its text lives during the call only
    bool isDefinition; ///< a section, the list of a family of flashes, or the packages of a device
};

/// Calls `use` for each name in a file. Definition, references and rename have this one index.
/// @param containing only in lines that contain this text, in any case; empty: in all lines
void forEachName(const lint::Model& model, const AcdLines& file, std::string_view containing,
                 const std::function<void(const NameUse&)>& use);

/// The name at a position, and its range.
struct FoundName {
    Name name;
    Range range;
};
[[nodiscard]] std::optional<FoundName> nameAt(const View& view, const Position& position);

/// The locations of a name's definitions.
[[nodiscard]] Json definitionsOf(const View& view, const Name& name);

/// The locations of all its uses.
[[nodiscard]] Json referencesOf(const View& view, const Name& name, bool withDefinitions);

/// The edits that give it another name, in all files of the database.
/// @param canRenameFiles says whether the editor can
/// @throw RequestError (REQUEST_FAILED) if the new name is not a valid name, or is in use
[[nodiscard]] Json renamingOf(const View& view, const Name& name, const std::string& newName,
                              bool canRenameFiles);

} // namespace lsp
