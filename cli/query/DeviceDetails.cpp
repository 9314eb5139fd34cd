// Gathers everything about one device, apart from how it is shown.
#include "query/DeviceDetails.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "query/Apart.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <functional>

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

/// The answers to one kind of question: numbers, or masks.
using Numbers = std::vector<int>;

Numbers asked(Asking asking, const std::function<Numbers()>& ask) {
    if (asking == Asking::HERE) {
        return ask();
    }
    return Json::parse(why::apart([&] { return Json(ask()).dump(); }));
}

/// The masks of a table, mode by mode and in them output by output.
template <typename Query>
Numbers masks(Query query) {
    Numbers answers;
    for (std::size_t mode = 0; mode < DeviceSheet::MODES; ++mode) {
        for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
            answers.push_back(query(static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output)));
        }
    }
    return answers;
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

Numbers bsdlMasks(ConstraintsManager& manager, const char* device) {
    Numbers answers;
    for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
        answers.push_back(manager.getBsdlOperations(device, static_cast<OUTPUT_TYPE>(output)));
    }
    return answers;
}

Numbers modeNumbers(Tool& tool, const std::string& device) {
    Numbers answers;
    for (const std::string& key : questions::modes(tool, device)) {
        answers.push_back(static_cast<int>(vocabulary::readMode(key)));
    }
    return answers;
}

/// All names that the lists of multiboot arrangements hold, in lower case.
std::unordered_set<std::string> multibootNames() {
    std::unordered_set<std::string> names;
    for (const std::string& key : multiboot::keys()) {
        for (const std::string& name : catalogue::list("spi.acd", key)) {
            names.insert(lowerCase(name));
        }
    }
    return names;
}

} // namespace

std::string outputLetters() {
    std::string letters;
    for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
        const std::string& key = vocabulary::outputs().at(output);
        letters += key.at(key.find_first_not_of(letters));
    }
    return letters;
}

void addTables(DeviceSheet& sheet, Tool& tool, Asking asking) {
    ConstraintsManager& manager = tool.manager();
    const char* const device = sheet.name.c_str();
    const Numbers operations = asked(asking, [&] {
        return masks([&](MODE_TYPE mode, OUTPUT_TYPE output) {
            return manager.getDeviceOperations(device, mode, output);
        });
    });
    const Numbers options = asked(asking, [&] {
        return masks([&](MODE_TYPE mode, OUTPUT_TYPE output) {
            return manager.getProgramOptions(device, mode, output, nullptr);
        });
    });
    const Numbers bsdl = asked(asking, [&] { return bsdlMasks(manager, device); });
    sheet.operations = rows(vocabulary::operations(), operations, bsdl);
    sheet.options = rows(vocabulary::options(), options, {});
    for (const int mode : asked(asking, [&] { return modeNumbers(tool, sheet.name); })) {
        sheet.modes.push_back(vocabulary::key(static_cast<MODE_TYPE>(mode)));
    }
}

FactReader::FactReader(ConstraintsManager& manager)
    : m_manager(manager), m_idcodes(manager), m_idcodeEntries(catalogue::entries("base.acd", "IDCODE")),
      m_properties(manager), m_multiboot(multibootNames()) {}

void FactReader::addFacts(DeviceSheet& sheet) {
    const char* const device = sheet.name.c_str();
    // Loads all records, properties or none.
    static_cast<void>(m_manager.getDeviceStringProperties(device, ""));
    sheet.family = plain(m_manager.getPartFamily(device));
    sheet.properties = m_properties.read(sheet.name);
    sheet.idcode = idcode(sheet.name);
    sheet.flash = m_manager.isSpiDevice(device);
    if (sheet.flash) {
        sheet.flashProperties = flashProperties(m_manager, sheet.name);
    }
    sheet.multiboot = arrangements(sheet.name);
}

std::optional<DeviceSheet::Idcode> FactReader::idcode(const std::string& device) const {
    std::optional<IdcodeFinder::Idcode> found = m_idcodes.find(device);
    if (!found) {
        // A package does not change the IDCODE.
        StringBase bare(device.c_str());
        ConstraintsManager::removePackageName(bare);
        found = m_idcodes.find(plain(bare));
    }
    if (!found) {
        return std::nullopt;
    }
    const catalogue::Entry& entry = m_idcodeEntries.at(found->name);
    return DeviceSheet::Idcode{found->value, entry.origin, entry.shadows};
}

std::vector<DeviceSheet::Arrangement> FactReader::arrangements(const std::string& device) const {
    std::vector<DeviceSheet::Arrangement> found;
    if (m_multiboot.count(lowerCase(device)) == 0) {
        return found;
    }
    multiboot::forEachArrangement([&](const std::string& type, const std::string& width, bool lead) {
        if (m_manager.isMbBpiSpiSupport(device.c_str(), type.c_str(), width.c_str(), lead)) {
            found.push_back({type, width, lead ? "lead" : "chain"});
        }
    });
    return found;
}

DeviceSheet deviceSheet(Tool& tool, const std::string& device) {
    ConstraintsManager& manager = tool.manager();
    DeviceSheet sheet{};
    sheet.name = device;
    // Read here first, so that what the host layer says about the files is said where it can be heard.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    addTables(sheet, tool, Asking::APART);
    // Nothing was asked so far but of copies of this manager.
    questions::requireKnown(manager, device);
    // What the manager says about the records was said to its copies only.
    FactReader(manager).addFacts(sheet);
    sheet.spelling = spelling(device, sheet.family);
    return sheet;
}
