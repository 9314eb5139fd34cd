#pragma once

#include "edit/Draft.h"

#include <string>

namespace edit {

/// Writes a new name of a family, device, flash or family of flashes at every place where the former one is. The file of
/// a family gets the new name, too.
/// @param from as the database spells it
void renameIn(Draft& draft, const std::string& from, const std::string& to);

/// The comments that contain a name, as "file:line".
[[nodiscard]] std::vector<std::string> commentsAbout(const Draft& draft, const std::string& name);

} // namespace edit
