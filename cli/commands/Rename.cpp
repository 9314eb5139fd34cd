// `rename`: gives a device, a family or a flash another name, at every place of the database.
#include "commands/Commands.h"
#include "commands/CommonArguments.h"
#include "commands/EditedFiles.h"

#include "edit/Names.h"
#include "edit/Rename.h"
#include "query/Tool.h"

#include <fmt/format.h>

#include <memory>

namespace {

struct Arguments {
    std::string from;
    std::string to;
    bool dryRun = false;
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const std::string& to = arguments.to;
    const auto rename = [&to](edit::Draft& draft, const lint::Model& before, const edit::KnownName& known) {
        edit::requireNewName(before, to, known.isFamily, known.name);
        if (known.name == to) {
            throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" has this name already", to));
        }
        renameIn(draft, known.name, to);
        return edit::Intention{.renamed = {{known.name, to}}};
    };
    return editName(tool, arguments.from, arguments.dryRun, rename);
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
