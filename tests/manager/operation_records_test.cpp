#include "Members.h"

#include "PermissionRecordParser.h"

#include <climits>

// "OPERATION" entries: which cells they set, what they say, and where they raise.

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// Three supported families, of which "kestrel" (index 1) has the given entry.
struct OperationSession : ManagerFixture {
    explicit OperationSession(const std::string& entry)
        : ManagerFixture({{"base.acd", "DEVICE_SUPPORTED = falcon,kestrel,merlin\n"},
                          {"kestrel.acd", "OPERATION = " + entry + "\n"}}) {}

    void parse(unsigned index = 1, const char* family = "kestrel") {
        members().parseOperationEntries(accessorOf("kestrel"), index, family);
    }
    void parseQuietly() {
        (*this)->setExceptions(false);
        parse();
    }
};

/// Parses with exceptions on and tells where it raised.
template <typename Exception>
int raises(OperationSession& session) {
    session->setExceptions(true);
    return raisedLine<Exception>([&] { session.parse(); });
}

TEST(OperationEntries, EachItemAllowsItsOutputs) {
    OperationSession session("PROGRAM,Bscan,PARALLEL,USB2:VERIFY,SS,PARALLEL");
    session.parse();
    EXPECT_THAT(operationCells(session.members()),
                ElementsAre(Cell{1, 0, 0, 0}, Cell{1, 0, 0, 2}, Cell{1, 3, 1, 0}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(OperationEntries, LeaveTheOtherTablesAlone) {
    OperationSession session("PROGRAM,Bscan,PARALLEL");
    session.parse();
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
}

TEST(OperationEntries, ItemsOfOneOperationAddUp) {
    OperationSession session("ERASE,SM,SVF:ERASE,SM,STAPL:ERASE,DP770,SVF");
    session.parse();
    EXPECT_THAT(operationCells(session.members()),
                ElementsAre(Cell{1, 4, 2, 3}, Cell{1, 4, 2, 4}, Cell{1, 4, 4, 3}));
}

TEST(OperationEntries, EveryOperationKeyIsReadInAnyCase) {
    for (int operation = 0; operation < 32; ++operation) {
        StringBase key = ConstraintsManager::operationType2String(TARVIKNS::OP_TYPE{operation});
        key.MakeLower();
        OperationSession session(text(key) + ",SPI,ZORVA");
        session.parse();
        EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, operation, 5, 1}));
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(OperationEntries, ModesUpToSpiHaveCells) {
    OperationSession session(
        "ERASE,bscan,SVF:ERASE,sserial,SVF:ERASE,SMAP,SVF:ERASE,bsfile,SVF:ERASE,dtconfig,SVF:"
        "ERASE,spi,SVF");
    session.parse();
    EXPECT_THAT(operationCells(session.members()),
                ElementsAre(Cell{1, 4, 0, 3}, Cell{1, 4, 1, 3}, Cell{1, 4, 2, 3}, Cell{1, 4, 3, 3},
                            Cell{1, 4, 4, 3}, Cell{1, 4, 5, 3}));
}

TEST(OperationEntries, ModesBehindSpiHaveNoCells) {
    OperationSession session("PROGRAM,KITECF,USB2:PROGRAM,MPM,USB2:PROGRAM,PFF,USB2");
    session.parse();
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(OperationEntries, OutputsBehindStaplHaveNoCells) {
    OperationSession session("PROGRAM,SPI,EXPRESSSVF,EXPRESSQSVF,STAPL");
    session.parse();
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 5, 4}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(OperationEntries, ModeThatIsNoneIsBoundaryScanSilently) {
    OperationSession session("PROGRAM,nonsense,USB2:ERASE,,USB2:VERIFY,NONE,USB2");
    session.parse();
    EXPECT_THAT(operationCells(session.members()),
                ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 3, 0, 2}, Cell{1, 4, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(OperationEntries, MissingOrEmptyEntrySetsNothing) {
    OperationSession empty("");
    empty.parse();
    empty.members().parseOperationEntries(accessorOf("nobody"), 0, "nobody");
    EXPECT_THAT(operationCells(empty.members()), IsEmpty());
    EXPECT_THAT(empty.messages(), IsEmpty());
}

TEST(OperationEntries, SetTheBlockOfTheirFamilyIndexAlone) {
    OperationSession session("PROGRAM,BS,USB2");
    session.parse(0);
    session.parse(2);
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}, Cell{2, 0, 0, 2}));
}

TEST(OperationEntries, FamilyIndexWithoutABlockSetsNothing) {
    OperationSession session("PROGRAM,BS,USB2:ERASE,BS,usb2");
    session->setExceptions(false);
    for (const unsigned index : {3U, 4U, 1U << 31, UINT_MAX}) {
        session.parse(index);
        EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = usb2\n")));
    }
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
}

TEST(OperationEntries, ParsedTwiceChangeNothing) {
    OperationSession session("PROGRAM,BS,USB2");
    session.parse();
    session.parse();
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}));
}

