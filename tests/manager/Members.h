#pragma once

// The manager's members in forms that compare and print.

#include "ManagerFixture.h"

#include <AcdReader.h>
#include <Implementation.h>
#include <PM_DEVKEY.h>

#include <cstddef>
#include <ostream>
#include <set>

/// The accessor that a reader opened by `name` hands out; it outlives the reader.
[[nodiscard]] inline PM_DEVKEY* accessorOf(const char* name) { return AcdReader(name).getDevkey(); }

/// Property table or multiboot types: key to the names it holds.
template <typename Lists>
[[nodiscard]] std::map<std::string, std::vector<std::string>> lists(const Lists& map) {
    std::map<std::string, std::vector<std::string>> result;
    for (const auto& [key, names] : map) {
        result.emplace(text(key), texts(names));
    }
    return result;
}

/// One allowed cell of a permission table.
struct Cell {
    std::size_t block;
    int row;
    int mode;
    int output;

    friend bool operator==(const Cell&, const Cell&) = default;
    friend std::ostream& operator<<(std::ostream& out, const Cell& cell) {
        return out << "block " << cell.block << " row " << cell.row << " mode " << cell.mode << " output "
                   << cell.output;
    }
};

/// All allowed cells, by block, row, mode and output.
[[nodiscard]] inline std::vector<Cell> allowedCells(const PermissionTable& table, int rows, int modes,
                                                    int outputs) {
    std::vector<Cell> cells;
    for (std::size_t block = 0; block < table.blocks(); ++block) {
        for (int row = 0; row < rows; ++row) {
            for (int mode = 0; mode < modes; ++mode) {
                for (int output = 0; output < outputs; ++output) {
                    if (table.allows(block, row, mode, output)) {
                        cells.push_back({block, row, mode, output});
                    }
                }
            }
        }
    }
    return cells;
}
[[nodiscard]] inline std::vector<Cell> operationCells(const TarvikTestPeer::Members& members) {
    return allowedCells(members.m_operationTable, 32, 6, 5);
}
[[nodiscard]] inline std::vector<Cell> bsdlOperationCells(const TarvikTestPeer::Members& members) {
    return allowedCells(members.m_bsdlOperationTable, 32, 1, 5);
}
[[nodiscard]] inline std::vector<Cell> programOptionCells(const TarvikTestPeer::Members& members) {
    return allowedCells(members.m_programOptionTable, 24, 6, 5);
}

/// The nine output sets, or device sets, in mode order.
[[nodiscard]] inline std::vector<const std::set<TARVIKNS::OUTPUT_TYPE>*>
modeOutputs(const TarvikTestPeer::Members& members) {
    return {&members.m_bsCables,     &members.m_ssCables,      &members.m_smCables,
            &members.m_bsFileCables, &members.m_dp770Cables,   &members.m_spiCables,
            &members.m_kiteCfCables, &members.m_kiteMpmCables, &members.m_pffCables};
}
[[nodiscard]] inline std::vector<const NameSet*> modeDevices(const TarvikTestPeer::Members& members) {
    return {&members.m_bsDevices,     &members.m_ssDevices,      &members.m_smDevices,
            &members.m_bsFileDevices, &members.m_dp770Devices,   &members.m_spiDevices,
            &members.m_kiteCfDevices, &members.m_kiteMpmDevices, &members.m_pffDevices};
}
inline constexpr const char* MODE_KEYS[] = {"BS",  "SS",     "SM",      "BSFILE", "DP770",
                                            "SPI", "KITECF", "KITEMPM", "PFF"};
