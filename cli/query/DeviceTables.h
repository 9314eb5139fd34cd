#pragma once

#include <array>
#include <exception>
#include <functional>
#include <memory>
#include <string>
#include <vector>

class ConstraintsManager;

/// The operations of a device, or its options, that are allowed somewhere.
struct DeviceTable {
    /// The tables have rows for the modes up to `SPI`, and cells for the outputs up to `STAPL`.
    static constexpr std::size_t MODES = 6;
    static constexpr std::size_t OUTPUTS = 5;

    /// A set of outputs: bit i is output i.
    using Outputs = unsigned;

    /// One operation or option.
    struct Row {
        std::string key;
        std::array<Outputs, MODES> outputs; ///< by mode
        Outputs bsdl;                       ///< as a boundary-scan operation; none for options

        bool operator==(const Row&) const = default;

        /// Is it allowed in SPI mode only? In that mode the manager answers for "spi", whatever the device.
        [[nodiscard]] bool isOfSpiModeOnly() const;
    };

    std::vector<Row> rows;
    std::string fault; ///< why some of the answers are missing; empty if none is
};

/// Devices that answer alike share one table.
using SharedTable = std::shared_ptr<const DeviceTable>;

/// The questions from which tables are made.
///
/// In SPI mode the manager answers for "spi", whatever the device, so that mode's rows are asked for separately.
/// @throw TarvikException if the manager raises
namespace tables {

[[nodiscard]] DeviceTable operations(ConstraintsManager& manager, const std::string& device);
[[nodiscard]] DeviceTable bsdlOperations(ConstraintsManager& manager, const std::string& device);
[[nodiscard]] DeviceTable options(ConstraintsManager& manager, const std::string& device,
                                  const char* package);
[[nodiscard]] DeviceTable spiOperations(ConstraintsManager& manager);
[[nodiscard]] DeviceTable spiOptions(ConstraintsManager& manager);

/// Asks one of these questions of a manager that was asked nothing before. An exception becomes the table's fault.
[[nodiscard]] DeviceTable askFresh(const std::function<DeviceTable(ConstraintsManager&)>& ask);

/// One table with all rows of several.
[[nodiscard]] SharedTable joined(const std::vector<DeviceTable>& parts);

} // namespace tables

/// A letter for each output of the tables: the first of its key that no earlier output has.
[[nodiscard]] std::string outputLetters();

/// How an exception of the manager reads.
[[nodiscard]] std::string faultText(const std::exception& fault);

/// The part of a `faultText` that is the same in all copies of a database: without what was read last, and where.
[[nodiscard]] std::string withoutPlace(const std::string& faultText);
