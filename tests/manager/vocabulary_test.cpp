#include "ManagerFixture.h"

#include <UT_STR.h>

#include <climits>

// The names of modes and outputs, and the cutting of packages: every row in both directions.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

struct ModeRow {
    MODE_TYPE mode;
    const char* key;
    std::vector<const char*> accepted;
    const char* display;
};
const ModeRow MODES[] = {
    {MODE_TYPE::BS, "BS", {"Bscan"}, "Boundary Scan mode"},
    {MODE_TYPE::SS, "SS", {"SS", "SSerial"}, "Slave Serial mode"},
    {MODE_TYPE::SM, "SM", {"SM", "Smap"}, "Select Map mode"},
    {MODE_TYPE::BSFILE, "BSFILE", {"BSFILE"}, "Boundary Scan File mode"},
    {MODE_TYPE::DP770, "DP770", {"DTCONFIG", "DP770"}, "Destop Programming mode"},
    {MODE_TYPE::SPI, "SPI", {"SPI"}, "SPI mode"},
    {MODE_TYPE::KITECF, "KITECF", {"CF", "KITECF", "CompactFlash"}, "Kite Compact Flash  mode"},
    {MODE_TYPE::KITEMPM, "KITEMPM", {"MPM", "KITEMPM"}, "Kite MPM  mode"},
    {MODE_TYPE::PFF, "PFF", {"PFF", "PromFile"}, "Prom File Formatter mode"},
};

struct OutputRow {
    OUTPUT_TYPE output;
    const char* key;
    bool accepted;
    const char* display;
};
const OutputRow OUTPUTS[] = {
    {OUTPUT_TYPE::PARALLEL, "PARALLEL", true, "Parallel cable"},
    {OUTPUT_TYPE::ZORVA, "ZORVA", true, "ZORVA cable"},
    {OUTPUT_TYPE::USB2, "USB2", true, "USB2 cable"},
    {OUTPUT_TYPE::SVF, "SVF", true, "SVF"},
    {OUTPUT_TYPE::STAPL, "STAPL", true, "Stapl"},
    {OUTPUT_TYPE::QSVF, "QSVF", false, "QSVF"},
    {OUTPUT_TYPE::EXPRESSSVF, "EXPRESSSVF", true, "Express SVF"},
    {OUTPUT_TYPE::EXPRESSQSVF, "EXPRESSQSVF", true, "Express QSVF"},
    {OUTPUT_TYPE::NULLCABLE, "NULLCABLE", false, "Null cable"},
    {OUTPUT_TYPE::NONE, "NONE", true, "Unspecified cable"},
};

std::string lower(const char* name) {
    StringBase result(name);
    result.MakeLower();
    return text(result);
}

StringBase cut(StringBase device) {
    ConstraintsManager::removePackageName(device);
    return device;
}

TEST(ModeNames, RowsStandInValueOrder) {
    int value = 0;
    for (const ModeRow& row : MODES) {
        EXPECT_EQ(static_cast<int>(row.mode), value++) << row.key;
    }
    EXPECT_EQ(value, 9);
}

TEST(ModeNames, EachModeHasItsKeyName) {
    for (const ModeRow& row : MODES) {
        EXPECT_EQ(text(ConstraintsManager::modeType2String(row.mode)), row.key);
    }
}

TEST(ModeNames, EachAcceptedNameGivesItsModeInAnyCase) {
    for (const ModeRow& row : MODES) {
        for (const char* name : row.accepted) {
            EXPECT_EQ(ConstraintsManager::modeString2Type(name), row.mode) << name;
            EXPECT_EQ(ConstraintsManager::modeString2Type(lower(name).c_str()), row.mode) << name;
            EXPECT_EQ(ConstraintsManager::modeString2Type(UT_STR::Upper(name).c_str()), row.mode) << name;
        }
    }
}

TEST(ModeNames, EachKeyNameGivesItsMode) {
    for (const ModeRow& row : MODES) {
        EXPECT_EQ(ConstraintsManager::modeString2Type(row.key), row.mode);
    }
}

TEST(ModeNames, TextThatNamesNoModeIsBoundaryScan) {
    for (const char* name :
         {"", "S", "SSeria", "SSerials", " SS", "SS ", "PROM", "BS", "none", "9", "\xff"}) {
        EXPECT_EQ(ConstraintsManager::modeString2Type(name), MODE_TYPE::BS) << name;
    }
    EXPECT_EQ(ConstraintsManager::modeString2Type(nullptr), MODE_TYPE::BS);
}

