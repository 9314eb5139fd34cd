// `remove`: takes a device, a family or a flash out of a database.
#include "commands/Commands.h"
#include "commands/CommonArguments.h"
#include "commands/EditedFiles.h"

#include "edit/Remove.h"
#include "query/Tool.h"

#include <memory>

namespace {

struct Arguments {
    std::string name;
    bool dryRun = false;
};

ExitCode run(Tool& tool, const Arguments& arguments) {
    const auto remove = [](edit::Draft& draft, const lint::Model& before, const edit::KnownName& known) {
        const std::set<std::string> names = namesRemovedWith(before, known);
        removeFrom(draft, names);
        return edit::Intention{.removed = names};
    };
    return editName(tool, arguments.name, arguments.dryRun, remove);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "NAME",
         .description = "The device, family, flash or family of flashes; a family with its devices",
         .kind = ValueKind::DEVICE,
         .required = true,
         .target = &arguments->name},
        argument::dryRun(&arguments->dryRun),
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::REMOVE{
    "remove",
    "Remove a device, a family or a flash",
    "Removes the section or the file, and the name from all lists, records and keys. Before anything is "
    "written it is proven that no other answer changes, and that lint has no new finding.",
    "tarvik remove KS600 --database database\n"
    "tarvik --database database remove kestrel --dry-run",
    declare,
};
