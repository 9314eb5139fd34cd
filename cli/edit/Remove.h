#pragma once

#include "edit/Draft.h"
#include "edit/Names.h"

#include <set>
#include <string>

namespace edit {

/// What goes with a name: a family has its devices, a family of flashes its flashes, unless others have them, too.
[[nodiscard]] std::set<std::string> namesRemovedWith(const lint::Model& model, const KnownName& known);

/// Removes all places of these names: sections, items, records, keys, and the files of families.
void removeFrom(Draft& draft, const std::set<std::string>& names);

} // namespace edit
