#pragma once

#include "diff/Snapshot.h"
#include "edit/Draft.h"
#include "edit/Guard.h"
#include "edit/Names.h"
#include "lint/Model.h"
#include "term/ExitCode.h"
#include "term/Terminal.h"
#include "text/Json.h"

#include <functional>
#include <string>
#include <vector>

class Tool;

/// The files that a command wrote, or would write.
struct EditedFiles {
    std::vector<std::string> files;
    std::string diff; ///< what is shown in place of the files; empty for their names
    bool isWritten;
};

[[nodiscard]] std::string asText(const EditedFiles& edited, const Terminal& terminal);
[[nodiscard]] Json asJson(const EditedFiles& edited);

/// Changes a draft in which a name is known, and says what it is meant to change.
using NameEdit = std::function<edit::Intention(edit::Draft& draft, const lint::Model& before,
                                               const edit::KnownName& known)>;

/// Edits the open database about a name, in any case, and finishes the edit. Comments that still contain the name are
/// listed: what they say is for their author to change.
/// @throw CommandError (NO) with the nearest names if the database has no such name, (FAULT) if its name is fixed, and
/// as `finishEdit`
[[nodiscard]] ExitCode editName(Tool& tool, const std::string& name, bool isDryRun, const NameEdit& edit);

/// Proves an edit, writes its files unless only the difference is wanted, and shows them.
/// @param before the database as it is
/// @throw CommandError (FAULT) if it cannot be proven or written; nothing has changed then
[[nodiscard]] ExitCode finishEdit(Tool& tool, const lint::Model& before, const edit::Draft& draft,
                                  const std::vector<std::string>& layers, const edit::Intention& intention,
                                  bool isDryRun);