TEST(ModeNames, UnknownTextIsNotReported) {
    MessageRecorder recorder;
    EXPECT_EQ(ConstraintsManager::modeString2Type("nonsense"), MODE_TYPE::BS);
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(ModeNames, ValueThatIsNoModeHasTheNameOfBoundaryScan) {
    for (const int value : {9, 10, -1, INT_MAX, INT_MIN}) {
        EXPECT_EQ(text(ConstraintsManager::modeType2String(MODE_TYPE{value})), "BS") << value;
    }
}

TEST(OutputNames, RowsStandInValueOrder) {
    int value = 0;
    for (const OutputRow& row : OUTPUTS) {
        EXPECT_EQ(static_cast<int>(row.output), value++) << row.key;
    }
    EXPECT_EQ(value, 10);
}

TEST(OutputNames, EachOutputHasItsKeyName) {
    for (const OutputRow& row : OUTPUTS) {
        EXPECT_EQ(text(ConstraintsManager::cableType2String(row.output)), row.key);
    }
}

TEST(OutputNames, QsvfAndNullCableAreWrittenButNotRead) {
    for (const OutputRow& row : OUTPUTS) {
        const OUTPUT_TYPE expected = row.accepted ? row.output : OUTPUT_TYPE::NONE;
        EXPECT_EQ(ConstraintsManager::cableString2Type(row.key), expected) << row.key;
    }
}

TEST(OutputNames, NamesAreReadCaseIncluded) {
    for (const OutputRow& row : OUTPUTS) {
        EXPECT_EQ(ConstraintsManager::cableString2Type(lower(row.key).c_str()), OUTPUT_TYPE::NONE) << row.key;
    }
}

TEST(OutputNames, UnknownTextIsNoneSilently) {
    MessageRecorder recorder;
    for (const char* name : {"", "USB", "USB22", " USB2", "USB2 ", "Parallel cable", "\xff"}) {
        EXPECT_EQ(ConstraintsManager::cableString2Type(name), OUTPUT_TYPE::NONE) << name;
    }
    EXPECT_EQ(ConstraintsManager::cableString2Type(nullptr), OUTPUT_TYPE::NONE);
    EXPECT_THAT(recorder.take(), IsEmpty());
}

TEST(OutputNames, ValueThatIsNoOutputHasNoName) {
    for (const int value : {10, 11, -1, INT_MAX, INT_MIN}) {
        EXPECT_EQ(text(ConstraintsManager::cableType2String(OUTPUT_TYPE{value})), "") << value;
    }
}

TEST(DisplayNames, RefusalsShowTheModesDisplayName) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    for (const ModeRow& row : MODES) {
        if (row.mode != MODE_TYPE::PFF) {
            EXPECT_FALSE(session->checkConstraints(row.mode, OUTPUT_TYPE::PARALLEL));
            EXPECT_THAT(session.messages(),
                        ElementsAre(info(201, std::string("Parallel cable is not supported in ") +
                                                  row.display + "\n")));
        }
    }
}

TEST(DisplayNames, PromFileFormatterShowsWhereItRefusesADevice) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    EXPECT_FALSE(session->checkConstraints(MODE_TYPE::PFF, OUTPUT_TYPE::PARALLEL, "KS50", nullptr));
    EXPECT_THAT(session.messages(),
                ElementsAre(info(256, "KS50 is not supported in Prom File Formatter mode\n")));
}

TEST(DisplayNames, ValueThatIsNoModeShowsAsPromFileFormatter) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    for (const int value : {9, 10, -1, INT_MAX, INT_MIN}) {
        EXPECT_FALSE(session->checkConstraints(MODE_TYPE{value}, OUTPUT_TYPE::PARALLEL));
        EXPECT_THAT(session.messages(),
                    ElementsAre(info(201, "Parallel cable is not supported in Prom File Formatter mode\n")));
    }
}

TEST(DisplayNames, RefusalsShowTheOutputsDisplayName) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    for (const OutputRow& row : OUTPUTS) {
        EXPECT_FALSE(session->checkConstraints(MODE_TYPE::SS, row.output));
        EXPECT_THAT(
            session.messages(),
            ElementsAre(info(201, std::string(row.display) + " is not supported in Slave Serial mode\n")));
    }
}

TEST(DisplayNames, ValueThatIsNoOutputShowsAsUnspecified) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = kestrel\n"});
    for (const int value : {10, -1, INT_MAX, INT_MIN}) {
        EXPECT_FALSE(session->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE{value}));
        EXPECT_THAT(session.messages(),
                    ElementsAre(info(201, "Unspecified cable is not supported in Boundary Scan mode\n")));
    }
}

TEST(PackageNames, NameIsCutBeforeItsFirstUnderscore) {
    EXPECT_EQ(text(cut("KS50_PQ100")), "KS50");
    EXPECT_EQ(text(cut("a_b_c")), "a");
}

TEST(PackageNames, NameWithoutUnderscoreStays) {
    EXPECT_EQ(text(cut("KS50")), "KS50");
    EXPECT_EQ(text(cut("KS50-PQ100")), "KS50-PQ100");
    EXPECT_EQ(text(cut("")), "");
}

TEST(PackageNames, NameThatStartsOrEndsWithUnderscore) {
    EXPECT_EQ(text(cut("_PQ100")), "");
    EXPECT_EQ(text(cut("_")), "");
    EXPECT_EQ(text(cut("KS50_")), "KS50");
}

TEST(PackageNames, BytesBeforeTheUnderscoreAreKeptAsTheyAre) {
    EXPECT_EQ(text(cut(StringBase("\xff\0x_y", 5))), std::string("\xff\0x", 3));
}

} // namespace
