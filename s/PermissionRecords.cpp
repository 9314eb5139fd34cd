#include "Diagnostics.h"
#include "Implementation.h"
#include "PermissionRecordParser.h"
#include "RecordReader.h"

// The records of a family's database that fill the permission tables. A cell that is set stays set, even if a later
// record raises.

using TARVIKNS::PROGRAM_OPTION;

namespace {

namespace location = diagnostics::location;

/// For a fault that a kind of record cannot have.
constexpr int NOWHERE = 0;

constexpr RecordLocations OPERATION{location::OPERATION_UNKNOWN, location::OPERATION_WITHOUT_MODE,
                                    location::OPERATION_MODE_UNKNOWN, location::OPERATION_WITHOUT_OUTPUT,
                                    location::OPERATION_OUTPUT_UNKNOWN};

constexpr RecordLocations BSDL_OPERATION{location::BSDL_OPERATION_UNKNOWN, NOWHERE, NOWHERE,
                                         location::BSDL_OPERATION_WITHOUT_OUTPUT,
                                         location::BSDL_OPERATION_OUTPUT_UNKNOWN};

constexpr RecordLocations PROGRAM_OPTIONS{
    NOWHERE, location::PROGRAM_OPTION_WITHOUT_MODE, location::PROGRAM_OPTION_MODE_UNKNOWN,
    location::PROGRAM_OPTION_WITHOUT_OUTPUT, location::PROGRAM_OPTION_OUTPUT_UNKNOWN};

} // namespace

void ConstraintsManager::Implementation::parseOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex,
                                                               const char* family) {
    const PermissionRecordParser parser(OPERATION, family, m_exceptions);
    forEachRecord(*accessor, "OPERATION", [&](const Record& record, const StringBase& name) {
        const OP_TYPE operation = parser.operation(name);
        const MODE_TYPE mode = parser.mode(record);
        parser.forEachOutput(record, 2, [&](OUTPUT_TYPE output) {
            m_operationTable.allow(familyIndex, static_cast<int>(operation), static_cast<int>(mode),
                                   static_cast<int>(output));
        });
    });
}

void ConstraintsManager::Implementation::parseBsdlOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex,
                                                                   const char* family) {
    const PermissionRecordParser parser(BSDL_OPERATION, family, m_exceptions);
    forEachRecord(*accessor, "BSDL_OPERATION", [&](const Record& record, const StringBase& name) {
        const OP_TYPE operation = parser.operation(name);
        parser.forEachOutput(record, 1, [&](OUTPUT_TYPE output) {
            m_bsdlOperationTable.allow(familyIndex, static_cast<int>(operation), 0, static_cast<int>(output));
        });
    });
}

void ConstraintsManager::Implementation::parseProgramOptionEntries(PM_DEVKEY* accessor, const char* family) {
    // Before the first record: a family that is no option package raises even without one.
    const auto package = static_cast<std::size_t>(programOptionTableIndex(family));
    const PermissionRecordParser parser(PROGRAM_OPTIONS, family, m_exceptions);
    forEachRecord(*accessor, "PROGRAM_OPTION", [&](const Record& record, const StringBase& name) {
        const PROGRAM_OPTION option = optionString2Type(name.c_str());
        const MODE_TYPE mode = parser.mode(record);
        parser.forEachOutput(record, 2, [&](OUTPUT_TYPE output) {
            m_programOptionTable.allow(package, static_cast<int>(option), static_cast<int>(mode),
                                       static_cast<int>(output));
        });
    });
}
