#include "EntryReader.h"
#include "Lists.h"
#include "PermissionTable.h"
#include "Reporting.h"

#include <tarvik/ConstraintsManager.h>

// The entries of a family's database that fill the permission tables. A cell that is set stays set, also when
// a later record raises.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace {

namespace location = reporting::location;

/// For a fault that a kind of entry cannot have.
constexpr int NOWHERE = 0;

constexpr EntryLocations OPERATION{location::OPERATION_UNKNOWN, location::OPERATION_WITHOUT_MODE,
                                   location::OPERATION_MODE_UNKNOWN, location::OPERATION_WITHOUT_OUTPUT,
                                   location::OPERATION_OUTPUT_UNKNOWN};

constexpr EntryLocations BSDL_OPERATION{location::BSDL_OPERATION_UNKNOWN, NOWHERE, NOWHERE,
                                        location::BSDL_OPERATION_WITHOUT_OUTPUT,
                                        location::BSDL_OPERATION_OUTPUT_UNKNOWN};

constexpr EntryLocations PROGRAM_OPTIONS{
    NOWHERE, location::PROGRAM_OPTION_WITHOUT_MODE, location::PROGRAM_OPTION_MODE_UNKNOWN,
    location::PROGRAM_OPTION_WITHOUT_OUTPUT, location::PROGRAM_OPTION_OUTPUT_UNKNOWN};

} // namespace

void ConstraintsManager::parseOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex,
                                               const char* family) {
    const EntryReader reader(OPERATION, family, m_exceptions);
    forEachRecord(*accessor, "OPERATION", [&](const Record& record, const StringBase& name) {
        const OP_TYPE operation = reader.operation(name);
        const MODE_TYPE mode = reader.mode(record);
        reader.forEachOutput(record, 2, [&](OUTPUT_TYPE output) {
            m_operationTable->allow(familyIndex, static_cast<int>(operation), static_cast<int>(mode),
                                    static_cast<int>(output));
        });
    });
}

void ConstraintsManager::parseBsdlOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex,
                                                   const char* family) {
    const EntryReader reader(BSDL_OPERATION, family, m_exceptions);
    forEachRecord(*accessor, "BSDL_OPERATION", [&](const Record& record, const StringBase& name) {
        const OP_TYPE operation = reader.operation(name);
        reader.forEachOutput(record, 1, [&](OUTPUT_TYPE output) {
            m_bsdlOperationTable->allow(familyIndex, static_cast<int>(operation), 0,
                                        static_cast<int>(output));
        });
    });
}

void ConstraintsManager::parseProgramOptionEntries(PM_DEVKEY* accessor, const char* family) {
    // Before the first record is looked at: a family that is no option package raises without an entry, too.
    const auto package = static_cast<std::size_t>(programOptionTableIndex(family));
    const EntryReader reader(PROGRAM_OPTIONS, family, m_exceptions);
    forEachRecord(*accessor, "PROGRAM_OPTION", [&](const Record& record, const StringBase& name) {
        const PROGRAM_OPTION option = optionString2Type(name.c_str());
        const MODE_TYPE mode = reader.mode(record);
        reader.forEachOutput(record, 2, [&](OUTPUT_TYPE output) {
            m_programOptionTable->allow(package, static_cast<int>(option), static_cast<int>(mode),
                                        static_cast<int>(output));
        });
    });
}
