#pragma once

// Reads the fields that the three kinds of permission entries share, and reports what is wrong with them.

#include "Lists.h"
#include "Reporting.h"

#include <tarvik/ConstraintsManager.h>

#include <Port_MsgManData.h>

/// The locations at which one kind of entry raises.
struct EntryLocations {
    int unknownOperation;
    int absentMode;
    int unknownMode;
    int absentOutput;
    int unknownOutput;
};

/// Reads the fields of one kind of entry. A fault gives a debug message; while exceptions are on it raises,
/// else the reader goes on with a value that has no cell.
class EntryReader {
public:
    /// @param family named in the messages only
    EntryReader(const EntryLocations& locations, const char* family, bool exceptions) noexcept
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
        return known(ConstraintsManager::modeString2Type(name));
    }

    /// Refuses the value that stands for no mode. An unknown text converts to Boundary Scan, so nothing that
    /// can be written in a database gets here; the test stands in case the vocabulary ever grows that value.
    [[nodiscard]] TARVIKNS::MODE_TYPE known(TARVIKNS::MODE_TYPE mode) const {
        if (mode == NO_MODE) {
            reporting::raiseIf<DataMismatchException>(m_exceptions, m_locations.unknownMode);
        }
        return mode;
    }

    /// Hands the outputs from field number `first` on to `action`; there has to be one.
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
    static constexpr TARVIKNS::MODE_TYPE NO_MODE{9};

    /// A field that is not there, as messages show it.
    static constexpr const char* ABSENT = "(null)";

    template <typename Exception>
    void fault(const char* format, const char* text, int location) const {
        Port_MsgManData::debugStub(format, m_family, text);
        reporting::raiseIf<Exception>(m_exceptions, location);
    }

    const EntryLocations& m_locations;
    const char* m_family;
    bool m_exceptions;
};
