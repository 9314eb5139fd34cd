#include "FamilyNames.h"
#include "PermissionTable.h"
#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <Port_MsgManData.h>

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

/// How a question that was answered before is answered again: with a single look-up, which leaves the same latest
/// resolution. Null for a device that was not asked for yet.
const ConstraintsManager::Shortcut* ConstraintsManager::recall(const Shortcuts& shortcuts,
                                                               const char* device) {
    const auto found = shortcuts.find(view(device));
    if (found == shortcuts.end()) {
        return nullptr;
    }
    if (found->second.family != nullptr) {
        m_partFamily = *found->second.family;
    }
    return &found->second;
}

/// Keeps the way to a device's operations. Only with all of its owner's data loaded, as then every question about
/// operations goes this way; and only where the owner has the block itself, as then nothing else is resolved.
void ConstraintsManager::keepOperationShortcut(const StringBase& device, const StringBase& owner,
                                               std::size_t block) {
    if (block >= m_supportedDevices.size() || m_supportedDevices[block] != owner ||
        m_loadedFamilies.find(view(owner)) == m_loadedFamilies.end() ||
        !m_operationsLoaded.contains(view(owner))) {
        return;
    }
    const bool isResolved = !m_supportedDevices.contains(baseName(view(device)));
    m_operationShortcuts.insert_or_assign(device,
                                          Shortcut{isResolved ? &m_supportedDevices[block] : nullptr, block});
}

/// Keeps the way to a device's options. The owner's are loaded if they have a block at all, and the family is always
/// resolved.
void ConstraintsManager::keepOptionShortcut(const StringBase& device, std::size_t block) {
    if (block >= m_programOptionPackages.size()) {
        return;
    }
    StringBase key = baseNameOf(view(device));
    key.MakeLower();
    // Families are few: their names in the list of supported ones stay near, those in the cache lie apart.
    const std::size_t family = m_supportedDevices.position(view(m_deviceFamilyCache.find(view(key))->second));
    if (family != m_supportedDevices.size()) {
        m_optionShortcuts.insert_or_assign(device, Shortcut{&m_supportedDevices[family], block});
    }
}

int ConstraintsManager::getDeviceOperations(const char* device, MODE_TYPE mode, OUTPUT_TYPE output) {
    // Modes and outputs that have no cell give 0 without a word, behind the look-up, which may raise.
    const auto answer = [&](std::size_t block) {
        return static_cast<int>(
            m_operationTable->mask(block, static_cast<int>(mode), static_cast<int>(output)));
    };
    if (mode == MODE_TYPE::SPI) {
        return answer(familyIndex(familyNames::SPI));
    }
    if (const Shortcut* const known = recall(m_operationShortcuts, device)) {
        return answer(known->block);
    }
    const StringBase name(device);
    const StringBase owner = operationOwner(name);
    if (m_loadedFamilies.find(view(owner)) == m_loadedFamilies.end()) {
        loadDeviceData(owner.c_str(), nullptr);
    }
    const unsigned block = familyIndex(owner.c_str());
    keepOperationShortcut(name, owner, block);
    return answer(block);
}

int ConstraintsManager::getProgramOptions(const char* device, MODE_TYPE mode, OUTPUT_TYPE output,
                                          const char* package) {
    // A package may lead to a block of its own.
    const bool isPlain = mode != MODE_TYPE::SPI && view(package).empty();
    const Shortcut* const known = isPlain ? recall(m_optionShortcuts, device) : nullptr;
    const StringBase name(known == nullptr ? device : nullptr);
    StringBase owner(familyNames::SPI);
    if (mode != MODE_TYPE::SPI && known == nullptr) {
        owner = loadedOptionOwner(name, package);
    }
    if (isRefused(mode, extent::MODES, MODE_OUT_OF_RANGE) ||
        isRefused(output, extent::OUTPUTS, OUTPUT_OUT_OF_RANGE)) {
        return 0;
    }
    const std::size_t block =
        known != nullptr ? known->block : static_cast<std::size_t>(programOptionTableIndex(owner.c_str()));
    if (isPlain && known == nullptr) {
        keepOptionShortcut(name, block);
    }
    return static_cast<int>(
        m_programOptionTable->mask(block, static_cast<int>(mode), static_cast<int>(output)));
}

bool ConstraintsManager::isProgramOptionTableLoaded(const char* name) const {
    return m_programOptionsLoaded.contains(view(name));
}

/// The name whose program options answer for a device in a package, its options loaded: the two joined when
/// they are listed together, else the device when it is listed or a family, else its family.
StringBase ConstraintsManager::loadedOptionOwner(const StringBase& device, const char* package) {
    StringBase name = device;
    StringBase joined = name;
    joined += package;
    const StringBase family = getPartFamily(name.c_str());
    if (family != name) {
        if (m_programOptionPackages.contains(view(joined))) {
            if (!isProgramOptionTableLoaded(joined.c_str())) {
                loadDeviceData(name.c_str(), package);
            }
            return joined;
        }
        if (!m_programOptionPackages.contains(view(name))) {
            name = family;
        }
    }
    if (!isProgramOptionTableLoaded(name.c_str())) {
        loadDeviceData(name.c_str(), nullptr);
    }
    return name;
}

int ConstraintsManager::getBsdlOperations(const char* device, OUTPUT_TYPE output) {
    std::size_t block = 0;
    if (const Shortcut* const known = recall(m_operationShortcuts, device)) {
        block = known->block;
    } else {
        const StringBase name(device);
        const StringBase owner = operationOwner(name);
        if (!m_operationsLoaded.contains(view(owner))) {
            loadDeviceData(owner.c_str(), nullptr);
        }
        block = familyIndex(owner.c_str());
        keepOperationShortcut(name, owner, block);
    }
    // Negative outputs pass this test, have no cell and give 0 without a word.
    if (static_cast<int>(output) >= extent::OUTPUTS) {
        Port_MsgManData::debugStub(OUTPUT_OUT_OF_RANGE, static_cast<int>(output));
        return 0;
    }
    return static_cast<int>(m_bsdlOperationTable->mask(block, 0, static_cast<int>(output)));
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, const char* device,
                                          OP_TYPE operation, const char* /*family*/) {
    const Shortcut* const known = mode != MODE_TYPE::SPI ? recall(m_operationShortcuts, device) : nullptr;
    const StringBase name(known == nullptr ? device : nullptr);
    StringBase owner(familyNames::SPI);
    if (mode != MODE_TYPE::SPI && known == nullptr) {
        // The base name is what is resolved here: a flash that is listed with its package is none then.
        const StringBase base = baseNameOf(view(name));
        owner = m_supportedDevices.contains(view(base)) ? name : getPartFamily(base.c_str());
        if (!m_operationsLoaded.contains(view(owner))) {
            loadDeviceData(owner.c_str(), nullptr);
        }
    }
    if (isRefused(mode, extent::MODES, MODE_OUT_OF_RANGE) ||
        isRefused(output, extent::OUTPUTS, CHECKED_OUTPUT_OUT_OF_RANGE) ||
        isRefused(operation, extent::OPERATIONS, CHECKED_OPERATION_OUT_OF_RANGE)) {
        return false;
    }
    const std::size_t block = known != nullptr ? known->block : familyIndex(owner.c_str());
    if (mode != MODE_TYPE::SPI && known == nullptr) {
        keepOperationShortcut(name, owner, block);
    }
    return m_operationTable->allows(block, static_cast<int>(operation), static_cast<int>(mode),
                                    static_cast<int>(output));
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
