// Manager and reference over scenarios written by hand; those that a random search finds are put here too.
#include "CallRunner.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using namespace reference;
using namespace std::string_literals;

/// A small world with a bit of everything.
Files world() {
    return {{"base.acd", "DEVICE_SUPPORTED = kes,spi\n"
                         "PROGRAM_OPTION_PACKAGE = KS50PQ,base,kes,spi\n"
                         "BS = outs,PARALLEL,USB2,QSVF:fams,kes\n"
                         "SPI = outs,USB2:fams,spi\n"
                         "NOT_SUPPORTED_PART_IN_MODE = BS_KS50_PQ\n"
                         "IDCODE = KS50,0x1:KS50,0x2:KS100\n"},
            {"kes.acd", "OPERATION = PROGRAM,Bscan,PARALLEL,USB2:VERIFY,Bscan,USB2\n"
                        "BSDL_OPERATION = BYPASS,PARALLEL\n"
                        "PROGRAM_OPTION = VERIFY,Bscan,USB2\n"
                        "PROPERTY = VENDOR,Korvel:PROGRAM,BS:OP_PROGRAM,fast:VERIFY,BS:OP_VERIFY_BS,slow\n"
                        "[KS50]\n"
                        "PROGRAM_OPTION = ERASE,Bscan,USB2\n"
                        "PROPERTIES = PINS,2,144,100:FLASH,1,TRUE\n"},
            {"spi.acd", "DEVICE_FAMILY = FLASH,ST1\n"
                        "FLASH_DEVICES = FLASH25,FLASH40\n"
                        "FLASH25_PROPERTY = SIZE,16:WRITABLE,true\n"
                        "ST1_DEVICES = FLASH40\n"
                        "ST1_PROPERTY = SIZE,32\n"
                        "TYPE_MB_SPI_NONE_LEAD = KS50,FLASH25\n"
                        "OPERATION = ERASE,SPI,USB2\n"
                        "PROGRAM_OPTION = VERIFY,SPI,USB2\n"}};
}

TEST(ManagerAgreementByHand, OverNoDatabasesAtAll) {
    expectAgreement({{},
                     {{Method::GET_OPERATION_ORDERS, {}},
                      {Method::GET_DEVICE_OPERATIONS, {"KS50"s, 0, 2}},
                      {Method::SET_EXCEPTIONS, {false}},
                      {Method::GET_DEVICE_OPERATIONS, {"KS50"s, 0, 2}},
                      {Method::CHECK_OUTPUT, {0, 0}},
                      {Method::DUMP_MB_BPI_SPI, {}}}});
}

TEST(ManagerAgreementByHand, OverASpiDatabaseWithoutABase) {
    expectAgreement({{{"spi.acd"s, "DEVICE_FAMILY = FLASH\n"s}},
                     {{Method::GET_PART_FAMILY, {"spi_x"s}},
                      {Method::GET_PART_FAMILY, {"FLASH"s}},
                      {Method::GET_PART_FAMILY, {"spi"s}}}});
}

TEST(ManagerAgreementByHand, OnlyTheWholeNameSpiIsSpi) {
    expectAgreement({{}, {{Method::GET_PART_FAMILY, {"spi_x"s}}}});
}

TEST(ManagerAgreementByHand, AFamilyIsNotTheBaseInAnotherCase) {
    expectAgreement({world(),
                     {{Method::GET_PART_FAMILY, {"KS50"s}},
                      {Method::ADD_CACHED_DEVICE_FAMILY, {"dev"s, "BASE"s}},
                      {Method::IS_KORVEL_DEVICE, {"dev"s}}}});
}

TEST(ManagerAgreementByHand, WhenAnUnknownOptionStopsTheStartUp) {
    Files files = world();
    files["spi.acd"] += "PROGRAM_OPTION = OTP,SPI,USB2\n";
    expectAgreement({files, {{Method::GET_OPERATION_ORDERS, {}}, {Method::DUMP_MB_BPI_SPI, {}}}});
}

