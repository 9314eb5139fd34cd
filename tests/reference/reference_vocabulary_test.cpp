// The reference's converters.
#include "BaseOnly.h"
#include "Reference.h"

#include <gtest/gtest.h>

namespace {

using namespace reference;
using namespace TARVIKNS;

std::vector<Message> infoWithAnyLine(const std::string& text) { return {{Channel::INFO, ANY_LINE, text}}; }

int raisedLine(const auto& call) {
    try {
        call();
    } catch (const Raised& raised) {
        EXPECT_EQ(raised.type, "DataMismatchException");
        return raised.line;
    }
    return 0;
}

TEST(ReferenceVocabulary, ModeNamesMatchWithoutCase) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.modeString2Type("sserial"), MODE_TYPE::SS);
    EXPECT_EQ(reference.modeString2Type("DTconfig"), MODE_TYPE::DP770);
    EXPECT_EQ(reference.modeString2Type("Bscan"), MODE_TYPE::BS);
    EXPECT_EQ(reference.modeString2Type("nothing"), MODE_TYPE::BS);
    EXPECT_EQ(reference.modeString2Type(nullptr), MODE_TYPE::BS);
}

TEST(ReferenceVocabulary, EveryOtherModeIsBs) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.modeType2String(MODE_TYPE::PFF), "PFF");
    EXPECT_EQ(reference.modeType2String(MODE_TYPE(9)), "BS");
    EXPECT_EQ(reference.modeType2String(MODE_TYPE(-1)), "BS");
}

TEST(ReferenceVocabulary, OutputNamesMatchWithCase) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.cableString2Type("PARALLEL"), OUTPUT_TYPE::PARALLEL);
    EXPECT_EQ(reference.cableString2Type("EXPRESSQSVF"), OUTPUT_TYPE::EXPRESSQSVF);
    EXPECT_EQ(reference.cableString2Type("parallel"), OUTPUT_TYPE::NONE);
    EXPECT_EQ(reference.cableString2Type("QSVF"), OUTPUT_TYPE::NONE);
    EXPECT_EQ(reference.cableString2Type("NULLCABLE"), OUTPUT_TYPE::NONE);
}

TEST(ReferenceVocabulary, AllOutputsHaveNames) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.cableType2String(OUTPUT_TYPE::QSVF), "QSVF");
    EXPECT_EQ(reference.cableType2String(OUTPUT_TYPE::NONE), "NONE");
    EXPECT_EQ(reference.cableType2String(OUTPUT_TYPE(10)), "");
}

TEST(ReferenceVocabulary, OperationNamesMatchWithoutCase) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.operationString2Type("program"), OP_TYPE::PROGRAM);
    EXPECT_EQ(reference.operationDisplayString2Type("ONE STEP qsvf"), OP_TYPE::EXPRESSQSVF);
    EXPECT_TRUE(reference.takeMessages().empty());
}

TEST(ReferenceVocabulary, AnUnknownOperationIsReported) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.operationString2Type("x%s"), NO_OPERATION);
    EXPECT_EQ(reference.takeMessages(), infoWithAnyLine("Operation x%s is not defined.\n"));
    EXPECT_EQ(reference.operationString2Type(nullptr), NO_OPERATION);
    EXPECT_EQ(reference.takeMessages(), infoWithAnyLine("Operation (null) is not defined.\n"));
    EXPECT_EQ(reference.operationType2String(NO_OPERATION), "");
    EXPECT_EQ(reference.takeMessages(), infoWithAnyLine("Operation 32 is not defined.\n"));
    EXPECT_EQ(reference.operationType2DisplayString(OP_TYPE(-1)), "");
    EXPECT_EQ(reference.takeMessages(), infoWithAnyLine("Operation -1 is not defined.\n"));
}

TEST(ReferenceVocabulary, TheTrailingBlankOfADisplayNameCounts) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.operationDisplayString2Type("Program FPGA Only "), OP_TYPE::PROGRAMFPGAONLY);
    EXPECT_EQ(reference.operationDisplayString2Type("Program FPGA Only"), NO_OPERATION);
    EXPECT_EQ(reference.takeMessages(), infoWithAnyLine("Operation Program FPGA Only is not defined.\n"));
}

TEST(ReferenceVocabulary, NamesStandAtTheirValues) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.operationType2String(OP_TYPE::LOADCONFIGURATIONREVISION),
              "LOADCONFIGURATIONREVISION");
    EXPECT_EQ(reference.operationType2String(OP_TYPE::EXPRESSQSVF), "EXPRESSQSVF");
    EXPECT_EQ(reference.operationType2DisplayString(OP_TYPE::PROGRAMCUSTOMERCODE), "PROGRAM CUSTOMER CODE");
    EXPECT_EQ(reference.optionType2String(PROGRAM_OPTION::OTP), "OTP");
    EXPECT_EQ(reference.optionType2String(PROGRAM_OPTION::RS_PIN0), "RS_PIN0");
}

TEST(ReferenceVocabulary, OnlySomeOptionsCanBeRead) {
    Reference reference(baseOnly());
    EXPECT_EQ(reference.optionString2Type("SECTOR_LOCKDOWN"), PROGRAM_OPTION::SECTOR_LOCKDOWN);
    reference.setExceptions(false);
    EXPECT_EQ(raisedLine([&] { (void)reference.optionString2Type("OTP"); }), 1500);
    EXPECT_EQ(raisedLine([&] { (void)reference.optionString2Type("erase"); }), 1500);
    EXPECT_EQ(raisedLine([&] { (void)reference.optionString2Type(nullptr); }), 1500);
    EXPECT_EQ(raisedLine([&] { (void)reference.optionType2String(PROGRAM_OPTION(24)); }), 1413);
}

TEST(ReferenceVocabulary, ANameIsCutAtItsFirstUnderscore) {
    Reference reference(baseOnly());
    std::string device = "a_b_c";
    reference.removePackageName(device);
    EXPECT_EQ(device, "a");
    reference.removePackageName(device);
    EXPECT_EQ(device, "a");
}

TEST(ReferenceVocabulary, DisplayNamesKeepTheirSpelling) {
    EXPECT_EQ(modeDisplayName(4), "Destop Programming mode");
    EXPECT_EQ(modeDisplayName(7), "Kite MPM  mode");
    EXPECT_EQ(modeDisplayName(9), "Prom File Formatter mode");
    EXPECT_EQ(outputDisplayName(8), "Null cable");
    EXPECT_EQ(outputDisplayName(-1), "Unspecified cable");
}

TEST(ReferenceVocabulary, NumbersAreReadUpToTheFirstOtherByte) {
    EXPECT_EQ(decimal(" -12x"), -12);
    EXPECT_EQ(decimal("\t\n\v\f\r4"), 4);
    EXPECT_EQ(decimal("+3"), 3);
    EXPECT_EQ(decimal("- 3"), 0);
    EXPECT_EQ(decimal(""), 0);
    EXPECT_EQ(decimal("99999999999999999999"), 2147483647);
    EXPECT_EQ(decimal("-2147483649"), -2147483648);
}

} // namespace
