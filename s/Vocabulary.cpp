#include "WordTables.h"

#include "Diagnostics.h"

#include <tarvik/ConstraintsManager.h>

#include <UT_STR.h>

#include <algorithm>

// The conversions between values, key names and display names. They need no manager; how each treats case and
// unknown input differs deliberately.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;
using namespace wordTables;

namespace {

/// The operation whose key name, or display name, is `text` in any case.
OP_TYPE operationWith(const char* Operation::*name, const char* text) {
    const auto found = std::find_if(OPERATIONS.begin(), OPERATIONS.end(), [=](const Operation& operation) {
        return UT_STR::ICompare(operation.*name, text) == 0;
    });
    if (found == OPERATIONS.end()) {
        diagnostics::message(diagnostics::location::OPERATION_NOT_DEFINED)
            .issueInfo("Operation %s is not defined.\n", text);
        return TARVIKNS::NO_OPERATION;
    }
    return found->value;
}

/// The key name, or display name, of an operation.
const char* nameOf(OP_TYPE operation, const char* Operation::*name) {
    const Operation* const row = rowOf(OPERATIONS, operation);
    if (row == nullptr) {
        diagnostics::message(diagnostics::location::OPERATION_NOT_DEFINED)
            .issueInfo("Operation %d is not defined.\n", static_cast<int>(operation));
        return "";
    }
    return row->*name;
}

} // namespace

const char* wordTables::operationKey(OP_TYPE operation) { return nameOf(operation, &Operation::key); }

const char* wordTables::modeDisplayName(MODE_TYPE mode) noexcept {
    const Mode* const row = rowOf(MODES, mode);
    return lastModeName = (row == nullptr ? MODES.back() : *row).display;
}

const char* wordTables::outputDisplayName(OUTPUT_TYPE output) noexcept {
    const Output* const row = rowOf(OUTPUTS, output);
    return lastOutputName = (row == nullptr ? OUTPUTS.back() : *row).display;
}

MODE_TYPE ConstraintsManager::modeString2Type(const char* text) noexcept {
    for (const Mode& mode : MODES) {
        for (const char* const name : mode.names) {
            if (name != nullptr && UT_STR::ICompare(text, name) == 0) {
                return mode.value;
            }
        }
    }
    return MODE_TYPE::BS;
}

StringBase ConstraintsManager::modeType2String(MODE_TYPE mode) { return modeKey(mode); }

OUTPUT_TYPE ConstraintsManager::cableString2Type(const char* text) noexcept {
    for (const Output& output : OUTPUTS) {
        if (output.isParseable && UT_STR::Compare(text, output.key) == 0) {
            return output.value;
        }
    }
    return OUTPUT_TYPE::NONE;
}

StringBase ConstraintsManager::cableType2String(OUTPUT_TYPE output) {
    const Output* const row = rowOf(OUTPUTS, output);
    return row == nullptr ? "" : row->key;
}

OP_TYPE ConstraintsManager::operationString2Type(const char* text) {
    return operationWith(&Operation::key, text);
}

OP_TYPE ConstraintsManager::operationDisplayString2Type(const char* text) {
    return operationWith(&Operation::display, text);
}

StringBase ConstraintsManager::operationType2String(OP_TYPE operation) { return operationKey(operation); }

StringBase ConstraintsManager::operationType2DisplayString(OP_TYPE operation) {
    return nameOf(operation, &Operation::display);
}

PROGRAM_OPTION ConstraintsManager::optionString2Type(const char* text) {
    for (const Option& option : OPTIONS) {
        if (option.isParseable && UT_STR::Compare(text, option.key) == 0) {
            return option.value;
        }
    }
    diagnostics::raise<DataMismatchException>(diagnostics::location::OPTION_NAME_UNKNOWN);
}

StringBase ConstraintsManager::optionType2String(PROGRAM_OPTION option) {
    const Option* const row = rowOf(OPTIONS, option);
    if (row == nullptr) {
        diagnostics::raise<DataMismatchException>(diagnostics::location::OPTION_WITHOUT_NAME);
    }
    return row->key;
}

void ConstraintsManager::removePackageName(StringBase& device) {
    const auto underscore = device.GetIndexOfFirstChar('_', 0);
    if (underscore != StringBase::NOT_FOUND) {
        device.Truncate(underscore);
    }
}
