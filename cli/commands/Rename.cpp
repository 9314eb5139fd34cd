// `rename`: gives a device, a family or a flash another name, at every place of the database.
#include "commands/Commands.h"
#include "commands/CommonArguments.h"
#include "commands/EditedFiles.h"

#include "edit/Names.h"
#include "edit/Rename.h"
#include "model/Catalogue.h"
#include "query/Tool.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <memory>

namespace {

struct Arguments {
    std::string from;
    std::string to;
    bool dryRun = false;
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const std::vector<std::string> layers = tool.openDirectories();
    tool.openDatabase();
    edit::Draft draft = edit::Draft::ofDatabase();
    const lint::Model before = draft.model();
    const edit::KnownName known = requireKnownName(before, arguments.from);
    const std::string& from = known.name;
    requireNewName(draft, before, arguments.to, known.isFamily, from);
    if (from == arguments.to) {
        throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" has this name already", from));
    }
    renameIn(draft, from, arguments.to);
    noteComments(tool, draft, from);
    return finishEdit(tool, before, draft, layers, {.renamed = {{from, arguments.to}}}, arguments.dryRun);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "OLD",
         .description = "The device, family, flash or family of flashes",
         .kind = ValueKind::DEVICE,
         .required = true,
         .target = &arguments->from},
        {.name = "NEW", .description = "Its new name", .required = true, .target = &arguments->to},
        argument::dryRun(&arguments->dryRun),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::RENAME{
    "rename",
    "Rename a device, a family or a flash",
    "Changes the name at all its places: section or file, IDCODE, lists, excluded parts and keys. Before "
    "anything is written it is proven that all answers are the same under the new name, and that lint has no "
    "new finding.",
    "tarvik rename KS800 KS850 --database database\n"
    "tarvik --database database rename kestrel windhover --dry-run",
    declare,
};
