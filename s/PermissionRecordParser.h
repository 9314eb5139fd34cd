#pragma once

// Parses the fields that the three kinds of permission records share, and reports what is wrong with them.

#include "Diagnostics.h"
#include "RecordReader.h"

#include <tarvik/ConstraintsManager.h>

#include <Port_MsgManData.h>

/// The locations at which one kind of record raises.
struct RecordLocations {
    int unknownOperation;
    int absentMode;
    int unknownMode;
    int absentOutput;
    int unknownOutput;
};

/// Parses the fields of one kind of record. A fault issues a debug message. While exceptions are on it also raises;
/// otherwise parsing continues with a value that has no cell.
class PermissionRecordParser {
public:
    /// @param family named in the messages only
    /// @param exceptions the manager's switch itself, as a message sink may turn it while a record is parsed
    PermissionRecordParser(const RecordLocations& locations, const char* family,
                           const bool& exceptions) noexcept
        : m_locations(locations), m_family(family), m_exceptions(exceptions) {}

    [[nodiscard]] TARVIKNS::OP_TYPE operation(const StringBase& name) const {
        const TARVIKNS::OP_TYPE operation = ConstraintsManager::operationString2Type(name.c_str());
        if (operation == TARVIKNS::NO_OPERATION) {
            fault<OutOfRangeException>("%s op = %s\n", name.c_str(), m_locations.unknownOperation);
        }
        return operation;
    }

    /// Reads field 1 as a mode.
    [[nodiscard]] TARVIKNS::MODE_TYPE mode(const Record& record) const {
        const char* const name = record.field(1);
        if (name == nullptr) {
            fault<DataMismatchException>("%s mode =   %s\n", ABSENT, m_locations.absentMode);
        }
        return checkedMode(ConstraintsManager::modeString2Type(name));
    }

    /// Rejects the value 9. An unknown text converts to Boundary Scan, so no database can cause this; the check is for
    /// a vocabulary that has such a value one day.
    [[nodiscard]] TARVIKNS::MODE_TYPE checkedMode(TARVIKNS::MODE_TYPE mode) const {
        if (mode == UNKNOWN_MODE) {
            diagnostics::raiseIf<DataMismatchException>(m_exceptions, m_locations.unknownMode);
        }
        return mode;
    }

    /// Calls `action` for each output from field number `first`, of which there has to be one.
    template <typename Action>
    void forEachOutput(const Record& record, long first, Action action) const {
        if (record.field(first) == nullptr) {
            fault<DataMismatchException>("%s out = %s\n", ABSENT, m_locations.absentOutput);
        }
        record.forEachFieldFrom(first, [&](const char* name) {
            const TARVIKNS::OUTPUT_TYPE output = ConstraintsManager::cableString2Type(name);
            if (output == TARVIKNS::OUTPUT_TYPE::NONE) {
                fault<DataMismatchException>("%s out   = %s\n", name, m_locations.unknownOutput);
            }
            action(output);
        });
    }

private:
    static constexpr TARVIKNS::MODE_TYPE UNKNOWN_MODE{9};

    /// How messages show a missing field.
    static constexpr const char* ABSENT = "(null)";

    template <typename Exception>
    void fault(const char* format, const char* text, int location) const {
        Port_MsgManData::debugStub(format, m_family, text);
        diagnostics::raiseIf<Exception>(m_exceptions, location);
    }

    const RecordLocations& m_locations;
    const char* m_family;
    const bool& m_exceptions;
};
