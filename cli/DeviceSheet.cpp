// Gathers everything about one device, apart from how it is shown.
#include "DeviceSheet.h"

#include "Idcodes.h"
#include "Multiboot.h"
#include "Nearest.h"
#include "Questions.h"
#include "Tool.h"
#include "Vocabulary.h"
#include "why/Apart.h"

#include <tarvik/ConstraintsManager.h>

#include <algorithm>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

std::string spelling(const std::string& device, const std::string& family) {
    for (const std::string& known : catalogue::families()) {
        if (known == family) {
            for (const std::string& name : AcdStore::devices(family)) {
                if (sameWithoutCase(name, device)) {
                    return name;
                }
            }
        }
    }
    return device;
}

std::optional<DeviceSheet::Idcode> idcode(const ConstraintsManager& manager, const std::string& device) {
    const IdcodeFinder idcodes(manager);
    std::optional<IdcodeFinder::Idcode> found = idcodes.find(device);
    if (!found) {
        // A package does not change the IDCODE.
        StringBase bare(device.c_str());
        ConstraintsManager::removePackageName(bare);
        found = idcodes.find(plain(bare));
    }
    if (!found) {
        return std::nullopt;
    }
    const catalogue::Entry entry = catalogue::entries("base.acd", "IDCODE").at(found->name);
    return DeviceSheet::Idcode{found->value, entry.origin, entry.shadows};
}

std::vector<DeviceSheet::Arrangement> arrangements(const ConstraintsManager& manager,
                                                   const std::string& device) {
    std::vector<DeviceSheet::Arrangement> found;
    for (const std::string& type : multiboot::TYPES) {
        for (const std::string& width : multiboot::WIDTHS) {
            for (const bool lead : {true, false}) {
                if (manager.isMbBpiSpiSupport(device.c_str(), type.c_str(), width.c_str(), lead)) {
                    found.push_back({type, width, lead ? "lead" : "chain"});
                }
            }
        }
    }
    return found;
}

/// Asks a manager that nothing was asked of before: what it loads for one question can change its answer to
/// another. The numbers, or masks, come back as a list.
template <typename Ask>
std::vector<int> asked(Ask ask) {
    return Json::parse(why::apart([&] {
        Json answers = Json::array();
        ask(answers);
        return answers.dump();
    }));
}

/// The masks of a table, mode by mode and in them output by output.
template <typename Query>
std::vector<int> masks(Query query) {
    return asked([&](Json& answers) {
        for (std::size_t mode = 0; mode < DeviceSheet::MODES; ++mode) {
            for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
                answers.push_back(query(static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output)));
            }
        }
    });
}

bool contains(int mask, std::size_t value) { return (static_cast<unsigned>(mask) >> value & 1U) != 0; }

/// The outputs whose masks contain a value.
DeviceSheet::Outputs outputs(const std::vector<int>& masks, std::size_t first, std::size_t value) {
    DeviceSheet::Outputs found = 0;
    for (std::size_t output = 0; output < DeviceSheet::OUTPUTS && first + output < masks.size(); ++output) {
        if (contains(masks[first + output], value)) {
            found |= 1U << output;
        }
    }
    return found;
}

/// Turns masks into rows by key, those that allow something.
std::vector<DeviceSheet::Row> rows(const std::vector<std::string>& keys, const std::vector<int>& byMode,
                                   const std::vector<int>& bsdl) {
    std::vector<DeviceSheet::Row> all;
    for (std::size_t value = 0; value < keys.size(); ++value) {
        DeviceSheet::Row row{keys[value], {}, outputs(bsdl, 0, value)};
        for (std::size_t mode = 0; mode < DeviceSheet::MODES; ++mode) {
            row.outputs.at(mode) = outputs(byMode, mode * DeviceSheet::OUTPUTS, value);
        }
        if (row.bsdl != 0 || row.outputs != decltype(row.outputs){}) {
            all.push_back(std::move(row));
        }
    }
    return all;
}

std::vector<int> bsdlMasks(ConstraintsManager& manager, const char* device) {
    return asked([&](Json& answers) {
        for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
            answers.push_back(manager.getBsdlOperations(device, static_cast<OUTPUT_TYPE>(output)));
        }
    });
}

void addTables(DeviceSheet& sheet, ConstraintsManager& manager) {
    const char* const device = sheet.name.c_str();
    const std::vector<int> operations = masks([&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getDeviceOperations(device, mode, output);
    });
    const std::vector<int> options = masks([&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getProgramOptions(device, mode, output, nullptr);
    });
    sheet.operations = rows(vocabulary::operations(), operations, bsdlMasks(manager, device));
    sheet.options = rows(vocabulary::options(), options, {});
}

void addModes(DeviceSheet& sheet, Tool& tool) {
    const std::vector<int> modes = asked([&](Json& answers) {
        for (const std::string& key : questions::modes(tool, sheet.name)) {
            answers.push_back(static_cast<int>(vocabulary::readMode(key)));
        }
    });
    for (const int mode : modes) {
        sheet.modes.push_back(vocabulary::key(static_cast<MODE_TYPE>(mode)));
    }
}

} // namespace

DeviceSheet deviceSheet(Tool& tool, const std::string& device) {
    ConstraintsManager& manager = tool.manager();
    DeviceSheet sheet{};
    sheet.name = device;
    // Read here first, so that what the host layer says about the files is said where it can be heard.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    addTables(sheet, manager);
    addModes(sheet, tool);
    // Nothing was asked so far but of copies of this manager.
    sheet.family = plain(manager.getPartFamily(device.c_str()));
    questions::requireKnown(manager, device);
    // Loads all records, properties or none: what the manager says about them was said to its copies only.
    static_cast<void>(manager.getDeviceStringProperties(device.c_str(), ""));
    sheet.properties = deviceProperties(manager, device);
    sheet.spelling = spelling(device, sheet.family);
    sheet.idcode = idcode(manager, device);
    sheet.flash = manager.isSpiDevice(device.c_str());
    if (sheet.flash) {
        sheet.flashProperties = flashProperties(manager, device);
    }
    sheet.multiboot = arrangements(manager, device);
    return sheet;
}