TEST(ManagerAgreementByHand, EachQueryOfADevice) {
    expectAgreement({world(),
                     {{Method::GET_DEVICE_OPERATIONS, {"KS50"s, 0, 2}},
                      {Method::GET_PROGRAM_OPTIONS, {"KS50"s, 0, 2, nullptr}},
                      {Method::GET_PROGRAM_OPTIONS, {"KS50"s, 0, 2, "PQ"s}},
                      {Method::GET_BSDL_OPERATIONS, {"KS50"s, 0}},
                      {Method::GET_DEVICE_OPERATION_OPTIONS, {"KS50"s, "PROGRAM"s, 0}},
                      {Method::GET_DEVICE_OPERATION_OPTIONS, {"KS50"s, "VERIFY"s, 0}},
                      {Method::GET_DEVICE_STRING_PROPERTIES, {"KS50"s, "PINS"s}},
                      {Method::GET_DEVICE_STRING_PROPERTY, {"KS50"s, "PINS"s}},
                      {Method::GET_DEVICE_LONG_PROPERTY, {"KS50"s, "PINS"s}},
                      {Method::GET_DEVICE_LONG_PROPERTY, {"KS50"s, "none"s}},
                      {Method::GET_DEVICE_BOOL_PROPERTY, {"KS50"s, "FLASH"s}},
                      {Method::CHECK_OPERATION, {0, 2, "KS50"s, 3, nullptr}},
                      {Method::CHECK_OPERATION_PROPERTY, {"KS50"s, 0, 0, nullptr}},
                      {Method::CHECK_DEVICE, {0, "KS50"s, "PQ"s}},
                      {Method::CHECK_OUTPUT_AND_DEVICE, {0, 2, "KS50"s, nullptr}},
                      {Method::GET_ALL_DEVICE_IDCODES, {}}}});
}

TEST(ManagerAgreementByHand, EachQueryOfASpiFlash) {
    expectAgreement({world(),
                     {{Method::IS_SPI_DEVICE, {"flash25"s}},
                      {Method::GET_PART_FAMILY, {"flash25"s}},
                      {Method::GET_SPI_DEVICE_STRING_PROPERTY, {"flash25"s, "SIZE"s}},
                      {Method::GET_SPI_DEVICE_BOOL_PROPERTY, {"flash25"s, "writable"s}},
                      {Method::GET_SPI_DEVICE_LONG_PROPERTY, {"flash40"s, "size"s}},
                      {Method::GET_DEVICE_LONG_PROPERTY, {"flash40"s, "size"s}},
                      {Method::GET_DEVICE_OPERATIONS, {"flash25"s, 5, 2}},
                      {Method::GET_PROGRAM_OPTIONS, {"flash25"s, 5, 2, nullptr}},
                      {Method::IS_MB_BPI_SPI_SUPPORT, {"ks50"s, "TYPE_MB_SPI"s, "NONE"s, true}},
                      {Method::DUMP_MB_BPI_SPI, {}}}});
}

TEST(ManagerAgreementByHand, EachDumpToEitherSink) {
    std::vector<Call> calls{{Method::GET_DEVICE_OPERATIONS, {"KS50"s, 0, 2}}};
    for (const Method dump : {Method::DUMP_OPERATIONS_TABLE, Method::DUMP_BSDL_OPERATIONS_TABLE,
                              Method::DUMP_PROGRAM_OPTIONS_TABLE, Method::DUMP_CACHED_DEVICE_FAMILIES}) {
        calls.push_back({dump, {true}});
        calls.push_back({dump, {false}});
    }
    expectAgreement({world(), calls});
}

TEST(ManagerAgreementByHand, NullForEachText) {
    expectAgreement({world(),
                     {{Method::SET_EXCEPTIONS, {false}},
                      {Method::GET_PART_FAMILY, {nullptr}},
                      {Method::ADD_CACHED_DEVICE_FAMILY, {nullptr, nullptr}},
                      {Method::GET_DEVICE_OPERATIONS, {nullptr, 0, 0}},
                      {Method::GET_PROGRAM_OPTIONS, {nullptr, 0, 0, nullptr}},
                      {Method::GET_BSDL_OPERATIONS, {nullptr, 0}},
                      {Method::GET_DEVICE_OPERATION_OPTIONS, {nullptr, nullptr, 0}},
                      {Method::GET_DEVICE_STRING_PROPERTY, {nullptr, nullptr}},
                      {Method::GET_SPI_DEVICE_STRING_PROPERTY, {nullptr, nullptr}},
                      {Method::IS_MB_BPI_SPI_SUPPORT, {nullptr, nullptr, nullptr, false}},
                      {Method::CHECK_OUTPUT_AND_DEVICE, {0, 0, nullptr, nullptr}},
                      {Method::CHECK_OPERATION, {0, 0, nullptr, 0, nullptr}},
                      {Method::CHECK_OPERATION_PROPERTY, {nullptr, 0, 0, nullptr}},
                      {Method::MODE_STRING_2_TYPE, {nullptr}},
                      {Method::CABLE_STRING_2_TYPE, {nullptr}},
                      {Method::OPERATION_STRING_2_TYPE, {nullptr}},
                      {Method::OPERATION_DISPLAY_STRING_2_TYPE, {nullptr}},
                      {Method::OPTION_STRING_2_TYPE, {nullptr}}}});
}

