#pragma once

#include "Catalogue.h"
#include "Properties.h"

#include <array>
#include <optional>
#include <string>
#include <vector>

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

/// Asks the manager everything about a device: each kind of question of a manager that was asked nothing before.
/// The tool's manager must not have been asked anything yet either.
/// @throw Failure (NO) for a device that the manager does not know
[[nodiscard]] DeviceSheet deviceSheet(Tool& tool, const std::string& device);
