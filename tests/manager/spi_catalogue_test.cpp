#include "Members.h"

// What the start-up reads from the SPI flash database: names, properties, and the tables of the family "spi".

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

namespace {

/// A manager over an SPI database; "spi" is the second supported family and option package.
struct SpiSession : ManagerFixture {
    explicit SpiSession(const std::string& spi)
        : ManagerFixture(
              {{"base.acd", "DEVICE_SUPPORTED = kestrel,spi\nPROGRAM_OPTION_PACKAGE = kestrel,spi\n"},
               {"spi.acd", spi}}) {}
};

TEST(SpiNames, FamiliesAndTheirDevicesStandInFileOrderTheFirstDeviceTwice) {
    SpiSession session(R"(
DEVICE_FAMILY = ZETA,ALPHA
ZETA_DEVICES = Z2,Z1,Z3
ALPHA_DEVICES = A1
)");
    EXPECT_THAT(texts(session.members().m_spiNames),
                ElementsAre("ZETA", "Z2", "Z2", "Z1", "Z3", "ALPHA", "A1", "A1"));
    EXPECT_THAT(texts(session.members().m_spiFamilies), ElementsAre("ZETA", "ALPHA"));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiNames, FamilyWithoutDevicesStandsAlone) {
    SpiSession session("DEVICE_FAMILY = ALPHA,BETA\nBETA_DEVICES =\n");
    EXPECT_THAT(texts(session.members().m_spiNames), ElementsAre("ALPHA", "BETA"));
    EXPECT_THAT(texts(session.members().m_spiFamilies), ElementsAre("ALPHA", "BETA"));
}

TEST(SpiNames, AreKeptAsWrittenAndAsOftenAsWritten) {
    SpiSession session("DEVICE_FAMILY = alpha,ALPHA,alpha\nalpha_DEVICES = x, y ,w\nALPHA_DEVICES = z\n");
    EXPECT_THAT(texts(session.members().m_spiNames),
                ElementsAre("alpha", "x", "x", " y ", "w", "ALPHA", "z", "z", "alpha", "x", "x", " y ", "w"));
    EXPECT_THAT(texts(session.members().m_spiFamilies), ElementsAre("alpha", "ALPHA", "alpha"));
}

TEST(SpiNames, DevicesOfAFamilyThatIsNotListedAreNotRead) {
    SpiSession session("DEVICE_FAMILY = ALPHA\nBETA_DEVICES = B1\n");
    EXPECT_THAT(texts(session.members().m_spiNames), ElementsAre("ALPHA"));
}

TEST(SpiNames, EmptyItemIsANameAndDoesNotEndTheList) {
    SpiSession session("DEVICE_FAMILY = ALPHA,,BETA\nALPHA_DEVICES = A1,,A2\n_DEVICES = U1\n");
    EXPECT_THAT(texts(session.members().m_spiNames),
                ElementsAre("ALPHA", "A1", "A1", "", "A2", "", "U1", "U1", "BETA"));
}

TEST(SpiNames, DevicesBehindIndex32767DoNotExist) {
    SpiSession session("DEVICE_FAMILY = ALPHA\nALPHA_DEVICES = " + numberedList("D", 40000) + "\n");
    EXPECT_THAT(session.members().m_spiNames, SizeIs(1 + 1 + 32768));
    EXPECT_EQ(text(session.members().m_spiNames.back()), "D32767");
}

TEST(SpiNames, WithoutAnSpiDatabaseThereAreNone) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = spi\n"});
    EXPECT_THAT(session.members().m_spiNames, IsEmpty());
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiProperties, AreKeyedByNameAndPropertyWrittenTogether) {
    SpiSession session(R"(
DEVICE_FAMILY = ALPHA
ALPHA_DEVICES = A1,A2
ALPHA_PROPERTY = VENDOR,any
A1_PROPERTY = SIZE,4:WIDTH,8
A2_PROPERTY = SIZE,16
)");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()),
                ElementsAre(Pair("A1SIZE", "4"), Pair("A1WIDTH", "8"), Pair("A2SIZE", "16"),
                            Pair("ALPHAVENDOR", "any")));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiProperties, EntryIsReadUnderTheUpperCasedNameAndKeptUnderTheNameAsWritten) {
    SpiSession session(R"(
DEVICE_FAMILY = Alpha
Alpha_DEVICES = a1
ALPHA_PROPERTY = Vendor,Any
Alpha_PROPERTY = Vendor,wrong
A1_PROPERTY = size,4
a1_PROPERTY = size,wrong
)");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()),
                ElementsAre(Pair("AlphaVendor", "Any"), Pair("a1size", "4")));
}

