// `property`: the values of a property of a device.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "query/ApplicationFault.h"
#include "query/AskedDevice.h"
#include "query/ManagerQueries.h"
#include "query/Properties.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string key;
};

/// All values. The single value is asked for first: only that question finds a property of an SPI flash and issues
/// the messages about a missing one.
std::vector<std::string> propertyValues(ConstraintsManager& manager, const char* device, const char* key) {
    const char* const value = manager.getDeviceStringProperty(device, key);
    const bool flash = manager.isSpiDevice(device);
    if (value == nullptr || (flash && *value == '\0')) {
        return {};
    }
    std::vector<std::string> all;
    if (!flash) {
        for (const StringBase& one : manager.getDeviceStringProperties(device, key)) {
            all.push_back(toStdString(one));
        }
    }
    return all.empty() ? std::vector<std::string>{value} : all;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const std::string device = askedDevice(tool, arguments.device).name;
    ConstraintsManager& manager = tool.manager();
    const PropertyAnswer answer{device, arguments.key,
                                propertyValues(manager, device.c_str(), arguments.key.c_str())};
    questions::requireKnown(tool, device);
    noteApplicationFault(
        tool,
        [&](ConstraintsManager& asked) {
            return inWords(propertyValues(asked, device.c_str(), arguments.key.c_str()));
        },
        inWords(answer.values));
    return showProperty(tool, answer,
                        manager.isSpiDevice(device.c_str()) ? flashProperties(manager, device)
                                                            : deviceProperties(manager, device));
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::device(&arguments->device),
        {.name = "KEY",
         .description = "The property's name, case included",
         .kind = ValueKind::PROPERTY,
         .required = true,
         .target = &arguments->key},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::PROPERTY{
    "property", "Show the values of a property of a device", "", "tarvik property KS50 VENDOR", declare,
};
