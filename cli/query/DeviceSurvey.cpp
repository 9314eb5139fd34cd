// Asks about all devices with as few questions, and as few managers, as exact answers allow.
#include "query/DeviceSurvey.h"

#include "model/Catalogue.h"
#include "query/ManagerQueries.h"
#include "query/OrderDependentNames.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

namespace {

constexpr const char* BASE = "base";
constexpr const char* SPI = "spi";

std::unordered_set<std::string> setOf(const char* key) {
    const std::vector<std::string> names = catalogue::list("base.acd", key);
    return {names.begin(), names.end()};
}

} // namespace

std::string unansweredText(const std::vector<std::string>& devices) {
    return fmt::format("no answer for {} device{}, the first {}: see tarvik show {}", devices.size(),
                       devices.size() == 1 ? "" : "s", devices.front(), devices.front());
}

DeviceSurvey::DeviceSurvey(Topics topics)
    : m_topics(std::move(topics)), m_manager(freshManager()), m_supported(setOf("DEVICE_SUPPORTED")),
      m_optionOwners(setOf("PROGRAM_OPTION_PACKAGE")) {
    if (m_topics.operations) {
        m_spiOperations = tables::askFresh(tables::spiOperations);
    }
    if (m_topics.options || m_topics.packages) {
        m_spiOptions = tables::askFresh(tables::spiOptions);
    }
    if (m_topics.facts) {
        m_facts.emplace(*m_manager);
    }
}

void DeviceSurvey::run(const DeviceVisitor& visit, const ProgressCallback& progress) {
    std::vector<ListedName> names = deviceList();
    const std::size_t devices = names.size();
    if (m_topics.families) {
        const std::vector<ListedName> families = familyList(names);
        names.insert(names.end(), families.begin(), families.end());
    }
    std::vector<std::string> texts;
    std::ranges::transform(names, std::back_inserter(texts), &ListedName::name);
    findPackages(texts);
    // Tables before properties: a question about a device's properties can load its options as its family's.
    for (const ListedName& name : names) {
        if (!name.isOrderDependent) {
            DeviceDetails details;
            details.name = name.name;
            addTables(name, details);
        }
    }
    for (std::size_t position = 0; position < names.size(); ++position) {
        if (progress) {
            progress(position, names.size());
        }
        const ListedName& name = names[position];
        DeviceDetails details;
        details.name = name.name;
        details.isFamily = position >= devices;
        details.spelling = name.name;
        details.family = name.family;
        if (name.isOrderDependent) {
            const MutedMessages muted;
            askAlone(*freshManager(), details, true);
        } else {
            addTables(name, details);
            addFacts(name, details);
        }
        visit(details);
    }
}

DeviceDetails DeviceSurvey::ask(const std::string& device) {
    findPackages({device});
    DeviceDetails details;
    details.name = device;
    askAlone(*m_manager, details, OrderDependentNames().contains(device));
    return details;
}

/// Finds the packages that have options of their own, or are excluded from a mode.
void DeviceSurvey::findPackages(const std::vector<std::string>& names) {
    if (!m_topics.packages) {
        return;
    }
    const Set known(names.begin(), names.end());
    const auto add = [&](const std::string& device, const std::string& package) {
        if (known.count(device) == 0) {
            return;
        }
        std::vector<std::string>& packages = m_packages[device];
        if (std::ranges::find(packages, package) == packages.end()) {
            packages.push_back(package);
        }
    };
    for (const std::string& owner : m_optionOwners) {
        for (std::size_t length = 1; length < owner.size(); ++length) {
            if (known.count(owner.substr(0, length)) != 0) {
                add(owner.substr(0, length), owner.substr(length));
                ++m_readers[owner];
            }
        }
        m_readers[owner] += static_cast<int>(known.count(owner));
    }
    for (const std::string& part : catalogue::list("base.acd", "NOT_SUPPORTED_PART_IN_MODE")) {
        const std::size_t device = part.find('_') + 1;
        const std::size_t package = part.find('_', device) + 1;
        if (device != 0 && package != 0) {
            add(part.substr(device, package - 1 - device), part.substr(package));
        }
    }
}

DeviceSurvey::TableQuery DeviceSurvey::operationsQuery(const std::string& name) const {
    return {{[name](ConstraintsManager& manager) { return tables::operations(manager, name); },
             [name](ConstraintsManager& manager) { return tables::bsdlOperations(manager, name); }},
            &m_spiOperations};
}

DeviceSurvey::TableQuery DeviceSurvey::optionsQuery(const std::string& name,
                                                    const std::string& package) const {
    return {{[name, package](ConstraintsManager& manager) {
                return tables::options(manager, name, package.empty() ? nullptr : package.c_str());
            }},
            &m_spiOptions};
}

/// Asks for each part of a table on a manager of its own.
SharedTable DeviceSurvey::askFresh(const TableQuery& query) {
    std::vector<DeviceTable> parts;
    std::ranges::transform(query.parts, std::back_inserter(parts), tables::askFresh);
    parts.push_back(*query.spiRows);
    return tables::joined(parts);
}

