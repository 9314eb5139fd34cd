#pragma once

#include "query/DeviceDetails.h"
#include "query/DeviceList.h"
#include "query/FreshManager.h"

#include <functional>
#include <optional>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

/// Called as work goes on: so many parts of all are done.
using ProgressCallback = std::function<void(std::size_t done, std::size_t total)>;

/// Called with the details of each device, which live until it returns.
using DeviceVisitor = std::function<void(const DeviceDetails&)>;

/// "no answer for 10 devices, the first KS50: see tarvik show KS50".
/// @param devices those at which the manager raises, at least one
[[nodiscard]] std::string unansweredText(const std::vector<std::string>& devices);

/// Asks about all devices of the database, flashes included.
///
/// Each answer is that of a manager that was asked nothing before. Devices that read the same tables are asked for
/// them once. One manager answers for all devices whose answers do not depend on what it was asked before; each kind
/// of question about another device is asked of a manager of its own.
class DeviceSurvey {
public:
    /// What is asked of a manager besides the details.
    using Question = std::function<bool(ConstraintsManager&, const std::string& device)>;

    /// What is asked about each device. The family is always among it.
    struct Topics {
        bool operations = false;
        bool options = false;  ///< without a package
        bool packages = false; ///< the modes and options of packages that change them
        bool facts = false;    ///< everything else
        Question question{};   ///< about the device's properties; may be empty
        bool families = false; ///< families, too, with "base" and "spi"
    };

    explicit DeviceSurvey(Topics topics);

    /// Visits all devices in the order of their families. Call it once.
    void run(const DeviceVisitor& visit, const ProgressCallback& progress = {});

    /// Asks about one device. Call it once, in place of `run`.
    /// @param device any name
    [[nodiscard]] DeviceDetails ask(const std::string& device);

    /// The rows that all tables of operations, or of options, have for SPI mode.
    [[nodiscard]] const DeviceTable& spiOperations() const { return m_spiOperations; }
    [[nodiscard]] const DeviceTable& spiOptions() const { return m_spiOptions; }

private:
    using Set = std::unordered_set<std::string>;
    using Ask = std::function<DeviceTable(ConstraintsManager&)>;

    /// How to ask for the parts of a table.
    struct TableQuery {
        std::vector<Ask> parts;
        const DeviceTable* spiRows;
    };

    void findPackages(const std::vector<std::string>& names);
    [[nodiscard]] TableQuery operationsQuery(const std::string& name) const;
    [[nodiscard]] TableQuery optionsQuery(const std::string& name, const std::string& package) const;
    [[nodiscard]] static SharedTable askFresh(const TableQuery& query);

    void askAlone(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent);
    void addTables(const ListedName& name, DeviceDetails& details);
    void addFacts(const ListedName& name, DeviceDetails& details);
    static void addModes(ConstraintsManager& manager, DeviceDetails& details);
    void addPackages(ConstraintsManager& manager, DeviceDetails& details);
    void askFacts(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent = false);
    [[nodiscard]] bool raises(const ListedName& name);
    [[nodiscard]] bool mayRaise(const std::string& owner);

    Topics m_topics;
    ManagerFactory::Manager m_manager; ///< for all questions whose answers do not depend on others
    std::optional<DeviceFactsReader> m_facts;
    DeviceTable m_spiOperations;
    DeviceTable m_spiOptions;
    Set m_supported;    ///< the owners of operations
    Set m_optionOwners; ///< of options: families, devices, and devices with a package
    std::unordered_map<std::string, std::vector<std::string>> m_packages; ///< by device
    std::unordered_map<std::string, int> m_readers; ///< how many questions read the options of an owner
    std::unordered_map<std::string, SharedTable> m_tables;  ///< by kind and owner
    std::unordered_map<std::string, bool> m_mayRaise;       ///< by owner
    std::unordered_map<std::string, std::string> m_faults;  ///< of devices that read their family's options
    std::unordered_map<std::string, DeviceDetails> m_modes; ///< by family; with modes alone
};
