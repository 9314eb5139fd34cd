#include "Members.h"

#include <StringViews.h>

// "PROGRAM_OPTION" entries, and the look-up of the package index that stands before them.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

/// Three option packages, of which "kestrel" (index 1) has the given entry.
struct OptionSession : ManagerFixture {
    explicit OptionSession(const std::string& entry)
        : ManagerFixture({{"base.acd", "PROGRAM_OPTION_PACKAGE = falcon,kestrel,merlin\n"},
                          {"kestrel.acd", "PROGRAM_OPTION = " + entry + "\n"}}) {}

    void parse(const char* family = "kestrel") {
        members().parseProgramOptionEntries(accessorOf("kestrel"), family);
    }
    void parseQuietly() {
        (*this)->setExceptions(false);
        parse();
    }
};

/// Parses and tells where it raised.
template <typename Exception>
int raises(OptionSession& session, const char* family = "kestrel") {
    return raisedLine<Exception>([&] { session.parse(family); });
}

std::map<std::string, int> cachedIndexes(TarvikTestPeer::Members& members) {
    std::map<std::string, int> result;
    for (const auto& [name, index] : members.m_programOptionPackageIndex) {
        result.emplace(text(name), index);
    }
    return result;
}

TEST(ProgramOptionEntries, EachItemAllowsItsOutputs) {
    OptionSession session("ERASE,Bscan,PARALLEL,USB2:SECTOR_LOCKDOWN,SPI,STAPL");
    session.parse();
    EXPECT_THAT(programOptionCells(session.members()),
                ElementsAre(Cell{1, 0, 0, 0}, Cell{1, 0, 0, 2}, Cell{1, 16, 5, 4}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ProgramOptionEntries, LeaveTheOtherTablesAlone) {
    ManagerFixture session({{"base.acd", "DEVICE_SUPPORTED = kestrel\nPROGRAM_OPTION_PACKAGE = kestrel\n"},
                            {"kestrel.acd", "PROGRAM_OPTION = ERASE,BS,USB2\n"}});
    session.members().parseProgramOptionEntries(accessorOf("kestrel"), "kestrel");
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
}

TEST(ProgramOptionEntries, EveryReadableOptionHasItsRow) {
    for (int option = 0; option <= 16; ++option) {
        OptionSession session(text(ConstraintsManager::optionType2String(TARVIKNS::PROGRAM_OPTION{option})) +
                              ",SS,ZORVA");
        session.parse();
        EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, option, 1, 1}));
    }
}

TEST(ProgramOptionEntries, OptionsThatCannotBeReadRaiseWhateverTheSwitchSays) {
    for (int option = 17; option < 24; ++option) {
        OptionSession session(text(ConstraintsManager::optionType2String(TARVIKNS::PROGRAM_OPTION{option})) +
                              ",SS,ZORVA");
        for (const bool exceptions : {false, true}) {
            session->setExceptions(exceptions);
            EXPECT_EQ(raises<DataMismatchException>(session), 1500);
        }
        EXPECT_THAT(session.messages(), IsEmpty());
        EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
    }
}

TEST(ProgramOptionEntries, UnknownOptionRaisesSilentlyBeforeTheRestOfItsItemAndKeepsWhatWasSet) {
    for (const char* option : {"nonsense", "erase", "Erase", " ERASE", ""}) {
        OptionSession session(std::string("VERIFY,BS,USB2:") + option + ":ERASE,BS,USB2");
        for (const bool exceptions : {false, true}) {
            session->setExceptions(exceptions);
            EXPECT_EQ(raises<DataMismatchException>(session), 1500) << option;
        }
        EXPECT_THAT(session.messages(), IsEmpty());
        EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 1, 0, 2}));
    }
}

