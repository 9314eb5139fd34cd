#include "Diagnostics.h"
#include "Implementation.h"
#include "ModeTables.h"
#include "RecordReader.h"
#include "StringViews.h"
#include "WordTables.h"

#include <array>
#include <limits>
#include <utility>

// The base database: the mode tables, the lists of names, and the size of the permission tables, which follows from
// those lists.

/// The tables of a mode; null for a value that is no mode.
const ConstraintsManager::Implementation::ModeTable*
ConstraintsManager::Implementation::modeTable(MODE_TYPE mode) {
    using M = Implementation;
    static constexpr std::array<ModeTable, wordTables::MODES.size()> TABLES{{
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
    return wordTables::rowOf(TABLES, mode);
}

void ConstraintsManager::Implementation::loadSupportedLists() {
    m_supportedDevices = NameSet(readList(*m_devKey, "DEVICE_SUPPORTED"));
    m_programOptionPackages = NameSet(readList(*m_devKey, "PROGRAM_OPTION_PACKAGE"));
}

// A mode's entry has two records: outputs, then families. The first field of each is a label that is not used.

void ConstraintsManager::Implementation::loadModeOutputSets() {
    for (const wordTables::Mode& mode : wordTables::MODES) {
        auto& outputs = this->*modeTable(mode.value)->outputs; // each mode of the vocabulary has a table
        Record(*m_devKey, mode.key, 0).forEachFieldFrom(1, [&](const char* name) {
            outputs.insert(cableString2Type(name));
        });
    }
}

void ConstraintsManager::Implementation::loadModeDeviceSets() {
    for (const wordTables::Mode& mode : wordTables::MODES) {
        std::vector<StringBase> families;
        Record(*m_devKey, mode.key, 1).forEachFieldFrom(1, [&](const char* name) {
            families.emplace_back(name);
        });
        this->*modeTable(mode.value)->devices = NameSet(std::move(families));
    }
}

void ConstraintsManager::Implementation::loadDeviceIdcodes() {
    forEachRecord(*m_devKey, "IDCODE", [&](const Record& record, const StringBase& device) {
        m_deviceIdcodes.set(view(device), {}, view(record.field(1)));
    });
}

void ConstraintsManager::Implementation::loadNotSupportedParts() {
    m_notSupportedPartInMode = NameSet(readList(*m_devKey, "NOT_SUPPORTED_PART_IN_MODE"));
}

// Each operation and option has a row in the tables, and a bit in the masks that questions are answered with.
static_assert(tableDimensions::OPERATIONS == wordTables::OPERATIONS.size());
static_assert(tableDimensions::OPTIONS == wordTables::OPTIONS.size());
static_assert(tableDimensions::OPERATIONS <= std::numeric_limits<unsigned>::digits);
static_assert(tableDimensions::OPTIONS <= std::numeric_limits<unsigned>::digits);
static_assert(static_cast<int>(TARVIKNS::NO_OPERATION) == tableDimensions::OPERATIONS);

void ConstraintsManager::Implementation::allocateTables() {
    const std::size_t families = m_supportedDevices.size();
    const std::size_t packages = m_programOptionPackages.size();
    m_operationTable = PermissionTable(families, tableDimensions::OPERATIONS, tableDimensions::MODES,
                                       tableDimensions::OUTPUTS);
    m_programOptionTable =
        PermissionTable(packages, tableDimensions::OPTIONS, tableDimensions::MODES, tableDimensions::OUTPUTS);
    m_bsdlOperationTable =
        PermissionTable(families, tableDimensions::OPERATIONS, 1, tableDimensions::OUTPUTS);
}

/// The position of a name among the option packages; one past the last for a name that is not listed.
int ConstraintsManager::Implementation::programOptionTableIndex(std::string_view name) {
    const auto cached = m_programOptionPackageIndex.find(name);
    if (cached != m_programOptionPackageIndex.end() && cached->second >= 0) {
        return cached->second;
    }
    const std::size_t position = m_programOptionPackages.position(name);
    if (position == m_programOptionPackages.size()) {
        diagnostics::raiseIf<OutOfRangeException>(m_exceptions,
                                                  diagnostics::location::PROGRAM_OPTION_PACKAGE_UNKNOWN);
        return static_cast<int>(position);
    }
    return m_programOptionPackageIndex[toStringBase(name)] = static_cast<int>(position);
}
