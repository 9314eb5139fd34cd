#include "Lists.h"
#include "PermissionTable.h"
#include "PropertyTable.h"
#include "Reporting.h"
#include "Vocabulary.h"

#include <tarvik/ConstraintsManager.h>

#include <AcdReader.h>

#include <new>

// How the one manager comes and goes, and the order in which its start-up fills it.

ConstraintsManager* ConstraintsManager::s_instance = nullptr;

ConstraintsManager* ConstraintsManager::getConstraintsManager() {
    if (s_instance == nullptr) {
        // Raw, as it lives until the host removes it; without memory for it the answer is null.
        s_instance = new (std::nothrow) ConstraintsManager;
    }
    return s_instance;
}

void ConstraintsManager::RemoveConstraintsManager() {
    // The pointer deliberately stays: a removed manager is not replaced by a fresh one.
    delete s_instance;
}

ConstraintsManager::ConstraintsManager()
    : m_deviceProperties(std::make_unique<PropertyTable>()),
      m_operationTable(std::make_unique<PermissionTable>()),
      m_programOptionTable(std::make_unique<PermissionTable>()),
      m_bsdlOperationTable(std::make_unique<PermissionTable>()) {
    initialise();
    // Not before: faults of the start-up are tolerated where a fault of a question would raise.
    m_exceptions = true;
}

ConstraintsManager::~ConstraintsManager() = default;

/// Fills the tables. The first fault ends it, and leaves what it has filled by then.
void ConstraintsManager::initialise() {
    try {
        const AcdReader base;
        m_devKey = base.getDevkey();
        loadSupportedLists();
        loadModeOutputSets();
        loadModeDeviceSets();
        loadDeviceIdcodes();
        loadNotSupportedParts();
        allocateTables();
        for (const vocabulary::Operation& operation : vocabulary::OPERATIONS) {
            m_operationOrders.push_back(operation.value);
        }
        for (const vocabulary::Option& option : vocabulary::OPTIONS) {
            m_programOptionOrders.push_back(option.value);
        }
        loadSpiCatalogue();
    } catch (const TarvikException& exception) {
        exception.report();
    }
}

void ConstraintsManager::setExceptions(bool exceptions) noexcept { m_exceptions = exceptions; }

const std::vector<TARVIKNS::OP_TYPE>& ConstraintsManager::getOperationOrders() const noexcept {
    return m_operationOrders;
}

const std::vector<TARVIKNS::PROGRAM_OPTION>& ConstraintsManager::getProgramOptionOrders() const noexcept {
    return m_programOptionOrders;
}
