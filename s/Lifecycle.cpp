#include "Implementation.h"
#include "WordTables.h"

#include <AcdReader.h>
#include <TarvikException.h>

#include <new>
#include <optional>

// How the manager of the process comes and goes, and the order in which the start-up fills a manager.

namespace {

/// True as long as the manager of the process starts up.
bool g_isStarting = false;

/// Sets a flag as long as it lives.
class FlagSetter {
public:
    explicit FlagSetter(bool& flag) noexcept : m_flag(flag) { m_flag = true; }
    ~FlagSetter() { m_flag = false; }
    FlagSetter(const FlagSetter&) = delete;
    FlagSetter& operator=(const FlagSetter&) = delete;

private:
    bool& m_flag;
};

} // namespace

ConstraintsManager* ConstraintsManager::s_instance = nullptr;

ConstraintsManager* ConstraintsManager::getConstraintsManager() {
    // A message sink may ask for the manager that is just starting: it is not ready, and there is no second one.
    if (s_instance == nullptr && !g_isStarting) {
        const FlagSetter starting(g_isStarting);
        s_instance = new (std::nothrow) ConstraintsManager;
    }
    return s_instance;
}

void ConstraintsManager::RemoveConstraintsManager() {
    // The pointer deliberately stays: a removed manager is not replaced by a new one.
    delete s_instance;
}

ConstraintsManager::ConstraintsManager() : m_implementation(new Implementation) {}

ConstraintsManager::~ConstraintsManager() { delete m_implementation; }

ConstraintsManager::Implementation::Implementation() {
    initialise();
    // Not earlier: the start-up tolerates faults that raise in a question.
    m_exceptions = true;
}

/// Fills the tables. The first fault ends it, and what is filled by then stays.
void ConstraintsManager::Implementation::initialise() {
    // Outlives the handler: a fault reports itself before the reader is closed.
    std::optional<AcdReader> base;
    try {
        base.emplace();
        m_devKey = base->getDevkey();
        loadSupportedLists();
        loadModeOutputSets();
        loadModeDeviceSets();
        loadDeviceIdcodes();
        loadNotSupportedParts();
        allocateTables();
        for (const wordTables::Operation& operation : wordTables::OPERATIONS) {
            m_operationOrders.push_back(operation.value);
        }
        for (const wordTables::Option& option : wordTables::OPTIONS) {
            m_programOptionOrders.push_back(option.value);
        }
        loadSpiCatalogue();
    } catch (const TarvikException& exception) {
        exception.report();
    }
}
