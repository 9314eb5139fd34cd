#include "Diagnostics.h"
#include "FamilyNames.h"
#include "Implementation.h"
#include "JoinedText.h"
#include "ModeTables.h"
#include "StringViews.h"
#include "WordTables.h"

// The five checks: may a mode use an output, may a device be configured in a mode, may an operation run. Except for
// operations, a refusal is a message in the user's words and never an exception.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
namespace location = diagnostics::location;

namespace {

constexpr const char* REFUSAL = "%s is not supported in %s\n";

// Hosts search their logs for these two texts, so their spelling stays.
constexpr const char* OUTPUT_OUT_OF_RANGE = "Outstream(Cable or file type is out of range -- %d.\n";
constexpr const char* OPERATION_OUT_OF_RANGE = "Opeartion is out of range -- %d.\n";

void refuseOutput(OUTPUT_TYPE output, MODE_TYPE mode, int location) {
    wordTables::outputDisplayName(output);
    wordTables::modeDisplayName(mode);
    diagnostics::message(location).issueInfo(REFUSAL, wordTables::lastOutputName, wordTables::lastModeName);
}

void refuseDevice(std::string_view device, const char* package, MODE_TYPE mode, int location) {
    StringBase part(device.data(), device.size());
    if (package != nullptr) {
        part += "_";
        part += package;
    }
    wordTables::modeDisplayName(mode);
    diagnostics::message(location).issueInfo(REFUSAL, part.c_str(), wordTables::lastModeName);
}

} // namespace

/// The families that a mode supports. For a value that is no mode: raises from `location`, or null.
const NameSet* ConstraintsManager::Implementation::modeDeviceSet(MODE_TYPE mode, int location) const {
    const ModeTable* const table = modeTable(mode);
    if (table == nullptr) {
        diagnostics::raiseIf<OutOfRangeException>(m_exceptions, location);
        return nullptr;
    }
    return &(this->*table->devices);
}

const NameSet* ConstraintsManager::Implementation::checkedModeDeviceSet(MODE_TYPE mode) const {
    return modeDeviceSet(mode, location::CHECKED_MODE_UNKNOWN);
}

/// The look-up for a dump of the modes, with its own location. No dump lists the families of a mode yet.
const NameSet* ConstraintsManager::Implementation::dumpedModeDeviceSet(MODE_TYPE mode) const {
    return modeDeviceSet(mode, location::DUMPED_MODE_UNKNOWN);
}

bool ConstraintsManager::Implementation::modeAllowsOutput(MODE_TYPE mode, OUTPUT_TYPE output) const {
    // The PROM file formatter accepts every output, whatever the database lists for it.
    if (mode == MODE_TYPE::PFF) {
        return true;
    }
    const ModeTable* const table = modeTable(mode);
    return table != nullptr && (this->*table->outputs).count(output) != 0;
}

bool ConstraintsManager::Implementation::isPartAllowedInMode(MODE_TYPE mode, std::string_view device,
                                                             std::string_view package) const {
    const JoinedText key{wordTables::modeKey(mode), "_", device, "_", package};
    return !m_notSupportedPartInMode.contains(key.view());
}

bool ConstraintsManager::Implementation::familySupportsMode(MODE_TYPE mode, std::string_view device,
                                                            const char* package) {
    if (package != nullptr && !isPartAllowedInMode(mode, device, package)) {
        return false;
    }
    const StringBase family = getPartFamily(baseName(device));
    const NameSet* const families = checkedModeDeviceSet(mode);
    return families != nullptr && families->contains(view(family));
}

bool ConstraintsManager::Implementation::deviceSupportsMode(MODE_TYPE mode, std::string_view device,
                                                            const char* package) {
    // In SPI mode all flashes are treated as one device.
    return familySupportsMode(mode, mode == MODE_TYPE::SPI ? familyNames::SPI : baseName(device), package);
}

bool ConstraintsManager::Implementation::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output) const {
    if (modeAllowsOutput(mode, output)) {
        return true;
    }
    refuseOutput(output, mode, location::OUTPUT_REFUSED);
    return false;
}

bool ConstraintsManager::Implementation::checkConstraints(MODE_TYPE mode, std::string_view device,
                                                          const char* package) {
    if (mode == MODE_TYPE::PFF || mode == MODE_TYPE::SPI) {
        return true;
    }
    const std::string_view base = baseName(device);
    if (deviceSupportsMode(mode, base, package)) {
        return true;
    }
    refuseDevice(base, package, mode, location::DEVICE_REFUSED);
    return false;
}

bool ConstraintsManager::Implementation::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output,
                                                          std::string_view device, const char* package) {
    const std::string_view base = baseName(device);
    const bool outputAllowed = modeAllowsOutput(mode, output);
    // Asked in every case: it may raise, and it resolves the family. Unlike the check without an output it makes no
    // exception for SPI and PROM file formatter.
    const bool deviceAllowed = deviceSupportsMode(mode, base, package);
    if (!outputAllowed) {
        refuseOutput(output, mode, location::OUTPUT_REFUSED_WITH_DEVICE);
    } else if (!deviceAllowed) {
        refuseDevice(base, package, mode, location::DEVICE_REFUSED_WITH_OUTPUT);
    }
    return outputAllowed && deviceAllowed;
}

bool ConstraintsManager::Implementation::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output,
                                                          std::string_view device, OP_TYPE operation) {
    const auto isOutOfRange = [&] {
        return diagnostics::rejectOutOfRange(mode, tableDimensions::MODES, diagnostics::MODE_OUT_OF_RANGE) ||
               diagnostics::rejectOutOfRange(output, tableDimensions::OUTPUTS, OUTPUT_OUT_OF_RANGE) ||
               diagnostics::rejectOutOfRange(operation, tableDimensions::OPERATIONS, OPERATION_OUT_OF_RANGE);
    };
    const auto answer = [&](std::size_t block) {
        return m_operationTable.allows(block, static_cast<int>(operation), static_cast<int>(mode),
                                       static_cast<int>(output));
    };

    if (mode == MODE_TYPE::SPI) {
        return !isOutOfRange() && answer(familyIndex(familyNames::SPI));
    }
    if (const CachedLookup* const known = findCachedLookup(m_operationLookups, device)) {
        const std::size_t block = known->block;
        return !isOutOfRange() && answer(block);
    }
    const StringBase name = toStringBase(device);
    // Resolves the base name, unlike the masks: a flash that is listed with its package is no flash here.
    const std::string_view base = baseName(view(name));
    const StringBase owner = m_supportedDevices.contains(base) ? name : getPartFamily(base);
    if (!m_operationsLoaded.contains(view(owner))) {
        loadDeviceData(view(owner), {});
    }
    if (isOutOfRange()) {
        return false;
    }
    const std::size_t block = familyIndex(view(owner));
    cacheOperationLookup(name, owner, block);
    return answer(block);
}

bool ConstraintsManager::Implementation::checkConstraints(std::string_view device, MODE_TYPE mode,
                                                          OP_TYPE operation) {
    return hasDevicePropertyValue(baseName(device), wordTables::operationKey(operation),
                                  wordTables::modeKey(mode));
}
