// The enumerations: that they are those of the C++ library, their names, and the conversions.
#include "Boundary.h"

#include <array>
#include <cstring>
#include <span>

using namespace boundary;

namespace {

struct Enumerator {
    const char* name;
    int value;
};

/// An enumerator of which the C++ library has one of the same name: the compiler compares the values.
#define TARVIK_SAME(PREFIX, TYPE, NAME)                                                                      \
    Enumerator {                                                                                             \
#NAME, sameValue < static_cast < int>(TARVIK_##PREFIX##_##NAME),                                     \
            static_cast < int>(TARVIKNS::TYPE::NAME)>()                                                      \
    }

template <int VALUE, int VALUE_IN_CPP>
consteval int sameValue() {
    static_assert(VALUE == VALUE_IN_CPP);
    return VALUE;
}

constexpr std::array MODES{
    TARVIK_SAME(MODE, MODE_TYPE, BS),     TARVIK_SAME(MODE, MODE_TYPE, SS),
    TARVIK_SAME(MODE, MODE_TYPE, SM),     TARVIK_SAME(MODE, MODE_TYPE, BSFILE),
    TARVIK_SAME(MODE, MODE_TYPE, DP770),  TARVIK_SAME(MODE, MODE_TYPE, SPI),
    TARVIK_SAME(MODE, MODE_TYPE, KITECF), TARVIK_SAME(MODE, MODE_TYPE, KITEMPM),
    TARVIK_SAME(MODE, MODE_TYPE, PFF),
};

constexpr std::array OUTPUTS{
    TARVIK_SAME(OUTPUT, OUTPUT_TYPE, PARALLEL),   TARVIK_SAME(OUTPUT, OUTPUT_TYPE, ZORVA),
    TARVIK_SAME(OUTPUT, OUTPUT_TYPE, USB2),       TARVIK_SAME(OUTPUT, OUTPUT_TYPE, SVF),
    TARVIK_SAME(OUTPUT, OUTPUT_TYPE, STAPL),      TARVIK_SAME(OUTPUT, OUTPUT_TYPE, QSVF),
    TARVIK_SAME(OUTPUT, OUTPUT_TYPE, EXPRESSSVF), TARVIK_SAME(OUTPUT, OUTPUT_TYPE, EXPRESSQSVF),
    TARVIK_SAME(OUTPUT, OUTPUT_TYPE, NULLCABLE),  TARVIK_SAME(OUTPUT, OUTPUT_TYPE, NONE),
};

constexpr std::array OPERATIONS{
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAM),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMFLASH),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMFPGAONLY),
    TARVIK_SAME(OPERATION, OP_TYPE, VERIFY),
    TARVIK_SAME(OPERATION, OP_TYPE, ERASE),
    TARVIK_SAME(OPERATION, OP_TYPE, FUNCTIONTEST),
    TARVIK_SAME(OPERATION, OP_TYPE, BLANKCHECK),
    TARVIK_SAME(OPERATION, OP_TYPE, READBACKTOFILE),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMUES),
    TARVIK_SAME(OPERATION, OP_TYPE, READIDCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, CHECKSUM),
    TARVIK_SAME(OPERATION, OP_TYPE, READUSERCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, READCUSTOMERCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, READUES),
    TARVIK_SAME(OPERATION, OP_TYPE, ACTIVATEOTF),
    TARVIK_SAME(OPERATION, OP_TYPE, VALIDATEUSERCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, CHECKIDCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, READSTATUSREGISTER),
    TARVIK_SAME(OPERATION, OP_TYPE, LOADCONFIGURATIONREVISION),
    TARVIK_SAME(OPERATION, OP_TYPE, BYPASS),
    TARVIK_SAME(OPERATION, OP_TYPE, HIGHZ),
    TARVIK_SAME(OPERATION, OP_TYPE, CLAMP),
    TARVIK_SAME(OPERATION, OP_TYPE, DOPRELOAD),
    TARVIK_SAME(OPERATION, OP_TYPE, ISPENABLE),
    TARVIK_SAME(OPERATION, OP_TYPE, CONLD),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMKEY),
    TARVIK_SAME(OPERATION, OP_TYPE, SECUREMODE),
    TARVIK_SAME(OPERATION, OP_TYPE, READTEMP),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMUSERCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, PROGRAMCUSTOMERCODE),
    TARVIK_SAME(OPERATION, OP_TYPE, EXPRESSSVF),
    TARVIK_SAME(OPERATION, OP_TYPE, EXPRESSQSVF),
};

constexpr std::array OPTIONS{
    TARVIK_SAME(OPTION, PROGRAM_OPTION, ERASE),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, VERIFY),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, READPROTECT),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, WRITEPROTECT),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, FUNCTIONTEST),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, SKIPUSERARRAY),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, LOADFPGA),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, PARALLELMODE),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, USED4),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, USERCODE),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, UES),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, SECUREMODE),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, PROGRAMKEY),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, OTF),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, PROG),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, SECTOR_PROTECT),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, SECTOR_LOCKDOWN),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, PROGRAM_ONLYFPGA),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, READ_PROTECT_NOBSCANTEST),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, OTP),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, ASSERT_INIT),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, DATA_WIDTH),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, RS_PIN1),
    TARVIK_SAME(OPTION, PROGRAM_OPTION, RS_PIN0),
};