TEST(OperationEntries, UnknownOperationIsReportedAndPassedOver) {
    OperationSession session("NONSENSE,BS,USB2:PROGRAM,BS,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}));
}

TEST(OperationEntries, UnknownOperationRaisesBehindItsMessages) {
    OperationSession session("PROGRAM,BS,USB2:NONSENSE:ERASE,BS,USB2");
    EXPECT_EQ(raises<OutOfRangeException>(session), 1631);
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}));
}

TEST(OperationEntries, RestOfAnUnknownOperationsItemIsReadAsUsual) {
    OperationSession session("NONSENSE:WORSE,BS,usb2,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n"),
                            debug("kestrel mode =   (null)\n"), debug("kestrel out = (null)\n"),
                            info("Operation WORSE is not defined.\n"), debug("kestrel op = WORSE\n"),
                            debug("kestrel out   = usb2\n")));
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
}

TEST(OperationEntries, DisplayNameIsNoKey) {
    OperationSession session("Blank Check,BS,USB2");
    EXPECT_EQ(raises<OutOfRangeException>(session), 1631);
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
}

TEST(OperationEntries, EmptyItemIsAnUnknownOperationAndDoesNotEndTheEntry) {
    OperationSession session("PROGRAM,BS,USB2::ERASE,BS,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation  is not defined.\n"), debug("kestrel op = \n"),
                            debug("kestrel mode =   (null)\n"), debug("kestrel out = (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 4, 0, 2}));
}

TEST(OperationEntries, MissingModeIsReportedAndTheItemSetsNothing) {
    OperationSession session("PROGRAM:ERASE,SS,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel mode =   (null)\n"), debug("kestrel out = (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 4, 1, 2}));
}

TEST(OperationEntries, MissingModeRaisesBehindItsMessage) {
    OperationSession session("ERASE,SS,USB2:PROGRAM:VERIFY,SS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1638);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel mode =   (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 4, 1, 2}));
}

TEST(OperationEntries, MissingOutputIsReportedAndTheItemSetsNothing) {
    OperationSession session("PROGRAM,Bscan:ERASE,SS,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 4, 1, 2}));
}

TEST(OperationEntries, MissingOutputRaisesBehindItsMessage) {
    OperationSession session("ERASE,SS,USB2:PROGRAM,Bscan:VERIFY,SS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1649);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 4, 1, 2}));
}

TEST(OperationEntries, UnknownOutputIsReportedAndPassedOver) {
    OperationSession session("PROGRAM,BS,usb2,USB2,QSVF,NULLCABLE,NONE,,SVF");
    session.parseQuietly();
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel out   = usb2\n"), debug("kestrel out   = QSVF\n"),
                            debug("kestrel out   = NULLCABLE\n"), debug("kestrel out   = NONE\n"),
                            debug("kestrel out   = \n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 0, 0, 3}));
}

TEST(OperationEntries, UnknownOutputRaisesBehindItsMessageAndKeepsWhatWasSet) {
    OperationSession session("PROGRAM,BS,USB2,usb2,SVF:ERASE,BS,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1659);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = usb2\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}));
}

TEST(OperationEntries, EmptyOutputIsUnknownRatherThanMissing) {
    OperationSession session("PROGRAM,BS,");
    EXPECT_EQ(raises<DataMismatchException>(session), 1659);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = \n")));
}

TEST(OperationEntries, TextsAreShownWhateverTheyHold) {
    OperationSession session("50%n\xff,BS,%s%d");
    session->setExceptions(false);
    session.parse(1, "100%s%n");
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation 50%n\xff is not defined.\n"), debug("100%s%n op = 50%n\xff\n"),
                            debug("100%s%n out   = %s%d\n")));
}

TEST(OperationEntries, NullFamilyNameShowsAsNull) {
    OperationSession session("PROGRAM");
    session->setExceptions(false);
    session.parse(1, nullptr);
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("(null) mode =   (null)\n"), debug("(null) out = (null)\n")));
}

TEST(OperationEntries, ItemsBehindIndex32767DoNotExist) {
    OperationSession session(repeatedItem("PROGRAM,BS,USB2", 32767) +
                             ":ERASE,BS,USB2:VERIFY,BS,USB2:CHECKSUM,BS,USB2");
    session.parse();
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 4, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(OperationEntries, FieldsBehindIndex32767DoNotExist) {
    std::string item = "PROGRAM,BS";
    for (int field = 2; field < 32767; ++field) {
        item += ",USB2";
    }
    OperationSession session(item + ",SVF,STAPL");
    session.parse();
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 0, 2}, Cell{1, 0, 0, 3}));
}

// No text reads as this value; hosts know the location all the same.
TEST(OperationEntries, TheValueThatIsNoModeRaises) {
    const RecordLocations locations{1, 2, 3, 4, 5};
    EXPECT_EQ(raisedLine<DataMismatchException>([&] {
                  static_cast<void>(PermissionRecordParser(locations, "kestrel", true)
                                        .checkedMode(static_cast<TARVIKNS::MODE_TYPE>(9)));
              }),
              3);
    EXPECT_EQ(
        PermissionRecordParser(locations, "kestrel", false).checkedMode(static_cast<TARVIKNS::MODE_TYPE>(9)),
        static_cast<TARVIKNS::MODE_TYPE>(9));
}

} // namespace
