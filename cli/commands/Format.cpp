// `format`: brings database files into their canonical form.
#include "commands/Commands.h"
#include "commands/DatabaseArguments.h"
#include "commands/EditedFiles.h"

#include "diff/Presentation.h"
#include "edit/FileWriter.h"
#include "edit/Format.h"
#include "edit/Proof.h"
#include "edit/Sort.h"
#include "platform/Platform.h"
#include "query/Tool.h"

#include <AcdStore.h>

#include <fmt/format.h>

#include <filesystem>
#include <memory>

namespace {

struct Arguments {
    std::vector<std::string> paths;
    bool check = false;
    bool diff = false;
    bool sort = false;
};

/// Gives the files that are meant their canonical form.
void format(edit::Draft& draft, const DatabaseArguments& database, bool isSorting) {
    const edit::KeysOfFamilies skipped =
        isSorting ? edit::keysWithFindings(draft.model()) : edit::KeysOfFamilies();
    for (edit::Draft::File& each : draft.files()) {
        if (!database.isMeant(each.path)) {
            continue;
        }
        if (isSorting) {
            const auto keys = skipped.find(each.family);
            each.text = edit::sorted(edit::SourceFile(each.text, each.path, each.family),
                                     keys == skipped.end() ? std::set<std::string>() : keys->second);
        }
        const edit::SourceFile file(each.text, each.path, each.family);
        each.text = joined(edit::formatted(file));
        if (!edit::readsAlike(file.lines(), AcdLines(each.text))) {
            throw CommandError(ExitCode::FAULT, fmt::format("{} has no canonical form that reads alike",
                                                            printable(each.path)));
        }
    }
}

/// The canonical form never changes an answer. This is the last line of defence against a fault of the formatter.
void requireSameAnswers(const std::vector<std::string>& directories,
                        const std::vector<edit::Rewrite>& rewrites, bool isSorting) {
    const std::optional<diff::Comparison> effect = edit::effectOf(directories, rewrites);
    if (!effect && isSorting) {
        throw CommandError(
            ExitCode::FAULT,
            "a database without base.acd has no answers that could prove that sorting keeps them: "
            "name the directories of the layers below, too");
    }
    if (effect && !effect->isEmpty()) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("nothing is written, since the form would change answers:\n{}",
                                       diff::asMarkdown(*effect)));
    }
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const DatabaseArguments database(arguments.paths);
    if (!database.directories.empty()) {
        AcdStore::setSearchPath(database.directories);
    }
    const std::vector<std::string> directories = AcdStore::searchPath();
    if (directories.empty()) {
        throw CommandError(ExitCode::FAULT, "no database given: name its directory, or one of its files");
    }
    for (const std::string& directory : directories) {
        if (!std::filesystem::is_directory(acd::toPath(directory))) {
            throw CommandError(ExitCode::FAULT,
                               fmt::format("there is no directory \"{}\"", printable(directory)));
        }
    }
    edit::Draft draft = edit::Draft::ofDatabase();
    format(draft, database, arguments.sort);
    const std::vector<edit::Rewrite> wanted = draft.rewrites();
    const bool isWritten = !arguments.check && !arguments.diff;
    if ((isWritten || arguments.sort) && !wanted.empty()) {
        requireSameAnswers(directories, wanted, arguments.sort);
    }
    EditedFiles result{{}, arguments.diff ? draft.diff() : std::string(), isWritten};
    for (const edit::Rewrite& rewrite : wanted) {
        result.files.push_back(rewrite.path);
    }
    if (isWritten) {
        edit::writeAll(wanted);
    }
    return tool.answer(result, arguments.check && !wanted.empty() ? ExitCode::NO : ExitCode::YES);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DIR",
         .description = "The directories of the database, the uppermost layer first, or some of its files",
         .kind = ValueKind::PATH,
         .target = &arguments->paths},
        {.name = "--check",
         .description =
             "Write nothing; list the files that would change, and exit with status 1 if there are any",
         .target = &arguments->check},
        {.name = "--diff",
         .description = "Write nothing; show what would change",
         .target = &arguments->diff},
        {.name = "--sort",
         .description = "Sort what has no order: sections, names of lists, records of tables",
         .target = &arguments->sort},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::FORMAT{
    "format",
    "Bring database files into their canonical form",
    "Aligns the equals signs, fills lists and puts each record of a table on a line. Never changes an answer "
    "or a "
    "comment: both forms are compared before a file is written.",
    "tarvik format database\n"
    "tarvik format --check database\n"
    "tarvik format --sort --diff database\n"
    "tarvik format --diff database/kestrel.acd",
    declare,
};
