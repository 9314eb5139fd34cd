#include "Lists.h"
#include "ModeTables.h"
#include "PermissionTable.h"
#include "Reporting.h"
#include "Text.h"
#include "Vocabulary.h"

#include <tarvik/ConstraintsManager.h>

#include <array>
#include <limits>
#include <utility>

// What the base database says once and for all: the mode tables, the lists of names, and the size of the
// permission tables that follows from them.

using TARVIKNS::MODE_TYPE;

/// The tables of a mode; null for a value that is no mode.
const ConstraintsManager::ModeTable* ConstraintsManager::modeTable(MODE_TYPE mode) {
    using M = ConstraintsManager;
    static constexpr std::array<ModeTable, vocabulary::MODES.size()> TABLES{{
        {&M::m_bsCables, &M::m_bsDevices},
        {&M::m_ssCables, &M::m_ssDevices},
        {&M::m_smCables, &M::m_smDevices},
        {&M::m_bsFileCables, &M::m_bsFileDevices},
        {&M::m_dp770Cables, &M::m_dp770Devices},
        {&M::m_spiCables, &M::m_spiDevices},
        {&M::m_kiteCfCables, &M::m_kiteCfDevices},
        {&M::m_kiteMpmCables, &M::m_kiteMpmDevices},
        {&M::m_pffCables, &M::m_pffDevices},
    }};
    return vocabulary::rowOf(TABLES, mode);
}

void ConstraintsManager::loadSupportedLists() {
    m_supportedDevices = NameSet(readList(*m_devKey, "DEVICE_SUPPORTED"));
    m_programOptionPackages = NameSet(readList(*m_devKey, "PROGRAM_OPTION_PACKAGE"));
}

// A mode's entry has two records: outputs, then families. The first field of each is a label for the reader
// of the database.

void ConstraintsManager::loadModeOutputSets() {
    for (const vocabulary::Mode& mode : vocabulary::MODES) {
        auto& outputs = this->*modeTable(mode.value)->outputs;
        Record(*m_devKey, mode.key, 0).forEachFieldFrom(1, [&](const char* name) {
            outputs.insert(cableString2Type(name));
        });
    }
}

void ConstraintsManager::loadModeDeviceSets() {
    for (const vocabulary::Mode& mode : vocabulary::MODES) {
        std::vector<StringBase> families;
        Record(*m_devKey, mode.key, 1).forEachFieldFrom(1, [&](const char* name) {
            families.emplace_back(name);
        });
        this->*modeTable(mode.value)->devices = NameSet(std::move(families));
    }
}

void ConstraintsManager::loadDeviceIdcodes() {
    auto latest = m_deviceIdcodes.end();
    forEachRecord(*m_devKey, "IDCODE", [&](const Record& record, StringBase device) {
        latest = setBehind(m_deviceIdcodes, latest, std::move(device), record.field(1));
    });
}

void ConstraintsManager::loadNotSupportedParts() {
    m_notSupportedPartInMode = NameSet(readList(*m_devKey, "NOT_SUPPORTED_PART_IN_MODE"));
}

// Each operation and option has a row in the tables, and a bit in the masks that questions are answered with.
static_assert(extent::OPERATIONS == vocabulary::OPERATIONS.size());
static_assert(extent::OPTIONS == vocabulary::OPTIONS.size());
static_assert(extent::OPERATIONS <= std::numeric_limits<unsigned>::digits);
static_assert(extent::OPTIONS <= std::numeric_limits<unsigned>::digits);
static_assert(static_cast<int>(TARVIKNS::NO_OPERATION) == extent::OPERATIONS);

void ConstraintsManager::allocateTables() {
    const std::size_t families = m_supportedDevices.size();
    const std::size_t packages = m_programOptionPackages.size();
    *m_operationTable = PermissionTable(families, extent::OPERATIONS, extent::MODES, extent::OUTPUTS);
    *m_programOptionTable = PermissionTable(packages, extent::OPTIONS, extent::MODES, extent::OUTPUTS);
    *m_bsdlOperationTable = PermissionTable(families, extent::OPERATIONS, 1, extent::OUTPUTS);
}

/// The position of a name among the option packages; behind the last for a name that is none.
int ConstraintsManager::programOptionTableIndex(const char* name) {
    const auto cached = m_programOptionPackageIndex.find(view(name));
    if (cached != m_programOptionPackageIndex.end() && cached->second >= 0) {
        return cached->second;
    }
    const std::size_t position = m_programOptionPackages.position(view(name));
    if (position == m_programOptionPackages.size()) {
        reporting::raiseIf<OutOfRangeException>(m_exceptions,
                                                reporting::location::PROGRAM_OPTION_PACKAGE_UNKNOWN);
        return static_cast<int>(position);
    }
    return m_programOptionPackageIndex[name] = static_cast<int>(position);
}