/// Asks each kind of question about a device of a manager of its own.
/// @param manager one that was asked nothing before, for the facts
void DeviceSurvey::askAlone(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent) {
    if (m_topics.operations) {
        details.operations = askFresh(operationsQuery(details.name));
    }
    if (m_topics.options) {
        details.options = askFresh(optionsQuery(details.name, {}));
    }
    if (m_topics.facts) {
        const MutedMessages muted;
        addModes(*freshManager(), details);
    }
    if (m_topics.packages) {
        const MutedMessages muted;
        addPackages(*freshManager(), details);
        for (auto& [package, changes] : details.packages) {
            changes.options = askFresh(optionsQuery(details.name, package));
        }
    }
    askFacts(manager, details, isOrderDependent);
}

/// Adds the tables of a device that shares them with others.
void DeviceSurvey::addTables(const ListedName& name, DeviceDetails& details) {
    const auto share = [&](const std::string& kind, bool isIndependent, const TableQuery& query) {
        SharedTable& table = m_tables[kind];
        if (!table && isIndependent) {
            std::vector<DeviceTable> parts;
            for (const Ask& ask : query.parts) {
                parts.push_back(ask(*m_manager));
            }
            parts.push_back(*query.spiRows);
            table = tables::joined(parts);
        } else if (!table) {
            table = askFresh(query);
        }
        return table;
    };
    // A family without a table may leave its records in those of another one.
    if (m_topics.operations) {
        const std::string& owner = m_supported.count(name.name) != 0 ? name.name : name.family;
        details.operations = share("operations " + owner, m_supported.count(owner) != 0 && !mayRaise(owner),
                                   operationsQuery(name.name));
    }
    const bool isIndependent = m_supported.count(name.family) != 0 && !mayRaise(name.family);
    if (m_topics.options) {
        const std::string& owner = m_optionOwners.count(name.name) != 0 ? name.name : name.family;
        details.options =
            share("options " + owner, isIndependent && !mayRaise(owner), optionsQuery(name.name, {}));
    }
    if (m_topics.packages) {
        addPackages(*m_manager, details);
        for (auto& [package, changes] : details.packages) {
            const std::string owner = name.name + package;
            if (m_optionOwners.count(owner) != 0) {
                // Two devices can read the options of one owner; the first one's are loaded.
                changes.options = share("options " + name.name + '\n' + package,
                                        isIndependent && m_readers[owner] == 1 && !mayRaise(name.name),
                                        optionsQuery(name.name, package));
            }
        }
    }
}

void DeviceSurvey::addModes(ConstraintsManager& manager, DeviceDetails& details) {
    details.modes = questions::modes(manager, details.name, nullptr);
    details.modesWithoutOutput = questions::modesWithoutOutput(manager, details.name, nullptr);
}

/// Adds the packages of a device with their modes.
void DeviceSurvey::addPackages(ConstraintsManager& manager, DeviceDetails& details) {
    if (const auto packages = m_packages.find(details.name); packages != m_packages.end()) {
        for (const std::string& package : packages->second) {
            DeviceDetails::Package& changes = details.packages[package];
            changes.modes = questions::modes(manager, details.name, package.c_str());
            changes.modesWithoutOutput =
                questions::modesWithoutOutput(manager, details.name, package.c_str());
        }
    }
}

/// Adds what is asked about each device by itself.
void DeviceSurvey::addFacts(const ListedName& name, DeviceDetails& details) {
    if (m_topics.facts) {
        DeviceDetails& family = m_modes[name.family];
        if (family.name.empty()) {
            family.name = details.name;
            addModes(*m_manager, family);
        }
        details.modes = family.modes;
        details.modesWithoutOutput = family.modesWithoutOutput;
    }
    if (!m_topics.facts && !m_topics.question) {
        return;
    }
    if (!raises(name)) {
        askFacts(*m_manager, details);
        return;
    }
    const MutedMessages muted;
    if (hasOwnOptions(name.name)) {
        askFacts(*freshManager(), details);
        return;
    }
    // The others read the same options, and meet the same fault.
    const auto [known, isNew] = m_faults.try_emplace(name.file);
    if (isNew) {
        DeviceDetails first = details;
        askFacts(*freshManager(), first);
        known->second = first.fault;
    }
    details.fault = known->second;
    askFacts(*m_manager, details);
}

/// Asks for all but the tables. With a fault, the properties are left out.
void DeviceSurvey::askFacts(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent) {
    if (m_topics.facts) {
        m_facts->addFacts(manager, details, isOrderDependent);
    }
    try {
        if (m_topics.question && details.fault.empty()) {
            details.answer = m_topics.question(manager, details.name);
        }
    } catch (const TarvikException& fault) {
        details.fault = faultText(fault);
    }
    details.family = toStdString(manager.getPartFamily(details.name.c_str()));
}

/// Might the manager raise when it loads a device?
bool DeviceSurvey::raises(const ListedName& name) {
    // A flash without a section reads what base.acd and spi.acd have.
    const bool isBelow = name.file == SPI ? mayRaise(BASE) || mayRaise(SPI) : mayRaise(name.file);
    return isBelow || (hasOwnOptions(name.name) && hasUnknownOption(name.name));
}

bool DeviceSurvey::mayRaise(const std::string& owner) {
    const auto [known, isNew] = m_mayRaise.try_emplace(owner);
    if (isNew) {
        known->second = hasUnknownOption(owner);
    }
    return known->second;
}