TEST(ProgramOptionEntries, EmptyFirstItemIsAnOptionWithoutAName) {
    OptionSession session(":ERASE,BS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1500);
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
}

TEST(ProgramOptionEntries, ModesBehindSpiAndOutputsBehindStaplHaveNoCells) {
    OptionSession session("ERASE,KITECF,USB2:ERASE,MPM,USB2:ERASE,PFF,USB2:ERASE,BS,EXPRESSSVF,EXPRESSQSVF");
    session.parse();
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ProgramOptionEntries, ModeThatIsNoneIsBoundaryScanSilently) {
    OptionSession session("ERASE,nonsense,USB2:VERIFY,,USB2");
    session.parse();
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 1, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ProgramOptionEntries, MissingModeIsReportedAndTheItemSetsNothing) {
    OptionSession session("ERASE:VERIFY,SS,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel mode =   (null)\n"), debug("kestrel out = (null)\n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 1, 1, 2}));
}

TEST(ProgramOptionEntries, MissingModeRaisesBehindItsMessage) {
    OptionSession session("VERIFY,SS,USB2:ERASE:OTF,SS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1739);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel mode =   (null)\n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 1, 1, 2}));
}

TEST(ProgramOptionEntries, MissingOutputIsReportedAndTheItemSetsNothing) {
    OptionSession session("ERASE,BS:VERIFY,SS,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 1, 1, 2}));
}

TEST(ProgramOptionEntries, MissingOutputRaisesBehindItsMessage) {
    OptionSession session("VERIFY,SS,USB2:ERASE,BS:OTF,SS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1750);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 1, 1, 2}));
}

TEST(ProgramOptionEntries, UnknownOutputIsReportedAndPassedOver) {
    OptionSession session("ERASE,BS,usb2,USB2,QSVF,,SVF");
    session.parseQuietly();
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel out   = usb2\n"), debug("kestrel out   = QSVF\n"),
                            debug("kestrel out   = \n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 0, 0, 3}));
}

TEST(ProgramOptionEntries, UnknownOutputRaisesBehindItsMessageAndKeepsWhatWasSet) {
    OptionSession session("ERASE,BS,USB2,usb2,SVF:VERIFY,BS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1760);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = usb2\n")));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}));
}

TEST(ProgramOptionEntries, NameThatIsNoPackageRaisesEvenWithoutAnEntry) {
    OptionSession session("");
    EXPECT_EQ(raises<OutOfRangeException>(session, "osprey"), 2024);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ProgramOptionEntries, NameThatIsNoPackageRaisesBeforeTheEntryIsRead) {
    OptionSession session("nonsense");
    EXPECT_EQ(raises<OutOfRangeException>(session, "osprey"), 2024);
}

TEST(ProgramOptionEntries, NameThatIsNoPackageSetsNothingWhileExceptionsAreOff) {
    OptionSession session("ERASE,BS,USB2,usb2");
    session->setExceptions(false);
    session.parse("osprey");
    EXPECT_THAT(session.messages(), ElementsAre(debug("osprey out   = usb2\n")));
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
}

TEST(ProgramOptionEntries, MissingOrEmptyEntrySetsNothing) {
    OptionSession session("");
    session.parse();
    session.members().parseProgramOptionEntries(accessorOf("nobody"), "merlin");
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(ProgramOptionEntries, ItemsBehindIndex32767DoNotExist) {
    OptionSession session(repeatedItem("ERASE,BS,USB2", 32767) + ":VERIFY,BS,USB2:OTF,BS,USB2:UES,BS,USB2");
    session.parse();
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 1, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PackageIndex, IsThePositionInByteOrder) {
    ManagerFixture session(Base{"PROGRAM_OPTION_PACKAGE = merlin,Kestrel,KS50PQ,kestrel\n"});
    EXPECT_EQ(session.members().programOptionTableIndex("KS50PQ"), 0);
    EXPECT_EQ(session.members().programOptionTableIndex("Kestrel"), 1);
    EXPECT_EQ(session.members().programOptionTableIndex("kestrel"), 2);
    EXPECT_EQ(session.members().programOptionTableIndex("merlin"), 3);
}

TEST(PackageIndex, IsCachedUnderItsName) {
    OptionSession session("");
    EXPECT_EQ(session.members().programOptionTableIndex("merlin"), 2);
    EXPECT_EQ(session.members().programOptionTableIndex("falcon"), 0);
    EXPECT_THAT(cachedIndexes(session.members()), ElementsAre(Pair("falcon", 0), Pair("merlin", 2)));
}

TEST(PackageIndex, CachedValueAnswers) {
    OptionSession session("");
    session.members().m_programOptionPackageIndex[StringBase("osprey")] = 0;
    session.members().m_programOptionPackageIndex[StringBase("kestrel")] = 7;
    EXPECT_EQ(session.members().programOptionTableIndex("osprey"), 0);
    EXPECT_EQ(session.members().programOptionTableIndex("kestrel"), 7);
}

TEST(PackageIndex, CachedValueBelow0CountsAsNone) {
    OptionSession session("");
    session.members().m_programOptionPackageIndex[StringBase("kestrel")] = -1;
    EXPECT_EQ(session.members().programOptionTableIndex("kestrel"), 1);
    EXPECT_THAT(cachedIndexes(session.members()), ElementsAre(Pair("kestrel", 1)));
}

TEST(PackageIndex, UnknownNameRaisesAndIsNotCached) {
    OptionSession session("");
    for (const char* name : {"osprey", "Kestrel", "kestrel_PQ", "kestre", "kestrels", ""}) {
        EXPECT_EQ(
            raisedLine<OutOfRangeException>([&] { (void)session.members().programOptionTableIndex(name); }),
            2024);
    }
    EXPECT_THAT(cachedIndexes(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PackageIndex, UnknownNameIsOnePastTheLastWhileExceptionsAreOff) {
    OptionSession session("");
    session->setExceptions(false);
    EXPECT_EQ(session.members().programOptionTableIndex("osprey"), 3);
    EXPECT_EQ(session.members().programOptionTableIndex(""), 3);
    EXPECT_THAT(cachedIndexes(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PackageIndex, NullIsTheEmptyName) {
    ManagerFixture session(Base{"PROGRAM_OPTION_PACKAGE = kestrel,,merlin\n"});
    EXPECT_EQ(session.members().programOptionTableIndex(view(static_cast<const char*>(nullptr))), 0);
    EXPECT_EQ(session.members().programOptionTableIndex(""), 0);
}

} // namespace
