// `families`: the part families of the database, with the modes in which their devices may be configured.
#include "commands/Commands.h"

#include "model/Catalogue.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <fmt/ranges.h>

namespace {

struct Family {
    std::string name;
    std::size_t devices;
    std::vector<std::string> modes;
};

using Families = std::vector<Family>;

std::string asText(const Families& families, const Terminal& terminal) {
    Table table({"FAMILY", "DEVICES", "MODES"});
    for (const Family& family : families) {
        table.add(
            {family.name, std::to_string(family.devices), fmt::format("{}", fmt::join(family.modes, " "))});
    }
    return table.text(terminal);
}

Json asJson(const Families& families) {
    Json list = Json::array();
    for (const Family& family : families) {
        list.push_back({{"name", family.name}, {"devices", family.devices}, {"modes", family.modes}});
    }
    return {{"families", list}};
}

ExitCode run(Tool& tool) {
    tool.openDatabase();
    Families families;
    for (const std::string& name : catalogue::families()) {
        families.push_back({name, AcdStore::devices(name).size(), questions::modes(tool, name)});
    }
    if (const std::size_t flashes = catalogue::flashes().size(); flashes != 0) {
        families.push_back({"spi", flashes, questions::modes(tool, "spi")});
    }
    return tool.answer(families);
}

} // namespace

const Command command::FAMILIES{
    "families",
    "List the part families and their modes",
    "",
    "tarvik families",
    [](ArgumentList& /*none*/) -> Action { return run; },
};
