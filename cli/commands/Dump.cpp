// `dump`: the manager's smoke-test tables, byte for byte.
#include "commands/Commands.h"

#include "model/Catalogue.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <TarvikSmokeMgr.h>
#include <tarvik/ConstraintsManager.h>

#include <CLI/CLI.hpp>

#include <fmt/format.h>

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

/// Makes the manager load what it has on a device, as a host's questions would.
void load(ConstraintsManager& manager, const std::string& device) {
    using namespace TARVIKNS;
    static_cast<void>(manager.getDeviceOperations(device.c_str(), MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL));
    static_cast<void>(
        manager.getProgramOptions(device.c_str(), MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL, nullptr));
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const auto recorded = RECORDED.find(arguments.table);
    if (recorded == RECORDED.end() && arguments.table != MULTIBOOT) {
        const std::vector<std::string> names = tableNames();
        throw CommandError(ExitCode::FAULT,
                           fmt::format("unknown table \"{}\"{}\ntables:\n{}", arguments.table,
                                       didYouMean(arguments.table, names), wrapped(names, 2)));
    }
    ConstraintsManager& manager = tool.manager();
    for (const std::string& device : arguments.devices) {
        load(manager, device);
        if (!manager.isKorvelDevice(device.c_str())) {
            throw catalogue::unknownDevice(device);
        }
    }
    if (recorded == RECORDED.end()) {
        manager.dumpMbBpiSpi();
        return tool.answer(Dump{MULTIBOOT, tool.messages().takeStatus()});
    }
    TarvikSmokeMgr recorder;
    (manager.*recorded->second)(&recorder);
    return tool.answer(Dump{arguments.table, plain(recorder.text())});
}

} // namespace

Action declareDump(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    parser.add_option("TABLE", arguments->table, "operations, bsdl, options, families or multiboot")
        ->type_name("")
        ->required();
    parser
        .add_option("DEVICE", arguments->devices,
                    "Devices or families to load first: the manager shows what it has loaded")
        ->type_name("");
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}
