#pragma once

// The words of the system: one row for each value of an enumeration, in value order.

#include <tarvik/TARVIKNS.h>

#include <array>
#include <cstddef>

namespace wordTables {

struct Mode {
    TARVIKNS::MODE_TYPE value;
    const char* key;
    std::array<const char*, 3> names; ///< the texts that are read as this mode; null after the last
    const char* display;
};

struct Output {
    TARVIKNS::OUTPUT_TYPE value;
    const char* key;
    bool isParseable; ///< false: the key is written but never read
    const char* display;
};

struct Operation {
    TARVIKNS::OP_TYPE value;
    const char* key;
    const char* display;
};

struct Option {
    TARVIKNS::PROGRAM_OPTION value;
    const char* key;
    bool isParseable; ///< false: the key is written but never read
};

// The misspelling and the double blanks in the display names are what hosts show and compare.
inline constexpr std::array<Mode, 9> MODES{{
    {TARVIKNS::MODE_TYPE::BS, "BS", {"Bscan"}, "Boundary Scan mode"},
    {TARVIKNS::MODE_TYPE::SS, "SS", {"SS", "SSerial"}, "Slave Serial mode"},
    {TARVIKNS::MODE_TYPE::SM, "SM", {"SM", "Smap"}, "Select Map mode"},
    {TARVIKNS::MODE_TYPE::BSFILE, "BSFILE", {"BSFILE"}, "Boundary Scan File mode"},
    {TARVIKNS::MODE_TYPE::DP770, "DP770", {"DTCONFIG", "DP770"}, "Destop Programming mode"},
    {TARVIKNS::MODE_TYPE::SPI, "SPI", {"SPI"}, "SPI mode"},
    {TARVIKNS::MODE_TYPE::KITECF, "KITECF", {"CF", "KITECF", "CompactFlash"}, "Kite Compact Flash  mode"},
    {TARVIKNS::MODE_TYPE::KITEMPM, "KITEMPM", {"MPM", "KITEMPM"}, "Kite MPM  mode"},
    {TARVIKNS::MODE_TYPE::PFF, "PFF", {"PFF", "PromFile"}, "Prom File Formatter mode"},
}};

inline constexpr std::array<Output, 10> OUTPUTS{{
    {TARVIKNS::OUTPUT_TYPE::PARALLEL, "PARALLEL", true, "Parallel cable"},
    {TARVIKNS::OUTPUT_TYPE::ZORVA, "ZORVA", true, "ZORVA cable"},
    {TARVIKNS::OUTPUT_TYPE::USB2, "USB2", true, "USB2 cable"},
    {TARVIKNS::OUTPUT_TYPE::SVF, "SVF", true, "SVF"},
    {TARVIKNS::OUTPUT_TYPE::STAPL, "STAPL", true, "Stapl"},
    {TARVIKNS::OUTPUT_TYPE::QSVF, "QSVF", false, "QSVF"},
    {TARVIKNS::OUTPUT_TYPE::EXPRESSSVF, "EXPRESSSVF", true, "Express SVF"},
    {TARVIKNS::OUTPUT_TYPE::EXPRESSQSVF, "EXPRESSQSVF", true, "Express QSVF"},
    {TARVIKNS::OUTPUT_TYPE::NULLCABLE, "NULLCABLE", false, "Null cable"},
    {TARVIKNS::OUTPUT_TYPE::NONE, "NONE", false, "Unspecified cable"},
}};

// The trailing blank and the upper-case display names are what hosts show and compare.
inline constexpr std::array<Operation, 32> OPERATIONS{{
    {TARVIKNS::OP_TYPE::PROGRAM, "PROGRAM", "Program"},
    {TARVIKNS::OP_TYPE::PROGRAMFLASH, "PROGRAMFLASH", "Program Flash and FPGA"},
    {TARVIKNS::OP_TYPE::PROGRAMFPGAONLY, "PROGRAMFPGAONLY", "Program FPGA Only "},
    {TARVIKNS::OP_TYPE::VERIFY, "VERIFY", "Verify"},
    {TARVIKNS::OP_TYPE::ERASE, "ERASE", "Erase"},
    {TARVIKNS::OP_TYPE::FUNCTIONTEST, "FUNCTIONTEST", "Function Test"},
    {TARVIKNS::OP_TYPE::BLANKCHECK, "BLANKCHECK", "Blank Check"},
    {TARVIKNS::OP_TYPE::READBACKTOFILE, "READBACKTOFILE", "Readback"},
    {TARVIKNS::OP_TYPE::PROGRAMUES, "PROGRAMUES", "Program MIREL UES"},
    {TARVIKNS::OP_TYPE::READIDCODE, "READIDCODE", "Get Device ID"},
    {TARVIKNS::OP_TYPE::CHECKSUM, "CHECKSUM", "Get Device Checksum"},
    {TARVIKNS::OP_TYPE::READUSERCODE, "READUSERCODE", "Get Device Signature/Usercode"},
    {TARVIKNS::OP_TYPE::READCUSTOMERCODE, "READCUSTOMERCODE", "Get Device Customer Code"},
    {TARVIKNS::OP_TYPE::READUES, "READUES", "Get MIREL Device UES"},
    {TARVIKNS::OP_TYPE::ACTIVATEOTF, "ACTIVATEOTF", "Activate On-The-Fly Pattern"},
    {TARVIKNS::OP_TYPE::VALIDATEUSERCODE, "VALIDATEUSERCODE", "Validate Usercode"},
    {TARVIKNS::OP_TYPE::CHECKIDCODE, "CHECKIDCODE", "Check Idcode"},
    {TARVIKNS::OP_TYPE::READSTATUSREGISTER, "READSTATUSREGISTER", "Read Device Status"},
    {TARVIKNS::OP_TYPE::LOADCONFIGURATIONREVISION, "LOADCONFIGURATIONREVISION",
     "Load Configuration Revision"},
    {TARVIKNS::OP_TYPE::BYPASS, "BYPASS", "Bypass"},
    {TARVIKNS::OP_TYPE::HIGHZ, "HIGHZ", "Highz"},
    {TARVIKNS::OP_TYPE::CLAMP, "CLAMP", "Clamp"},
    {TARVIKNS::OP_TYPE::DOPRELOAD, "DOPRELOAD", "Do Preload"},
    {TARVIKNS::OP_TYPE::ISPENABLE, "ISPENABLE", "Ispenable"},
    {TARVIKNS::OP_TYPE::CONLD, "CONLD", "Conld"},
    {TARVIKNS::OP_TYPE::PROGRAMKEY, "PROGRAMKEY", "Program Key"},
    {TARVIKNS::OP_TYPE::SECUREMODE, "SECUREMODE", "Secure Mode"},
    {TARVIKNS::OP_TYPE::READTEMP, "READTEMP", "Read Temp and Voltage"},
    {TARVIKNS::OP_TYPE::PROGRAMUSERCODE, "PROGRAMUSERCODE", "PROGRAM USERCODE"},
    {TARVIKNS::OP_TYPE::PROGRAMCUSTOMERCODE, "PROGRAMCUSTOMERCODE", "PROGRAM CUSTOMER CODE"},
    {TARVIKNS::OP_TYPE::EXPRESSSVF, "EXPRESSSVF", "One Step SVF"},
    {TARVIKNS::OP_TYPE::EXPRESSQSVF, "EXPRESSQSVF", "One Step QSVF"},
}};

inline constexpr std::array<Option, 24> OPTIONS{{
    {TARVIKNS::PROGRAM_OPTION::ERASE, "ERASE", true},
    {TARVIKNS::PROGRAM_OPTION::VERIFY, "VERIFY", true},
    {TARVIKNS::PROGRAM_OPTION::READPROTECT, "READPROTECT", true},
    {TARVIKNS::PROGRAM_OPTION::WRITEPROTECT, "WRITEPROTECT", true},
    {TARVIKNS::PROGRAM_OPTION::FUNCTIONTEST, "FUNCTIONTEST", true},
    {TARVIKNS::PROGRAM_OPTION::SKIPUSERARRAY, "SKIPUSERARRAY", true},
    {TARVIKNS::PROGRAM_OPTION::LOADFPGA, "LOADFPGA", true},
    {TARVIKNS::PROGRAM_OPTION::PARALLELMODE, "PARALLELMODE", true},
    {TARVIKNS::PROGRAM_OPTION::USED4, "USED4", true},
    {TARVIKNS::PROGRAM_OPTION::USERCODE, "USERCODE", true},
    {TARVIKNS::PROGRAM_OPTION::UES, "UES", true},
    {TARVIKNS::PROGRAM_OPTION::SECUREMODE, "SECUREMODE", true},
    {TARVIKNS::PROGRAM_OPTION::PROGRAMKEY, "PROGRAMKEY", true},
    {TARVIKNS::PROGRAM_OPTION::OTF, "OTF", true},
    {TARVIKNS::PROGRAM_OPTION::PROG, "PROG", true},
    {TARVIKNS::PROGRAM_OPTION::SECTOR_PROTECT, "SECTOR_PROTECT", true},
    {TARVIKNS::PROGRAM_OPTION::SECTOR_LOCKDOWN, "SECTOR_LOCKDOWN", true},
    {TARVIKNS::PROGRAM_OPTION::PROGRAM_ONLYFPGA, "PROGRAM_ONLYFPGA", false},
    {TARVIKNS::PROGRAM_OPTION::READ_PROTECT_NOBSCANTEST, "READ_PROTECT_NOBSCANTEST", false},
    {TARVIKNS::PROGRAM_OPTION::OTP, "OTP", false},
    {TARVIKNS::PROGRAM_OPTION::ASSERT_INIT, "ASSERT_INIT", false},
    {TARVIKNS::PROGRAM_OPTION::DATA_WIDTH, "DATA_WIDTH", false},
    {TARVIKNS::PROGRAM_OPTION::RS_PIN1, "RS_PIN1", false},
    {TARVIKNS::PROGRAM_OPTION::RS_PIN0, "RS_PIN0", false},
}};

/// A table is indexed by value, so row i must hold value i.
template <typename Table>
[[nodiscard]] consteval bool isInValueOrder(const Table& table) {
    for (std::size_t row = 0; row < table.size(); ++row) {
        if (static_cast<std::size_t>(table[row].value) != row) {
            return false;
        }
    }
    return true;
}
static_assert(isInValueOrder(MODES));
static_assert(isInValueOrder(OUTPUTS));
static_assert(isInValueOrder(OPERATIONS));
static_assert(isInValueOrder(OPTIONS));

/// The row of a value; null for a value that has none.
template <typename Table, typename Value>
[[nodiscard]] constexpr auto rowOf(const Table& table, Value value) -> decltype(table.data()) {
    const auto row = static_cast<std::size_t>(value);
    return row < table.size() ? &table[row] : nullptr;
}

/// The key name of a mode; "BS" for a value that is no mode.
[[nodiscard]] inline const char* modeKey(TARVIKNS::MODE_TYPE mode) noexcept {
    const Mode* const row = rowOf(MODES, mode);
    return (row == nullptr ? MODES.front() : *row).key;
}

/// The key name of an operation; empty, after an info message, for a value that is no operation.
[[nodiscard]] const char* operationKey(TARVIKNS::OP_TYPE operation);

/// The display name of a mode; that of `PFF` for a value that is no mode. The result is also kept in
/// `lastModeName`, from which refusals take it.
const char* modeDisplayName(TARVIKNS::MODE_TYPE mode) noexcept;

/// The display name of an output; that of `NONE` for a value that is no output. Also kept in
/// `lastOutputName`.
const char* outputDisplayName(TARVIKNS::OUTPUT_TYPE output) noexcept;

// Process-wide: the last results of the two look-ups.
inline const char* lastModeName = "";
inline const char* lastOutputName = "";

} // namespace wordTables
