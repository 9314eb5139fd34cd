#pragma once

#include "RandomSource.h"

#include <string>

/// The words that random databases and random calls are made of: few, so that they meet.
namespace reference::words {

inline const Words FAMILIES{"kes", "Mir", "zor_x", "quillfamilyname16", "pct%%%d"};

/// What a family may be called that no file is named after.
inline const Words OTHER_FAMILIES{"base", "BASE", "spi", "SPI", "", "KES", "KS50"};

/// Some are named as families are, or as what a longer name leaves when it is cut.
inline const Words DEVICES{"KS50",    "ks100",   "MX2",  "zor", "KS50_PQ", "KS50",
                           "KS50_PQ", "FLASH25", "AT45", "mir", "dev%s",   "kes_x"};

/// Some are named as other devices, as families or as classes are.
inline const Words SPI_NAMES{"FLASH25", "AT45", "M25", "ST1", "BPI2", "KS50", "at45", "SPI", "N%25", "KES"};

inline const Words PACKAGES{"PQ", "_PQ", "44", "x"};

inline const Words MODES{"BS", "SS", "SM", "BSFILE", "DP770", "SPI", "KITECF", "KITEMPM", "PFF"};

inline const Words MODE_NAMES{"Bscan", "SS",       "SSerial", "SM",      "Smap",         "BSFILE", "DTCONFIG",
                              "DP770", "SPI",      "CF",      "KITECF",  "CompactFlash", "MPM",    "KITEMPM",
                              "PFF",   "PromFile", "bscan",   "sserial", "kitecf",       "BS"};

/// Those that come up most.
inline const Words USUAL_MODE_NAMES{"Bscan", "SS", "SPI", "Smap"};
inline const Words USUAL_MODES{"BS", "SS", "SPI", "SM"};

/// Those that have a place in the tables come more often.
inline const Words OUTPUT_NAMES{"PARALLEL", "ZORVA", "USB2", "SVF",   "STAPL",      "PARALLEL",
                                "USB2",     "SVF",   "USB2", "ZORVA", "EXPRESSSVF", "EXPRESSQSVF"};

inline const Words UNKNOWN_OUTPUT_NAMES{"QSVF", "NULLCABLE", "NONE", "usb2", "", "USB2 "};

inline const Words OPERATION_NAMES{"PROGRAM",    "VERIFY",      "ERASE",   "PROGRAM", "VERIFY",
                                   "READIDCODE", "BYPASS",      "HIGHZ",   "program", "Verify",
                                   "EXPRESSSVF", "EXPRESSQSVF", "CHECKSUM"};

inline const Words OPTION_NAMES{"ERASE", "VERIFY",      "USED4", "SECTOR_LOCKDOWN",
                                "PROG",  "READPROTECT", "OTF",   "UES"};

inline const Words UNKNOWN_OPTION_NAMES{"OTP", "RS_PIN0", "erase", "", "PROGRAM_ONLYFPGA"};

inline const Words DISPLAY_NAMES{"Program",       "Program FPGA Only ", "Program FPGA Only",
                                 "one step qsvf", "PROGRAM USERCODE",   "Get Device Signature/Usercode",
                                 "VERIFY"};

/// Many collide: "KS50" + "PQ_PINS" is "KS50_PQ" + "PINS".
inline const Words PROPERTIES{"VENDOR", "PINS", "pins", "x_PINS", "PQ_PINS", "PINS", "PQ_PINS"};

/// Properties that hold the options of an operation, in any mode or in one.
inline const Words OPTION_PROPERTIES{"OP_PROGRAM",   "OP_PROGRAM_BS", "OP_PROGRAM_SS", "OP_VERIFY_BS",
                                     "OP_VERIFY_SS", "OP_ERASE_BS",   "OP_ERASE_SPI",  "op_erase"};

/// Properties that list modes.
inline const Words OPERATION_PROPERTIES{"PROGRAM", "VERIFY", "ERASE", "program"};

/// Some are names that the manager can be asked about in turn.
inline const Words VALUES{
    "KS50",        "KS50_PQ",     "PINS", "PQ_PINS", "a value that is longer than short texts are",
    "TRUE",        "TRUE",        "7",    "-1",      "FALSE",
    "true",        "B",           "A",    " 12x",    "",
    "99999999999", "-2147483649", "50%",  "+3"};

inline const Words SPI_PROPERTIES{"SIZE", "ERASABLE", "WIDTH", "Size", "5SIZE"};
inline const Words SPI_VALUES{"TRUE", "true", "yes", "16", "-4", "", "abc"};

inline const Words CLASSES{"AT1", "ST1", "ST2", "BPI1", "BPI2", "BPI3"};

inline const Words MULTIBOOT_TYPES{"TYPE_BPI_SERIAL",    "TYPE_BPI_PARALLEL",    "TYPE_MB_SPI_NONE",
                                   "TYPE_MB_BPI_SERIAL", "TYPE_MB_BPI_PARALLEL", "TYPE_MB_QPRM_NONE"};
inline const Words TYPE_PREFIXES{"TYPE_BPI",     "TYPE_MB_SPI", "TYPE_MB_BPI",
                                 "TYPE_MB_QPRM", "type_mb_spi", "TYPE_"};
inline const Words WIDTHS{"SERIAL", "PARALLEL", "NONE", "none"};

/// What is no name of anything.
inline const Words NOISE{"",  "nobody", "_",   "%", "%%",   "%n%s", "\xFF\x80",
                         " ", "a=b",    "[x]", "#", "base", "spi"};

} // namespace reference::words
