#pragma once

#include "model/Catalogue.h"
#include "model/Idcodes.h"
#include "query/DeviceTables.h"
#include "query/Properties.h"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <unordered_set>
#include <vector>

class ConstraintsManager;

/// Everything about one device.
struct DeviceDetails {
    struct Idcode {
        std::string value;
        catalogue::Origin origin;
        catalogue::Shadows shadows;
    };

    struct Arrangement {
        std::string type;
        std::string width;
        std::string position; ///< "lead" or "chain"
    };

    /// An entry of the list of parts that a mode does not take.
    struct Exclusion {
        std::string mode;
        catalogue::Origin origin;
    };

    /// What a package changes.
    struct Package {
        std::vector<std::string> modes; ///< in which the device may be configured in this package
        std::vector<std::string> modesWithoutOutput;
        SharedTable options;                 ///< null: those of the device without a package
        std::vector<Exclusion> exclusions{}; ///< filled in for a single device only
    };

    std::string name;
    bool isFamily = false; ///< a family asked about by its own name
    std::string spelling;  ///< the name as the database writes it, if it has a section; otherwise the name
    std::string family;
    std::optional<Idcode> idcode;
    std::vector<std::string> modes;              ///< in which it may be configured through some output
    std::vector<std::string> modesWithoutOutput; ///< others that are allowed as long as no output is given
    Properties properties;
    bool flash = false;
    std::string flashClass; ///< whose properties the flash has where it has none itself; may be empty
    Properties flashProperties;
    std::vector<Arrangement> multiboot;
    SharedTable operations;
    SharedTable options; ///< without a package
    std::map<std::string, Package>
        packages;        ///< those that change an answer; for a single device all that are known
    bool answer = false; ///< to the question that a survey asks besides
    std::string fault;   ///< why the properties, or that answer, are missing; empty if they are not

    /// Does the manager know the device?
    [[nodiscard]] bool isKnown() const { return family != "base"; }

    /// The properties under the device's name. None for a flash: what spi.acd has for all flashes together is not found
    /// by the name of one.
    [[nodiscard]] const Properties& shownProperties() const;

    /// Why some answer is missing: the manager raises, or does not know the device. Empty if none is.
    [[nodiscard]] std::string whyIncomplete() const;
};

/// Asks for everything about a device: each kind of question is asked of a manager that was asked nothing before.
/// @throw CommandError (NO) for a device that the manager does not know; (FAULT) if the manager raises
[[nodiscard]] DeviceDetails deviceDetails(const std::string& device);

/// Asks for all but the tables. What many devices have in common is looked up once.
class DeviceFactsReader {
public:
    /// @param manager any one, which must live longer
    explicit DeviceFactsReader(const ConstraintsManager& manager);

    /// Fills in the facts about the device that the details name. If they have a fault, the properties are left out.
    /// @param manager is asked
    /// @param isOrderDependent asks for each property of a manager of its own
    void addFacts(ConstraintsManager& manager, DeviceDetails& details, bool isOrderDependent);

private:
    [[nodiscard]] std::optional<DeviceDetails::Idcode> idcode(const std::string& device) const;

    IdcodeFinder m_idcodes;
    std::map<std::string, catalogue::Entry> m_idcodeEntries;
    PropertyReader m_properties;
    std::unordered_set<std::string> m_multiboot; ///< the names that its lists hold, in lower case
};
