#include "FamilyNames.h"
#include "PermissionTable.h"
#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <Port_MsgManData.h>

#include <algorithm>

// What a device offers, as masks and sets. Which values each question refuses, with which message, and
// whether before or behind the look-up of the family, differs deliberately between them.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

constexpr const char* MODE_OUT_OF_RANGE = "Mode is out of range -- %d.\n";
constexpr const char* OUTPUT_OUT_OF_RANGE = "Outstream(Cable or file type) is out of range -- %d.\n";

// The check of an operation spells two of its messages in its own way, and hosts search their logs for them.
constexpr const char* CHECKED_OUTPUT_OUT_OF_RANGE = "Outstream(Cable or file type is out of range -- %d.\n";
constexpr const char* CHECKED_OPERATION_OUT_OF_RANGE = "Opeartion is out of range -- %d.\n";

/// Is the value outside 0 to `extent` - 1? Then it is told to developers.
template <typename Value>
bool isRefused(Value value, int extent, const char* message) {
    const int number = static_cast<int>(value);
    const bool isOutside = number < 0 || number >= extent;
    if (isOutside) {
        Port_MsgManData::debugStub(message, number);
    }
    return isOutside;
}

} // namespace

/// The name whose operation tables answer for a device: its own when its base name is supported, else that of
/// its family.
StringBase ConstraintsManager::operationOwner(const StringBase& device) {
    return m_supportedDevices.contains(baseName(view(device))) ? device : getPartFamily(device.c_str());
}

bool ConstraintsManager::isOperationTableLoaded(const StringBase& name) const {
    return std::find(m_operationsLoaded.begin(), m_operationsLoaded.end(), name) != m_operationsLoaded.end();
}

bool ConstraintsManager::isProgramOptionTableLoaded(const StringBase& name) const {
    return std::find(m_programOptionsLoaded.begin(), m_programOptionsLoaded.end(), name) !=
           m_programOptionsLoaded.end();
}

int ConstraintsManager::getDeviceOperations(const char* device, MODE_TYPE mode, OUTPUT_TYPE output) {
    StringBase name(familyNames::SPI);
    if (mode != MODE_TYPE::SPI) {
        name = operationOwner(device);
        if (m_loadedFamilies.find(view(name)) == m_loadedFamilies.end()) {
            loadDeviceData(name.c_str(), nullptr);
        }
    }
    // Modes and outputs that have no cell give 0 without a word, behind the look-up, which may raise.
    const unsigned index = familyIndex(name.c_str());
    return static_cast<int>(m_operationTable->mask(index, static_cast<int>(mode), static_cast<int>(output)));
}

int ConstraintsManager::getProgramOptions(const char* device, MODE_TYPE mode, OUTPUT_TYPE output,
                                          const char* package) {
    const StringBase owner = mode == MODE_TYPE::SPI ? familyNames::SPI : loadedOptionOwner(device, package);
    if (isRefused(mode, extent::MODES, MODE_OUT_OF_RANGE) ||
        isRefused(output, extent::OUTPUTS, OUTPUT_OUT_OF_RANGE)) {
        return 0;
    }
    const auto index = static_cast<std::size_t>(programOptionTableIndex(owner.c_str()));
    return static_cast<int>(
        m_programOptionTable->mask(index, static_cast<int>(mode), static_cast<int>(output)));
}

/// The name whose program options answer for a device in a package, its options loaded: the two joined when
/// they are listed together, else the device when it is listed or a family, else its family.
StringBase ConstraintsManager::loadedOptionOwner(const char* device, const char* package) {
    StringBase name(device);
    StringBase joined = name;
    joined += package;
    const StringBase family = getPartFamily(name.c_str());
    if (family != name) {
        if (m_programOptionPackages.contains(view(joined))) {
            if (!isProgramOptionTableLoaded(joined)) {
                loadDeviceData(name.c_str(), package);
            }
            return joined;
        }
        if (!m_programOptionPackages.contains(view(name))) {
            name = family;
        }
    }
    if (!isProgramOptionTableLoaded(name)) {
        loadDeviceData(name.c_str(), nullptr);
    }
    return name;
}

int ConstraintsManager::getBsdlOperations(const char* device, OUTPUT_TYPE output) {
    const StringBase name = operationOwner(device);
    if (!isOperationTableLoaded(name)) {
        loadDeviceData(name.c_str(), nullptr);
    }
    const unsigned index = familyIndex(name.c_str());
    // Negative outputs pass this test, have no cell and give 0 without a word.
    if (static_cast<int>(output) >= extent::OUTPUTS) {
        Port_MsgManData::debugStub(OUTPUT_OUT_OF_RANGE, static_cast<int>(output));
        return 0;
    }
    return static_cast<int>(m_bsdlOperationTable->mask(index, 0, static_cast<int>(output)));
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, const char* device,
                                          OP_TYPE operation, const char* /*family*/) {
    StringBase name(familyNames::SPI);
    if (mode != MODE_TYPE::SPI) {
        name = device;
        const StringBase base = baseNameOf(view(device));
        if (!m_supportedDevices.contains(view(base))) {
            name = getPartFamily(base.c_str());
        }
        if (!isOperationTableLoaded(name)) {
            loadDeviceData(name.c_str(), nullptr);
        }
    }
    if (isRefused(mode, extent::MODES, MODE_OUT_OF_RANGE) ||
        isRefused(output, extent::OUTPUTS, CHECKED_OUTPUT_OUT_OF_RANGE) ||
        isRefused(operation, extent::OPERATIONS, CHECKED_OPERATION_OUT_OF_RANGE)) {
        return false;
    }
    return m_operationTable->allows(familyIndex(name.c_str()), static_cast<int>(operation),
                                    static_cast<int>(mode), static_cast<int>(output));
}

bool ConstraintsManager::checkConstraints(const char* device, MODE_TYPE mode, OP_TYPE operation,
                                          const char* /*family*/) {
    const StringBase name = baseNameOf(view(device));
    const StringBase key = operationType2String(operation);
    return hasDevicePropertyValue(name.c_str(), key.c_str(), modeType2String(mode).c_str());
}

const ConstraintsManager::TextSet&
ConstraintsManager::getDeviceOperationOptions(const char* device, const char* operation, MODE_TYPE mode) {
    const StringBase modeName = modeType2String(mode);
    if (!hasDevicePropertyValue(device, operation, modeName.c_str())) {
        return m_operationOptions;
    }
    StringBase key("OP_");
    key += operation;
    key.MakeUpper();
    const TextSet& options = getDeviceStringProperties(device, key.c_str());
    if (!options.empty()) {
        return options;
    }
    key += "_";
    key += modeName;
    return getDeviceStringProperties(device, key.c_str());
}
