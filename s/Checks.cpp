#include "FamilyNames.h"
#include "ModeTables.h"
#include "Reporting.h"
#include "Text.h"
#include "Vocabulary.h"

#include <tarvik/ConstraintsManager.h>

// May a mode use an output, may a device be configured in a mode. A refusal is a message in the user's words
// and never an exception.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
namespace location = reporting::location;

namespace {

constexpr const char* REFUSAL = "%s is not supported in %s\n";

void refuseOutput(OUTPUT_TYPE output, MODE_TYPE mode, int location) {
    vocabulary::outputDisplayName(output);
    vocabulary::modeDisplayName(mode);
    reporting::message(location).issueInfo(REFUSAL, vocabulary::latestOutputName, vocabulary::latestModeName);
}

void refuseDevice(const StringBase& part, MODE_TYPE mode, int location) {
    vocabulary::modeDisplayName(mode);
    reporting::message(location).issueInfo(REFUSAL, part.c_str(), vocabulary::latestModeName);
}

StringBase makePartName(const StringBase& device, const char* package) {
    StringBase name = device;
    if (package != nullptr) {
        name += "_";
        name += package;
    }
    return name;
}

} // namespace

/// The families that a mode supports. For a value that is no mode: raises from `location`, or null.
const NameSet* ConstraintsManager::modeDeviceSet(MODE_TYPE mode, int location) const {
    const ModeTable* const table = modeTable(mode);
    if (table == nullptr) {
        reporting::raiseIf<OutOfRangeException>(m_exceptions, location);
        return nullptr;
    }
    return &(this->*table->devices);
}

bool ConstraintsManager::modeAllowsOutput(MODE_TYPE mode, OUTPUT_TYPE output) const {
    // The PROM file formatter accepts every output, whatever the database lists for it.
    if (mode == MODE_TYPE::PFF) {
        return true;
    }
    const ModeTable* const table = modeTable(mode);
    return table != nullptr && (this->*table->outputs).count(output) != 0;
}

bool ConstraintsManager::isPartAllowedInMode(MODE_TYPE mode, const StringBase& device,
                                             const char* package) const {
    StringBase key = modeType2String(mode);
    key += "_";
    key += makePartName(device, package);
    return !m_notSupportedPartInMode.contains(view(key));
}

bool ConstraintsManager::familySupportsMode(MODE_TYPE mode, const StringBase& device, const char* package) {
    if (package != nullptr && !isPartAllowedInMode(mode, device, package)) {
        return false;
    }
    const StringBase family = getPartFamily(baseNameOf(view(device)).c_str());
    const NameSet* const families = modeDeviceSet(mode, location::CHECKED_MODE_UNKNOWN);
    return families != nullptr && families->contains(view(family));
}

bool ConstraintsManager::deviceSupportsMode(MODE_TYPE mode, const StringBase& device, const char* package) {
    // All SPI flashes count as one device.
    return familySupportsMode(mode, mode == MODE_TYPE::SPI ? familyNames::SPI : baseNameOf(view(device)),
                              package);
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output) {
    if (modeAllowsOutput(mode, output)) {
        return true;
    }
    refuseOutput(output, mode, location::OUTPUT_REFUSED);
    return false;
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, const char* device, const char* package) {
    if (mode == MODE_TYPE::PFF || mode == MODE_TYPE::SPI) {
        return true;
    }
    const StringBase base = baseNameOf(view(device));
    if (deviceSupportsMode(mode, base, package)) {
        return true;
    }
    refuseDevice(makePartName(base, package), mode, location::DEVICE_REFUSED);
    return false;
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, const char* device,
                                          const char* package) {
    const StringBase base = baseNameOf(view(device));
    const bool outputAllowed = modeAllowsOutput(mode, output);
    // Asked in every case: it may raise, and it resolves the family. Unlike the check without an output it
    // knows no exception for SPI and PROM file formatter.
    const bool deviceAllowed = deviceSupportsMode(mode, base, package);
    if (!outputAllowed) {
        refuseOutput(output, mode, location::OUTPUT_REFUSED_WITH_DEVICE);
    } else if (!deviceAllowed) {
        refuseDevice(makePartName(base, package), mode, location::DEVICE_REFUSED_WITH_OUTPUT);
    }
    return outputAllowed && deviceAllowed;
}
