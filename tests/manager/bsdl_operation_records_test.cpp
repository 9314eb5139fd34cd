#include "Members.h"

#include <climits>

// "BSDL_OPERATION" entries: operation entries without a mode.

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// Three supported families, of which "kestrel" (index 1) has the given entry.
struct BsdlSession : ManagerFixture {
    explicit BsdlSession(const std::string& entry)
        : ManagerFixture({{"base.acd", "DEVICE_SUPPORTED = falcon,kestrel,merlin\n"},
                          {"kestrel.acd", "BSDL_OPERATION = " + entry + "\n"}}) {}

    void parse(unsigned index = 1, const char* family = "kestrel") {
        members().parseBsdlOperationEntries(accessorOf("kestrel"), index, family);
    }
    void parseQuietly() {
        (*this)->setExceptions(false);
        parse();
    }
};

/// Parses with exceptions on and tells where it raised.
template <typename Exception>
int raises(BsdlSession& session) {
    session->setExceptions(true);
    return raisedLine<Exception>([&] { session.parse(); });
}

TEST(BsdlOperationEntries, EachItemAllowsItsOutputs) {
    BsdlSession session("BYPASS,PARALLEL,USB2:HIGHZ,PARALLEL");
    session.parse();
    EXPECT_THAT(bsdlOperationCells(session.members()),
                ElementsAre(Cell{1, 19, 0, 0}, Cell{1, 19, 0, 2}, Cell{1, 20, 0, 0}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BsdlOperationEntries, LeaveTheOtherTablesAlone) {
    BsdlSession session("BYPASS,PARALLEL");
    session.parse();
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
}

TEST(BsdlOperationEntries, EveryOperationKeyIsReadInAnyCase) {
    for (int operation = 0; operation < 32; ++operation) {
        StringBase key = ConstraintsManager::operationType2String(TARVIKNS::OP_TYPE{operation});
        key.MakeLower();
        BsdlSession session(text(key) + ",STAPL");
        session.parse();
        EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, operation, 0, 4}));
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(BsdlOperationEntries, HaveNoModeField) {
    BsdlSession session("BYPASS,SS,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = SS\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}));
}

TEST(BsdlOperationEntries, OutputsBehindStaplHaveNoCells) {
    BsdlSession session("BYPASS,EXPRESSSVF,EXPRESSQSVF,STAPL");
    session.parse();
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 4}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BsdlOperationEntries, MissingOrEmptyEntrySetsNothing) {
    BsdlSession empty("");
    empty.parse();
    empty.members().parseBsdlOperationEntries(accessorOf("nobody"), 0, "nobody");
    EXPECT_THAT(bsdlOperationCells(empty.members()), IsEmpty());
    EXPECT_THAT(empty.messages(), IsEmpty());
}

TEST(BsdlOperationEntries, FamilyIndexWithoutABlockSetsNothing) {
    BsdlSession session("BYPASS,USB2");
    for (const unsigned index : {3U, 4U, 1U << 31, UINT_MAX}) {
        session.parse(index);
    }
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(BsdlOperationEntries, UnknownOperationIsReportedAndPassedOver) {
    BsdlSession session("NONSENSE,USB2:HIGHZ,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 20, 0, 2}));
}

TEST(BsdlOperationEntries, UnknownOperationRaisesBehindItsMessages) {
    BsdlSession session("BYPASS,USB2:NONSENSE:HIGHZ,USB2");
    EXPECT_EQ(raises<OutOfRangeException>(session), 1688);
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}));
}

TEST(BsdlOperationEntries, RestOfAnUnknownOperationsItemIsReadAsUsual) {
    BsdlSession session("NONSENSE:WORSE,usb2,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("kestrel op = NONSENSE\n"),
                            debug("kestrel out = (null)\n"), info("Operation WORSE is not defined.\n"),
                            debug("kestrel op = WORSE\n"), debug("kestrel out   = usb2\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
}

TEST(BsdlOperationEntries, EmptyItemIsAnUnknownOperationAndDoesNotEndTheEntry) {
    BsdlSession session("BYPASS,USB2::HIGHZ,USB2");
    session.parseQuietly();
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation  is not defined.\n"), debug("kestrel op = \n"),
                            debug("kestrel out = (null)\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}, Cell{1, 20, 0, 2}));
}

TEST(BsdlOperationEntries, MissingOutputIsReportedAndTheItemSetsNothing) {
    BsdlSession session("BYPASS:HIGHZ,USB2");
    session.parseQuietly();
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 20, 0, 2}));
}

TEST(BsdlOperationEntries, MissingOutputRaisesBehindItsMessage) {
    BsdlSession session("BYPASS,USB2:HIGHZ:CLAMP,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1695);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out = (null)\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}));
}

TEST(BsdlOperationEntries, UnknownOutputIsReportedAndPassedOver) {
    BsdlSession session("BYPASS,usb2,USB2,QSVF,,SVF");
    session.parseQuietly();
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel out   = usb2\n"), debug("kestrel out   = QSVF\n"),
                            debug("kestrel out   = \n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}, Cell{1, 19, 0, 3}));
}

TEST(BsdlOperationEntries, UnknownOutputRaisesBehindItsMessageAndKeepsWhatWasSet) {
    BsdlSession session("BYPASS,USB2,usb2,SVF:HIGHZ,USB2");
    EXPECT_EQ(raises<DataMismatchException>(session), 1705);
    EXPECT_THAT(session.messages(), ElementsAre(debug("kestrel out   = usb2\n")));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}));
}

TEST(BsdlOperationEntries, ItemsBehindIndex32767DoNotExist) {
    BsdlSession session(repeatedItem("BYPASS,USB2", 32767) + ":HIGHZ,USB2:CLAMP,USB2");
    session.parse();
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 2}, Cell{1, 20, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

} // namespace
