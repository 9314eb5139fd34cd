#include "Diagnostics.h"
#include "Implementation.h"

#include <TarvikSmokeMgr.h>

// The tables as fixed-width text. Every cell and every line end is a separate piece: hosts compare recordings and logs
// piece by piece.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace {

constexpr const char* NAME_CELL = "%-15.15s";
constexpr const char* BLOCK_CELL = "%-60.60s";
constexpr const char* MODE_CELL = "%-10.10s";
constexpr const char* BSDL_CELL = "%-10.6s";
constexpr const char* OUTPUT_CELL = "%-2.1s";

/// Sends pieces of text to the recorder, or (null) to the status channel.
class PieceWriter {
public:
    explicit PieceWriter(TarvikSmokeMgr* recorder) noexcept : m_recorder(recorder) {}

    /// Receivers expect the piece in the format position, and interpret each "%" in it.
    void write(const char* piece) const {
        if (m_recorder != nullptr) {
            m_recorder->smokeStatus(piece);
        } else {
            diagnostics::message(diagnostics::location::DUMP).issueStatus(piece);
        }
    }

    void writeCell(const char* format, const StringBase& text) const {
        StringBase piece;
        piece.Format(format, text.c_str());
        write(piece.c_str());
    }

    void writeFlag(bool flag) const { write(flag ? "1 " : "0 "); }

    void endLine() const { write("\n"); }

private:
    TarvikSmokeMgr* m_recorder;
};

/// A header line: an empty name cell, then `writeBlock` for each row of the table.
template <typename WriteBlock>
void writeHeader(const PieceWriter& writer, int rows, WriteBlock writeBlock) {
    writer.writeCell(NAME_CELL, "");
    for (int row = 0; row < rows; ++row) {
        writeBlock(row);
    }
    writer.endLine();
}

void writeOutputs(const PieceWriter& writer) {
    for (int output = 0; output < tableDimensions::OUTPUTS; ++output) {
        writer.writeCell(OUTPUT_CELL, ConstraintsManager::cableType2String(static_cast<OUTPUT_TYPE>(output)));
    }
}

/// One line for each block of a table: its name, then a flag for each row, mode and output.
template <typename NameAt>
void writeBlocks(const PieceWriter& writer, const PermissionTable& table, std::size_t blocks, int rows,
                 int modes, NameAt nameAt) {
    for (std::size_t block = 0; block < blocks; ++block) {
        writer.writeCell(NAME_CELL, nameAt(static_cast<int>(block)));
        for (int row = 0; row < rows; ++row) {
            for (int mode = 0; mode < modes; ++mode) {
                for (int output = 0; output < tableDimensions::OUTPUTS; ++output) {
                    writer.writeFlag(table.allows(block, row, mode, output));
                }
            }
        }
        writer.endLine();
    }
}

/// The three header lines of a table with modes. `rowName` gives the name of a row.
template <typename RowName>
void writeModeHeaders(const PieceWriter& writer, int rows, RowName rowName) {
    writeHeader(writer, rows, [&](int row) { writer.writeCell(BLOCK_CELL, rowName(row)); });
    writeHeader(writer, rows, [&](int) {
        for (int mode = 0; mode < tableDimensions::MODES; ++mode) {
            writer.writeCell(MODE_CELL, ConstraintsManager::modeType2String(static_cast<MODE_TYPE>(mode)));
        }
    });
    writeHeader(writer, rows, [&](int) {
        for (int mode = 0; mode < tableDimensions::MODES; ++mode) {
            writeOutputs(writer);
        }
    });
}

StringBase operationName(int row) {
    return ConstraintsManager::operationType2String(static_cast<OP_TYPE>(row));
}

StringBase optionName(int row) {
    return ConstraintsManager::optionType2String(static_cast<PROGRAM_OPTION>(row));
}

/// The name at a position of a set. After its end: raises from `location`, or the empty text.
StringBase nameAt(const NameSet& names, int position, bool exceptions, int location) {
    const auto index = static_cast<std::size_t>(position);
    if (index >= names.size()) {
        diagnostics::raiseIf<OutOfRangeException>(exceptions, location);
        return {};
    }
    return names[index];
}

} // namespace

StringBase ConstraintsManager::Implementation::supportedDeviceNameAt(int position) const {
    return nameAt(m_supportedDevices, position, m_exceptions,
                  diagnostics::location::SUPPORTED_DEVICE_POSITION);
}

StringBase ConstraintsManager::Implementation::programOptionPackageNameAt(int position) const {
    return nameAt(m_programOptionPackages, position, m_exceptions,
                  diagnostics::location::PROGRAM_OPTION_PACKAGE_POSITION);
}

void ConstraintsManager::Implementation::dumpOperationsTable(TarvikSmokeMgr* recorder) const {
    const PieceWriter writer(recorder);
    writeModeHeaders(writer, tableDimensions::OPERATIONS, operationName);
    writeBlocks(writer, m_operationTable, m_supportedDevices.size(), tableDimensions::OPERATIONS,
                tableDimensions::MODES, [this](int block) { return supportedDeviceNameAt(block); });
}

void ConstraintsManager::Implementation::dumpBsdlOperationsTable(TarvikSmokeMgr* recorder) const {
    const PieceWriter writer(recorder);
    writeHeader(writer, tableDimensions::OPERATIONS,
                [&](int row) { writer.writeCell(BSDL_CELL, operationName(row)); });
    writeHeader(writer, tableDimensions::OPERATIONS, [&](int) { writeOutputs(writer); });
    writeBlocks(writer, m_bsdlOperationTable, m_supportedDevices.size(), tableDimensions::OPERATIONS, 1,
                [this](int block) { return supportedDeviceNameAt(block); });
}

void ConstraintsManager::Implementation::dumpProgramOptionsTable(TarvikSmokeMgr* recorder) const {
    const PieceWriter writer(recorder);
    writeModeHeaders(writer, tableDimensions::OPTIONS, optionName);
    writeBlocks(writer, m_programOptionTable, m_programOptionPackages.size(), tableDimensions::OPTIONS,
                tableDimensions::MODES, [this](int block) { return programOptionPackageNameAt(block); });
}

void ConstraintsManager::Implementation::dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder) const {
    const PieceWriter writer(recorder);
    for (const auto& [device, family] : m_deviceFamilyCache) {
        StringBase piece;
        piece.Format("Device %s belongs to %s\n", device.c_str(), family.c_str());
        writer.write(piece.c_str());
    }
}
