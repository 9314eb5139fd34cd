// `which`: the inverse of `check` and `property`: the devices for which it holds.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "query/ApplicationFault.h"
#include "query/DeviceSurvey.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Progress.h"
#include "term/Table.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <optional>

namespace {

struct Arguments {
    std::optional<std::string> operation;
    std::optional<std::string> mode;
    std::optional<std::string> output;
    std::vector<std::string> properties;
};

/// What a device must answer to be listed.
struct Filter {
    struct Property {
        std::string key;
        std::string value;
    };

    std::optional<TARVIKNS::OP_TYPE> operation;
    std::optional<TARVIKNS::MODE_TYPE> mode;
    std::optional<TARVIKNS::OUTPUT_TYPE> output;
    std::vector<Property> properties;
};

struct NamedDevice {
    std::string name;
    std::string family;
};

struct Matches {
    const Filter& filter;
    std::vector<NamedDevice> devices;
    std::vector<std::string> faults; ///< devices at which the manager raises
    /// How many of the devices are not flashes and allow the operation in SPI mode only.
    std::size_t inSpiModeOnly = 0;
};

std::string asText(const Matches& matches, const Terminal& terminal) {
    if (matches.devices.empty()) {
        return {};
    }
    Table table({"DEVICE", "FAMILY"});
    for (const NamedDevice& device : matches.devices) {
        table.add({device.name, device.family});
    }
    return table.text(terminal);
}

Json asJson(const Filter& filter) {
    Json object;
    if (filter.mode) {
        object["mode"] = vocabulary::key(*filter.mode);
    }
    if (filter.output) {
        object["output"] = vocabulary::key(*filter.output);
    }
    if (filter.operation) {
        object["operation"] = vocabulary::key(*filter.operation);
    }
    if (filter.properties.size() == 1) {
        object["property"] = filter.properties.front().key;
        object["value"] = filter.properties.front().value;
    } else if (!filter.properties.empty()) {
        object["properties"] = Json::array();
        for (const auto& [key, value] : filter.properties) {
            object["properties"].push_back({{"property", key}, {"value", value}});
        }
    }
    return object;
}

Json asJson(const Matches& matches) {
    Json object = asJson(matches.filter);
    Json list = Json::array();
    for (const NamedDevice& device : matches.devices) {
        list.push_back({{"name", device.name}, {"family", device.family}});
    }
    object["devices"] = std::move(list);
    object["faults"] = matches.faults;
    return object;
}

CommandError usage() {
    return {ExitCode::FAULT,
            "which takes --operation, with or without --mode and --output, or --property KEY=VALUE, or both"
            "\nsee: tarvik which --help"};
}

Filter read(const Arguments& arguments) {
    Filter filter;
    if (arguments.operation) {
        filter.operation = vocabulary::readOperation(*arguments.operation);
    }
    if (arguments.mode) {
        filter.mode = vocabulary::readMode(*arguments.mode);
    }
    if (arguments.output) {
        filter.output = vocabulary::readOutput(*arguments.output);
    }
    for (const std::string& text : arguments.properties) {
        const std::size_t equals = text.find('=');
        if (equals == std::string::npos || equals == 0) {
            throw usage();
        }
        filter.properties.push_back({text.substr(0, equals), text.substr(equals + 1)});
    }
    if (filter.operation ? filter.output && !filter.mode
                         : filter.mode || filter.output || filter.properties.empty()) {
        throw usage();
    }
    return filter;
}

/// The row of the operation; null if it is allowed nowhere.
const DeviceTable::Row* rowOf(const DeviceTable& table, const Filter& filter) {
    const auto row =
        std::ranges::find(table.rows, vocabulary::key(*filter.operation), &DeviceTable::Row::key);
    return row == table.rows.end() ? nullptr : &*row;
}

/// Does the table allow the operation in the mode through the output, or anywhere?
bool allows(const DeviceTable& table, const Filter& filter) {
    const DeviceTable::Row* const row = rowOf(table, filter);
    if (row == nullptr) {
        return false;
    }
    if (!filter.mode) {
        return std::ranges::any_of(row->outputs, [](DeviceTable::Outputs outputs) { return outputs != 0; });
    }
    const auto mode = static_cast<std::size_t>(*filter.mode);
    return mode < DeviceTable::MODES &&
           (row->outputs.at(mode) >> static_cast<unsigned>(*filter.output) & 1U) != 0;
}

/// Is the value among those of the device's property? For a flash, its flash property is the one value.
bool hasValue(ConstraintsManager& manager, const std::string& device, const Filter::Property& property) {
    const char* const name = device.c_str();
    const char* const key = property.key.c_str();
    // Asked in any case: it loads the device, which may fail.
    const bool isListed = manager.getDeviceStringProperties(name, key).count(property.value) != 0;
    if (!manager.isSpiDevice(name)) {
        return isListed;
    }
    const std::string value = manager.getSpiDeviceStringProperty(name, key);
    return !value.empty() && value == property.value;
}

/// The questions of a filter, put to a survey.
DeviceSurvey::Topics topics(const Filter& filter) {
    const bool isInMode = filter.operation && filter.mode && !filter.output;
    DeviceSurvey::Topics topics;
    topics.operations = filter.operation && !isInMode;
    if (isInMode || !filter.properties.empty()) {
        topics.question = [&filter, isInMode](ConstraintsManager& manager, const std::string& device) {
            return std::ranges::all_of(
                       filter.properties,
                       [&](const Filter::Property& one) { return hasValue(manager, device, one); }) &&
                   (!isInMode ||
                    manager.checkConstraints(device.c_str(), *filter.mode, *filter.operation, nullptr));
        };
    }
    return topics;
}

Matches find(const Filter& filter) {
    Matches matches{filter, {}, {}};
    Progress progress("asking about each device");
    const DeviceSurvey::Topics asked = topics(filter);
    DeviceSurvey(asked).run(
        [&](const DeviceDetails& device) {
            if (!device.fault.empty() || (asked.operations && !device.operations->fault.empty())) {
                matches.faults.push_back(device.name);
            } else if ((!asked.operations || allows(*device.operations, filter)) &&
                       (!asked.question || device.answer)) {
                matches.devices.push_back({device.name, device.family});
                const bool isAnyMode =
                    filter.operation && !filter.mode && device.family != schema::SPI_FAMILY;
                if (isAnyMode && rowOf(*device.operations, filter)->isOfSpiModeOnly()) {
                    ++matches.inSpiModeOnly;
                }
            }
        },
        [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); });
    return matches;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const Filter filter = read(arguments);
    tool.openDatabase();
    const Matches matches = find(filter);
    const ExitCode status = !matches.faults.empty()   ? ExitCode::FAULT
                            : matches.devices.empty() ? ExitCode::NO
                                                      : ExitCode::YES;
    noteApplicationFaults(tool, findApplicationFaults());
    static_cast<void>(tool.answer(matches));
    if (!matches.faults.empty()) {
        tool.note(unansweredText(matches.faults));
    }
    if (filter.operation && filter.mode == TARVIKNS::MODE_TYPE::SPI) {
        tool.note(questions::SPI_MODE_RULE);
    }
    if (matches.inSpiModeOnly != 0) {
        tool.note(fmt::format("{} of these {} devices allow it in SPI mode only, and {}",
                              matches.inSpiModeOnly, matches.devices.size(), questions::SPI_MODE_RULE));
    }
    if (status == ExitCode::NO) {
        tool.note("no device matches");
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        argument::operation(&arguments->operation, "The operation that the devices allow"),
        argument::mode(&arguments->mode, false),
        argument::output(&arguments->output, false),
        {.name = "--property",
         .value = "KEY=VALUE",
         .description = "A property that the devices have; repeat it for several",
         .kind = ValueKind::PROPERTY_VALUE,
         .target = &arguments->properties},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::WHICH{
    "which",
    "List the devices that allow an operation or have a property",
    "",
    "tarvik which --operation ERASE --mode BS --output USB2\n"
    "tarvik which --property VENDOR=Korvel",
    declare,
};
