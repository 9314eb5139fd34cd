#include "ManagerFixture.h"

#include <climits>

// The names of operations and programming options: every row in both directions, and what the unknown gives.

using TARVIKNS::NO_OPERATION;
using TARVIKNS::OP_TYPE;
using TARVIKNS::PROGRAM_OPTION;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

struct OperationRow {
    OP_TYPE operation;
    const char* key;
    const char* display;
};
constexpr OperationRow OPERATIONS[] = {
    {OP_TYPE::PROGRAM, "PROGRAM", "Program"},
    {OP_TYPE::PROGRAMFLASH, "PROGRAMFLASH", "Program Flash and FPGA"},
    {OP_TYPE::PROGRAMFPGAONLY, "PROGRAMFPGAONLY", "Program FPGA Only "},
    {OP_TYPE::VERIFY, "VERIFY", "Verify"},
    {OP_TYPE::ERASE, "ERASE", "Erase"},
    {OP_TYPE::FUNCTIONTEST, "FUNCTIONTEST", "Function Test"},
    {OP_TYPE::BLANKCHECK, "BLANKCHECK", "Blank Check"},
    {OP_TYPE::READBACKTOFILE, "READBACKTOFILE", "Readback"},
    {OP_TYPE::PROGRAMUES, "PROGRAMUES", "Program MIREL UES"},
    {OP_TYPE::READIDCODE, "READIDCODE", "Get Device ID"},
    {OP_TYPE::CHECKSUM, "CHECKSUM", "Get Device Checksum"},
    {OP_TYPE::READUSERCODE, "READUSERCODE", "Get Device Signature/Usercode"},
    {OP_TYPE::READCUSTOMERCODE, "READCUSTOMERCODE", "Get Device Customer Code"},
    {OP_TYPE::READUES, "READUES", "Get MIREL Device UES"},
    {OP_TYPE::ACTIVATEOTF, "ACTIVATEOTF", "Activate On-The-Fly Pattern"},
    {OP_TYPE::VALIDATEUSERCODE, "VALIDATEUSERCODE", "Validate Usercode"},
    {OP_TYPE::CHECKIDCODE, "CHECKIDCODE", "Check Idcode"},
    {OP_TYPE::READSTATUSREGISTER, "READSTATUSREGISTER", "Read Device Status"},
    {OP_TYPE::LOADCONFIGURATIONREVISION, "LOADCONFIGURATIONREVISION", "Load Configuration Revision"},
    {OP_TYPE::BYPASS, "BYPASS", "Bypass"},
    {OP_TYPE::HIGHZ, "HIGHZ", "Highz"},
    {OP_TYPE::CLAMP, "CLAMP", "Clamp"},
    {OP_TYPE::DOPRELOAD, "DOPRELOAD", "Do Preload"},
    {OP_TYPE::ISPENABLE, "ISPENABLE", "Ispenable"},
    {OP_TYPE::CONLD, "CONLD", "Conld"},
    {OP_TYPE::PROGRAMKEY, "PROGRAMKEY", "Program Key"},
    {OP_TYPE::SECUREMODE, "SECUREMODE", "Secure Mode"},
    {OP_TYPE::READTEMP, "READTEMP", "Read Temp and Voltage"},
    {OP_TYPE::PROGRAMUSERCODE, "PROGRAMUSERCODE", "PROGRAM USERCODE"},
    {OP_TYPE::PROGRAMCUSTOMERCODE, "PROGRAMCUSTOMERCODE", "PROGRAM CUSTOMER CODE"},
    {OP_TYPE::EXPRESSSVF, "EXPRESSSVF", "One Step SVF"},
    {OP_TYPE::EXPRESSQSVF, "EXPRESSQSVF", "One Step QSVF"},
};

struct OptionRow {
    PROGRAM_OPTION option;
    const char* key;
};
constexpr OptionRow OPTIONS[] = {
    {PROGRAM_OPTION::ERASE, "ERASE"},
    {PROGRAM_OPTION::VERIFY, "VERIFY"},
    {PROGRAM_OPTION::READPROTECT, "READPROTECT"},
    {PROGRAM_OPTION::WRITEPROTECT, "WRITEPROTECT"},
    {PROGRAM_OPTION::FUNCTIONTEST, "FUNCTIONTEST"},
    {PROGRAM_OPTION::SKIPUSERARRAY, "SKIPUSERARRAY"},
    {PROGRAM_OPTION::LOADFPGA, "LOADFPGA"},
    {PROGRAM_OPTION::PARALLELMODE, "PARALLELMODE"},
    {PROGRAM_OPTION::USED4, "USED4"},
    {PROGRAM_OPTION::USERCODE, "USERCODE"},
    {PROGRAM_OPTION::UES, "UES"},
    {PROGRAM_OPTION::SECUREMODE, "SECUREMODE"},
    {PROGRAM_OPTION::PROGRAMKEY, "PROGRAMKEY"},
    {PROGRAM_OPTION::OTF, "OTF"},
    {PROGRAM_OPTION::PROG, "PROG"},
    {PROGRAM_OPTION::SECTOR_PROTECT, "SECTOR_PROTECT"},
    {PROGRAM_OPTION::SECTOR_LOCKDOWN, "SECTOR_LOCKDOWN"},
    {PROGRAM_OPTION::PROGRAM_ONLYFPGA, "PROGRAM_ONLYFPGA"},
    {PROGRAM_OPTION::READ_PROTECT_NOBSCANTEST, "READ_PROTECT_NOBSCANTEST"},
    {PROGRAM_OPTION::OTP, "OTP"},
    {PROGRAM_OPTION::ASSERT_INIT, "ASSERT_INIT"},
    {PROGRAM_OPTION::DATA_WIDTH, "DATA_WIDTH"},
    {PROGRAM_OPTION::RS_PIN1, "RS_PIN1"},
    {PROGRAM_OPTION::RS_PIN0, "RS_PIN0"},
};
constexpr int LAST_READABLE_OPTION = 16;

