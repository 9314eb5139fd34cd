// Asks for the cells of the permission tables, mask by mask.
#include "query/DeviceTables.h"

#include "model/Vocabulary.h"
#include "query/FreshManager.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

using Row = DeviceTable::Row;

constexpr auto SPI_MODE = static_cast<std::size_t>(MODE_TYPE::SPI);

/// A row for each key, without any cell.
DeviceTable emptyTable(const std::vector<std::string>& keys) {
    DeviceTable table;
    for (const std::string& key : keys) {
        table.rows.push_back({key, {}, 0});
    }
    return table;
}

/// Adds an output to the cells of the rows that a mask names.
/// @param cellOf gives the cell of a row
template <typename CellOf>
void add(DeviceTable& table, int mask, std::size_t output, CellOf cellOf) {
    for (std::size_t value = 0; value < table.rows.size(); ++value) {
        if ((static_cast<unsigned>(mask) >> value & 1U) != 0) {
            cellOf(table.rows[value]) |= 1U << output;
        }
    }
}

/// Makes a table of the masks that `ask(mode, output)` gives for the modes from `first` to before `last`.
template <typename Ask>
DeviceTable tableOf(const std::vector<std::string>& keys, std::size_t first, std::size_t last, Ask ask) {
    DeviceTable table = emptyTable(keys);
    for (std::size_t mode = first; mode < last; ++mode) {
        for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
            add(table, ask(static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output)), output,
                [mode](Row& row) -> DeviceTable::Outputs& { return row.outputs.at(mode); });
        }
    }
    return table;
}

} // namespace

bool DeviceTable::Row::isOfSpiModeOnly() const {
    return bsdl == 0 &&
           std::all_of(outputs.begin(), outputs.begin() + SPI_MODE, [](Outputs of) { return of == 0; });
}

namespace tables {

DeviceTable operations(ConstraintsManager& manager, const std::string& device) {
    return tableOf(vocabulary::operations(), 0, SPI_MODE, [&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getDeviceOperations(device.c_str(), mode, output);
    });
}

DeviceTable bsdlOperations(ConstraintsManager& manager, const std::string& device) {
    DeviceTable table = emptyTable(vocabulary::operations());
    for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
        add(table, manager.getBsdlOperations(device.c_str(), static_cast<OUTPUT_TYPE>(output)), output,
            [](Row& row) -> DeviceTable::Outputs& { return row.bsdl; });
    }
    return table;
}

DeviceTable options(ConstraintsManager& manager, const std::string& device, const char* package) {
    return tableOf(vocabulary::options(), 0, SPI_MODE, [&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getProgramOptions(device.c_str(), mode, output, package);
    });
}

DeviceTable spiOperations(ConstraintsManager& manager) {
    return tableOf(vocabulary::operations(), SPI_MODE, SPI_MODE + 1, [&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getDeviceOperations("spi", mode, output);
    });
}

DeviceTable spiOptions(ConstraintsManager& manager) {
    return tableOf(vocabulary::options(), SPI_MODE, SPI_MODE + 1, [&](MODE_TYPE mode, OUTPUT_TYPE output) {
        return manager.getProgramOptions("spi", mode, output, nullptr);
    });
}

DeviceTable askFresh(const std::function<DeviceTable(ConstraintsManager&)>& ask) {
    const MutedMessages muted;
    try {
        return ask(*freshManager());
    } catch (const TarvikException& fault) {
        return {{}, faultText(fault)};
    }
}

SharedTable joined(const std::vector<DeviceTable>& parts) {
    DeviceTable all;
    for (const DeviceTable& part : parts) {
        if (all.fault.empty()) {
            all.fault = part.fault;
        }
        if (all.rows.empty()) {
            all.rows = part.rows;
            continue;
        }
        for (std::size_t row = 0; row < part.rows.size(); ++row) {
            for (std::size_t mode = 0; mode < DeviceTable::MODES; ++mode) {
                all.rows[row].outputs.at(mode) |= part.rows[row].outputs.at(mode);
            }
            all.rows[row].bsdl |= part.rows[row].bsdl;
        }
    }
    std::erase_if(all.rows, [](const Row& row) {
        return row.bsdl == 0 && std::ranges::all_of(row.outputs, [](auto outputs) { return outputs == 0; });
    });
    return std::make_shared<DeviceTable>(std::move(all));
}

} // namespace tables

std::string outputLetters() {
    std::string letters;
    for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
        const std::string& key = vocabulary::outputs().at(output);
        letters += key.at(key.find_first_not_of(letters));
    }
    return letters;
}

std::string faultText(const std::exception& fault) {
    return fmt::format("the database cannot be read: {}", fault.what());
}

std::string withoutPlace(const std::string& faultText) {
    return faultText.substr(0, faultText.find("; last read: "));
}
