// The reference's vocabulary: the key names, display names and converters, typed a second time so that a slip in
// the manager's tables shows.
#include "Reference.h"

namespace reference {

namespace {

using Names = std::vector<std::string>;

const Names MODES{"BS", "SS", "SM", "BSFILE", "DP770", "SPI", "KITECF", "KITEMPM", "PFF"};

/// Other names that are read as a mode.
const std::map<std::string, int> READABLE_MODES{
    {"BSCAN", 0},    {"SS", 1},      {"SSERIAL", 1}, {"SM", 2},      {"SMAP", 2},   {"BSFILE", 3},
    {"DTCONFIG", 4}, {"DP770", 4},   {"SPI", 5},     {"CF", 6},      {"KITECF", 6}, {"COMPACTFLASH", 6},
    {"MPM", 7},      {"KITEMPM", 7}, {"PFF", 8},     {"PROMFILE", 8}};

const Names MODE_DISPLAYS{"Boundary Scan mode",       "Slave Serial mode",       "Select Map mode",
                          "Boundary Scan File mode",  "Destop Programming mode", "SPI mode",
                          "Kite Compact Flash  mode", "Kite MPM  mode",          "Prom File Formatter mode"};

const Names OUTPUTS{"PARALLEL", "ZORVA",      "USB2",        "SVF",       "STAPL",
                    "QSVF",     "EXPRESSSVF", "EXPRESSQSVF", "NULLCABLE", "NONE"};

const Names OUTPUT_DISPLAYS{
    "Parallel cable", "ZORVA cable", "USB2 cable",   "SVF",        "Stapl",
    "QSVF",           "Express SVF", "Express QSVF", "Null cable", "Unspecified cable"};

const Names OPERATIONS{"PROGRAM",
                       "PROGRAMFLASH",
                       "PROGRAMFPGAONLY",
                       "VERIFY",
                       "ERASE",
                       "FUNCTIONTEST",
                       "BLANKCHECK",
                       "READBACKTOFILE",
                       "PROGRAMUES",
                       "READIDCODE",
                       "CHECKSUM",
                       "READUSERCODE",
                       "READCUSTOMERCODE",
                       "READUES",
                       "ACTIVATEOTF",
                       "VALIDATEUSERCODE",
                       "CHECKIDCODE",
                       "READSTATUSREGISTER",
                       "LOADCONFIGURATIONREVISION",
                       "BYPASS",
                       "HIGHZ",
                       "CLAMP",
                       "DOPRELOAD",
                       "ISPENABLE",
                       "CONLD",
                       "PROGRAMKEY",
                       "SECUREMODE",
                       "READTEMP",
                       "PROGRAMUSERCODE",
                       "PROGRAMCUSTOMERCODE",
                       "EXPRESSSVF",
                       "EXPRESSQSVF"};

const Names OPERATION_DISPLAYS{"Program",
                               "Program Flash and FPGA",
                               "Program FPGA Only ",
                               "Verify",
                               "Erase",
                               "Function Test",
                               "Blank Check",
                               "Readback",
                               "Program MIREL UES",
                               "Get Device ID",
                               "Get Device Checksum",
                               "Get Device Signature/Usercode",
                               "Get Device Customer Code",
                               "Get MIREL Device UES",
                               "Activate On-The-Fly Pattern",
                               "Validate Usercode",
                               "Check Idcode",
                               "Read Device Status",
                               "Load Configuration Revision",
                               "Bypass",
                               "Highz",
                               "Clamp",
                               "Do Preload",
                               "Ispenable",
                               "Conld",
                               "Program Key",
                               "Secure Mode",
                               "Read Temp and Voltage",
                               "PROGRAM USERCODE",
                               "PROGRAM CUSTOMER CODE",
                               "One Step SVF",
                               "One Step QSVF"};

const Names OPTIONS{"ERASE",
                    "VERIFY",
                    "READPROTECT",
                    "WRITEPROTECT",
                    "FUNCTIONTEST",
                    "SKIPUSERARRAY",
                    "LOADFPGA",
                    "PARALLELMODE",
                    "USED4",
                    "USERCODE",
                    "UES",
                    "SECUREMODE",
                    "PROGRAMKEY",
                    "OTF",
                    "PROG",
                    "SECTOR_PROTECT",
                    "SECTOR_LOCKDOWN",
                    "PROGRAM_ONLYFPGA",
                    "READ_PROTECT_NOBSCANTEST",
                    "OTP",
                    "ASSERT_INIT",
                    "DATA_WIDTH",
                    "RS_PIN1",
                    "RS_PIN0"};
constexpr int READABLE_OPTIONS = 17;

std::optional<std::string> nameAt(const Names& names, int value) {
    if (value < 0 || value >= static_cast<int>(names.size())) {
        return std::nullopt;
    }
    return names[static_cast<std::size_t>(value)];
}

std::optional<int> valueOf(const Names& names, const std::string& name) {
    for (std::size_t value = 0; value < names.size(); ++value) {
        if (names[value] == name) {
            return static_cast<int>(value);
        }
    }
    return std::nullopt;
}

std::optional<int> valueWithoutCase(const Names& names, const std::string& name) {
    for (std::size_t value = 0; value < names.size(); ++value) {
        if (upper(names[value]) == upper(name)) {
            return static_cast<int>(value);
        }
    }
    return std::nullopt;
}

std::string notDefined(const std::string& what) { return "Operation " + what + " is not defined.\n"; }

} // namespace

std::string modeDisplayName(int mode) {
    return nameAt(MODE_DISPLAYS, mode).value_or("Prom File Formatter mode");
}

std::string outputDisplayName(int output) {
    return nameAt(OUTPUT_DISPLAYS, output).value_or("Unspecified cable");
}

TARVIKNS::MODE_TYPE Reference::modeString2Type(const char* text) {
    const auto found = READABLE_MODES.find(upper(textOf(text)));
    return static_cast<TARVIKNS::MODE_TYPE>(found == READABLE_MODES.end() ? 0 : found->second);
}

std::string Reference::modeType2String(TARVIKNS::MODE_TYPE mode) {
    return nameAt(MODES, static_cast<int>(mode)).value_or("BS");
}

TARVIKNS::OUTPUT_TYPE Reference::cableString2Type(const char* text) {
    const std::string name = textOf(text);
    const bool unreadable = name == "QSVF" || name == "NULLCABLE";
    return static_cast<TARVIKNS::OUTPUT_TYPE>(unreadable ? 9 : valueOf(OUTPUTS, name).value_or(9));
}

std::string Reference::cableType2String(TARVIKNS::OUTPUT_TYPE output) {
    return nameAt(OUTPUTS, static_cast<int>(output)).value_or("");
}

TARVIKNS::OP_TYPE Reference::operationString2Type(const char* text) {
    const auto value = valueWithoutCase(OPERATIONS, textOf(text));
    if (!value) {
        issueInfo(ANY_LINE, notDefined(text == nullptr ? "(null)" : text));
    }
    return static_cast<TARVIKNS::OP_TYPE>(value.value_or(32));
}

TARVIKNS::OP_TYPE Reference::operationDisplayString2Type(const char* text) {
    const auto value = valueWithoutCase(OPERATION_DISPLAYS, textOf(text));
    if (!value) {
        issueInfo(ANY_LINE, notDefined(text == nullptr ? "(null)" : text));
    }
    return static_cast<TARVIKNS::OP_TYPE>(value.value_or(32));
}

std::string Reference::operationType2String(TARVIKNS::OP_TYPE operation) {
    const int value = static_cast<int>(operation);
    if (!nameAt(OPERATIONS, value)) {
        issueInfo(ANY_LINE, notDefined(std::to_string(value)));
    }
    return nameAt(OPERATIONS, value).value_or("");
}

std::string Reference::operationType2DisplayString(TARVIKNS::OP_TYPE operation) {
    const int value = static_cast<int>(operation);
    if (!nameAt(OPERATION_DISPLAYS, value)) {
        issueInfo(ANY_LINE, notDefined(std::to_string(value)));
    }
    return nameAt(OPERATION_DISPLAYS, value).value_or("");
}

TARVIKNS::PROGRAM_OPTION Reference::optionString2Type(const char* text) {
    const auto value = valueOf(OPTIONS, textOf(text));
    if (!value || *value >= READABLE_OPTIONS) {
        throw Raised{"DataMismatchException", 1500};
    }
    return static_cast<TARVIKNS::PROGRAM_OPTION>(*value);
}

std::string Reference::optionType2String(TARVIKNS::PROGRAM_OPTION option) {
    const auto name = nameAt(OPTIONS, static_cast<int>(option));
    if (!name) {
        throw Raised{"DataMismatchException", 1413};
    }
    return *name;
}

void Reference::removePackageName(std::string& device) { device = baseName(device); }

} // namespace reference
