#pragma once

#include "diff/Snapshot.h"
#include "edit/Draft.h"
#include "edit/Guard.h"
#include "edit/Names.h"
#include "lint/Model.h"
#include "term/ExitCode.h"
#include "term/Terminal.h"
#include "text/Json.h"

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

/// Checks that a name can be given to something new.
/// @param isFamily whether it is for a family of devices, which is in lower case; all others are in upper case
/// @param former that has the name in another case, if it is renamed
/// @throw CommandError (FAULT) if it is not usable, or something has it
void requireNewName(const edit::Draft& draft, const lint::Model& model, const std::string& name,
                    bool isFamily, const std::string& former);

/// The name in any case, as the database has it.
/// @throw CommandError (NO) with the nearest names if it has no such name, (FAULT) if its name is fixed
[[nodiscard]] edit::KnownName requireKnownName(const lint::Model& model, const std::string& name);

/// Shows which comments still contain a name: what they say is for their author to change.
void noteComments(const Tool& tool, const edit::Draft& draft, const std::string& name);

/// Proves an edit, writes its files unless only the difference is wanted, and shows them.
/// @param before the database as it is
/// @throw CommandError (FAULT) if it cannot be proven or written; nothing has changed then
[[nodiscard]] ExitCode finishEdit(Tool& tool, const lint::Model& before, const edit::Draft& draft,
                                  const std::vector<std::string>& layers, const edit::Intention& intention,
                                  bool isDryRun);
