// `dump`: the manager's smoke-test tables, byte for byte.
#include "commands/Commands.h"

#include "model/Catalogue.h"
#include "query/ApplicationFault.h"
#include "query/Tool.h"

#include <TarvikSmokeMgr.h>
#include <tarvik/ConstraintsManager.h>

#include <map>
#include <memory>

namespace {

struct Arguments {
    std::string table;
    std::vector<std::string> devices;
};

struct Dump {
    std::string table;
    std::string text;
};

std::string asText(const Dump& dump, const Terminal&) { return dump.text; }

Json asJson(const Dump& dump) { return {{"table", dump.table}, {"text", dump.text}}; }

using Recorded = void (ConstraintsManager::*)(TarvikSmokeMgr*);

/// The tables that are written to a recorder. The multiboot table knows the status channel only.
const std::map<std::string, Recorded> RECORDED{
    {"bsdl", &ConstraintsManager::dumpBsdlOperationsTable},
    {"families", &ConstraintsManager::dumpCachedDeviceFamilies},
    {"operations", &ConstraintsManager::dumpOperationsTable},
    {"options", &ConstraintsManager::dumpProgramOptionsTable},
};
constexpr const char* MULTIBOOT = "multiboot";

std::vector<std::string> tableNames() {
    std::vector<std::string> names{MULTIBOOT};
    for (const auto& [name, method] : RECORDED) {
        names.push_back(name);
    }
    return names;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    ConstraintsManager& manager = tool.manager();
    for (const std::string& device : arguments.devices) {
        askForTables(manager, device);
        if (!manager.isKorvelDevice(device.c_str())) {
            throw catalogue::unknownDevice(device);
        }
    }
    if (arguments.table == MULTIBOOT) {
        manager.dumpMbBpiSpi();
        return tool.answer(Dump{MULTIBOOT, tool.messages().takeStatus()});
    }
    if (arguments.devices.empty()) {
        tool.note("no device is loaded, so the table has only what the manager reads when it starts");
    }
    TarvikSmokeMgr recorder;
    (manager.*RECORDED.at(arguments.table))(&recorder);
    return tool.answer(Dump{arguments.table, toStdString(recorder.text())});
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "TABLE",
         .description = "The table",
         .kind = ValueKind::CHOICE,
         .choices = tableNames(),
         .required = true,
         .target = &arguments->table},
        {.name = "DEVICE",
         .description = "Devices or families to load first",
         .kind = ValueKind::DEVICE,
         .target = &arguments->devices},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::DUMP{
    "dump",
    "Write a table of the manager as smoke tests record it",
    "The manager writes what it has loaded: name the devices or families to load first.",
    "tarvik dump multiboot\n"
    "tarvik dump operations KS50",
    declare,
};
