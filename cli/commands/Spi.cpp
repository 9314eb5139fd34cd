// `spi`: the SPI and BPI flashes, and their properties.
#include "commands/Commands.h"

#include "query/AskedDevice.h"
#include "query/Properties.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <memory>
#include <optional>

namespace {

struct Arguments {
    std::optional<std::string> device;
    std::optional<std::string> key;
};

struct Flashes {
    std::vector<catalogue::Flash> all;
};

std::string asText(const Flashes& flashes, const Terminal& terminal) {
    Table table({"FLASH", "FAMILY"});
    for (const catalogue::Flash& flash : flashes.all) {
        table.add({flash.name, flash.family});
    }
    return table.text(terminal);
}

Json asJson(const Flashes& flashes) {
    Json list = Json::array();
    for (const catalogue::Flash& flash : flashes.all) {
        list.push_back({{"name", flash.name}, {"family", flash.family}});
    }
    return {{"flashes", list}};
}

struct Flash {
    std::string name;
    Properties properties;
};

std::string asText(const Flash& flash, const Terminal& terminal) {
    return asText(flash.properties, terminal, 0);
}

Json asJson(const Flash& flash) { return {{"device", flash.name}, {"properties", asJson(flash.properties)}}; }

ExitCode listFlashes(Tool& tool) {
    // The manager's start-up reads the flashes that are listed here, and reports what is wrong with them.
    static_cast<void>(tool.manager());
    return tool.answer(Flashes{catalogue::flashes()});
}

CommandError unknownFlash(const std::string& name) {
    std::vector<std::string> names;
    for (const catalogue::Flash& flash : catalogue::flashes()) {
        names.push_back(flash.name);
        names.push_back(flash.family);
    }
    return {ExitCode::NO, fmt::format("the database has no flash \"{}\"{}", name, didYouMean(name, names))};
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    if (!arguments.device) {
        return listFlashes(tool);
    }
    const std::string device = askedDevice(tool, *arguments.device).name;
    const ConstraintsManager& manager = tool.manager();
    const Properties properties = flashProperties(manager, device);
    const bool known = manager.isSpiDevice(device.c_str());
    if (!arguments.key) {
        if (!known) {
            throw unknownFlash(device);
        }
        return tool.answer(Flash{device, properties});
    }
    PropertyAnswer answer{device, *arguments.key, {}};
    const std::string value = manager.getSpiDeviceStringProperty(device.c_str(), arguments.key->c_str());
    if (!value.empty()) {
        answer.values.push_back(value);
    } else if (!known) {
        throw unknownFlash(device);
    }
    return showProperty(tool, answer, properties);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DEVICE",
         .description = "A flash or flash family; lists all flashes if absent",
         .kind = ValueKind::FLASH,
         .target = &arguments->device},
        {.name = "KEY",
         .description = "A property; shows all properties if absent",
         .kind = ValueKind::PROPERTY,
         .target = &arguments->key},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::SPI{
    "spi",
    "List SPI and BPI flashes, or show their properties",
    "",
    "tarvik spi\n"
    "tarvik spi OVD16 DENSITY",
    declare,
};