TEST(ManagerAgreementByHand, EachValueAroundTheEnumerations) {
    std::vector<Call> calls;
    for (int value = -2; value < 35; ++value) {
        calls.push_back({Method::MODE_TYPE_2_STRING, {value}});
        calls.push_back({Method::CABLE_TYPE_2_STRING, {value}});
        calls.push_back({Method::OPERATION_TYPE_2_STRING, {value}});
        calls.push_back({Method::OPERATION_TYPE_2_DISPLAY_STRING, {value}});
        calls.push_back({Method::OPTION_TYPE_2_STRING, {value}});
        calls.push_back({Method::CHECK_OUTPUT, {value, 0}});
        calls.push_back({Method::CHECK_OUTPUT, {0, value}});
        calls.push_back({Method::GET_DEVICE_OPERATIONS, {"KS50"s, value, value}});
        calls.push_back({Method::GET_BSDL_OPERATIONS, {"KS50"s, value}});
        calls.push_back({Method::CHECK_OPERATION, {0, 2, "KS50"s, value, nullptr}});
    }
    expectAgreement({world(), calls});
}

std::string repeated(const std::string& text, int times) {
    std::string all;
    for (int time = 0; time < times; ++time) {
        all += text + std::to_string(time);
    }
    return all;
}

TEST(ManagerAgreementByHand, ListsLongerThanAnIndexReaches) {
    constexpr int TOO_MANY = 32771;
    Files files{{"base.acd", "IDCODE = a" + repeated(":b", TOO_MANY) + "\n" + //
                                 "NOT_SUPPORTED_PART_IN_MODE = a" + repeated(",b", TOO_MANY) + "\n"},
                {"spi.acd", "AT1_DEVICES = a" + repeated(",b", TOO_MANY) + "\n"},
                {"kes.acd", "PROPERTIES = A,40000" + repeated(",v", TOO_MANY) + "\n" + //
                                "PROPERTY = B,x" + repeated(":C,", TOO_MANY) + "\n"}};
    expectAgreement({files,
                     {{Method::SET_EXCEPTIONS, {false}},
                      {Method::GET_ALL_DEVICE_IDCODES, {}},
                      {Method::GET_DEVICE_STRING_PROPERTIES, {"kes"s, "A"s}},
                      {Method::GET_DEVICE_STRING_PROPERTIES, {"kes"s, "C"s}}}});
}

TEST(ManagerAgreementByHand, EveryNameReadsBack) {
    const Files files = world();
    std::vector<Call> calls;
    for (const char* name : {"PROGRAM",
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
                             "EXPRESSQSVF"}) {
        calls.push_back({Method::OPERATION_STRING_2_TYPE, {name}});
    }
    for (const char* name :
         {"ERASE", "VERIFY", "READPROTECT", "WRITEPROTECT", "FUNCTIONTEST", "SKIPUSERARRAY", "LOADFPGA",
          "PARALLELMODE", "USED4", "USERCODE", "UES", "SECUREMODE", "PROGRAMKEY", "OTF", "PROG",
          "SECTOR_PROTECT", "SECTOR_LOCKDOWN", "PROGRAM_ONLYFPGA"}) {
        calls.push_back({Method::OPTION_STRING_2_TYPE, {name}});
    }
    for (const char* name : {"BS", "Bscan", "SS", "SSerial", "SM", "Smap", "BSFILE", "DTCONFIG", "DP770",
                             "SPI", "CF", "KITECF", "CompactFlash", "MPM", "KITEMPM", "PFF", "PromFile"}) {
        calls.push_back({Method::MODE_STRING_2_TYPE, {name}});
    }
    for (const char* name : {"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL", "QSVF", "EXPRESSSVF", "EXPRESSQSVF",
                             "NULLCABLE", "NONE"}) {
        calls.push_back({Method::CABLE_STRING_2_TYPE, {name}});
    }
    expectAgreement({files, calls});
}

} // namespace
