#pragma once

// One call of each exported method, and small databases that answer them: what is asked while the machine refuses.

#include "reference/Call.h"

#include <vector>

namespace torture {

inline const reference::Files DATABASES{
    {"base.acd", "DEVICE_SUPPORTED = finch,swift,spi\n"
                 "PROGRAM_OPTION_PACKAGE = FN10_PQ,finch,spi\n"
                 "BS = outputs,PARALLEL,USB2:families,finch\n"
                 "NOT_SUPPORTED_PART_IN_MODE = BS_FN10_PQ\n"
                 "IDCODE = FN10,0x0010\n"},
    {"finch.acd",
     "OPERATION = PROGRAM,Bscan,USB2\nBSDL_OPERATION = HIGHZ,USB2\nPROGRAM_OPTION = ERASE,Bscan,USB2\n"
     "PROPERTY = VENDOR_OF_ALL_FINCHES,A_value_that_is_longer_than_short_texts_are\n"
     "PROPERTIES = PROGRAM,1,BS:OP_PROGRAM,2,VERIFY,ERASE\n"
     "[FN10]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTY = PINS,44\n"},
    {"swift.acd", "OPERATION = VERIFY,Bscan,USB2\nPROPERTY = PINS,100\n[SW10]\n"},
    {"spi.acd",
     "DEVICE_FAMILY = NV\nNV_DEVICES = FLA\nFLA_PROPERTY = SIZE,16:ERASABLE,TRUE\nAT1_DEVICES = FLA\n"
     "OPERATION = ERASE,SPI,USB2\nTYPE_MB_SPI_NONE_LEAD = FLA\n"}};

/// One for each method, about things that have to be loaded first where the method can load.
[[nodiscard]] inline const std::vector<reference::Call>& calls() {
    using enum reference::Method;
    static const std::vector<reference::Call> CALLS{
        {GET_CONSTRAINTS_MANAGER, {}},
        {SET_EXCEPTIONS, {true}},
        {GET_OPERATION_ORDERS, {}},
        {GET_PROGRAM_OPTION_ORDERS, {}},
        {MODE_STRING_2_TYPE, {"CompactFlash"}},
        {MODE_TYPE_2_STRING, {6}},
        {CABLE_STRING_2_TYPE, {"EXPRESSQSVF"}},
        {CABLE_TYPE_2_STRING, {7}},
        {OPERATION_STRING_2_TYPE, {"verify"}},
        {OPERATION_TYPE_2_STRING, {3}},
        {OPERATION_DISPLAY_STRING_2_TYPE, {"Program Flash and FPGA"}},
        {OPERATION_TYPE_2_DISPLAY_STRING, {1}},
        {OPTION_STRING_2_TYPE, {"SECTOR_LOCKDOWN"}},
        {OPTION_TYPE_2_STRING, {1}},
        {REMOVE_PACKAGE_NAME, {"FN10_a_package_that_is_longer_than_short_texts_are"}},
        {CHECK_OUTPUT, {0, 3}},
        {CHECK_DEVICE, {0, "FN10", "PQ"}},
        {CHECK_OUTPUT_AND_DEVICE, {0, 2, "FN10_PQ", nullptr}},
        {CHECK_OPERATION, {0, 2, "FN10", 0, nullptr}},
        {CHECK_OPERATION_PROPERTY, {"FN10", 0, 0, nullptr}},
        {GET_DEVICE_OPERATIONS, {"FN10", 0, 2}},
        {GET_PROGRAM_OPTIONS, {"FN10", 0, 2, "_PQ"}},
        {GET_BSDL_OPERATIONS, {"FN10", 2}},
        {GET_DEVICE_OPERATION_OPTIONS, {"FN10", "PROGRAM", 0}},
        {GET_DEVICE_STRING_PROPERTIES, {"FN10", "VENDOR_OF_ALL_FINCHES"}},
        {GET_DEVICE_STRING_PROPERTY, {"FN10", "a_key_that_is_longer_than_short_texts_are"}},
        {GET_DEVICE_BOOL_PROPERTY, {"FN10", "PINS"}},
        {GET_DEVICE_LONG_PROPERTY, {"FN10", "PINS"}},
        {GET_PART_FAMILY, {"FN10"}},
        {ADD_CACHED_DEVICE_FAMILY, {"FN10_PQ", "finch"}},
        {IS_KORVEL_DEVICE, {"FN10"}},
        {GET_ALL_DEVICE_IDCODES, {}},
        {IS_SPI_DEVICE, {"fla"}},
        {GET_SPI_DEVICE_STRING_PROPERTY, {"a_flash_that_is_longer_than_short_texts_are", "SIZE"}},
        {GET_SPI_DEVICE_BOOL_PROPERTY, {"FLA", "ERASABLE"}},
        {GET_SPI_DEVICE_LONG_PROPERTY, {"FLA", "SIZE"}},
        {IS_MB_BPI_SPI_SUPPORT, {"FLA", "TYPE_MB_SPI", "NONE", true}},
        {DUMP_OPERATIONS_TABLE, {true}},
        {DUMP_BSDL_OPERATIONS_TABLE, {true}},
        {DUMP_PROGRAM_OPTIONS_TABLE, {true}},
        {DUMP_CACHED_DEVICE_FAMILIES, {true}},
        {DUMP_MB_BPI_SPI, {}},
    };
    return CALLS;
}

} // namespace torture
