// What the commands that change names have in common.
#include "commands/EditedFiles.h"

#include "edit/FileWriter.h"
#include "edit/Rename.h"
#include "lint/Fix.h"
#include "model/Catalogue.h"
#include "query/Tool.h"
#include "text/Suggest.h"

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

void requireNewName(const edit::Draft& draft, const lint::Model& model, const std::string& name,
                    bool isFamily, const std::string& former) {
    if (!edit::isUsableName(name) || schema::fileOf(name) != schema::File::FAMILY) {
        throw CommandError(
            ExitCode::FAULT,
            fmt::format("\"{}\" cannot be a name: names have 1 to 15 letters, digits, \"-\", "
                        "\".\" and \"+\", begin with a letter or a digit, and are not \"base\" "
                        "or \"spi\"",
                        printable(name)));
    }
    const std::string spelling = isFamily ? lowerCase(name) : upperCase(name);
    if (name != spelling) {
        throw CommandError(
            ExitCode::FAULT,
            fmt::format("\"{}\" is in the wrong case, since lists are case-sensitive: families are in "
                        "lower case, all others in upper case: \"{}\"",
                        name, spelling));
    }
    if (sameWithoutCase(name, former)) {
        return;
    }
    if (const std::optional<edit::KnownName> known = edit::findName(model, name)) {
        throw CommandError(ExitCode::FAULT, fmt::format("the database has \"{}\" already", known->name));
    }
    if (const std::string place = placeOf(draft, name); !place.empty()) {
        throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" is named already: {}", name, place));
    }
}

edit::KnownName requireKnownName(const lint::Model& model, const std::string& name) {
    if (schema::fileOf(name) != schema::File::FAMILY || schema::isFlashClass(name)) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("\"{}\" is a fixed name, which cannot be changed", printable(name)));
    }
    const std::optional<edit::KnownName> known = edit::findName(model, name);
    if (!known) {
        throw catalogue::unknownDevice(name);
    }
    return *known;
}

void noteComments(const Tool& tool, const edit::Draft& draft, const std::string& name) {
    if (const std::vector<std::string> places = commentsAbout(draft, name); !places.empty()) {
        tool.note(fmt::format("comments mention {}: {}", name, fmt::join(places, ", ")));
    }
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
