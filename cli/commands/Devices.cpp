// `devices`: the devices of the database, with family and IDCODE.
#include "commands/Commands.h"

#include "model/Catalogue.h"
#include "model/IdcodePattern.h"
#include "model/Idcodes.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "text/Glob.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <memory>
#include <optional>
#include <unordered_set>

namespace {

struct Arguments {
    std::string family;
    std::string glob;
    bool namesOnly = false;
};

struct Device {
    std::string name;
    std::string family;
    std::optional<IdcodeFinder::Idcode> idcode;
};

struct Devices {
    std::vector<Device> all;
    bool namesOnly; ///< in text
};

std::string asText(const Devices& devices, const Terminal& terminal) {
    if (devices.namesOnly) {
        std::string names;
        for (const Device& device : devices.all) {
            names += terminal.sanitised(device.name) + '\n';
        }
        return names;
    }
    Table table({"DEVICE", "FAMILY", "IDCODE"});
    for (const Device& device : devices.all) {
        table.add({device.name, device.family, device.idcode ? device.idcode->value : "-"});
    }
    return table.text(terminal);
}

Json asJson(const Devices& devices) {
    Json list = Json::array();
    for (const Device& device : devices.all) {
        list.push_back({{"name", device.name},
                        {"family", device.family},
                        {"idcode", device.idcode ? Json(device.idcode->value) : Json()}});
    }
    return {{"devices", list}};
}

/// Does the device have the name, or the IDCODE, that is searched for?
/// @param code the pattern as an IDCODE, if it is one
bool matches(const std::string& glob, const std::optional<IdcodePattern>& code, const Device& device) {
    const auto isLike = [&](const std::string& text) { return matchesGlob(glob, text); };
    if (glob.empty() || isLike(device.name)) {
        return true;
    }
    if (!device.idcode) {
        return false;
    }
    const std::optional<IdcodePattern> own = readIdcode(device.idcode->value);
    return code && own ? code->matches(*own) : isLike(device.idcode->value);
}

/// The names that the family filter leaves, each once: the first family that has a device is the one that
/// answers for it.
std::vector<std::string> deviceNames(const std::string& wantedFamily) {
    const std::vector<std::string> families = catalogue::families();
    std::vector<std::string> names;
    std::unordered_set<std::string> seen;
    bool familyFound = false;
    for (const std::string& family : families) {
        const bool wanted = wantedFamily.empty() || sameWithoutCase(family, wantedFamily);
        familyFound = familyFound || wanted;
        for (std::string& name : AcdStore::devices(family)) {
            if (seen.insert(lowerCase(name)).second && wanted) {
                names.push_back(std::move(name));
            }
        }
    }
    if (!familyFound && !wantedFamily.empty()) {
        throw CommandError(ExitCode::NO, fmt::format("the database has no family \"{}\" with devices{}",
                                                     wantedFamily, didYouMean(wantedFamily, families)));
    }
    return names;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    ConstraintsManager& manager = tool.manager();
    const IdcodeFinder idcodes(manager);
    const std::optional<IdcodePattern> code = readIdcode(arguments.glob);
    Devices devices{{}, arguments.namesOnly};
    for (const std::string& name : deviceNames(arguments.family)) {
        Device device{name, {}, idcodes.find(name)};
        if (matches(arguments.glob, code, device)) {
            device.family = toStdString(manager.getPartFamily(name.c_str()));
            devices.all.push_back(std::move(device));
        }
    }
    if (devices.all.empty()) {
        throw CommandError(ExitCode::NO, arguments.glob.empty()
                                             ? "the database has no devices"
                                             : fmt::format("no device matches \"{}\"{}", arguments.glob,
                                                           didYouMean(arguments.glob, catalogue::names())));
    }
    return tool.answer(devices);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "--family",
         .value = "FAMILY",
         .description = "List only the devices of this family",
         .kind = ValueKind::FAMILY,
         .target = &arguments->family},
        {.name = "--names",
         .description = "Show only the names, one per line",
         .target = &arguments->namesOnly},
        {.name = "GLOB",
         .description =
             "List only the devices whose name or IDCODE matches, in any case; *, ? and [...] are wildcards",
         .kind = ValueKind::DEVICE,
         .target = &arguments->glob},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::DEVICES{
    "devices",
    "List devices with family and IDCODE",
    "",
    "tarvik devices --family kestrel\n"
    "tarvik devices 'ks*'\n"
    "tarvik devices 0x14104FB7",
    declare,
};