std::string lower(const char* name) {
    StringBase result(name);
    result.MakeLower();
    return text(result);
}

int readingOptionRaises(const char* name) {
    return raisedLine<DataMismatchException>([&] { (void)ConstraintsManager::optionString2Type(name); });
}
int namingOptionRaises(int value) {
    return raisedLine<DataMismatchException>(
        [&] { (void)ConstraintsManager::optionType2String(PROGRAM_OPTION{value}); });
}

TEST(OperationNames, RowsStandInValueOrder) {
    int value = 0;
    for (const OperationRow& row : OPERATIONS) {
        EXPECT_EQ(static_cast<int>(row.operation), value++) << row.key;
    }
    EXPECT_EQ(value, 32);
    EXPECT_EQ(static_cast<int>(NO_OPERATION), 32);
}

TEST(OperationNames, EachOperationHasItsKeyName) {
    MessageRecorder recorder;
    for (const OperationRow& row : OPERATIONS) {
        EXPECT_EQ(text(ConstraintsManager::operationType2String(row.operation)), row.key);
    }
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OperationNames, EachOperationHasItsDisplayName) {
    MessageRecorder recorder;
    for (const OperationRow& row : OPERATIONS) {
        EXPECT_EQ(text(ConstraintsManager::operationType2DisplayString(row.operation)), row.display);
    }
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OperationNames, KeyNamesAreReadInAnyCase) {
    MessageRecorder recorder;
    for (const OperationRow& row : OPERATIONS) {
        EXPECT_EQ(ConstraintsManager::operationString2Type(row.key), row.operation) << row.key;
        EXPECT_EQ(ConstraintsManager::operationString2Type(lower(row.key).c_str()), row.operation) << row.key;
    }
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OperationNames, DisplayNamesAreReadInAnyCase) {
    MessageRecorder recorder;
    for (const OperationRow& row : OPERATIONS) {
        EXPECT_EQ(ConstraintsManager::operationDisplayString2Type(row.display), row.operation) << row.display;
        EXPECT_EQ(ConstraintsManager::operationDisplayString2Type(lower(row.display).c_str()), row.operation)
            << row.display;
    }
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OperationNames, UnknownKeyNameIsReported) {
    MessageRecorder recorder;
    EXPECT_EQ(ConstraintsManager::operationString2Type("Readback"), NO_OPERATION);
    EXPECT_THAT(withoutLines(recorder.take()), ElementsAre(info("Operation Readback is not defined.\n")));
}

TEST(OperationNames, UnknownDisplayNameIsReported) {
    MessageRecorder recorder;
    EXPECT_EQ(ConstraintsManager::operationDisplayString2Type("READBACKTOFILE"), NO_OPERATION);
    EXPECT_THAT(withoutLines(recorder.take()),
                ElementsAre(info("Operation READBACKTOFILE is not defined.\n")));
}

TEST(OperationNames, TrailingBlankOfADisplayNameCounts) {
    MessageRecorder recorder;
    EXPECT_EQ(ConstraintsManager::operationDisplayString2Type("Program FPGA Only "),
              OP_TYPE::PROGRAMFPGAONLY);
    EXPECT_THAT(recorder.take(), IsEmpty());
    EXPECT_EQ(ConstraintsManager::operationDisplayString2Type("Program FPGA Only"), NO_OPERATION);
    EXPECT_THAT(withoutLines(recorder.take()),
                ElementsAre(info("Operation Program FPGA Only is not defined.\n")));
}

TEST(OperationNames, PartsOfANameAreNoName) {
    MessageRecorder recorder;
    for (const char* name : {"", "PROGRA", "PROGRAM ", " PROGRAM", "PROGRAMS", "0"}) {
        EXPECT_EQ(ConstraintsManager::operationString2Type(name), NO_OPERATION) << name;
        EXPECT_THAT(withoutLines(recorder.take()),
                    ElementsAre(info(std::string("Operation ") + name + " is not defined.\n")));
    }
}

