// `format`: brings database files into their canonical form.
#include "commands/Commands.h"
#include "commands/DatabaseArguments.h"

#include "diff/Presentation.h"
#include "edit/Format.h"
#include "edit/Proof.h"
#include "edit/UnifiedDiff.h"
#include "platform/Platform.h"
#include "query/Tool.h"
#include "term/AtomicFile.h"

#include <AcdStore.h>

#include <fmt/format.h>

#include <filesystem>
#include <memory>

namespace {

struct Arguments {
    std::vector<std::string> paths;
    bool check = false;
    bool diff = false;
};

/// What was, or would be, formatted.
struct Formatted {
    std::vector<std::string> files;
    std::string diff;
    bool isWritten;
};

std::string asText(const Formatted& formatted, const Terminal& /*any*/) {
    std::string text = formatted.diff;
    for (const std::string& file : formatted.diff.empty() ? formatted.files : std::vector<std::string>()) {
        text += printable(file) + '\n';
    }
    return text;
}

Json asJson(const Formatted& formatted) {
    return {{"files", formatted.files}, {"written", formatted.isWritten}, {"diff", formatted.diff}};
}

/// The files of the database that are meant and are not in their canonical form, with that form.
std::vector<edit::Rewrite> rewrites(const DatabaseArguments& database, std::string& diff) {
    std::vector<edit::Rewrite> all;
    for (const AcdLines& lines : AcdLines::ofDatabase()) {
        if (!database.isMeant(lines.path())) {
            continue;
        }
        const edit::SourceFile file(edit::readFile(lines.path()), lines.path(), lines.family());
        std::string text = joined(edit::formatted(file));
        if (text == file.text()) {
            continue;
        }
        if (!edit::readsAlike(file.lines(), AcdLines(text))) {
            throw CommandError(ExitCode::FAULT, fmt::format("{} has no canonical form that reads alike",
                                                            printable(lines.path())));
        }
        diff += edit::unifiedDiff(lines.path(), file.text(), text);
        all.push_back({lines.path(), std::move(text)});
    }
    return all;
}

/// The canonical form never changes an answer. This is the last line of defence against a fault of the formatter.
void requireSameAnswers(const std::vector<std::string>& directories,
                        const std::vector<edit::Rewrite>& rewrites) {
    const std::optional<diff::Comparison> effect = edit::effectOf(directories, rewrites);
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
    std::string diff;
    const std::vector<edit::Rewrite> wanted = rewrites(database, diff);
    const bool isWritten = !arguments.check && !arguments.diff;
    if (isWritten && !wanted.empty()) {
        requireSameAnswers(directories, wanted);
    }
    Formatted result{{}, arguments.diff ? diff : std::string(), isWritten};
    for (const edit::Rewrite& rewrite : wanted) {
        if (isWritten) {
            writeFile(rewrite.path, rewrite.text);
        }
        result.files.push_back(rewrite.path);
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
    "tarvik format --diff database/kestrel.acd",
    declare,
};
