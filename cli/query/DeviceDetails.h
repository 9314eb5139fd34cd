#pragma once

#include "model/Catalogue.h"
#include "model/Idcodes.h"
#include "query/Properties.h"

#include <array>
#include <map>
#include <optional>
#include <string>
#include <unordered_set>
#include <vector>

class ConstraintsManager;
class Tool;

/// Everything about one device.
struct DeviceSheet {
    /// The permission tables have rows for the modes up to `SPI`, and cells for the outputs up to `STAPL`.
    static constexpr std::size_t MODES = 6;
    static constexpr std::size_t OUTPUTS = 5;

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

    /// A set of outputs: bit i stands for output i.
    using Outputs = unsigned;

    /// One operation or option. Those that are allowed nowhere have no row.
    struct Row {
        std::string key;
        std::array<Outputs, MODES> outputs; ///< by mode
        Outputs bsdl;                       ///< as a boundary-scan operation; none for options
    };

    std::string name;
    std::string spelling; ///< the name as the database writes it, where it has a section; else the name
    std::string family;
    std::optional<Idcode> idcode;
    std::vector<std::string> modes; ///< in which it may be configured
    Properties properties;
    bool flash;
    Properties flashProperties;
    std::vector<Arrangement> multiboot;
    std::vector<Row> operations;
    std::vector<Row> options;
};

/// A letter for each output of the tables: the first of its key that no earlier output has.
[[nodiscard]] std::string outputLetters();

/// Asks the manager everything about a device: each kind of question of a manager that was asked nothing before.
/// The tool's manager must not have been asked anything yet either.
/// @throw CommandError (NO) for a device that the manager does not know
[[nodiscard]] DeviceSheet deviceSheet(Tool& tool, const std::string& device);

/// How a kind of question is asked: what the manager loads for one can change its answer to another.
enum class Asking {
    HERE, ///< of the manager as it stands
    APART ///< of a copy of it, which leaves no trace
};

/// Asks for the modes, operations and options of a device, each kind of question `asking`.
void addTables(DeviceSheet& sheet, Tool& tool, Asking asking);

/// Asks the manager, as it stands, for all but the tables. What many devices have in common is looked up once.
class FactReader {
public:
    explicit FactReader(ConstraintsManager& manager);

    /// Fills in the facts about the device that the sheet names.
    void addFacts(DeviceSheet& sheet);

private:
    [[nodiscard]] std::optional<DeviceSheet::Idcode> idcode(const std::string& device) const;
    [[nodiscard]] std::vector<DeviceSheet::Arrangement> arrangements(const std::string& device) const;

    ConstraintsManager& m_manager;
    IdcodeFinder m_idcodes;
    std::map<std::string, catalogue::Entry> m_idcodeEntries;
    PropertyReader m_properties;
    std::unordered_set<std::string> m_multiboot; ///< the names that its lists hold, in lower case
};