TEST(OperationNames, NullTextShowsAsNull) {
    MessageRecorder recorder;
    EXPECT_EQ(ConstraintsManager::operationString2Type(nullptr), NO_OPERATION);
    EXPECT_EQ(ConstraintsManager::operationDisplayString2Type(nullptr), NO_OPERATION);
    EXPECT_THAT(withoutLines(recorder.take()), ElementsAre(info("Operation (null) is not defined.\n"),
                                                           info("Operation (null) is not defined.\n")));
}

TEST(OperationNames, UnknownNameIsShownWhateverItHolds) {
    MessageRecorder recorder;
    const std::string odd = "%s%n%100000d\xff" + std::string(100000, 'x');
    EXPECT_EQ(ConstraintsManager::operationString2Type(odd.c_str()), NO_OPERATION);
    EXPECT_THAT(withoutLines(recorder.take()), ElementsAre(info("Operation " + odd + " is not defined.\n")));
}

TEST(OperationNames, ValueThatIsNoOperationIsReported) {
    MessageRecorder recorder;
    for (const int value : {32, 33, -1, INT_MAX, INT_MIN}) {
        const IssuedMessage report = info("Operation " + std::to_string(value) + " is not defined.\n");
        EXPECT_EQ(text(ConstraintsManager::operationType2String(OP_TYPE{value})), "");
        EXPECT_THAT(withoutLines(recorder.take()), ElementsAre(report));
        EXPECT_EQ(text(ConstraintsManager::operationType2DisplayString(OP_TYPE{value})), "");
        EXPECT_THAT(withoutLines(recorder.take()), ElementsAre(report));
    }
}

TEST(OperationNames, ReportsNameTheirSource) {
    std::vector<std::string> origins;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        origins.push_back(std::string(message.product) + "|" + std::string(message.source));
        EXPECT_EQ(message.line, 1300);
        EXPECT_EQ(message.revision, "1.0");
    });
    EXPECT_EQ(ConstraintsManager::operationString2Type("nonsense"), NO_OPERATION);
    EXPECT_EQ(text(ConstraintsManager::operationType2String(NO_OPERATION)), "");
    Port_MsgManData::setSink({});
    EXPECT_THAT(origins, ElementsAre("Tarvik|../s/ConstraintsManager", "Tarvik|../s/ConstraintsManager"));
}

TEST(OptionNames, RowsStandInValueOrder) {
    int value = 0;
    for (const OptionRow& row : OPTIONS) {
        EXPECT_EQ(static_cast<int>(row.option), value++) << row.key;
    }
    EXPECT_EQ(value, 24);
}

TEST(OptionNames, EachOptionHasItsKeyName) {
    for (const OptionRow& row : OPTIONS) {
        EXPECT_EQ(text(ConstraintsManager::optionType2String(row.option)), row.key);
    }
}

TEST(OptionNames, OptionsUpToSectorLockdownAreRead) {
    for (int value = 0; value <= LAST_READABLE_OPTION; ++value) {
        EXPECT_EQ(ConstraintsManager::optionString2Type(OPTIONS[value].key), PROGRAM_OPTION{value});
    }
}

TEST(OptionNames, OptionsBehindSectorLockdownAreNotRead) {
    for (int value = LAST_READABLE_OPTION + 1; value < 24; ++value) {
        EXPECT_EQ(readingOptionRaises(OPTIONS[value].key), 1500) << OPTIONS[value].key;
    }
}

TEST(OptionNames, NamesAreReadCaseIncluded) {
    for (const OptionRow& row : OPTIONS) {
        EXPECT_EQ(readingOptionRaises(lower(row.key).c_str()), 1500) << row.key;
    }
}

TEST(OptionNames, UnknownNameRaises) {
    for (const char* name : {"", "ERAS", "ERASE ", " ERASE", "ERASES", "0", "%s", "\xff"}) {
        EXPECT_EQ(readingOptionRaises(name), 1500) << name;
    }
    EXPECT_EQ(readingOptionRaises(nullptr), 1500);
}

TEST(OptionNames, ValueThatIsNoOptionRaises) {
    for (const int value : {24, 25, -1, INT_MAX, INT_MIN}) {
        EXPECT_EQ(namingOptionRaises(value), 1413) << value;
    }
}

TEST(OptionNames, RaisingIsSilent) {
    MessageRecorder recorder;
    EXPECT_EQ(readingOptionRaises("nonsense"), 1500);
    EXPECT_EQ(namingOptionRaises(24), 1413);
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OptionNames, RaiseWhateverTheExceptionsSwitchSays) {
    ManagerFixture session(Base{""});
    for (const bool exceptions : {false, true}) {
        session->setExceptions(exceptions);
        EXPECT_EQ(readingOptionRaises("nonsense"), 1500);
        EXPECT_EQ(readingOptionRaises("OTP"), 1500);
        EXPECT_EQ(namingOptionRaises(24), 1413);
    }
}

TEST(Vocabulary, NeedsNoManager) {
    EXPECT_EQ(ConstraintsManager::operationString2Type("ERASE"), OP_TYPE::ERASE);
    EXPECT_EQ(ConstraintsManager::optionString2Type("ERASE"), PROGRAM_OPTION::ERASE);
    EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
}

} // namespace
