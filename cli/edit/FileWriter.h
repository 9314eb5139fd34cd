#pragma once

#include "edit/Proof.h"

#include <vector>

namespace edit {

/// Checks that files can be written, created and removed, before anything is done.
/// @throw CommandError (FAULT) that names one that cannot
void requireWritable(const std::vector<Rewrite>& rewrites);

/// Writes, renames and removes files: all of them, or none. Mode and owner stay. Each file is replaced in one step.
/// @throw CommandError (FAULT) if one of them fails; those before it are as they were
void writeAll(const std::vector<Rewrite>& rewrites);

} // namespace edit
