// `property`: the values of a property of a device.
#include "commands/Commands.h"

#include "query/ManagerQueries.h"
#include "query/Properties.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

#include <CLI/CLI.hpp>

#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string key;
};

/// All values. They are asked for behind the one value that the manager gives: only that question finds an SPI
/// flash's property, or says why there is none.
std::vector<std::string> values(ConstraintsManager& manager, const char* device, const char* key) {
    const char* const value = manager.getDeviceStringProperty(device, key);
    const bool flash = manager.isSpiDevice(device);
    if (value == nullptr || (flash && *value == '\0')) {
        return {};
    }
    std::vector<std::string> all;
    if (!flash) {
        for (const StringBase& one : manager.getDeviceStringProperties(device, key)) {
            all.push_back(plain(one));
        }
    }
    return all.empty() ? std::vector<std::string>{value} : all;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    ConstraintsManager& manager = tool.manager();
    const std::string& device = arguments.device;
    const PropertyAnswer answer{device, arguments.key,
                                values(manager, device.c_str(), arguments.key.c_str())};
    questions::requireKnown(manager, device);
    return showProperty(tool, answer,
                        manager.isSpiDevice(device.c_str()) ? flashProperties(manager, device)
                                                            : deviceProperties(manager, device));
}

} // namespace

Action declareProperty(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    parser.add_option("DEVICE", arguments->device, "The device, or a family")->type_name("")->required();
    parser.add_option("KEY", arguments->key, "The property's name, case included")->type_name("")->required();
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}
