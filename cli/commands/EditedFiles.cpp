// What the commands that change names have in common.
#include "commands/EditedFiles.h"

#include "edit/FileWriter.h"
#include "edit/Rename.h"
#include "lint/Fix.h"
#include "model/Catalogue.h"
#include "query/Tool.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

std::string asText(const EditedFiles& edited, const Terminal& /*any*/) {
    std::string text = edited.diff;
    for (const std::string& file : edited.diff.empty() ? edited.files : std::vector<std::string>()) {
        text += printable(file) + '\n';
    }
    return text;
}

Json asJson(const EditedFiles& edited) {
    return {{"files", edited.files}, {"written", edited.isWritten}, {"diff", edited.diff}};
}

ExitCode editName(Tool& tool, const std::string& name, bool isDryRun, const NameEdit& edit) {
    const std::vector<std::string> layers = tool.openDirectories();
    tool.openDatabase();
    edit::Draft draft = edit::Draft::ofDatabase();
    const lint::Model before = draft.model();
    edit::requireChangeable(name);
    const std::optional<edit::KnownName> known = edit::findName(before, name);
    if (!known) {
        throw catalogue::unknownDevice(name);
    }
    const edit::Intention intention = edit(draft, before, *known);
    if (const std::vector<std::string> places = commentsAbout(draft, known->name); !places.empty()) {
        tool.note(fmt::format("comments mention {}: {}", known->name, fmt::join(places, ", ")));
    }
    return finishEdit(tool, before, draft, layers, intention, isDryRun);
}

ExitCode finishEdit(Tool& tool, const lint::Model& before, const edit::Draft& draft,
                    const std::vector<std::string>& layers, const edit::Intention& intention, bool isDryRun) {
    const std::vector<edit::Rewrite> rewrites = draft.rewrites();
    requireWritable(rewrites);
    requireMeant(before, draft, layers, intention);
    EditedFiles edited{{}, isDryRun ? draft.diff() : std::string(), !isDryRun};
    for (const edit::Rewrite& rewrite : rewrites) {
        if (!rewrite.formerPath.empty()) {
            edited.files.push_back(rewrite.formerPath);
        }
        edited.files.push_back(rewrite.path);
    }
    if (!isDryRun) {
        writeAll(rewrites);
    }
    return tool.answer(edited);
}