#undef TARVIK_SAME

static_assert(TARVIK_NO_OPERATION == static_cast<int>(TARVIKNS::NO_OPERATION));

constexpr std::array STATUSES{
    Enumerator{"OK", TARVIK_OK},
    Enumerator{"DATA_MISMATCH", TARVIK_DATA_MISMATCH},
    Enumerator{"OUT_OF_RANGE", TARVIK_OUT_OF_RANGE},
    Enumerator{"DATA_NOT_FOUND", TARVIK_DATA_NOT_FOUND},
    Enumerator{"OTHER_EXCEPTION", TARVIK_OTHER_EXCEPTION},
    Enumerator{"NO_MEMORY", TARVIK_NO_MEMORY},
    Enumerator{"INVALID_ARGUMENT", TARVIK_INVALID_ARGUMENT},
    Enumerator{"TOO_LATE", TARVIK_TOO_LATE},
    Enumerator{"REMOVED", TARVIK_REMOVED},
    Enumerator{"BUSY", TARVIK_BUSY},
    Enumerator{"CALLBACK_FAILED", TARVIK_CALLBACK_FAILED},
};

constexpr std::array CHANNELS{
    Enumerator{"INFO", TARVIK_CHANNEL_INFO},
    Enumerator{"STATUS", TARVIK_CHANNEL_STATUS},
    Enumerator{"DEBUG", TARVIK_CHANNEL_DEBUG},
};

/// A name is found by its value, so row i must hold value i.
template <typename Table>
consteval bool isInValueOrder(const Table& table) {
    for (std::size_t row = 0; row < table.size(); ++row) {
        if (table[row].value != static_cast<int>(row)) {
            return false;
        }
    }
    return true;
}
static_assert(isInValueOrder(MODES) && isInValueOrder(OUTPUTS) && isInValueOrder(OPERATIONS) &&
              isInValueOrder(OPTIONS) && isInValueOrder(STATUSES) && isInValueOrder(CHANNELS));

std::span<const Enumerator> enumerators(int enumeration) noexcept {
    switch (enumeration) {
    case TARVIK_ENUMERATION_MODE:
        return MODES;
    case TARVIK_ENUMERATION_OUTPUT:
        return OUTPUTS;
    case TARVIK_ENUMERATION_OPERATION:
        return OPERATIONS;
    case TARVIK_ENUMERATION_OPTION:
        return OPTIONS;
    case TARVIK_ENUMERATION_STATUS:
        return STATUSES;
    case TARVIK_ENUMERATION_CHANNEL:
        return CHANNELS;
    default:
        return {};
    }
}

/// Writes the name that `conversion` returns to `*name`.
template <typename Conversion>
tarvik_status answerName(const char** name, Conversion conversion) noexcept {
    return answer(name, [&] { return intern(conversion()); });
}

} // namespace

extern "C" {

const char* tarvik_enumerator_name(int enumeration, int value) {
    const std::span<const Enumerator> rows = enumerators(enumeration);
    const auto row = static_cast<std::size_t>(value);
    return row < rows.size() ? rows[row].name : nullptr;
}

tarvik_status tarvik_mode_string_to_type(const char* text, int* mode) {
    return answer(mode, [=] { return ConstraintsManager::modeString2Type(text); });
}

tarvik_status tarvik_mode_type_to_string(int mode, const char** name) {
    return answerName(name, [=] { return ConstraintsManager::modeType2String(boundary::mode(mode)); });
}

tarvik_status tarvik_cable_string_to_type(const char* text, int* output) {
    return answer(output, [=] { return ConstraintsManager::cableString2Type(text); });
}

tarvik_status tarvik_cable_type_to_string(int output, const char** name) {
    return answerName(name, [=] { return ConstraintsManager::cableType2String(boundary::output(output)); });
}

tarvik_status tarvik_operation_string_to_type(const char* text, int* operation) {
    return answer(operation, [=] { return ConstraintsManager::operationString2Type(text); });
}

tarvik_status tarvik_operation_display_string_to_type(const char* text, int* operation) {
    return answer(operation, [=] { return ConstraintsManager::operationDisplayString2Type(text); });
}

tarvik_status tarvik_operation_type_to_string(int operation, const char** name) {
    return answerName(
        name, [=] { return ConstraintsManager::operationType2String(boundary::operation(operation)); });
}

tarvik_status tarvik_operation_type_to_display_string(int operation, const char** name) {
    return answerName(name, [=] {
        return ConstraintsManager::operationType2DisplayString(boundary::operation(operation));
    });
}

tarvik_status tarvik_option_string_to_type(const char* text, int* option) {
    return answer(option, [=] { return ConstraintsManager::optionString2Type(text); });
}

tarvik_status tarvik_option_type_to_string(int option, const char** name) {
    return answerName(name, [=] { return ConstraintsManager::optionType2String(boundary::option(option)); });
}

tarvik_status tarvik_remove_package_name(char* device) {
    return guard([=] {
        if (device != nullptr) {
            StringBase name(device);
            ConstraintsManager::removePackageName(name);
            device[name.GetLength()] = '\0';
        }
    });
}

} // extern "C"