TEST(SpiProperties, LaterEntryOverwrites) {
    SpiSession session("DEVICE_FAMILY = A\nA_PROPERTY = SIZE,4:SIZE,8\n");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()), ElementsAre(Pair("ASIZE", "8")));
}

TEST(SpiProperties, JoinedToTheSameKeyShareAnEntry) {
    SpiSession session("DEVICE_FAMILY = A,AB\nA_PROPERTY = BC,1\nAB_PROPERTY = C,2\n");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()), ElementsAre(Pair("ABC", "2")));
}

TEST(SpiProperties, OfNamesThatAreNotListedAreNotRead) {
    SpiSession session("DEVICE_FAMILY = A\nB_PROPERTY = SIZE,4\n");
    EXPECT_THAT(session.members().m_spiProperties.get(), IsEmpty());
}

TEST(SpiProperties, FieldsBehindTheValueAreNotRead) {
    SpiSession session("DEVICE_FAMILY = A\nA_PROPERTY = SIZE,4,8:EMPTY,\n");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()),
                ElementsAre(Pair("AEMPTY", ""), Pair("ASIZE", "4")));
}

TEST(SpiProperties, MissingValueIsTheEmptyTextDuringTheStartUp) {
    SpiSession session("DEVICE_FAMILY = A,B\nA_PROPERTY = SIZE:WIDTH,8\nB_PROPERTY = SIZE,4\n");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()),
                ElementsAre(Pair("ASIZE", ""), Pair("AWIDTH", "8"), Pair("BSIZE", "4")));
    EXPECT_TRUE(session.members().m_exceptions);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiProperties, MissingValueRaisesWhileExceptionsAreOn) {
    SpiSession session("DEVICE_FAMILY = A\nA_PROPERTY = WIDTH,8:SIZE:REST,1\n");
    session.members().m_spiProperties = {};
    EXPECT_EQ(raisedLine<DataMismatchException>(
                  [&] { session.members().readSpiProperties(accessorOf("spi.acd")); }),
              2322);
    EXPECT_EQ(session.members().m_spiProperties.get().count(StringBase("AREST")), 0U);
    EXPECT_EQ(session.members().m_spiProperties.get().count(StringBase("AWIDTH")), 1U);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiProperties, EmptyEntryIsAPropertyWithoutNameAndValue) {
    SpiSession session("DEVICE_FAMILY = A\nA_PROPERTY = SIZE,4::WIDTH,8\n");
    EXPECT_THAT(entries(session.members().m_spiProperties.get()),
                ElementsAre(Pair("A", ""), Pair("ASIZE", "4"), Pair("AWIDTH", "8")));
}

TEST(SpiTables, AreReadDuringTheStartUp) {
    SpiSession session(R"(
OPERATION = PROGRAM,SPI,USB2
BSDL_OPERATION = BYPASS,SVF
PROGRAM_OPTION = ERASE,SPI,USB2
)");
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 5, 2}));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{1, 19, 0, 3}));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{1, 0, 5, 2}));
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.members().m_loadedFamilies, IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiTables, OfAnUnsupportedSpiSetNothing) {
    ManagerFixture session({{"base.acd", "DEVICE_SUPPORTED = kestrel\nPROGRAM_OPTION_PACKAGE = kestrel\n"},
                            {"spi.acd", "OPERATION = PROGRAM,SPI,USB2\nBSDL_OPERATION = BYPASS,SVF\n"
                                        "PROGRAM_OPTION = ERASE,SPI,USB2\n"}});
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiTables, BadRecordsAreReportedAndPassedOverDuringTheStartUp) {
    SpiSession session(R"(
OPERATION = NONSENSE,SPI,USB2:PROGRAM,SPI,usb2,USB2
BSDL_OPERATION = BYPASS
PROGRAM_OPTION = ERASE
)");
    EXPECT_THAT(withoutLines(session.messages()),
                ElementsAre(info("Operation NONSENSE is not defined.\n"), debug("spi op = NONSENSE\n"),
                            debug("spi out   = usb2\n"), debug("spi out = (null)\n"),
                            debug("spi mode =   (null)\n"), debug("spi out = (null)\n")));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 0, 5, 2}));
    EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
}

} // namespace
