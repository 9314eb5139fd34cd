#include "Members.h"

#include <StringViews.h>

// Loading on demand: what one question about a device brings into memory, in which order, and only once.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

/// A manager over a base database with the given lists and more files.
struct LoadingSession : ManagerFixture {
    LoadingSession(const std::string& supported, const std::string& packages, Files files)
        : ManagerFixture(
              withBase("DEVICE_SUPPORTED = " + supported + "\nPROGRAM_OPTION_PACKAGE = " + packages + "\n",
                       std::move(files))) {}

    void load(std::string_view device, std::string_view package = {}) {
        members().loadDeviceData(device, package);
    }
    template <typename Exception>
    int raises(std::string_view device, std::string_view package = {}) {
        return raisedLine<Exception>([&] { load(device, package); });
    }

    auto owners() { return texts(members().m_loadedFamilies); }
    auto operationsLoaded() { return texts(members().m_operationsLoaded); }
    auto optionsLoaded() { return texts(members().m_programOptionsLoaded); }
    auto properties() { return lists(members().m_deviceProperties); }

private:
    static Files withBase(const std::string& base, Files files) {
        files["base.acd"] += base;
        return files;
    }
};

const char* const KESTREL = R"(
OPERATION = PROGRAM,BS,USB2
BSDL_OPERATION = BYPASS,SVF
PROGRAM_OPTION = ERASE,BS,USB2
PROPERTY = VENDOR,Korvel
[KS50]
PROPERTY = PINS,144
[KS100]
PROPERTY = PINS,256
)";

TEST(Loading, OfADeviceBringsTheDeviceAndItsFamily) {
    LoadingSession session("kestrel,merlin", "kestrel,merlin", {{"kestrel.acd", KESTREL}});
    session.load("KS50");
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.properties(),
                testing::UnorderedElementsAre(Pair("KS50_PINS", ElementsAre("144")),
                                              Pair("kestrel_VENDOR", ElementsAre("Korvel"))));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
    EXPECT_THAT(bsdlOperationCells(session.members()), ElementsAre(Cell{0, 19, 0, 3}));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Loading, OfAFamilyBringsTheFamilyAlone) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    session.load("kestrel");
    EXPECT_THAT(session.owners(), ElementsAre("kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
}

TEST(Loading, OfASecondDeviceAddsItsOwnDataAlone) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    session.load("KS50");
    session.load("KS100");
    EXPECT_THAT(session.owners(), ElementsAre("KS100", "KS50", "kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
}

TEST(Loading, HappensOnce) {
    LoadingSession session("kestrel", "kestrel",
                           {{"kestrel.acd", "OPERATION = PROGRAM,BS,usb2\n"
                                            "BSDL_OPERATION = BYPASS,svf\n"
                                            "PROGRAM_OPTION = ERASE,BS,zorva\n[KS50]\n"}});
    session->setExceptions(false);
    session.load("KS50");
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel out   = zorva\n"), debug("kestrel out   = usb2\n"),
                            debug("kestrel out   = svf\n")));
    session.load("KS50");
    session.load("kestrel");
    EXPECT_THAT(session.messages(), IsEmpty());
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
}

TEST(Loading, OfAFamilyReadsOperationsThenBsdlOperationsThenOptions) {
    LoadingSession session("kestrel", "kestrel",
                           {{"kestrel.acd", "OPERATION = PROGRAM,BS,usb2\n"
                                            "BSDL_OPERATION = BYPASS,svf\n"
                                            "PROGRAM_OPTION = ERASE,BS,zorva\n"}});
    session->setExceptions(false);
    session.load("kestrel");
    EXPECT_THAT(session.messages(),
                ElementsAre(debug("kestrel out   = usb2\n"), debug("kestrel out   = svf\n"),
                            debug("kestrel out   = zorva\n")));
}

TEST(Loading, NamesAreTakenCaseIncluded) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    session.load("KS50");
    session.load("ks50");
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel", "ks50"));
    EXPECT_THAT(session.properties()["ks50_PINS"], ElementsAre("144"));
}

TEST(Loading, OfADeviceWithAPackageTakesTheWholeNameAsOwner) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    session.load("KS50_PQ");
    EXPECT_THAT(session.owners(), ElementsAre("KS50_PQ", "kestrel"));
    EXPECT_THAT(session.properties()["KS50_PQ_PINS"], ElementsAre("144"));
}

TEST(Loading, OfAFamilyWithASuffixTakesTheWholeNameAsFamily) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    session->setExceptions(false);
    session.load("kestrel_x");
    EXPECT_THAT(session.owners(), ElementsAre("kestrel_x"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel_x"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel_x"));
    EXPECT_THAT(session.properties()["kestrel_x_VENDOR"], ElementsAre("Korvel"));
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Loading, OfAFamilyWithASuffixRaisesAtEachTableOnce) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", KESTREL}});
    EXPECT_EQ(session.raises<OutOfRangeException>("kestrel_x"), 1999);
    EXPECT_EQ(session.raises<OutOfRangeException>("kestrel_x"), 2024);
    EXPECT_EQ(session.raises<TarvikException>("kestrel_x"), -1);
}

TEST(Loading, TakesTheFamilyThatHoldsTheSectionRatherThanTheResolvedOne) {
    LoadingSession session("kestrel,osprey", "kestrel,osprey",
                           {{"kestrel.acd", KESTREL},
                            {"osprey.acd", "OPERATION = VERIFY,SS,SVF\n[KS50_X]\nPROPERTY = PINS,7\n"}});
    session.load("KS50_X");
    EXPECT_EQ(text(session->getPartFamily("KS50_X")), "kestrel");
    EXPECT_THAT(session.owners(), ElementsAre("KS50_X", "osprey"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "osprey"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel", "osprey"));
    EXPECT_THAT(session.properties()["KS50_X_PINS"], ElementsAre("7"));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{1, 3, 1, 3}));
}

TEST(Loading, TakesNoNoticeOfASeededFamily) {
    LoadingSession session("kestrel,osprey,spi", "kestrel,osprey",
                           {{"kestrel.acd", KESTREL}, {"osprey.acd", ""}});
    session->addCachedDeviceFamily("ks50", "osprey");
    session.load("KS50");
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "osprey", "kestrel"));
}

TEST(Loading, OfAnSpiFlashThatIsNoSectionLoadsTheBaseFamily) {
    LoadingSession session("base,spi", "base,spi",
                           {{"base.acd", "OPERATION = PROGRAM,BS,USB2\nPROPERTY = VENDOR,any\n"},
                            {"spi.acd", "DEVICE_FAMILY = FLASHES\nFLASHES_DEVICES = FLASH1\n"}});
    session.load("FLASH1");
    EXPECT_EQ(text(session->getPartFamily("FLASH1")), "spi");
    EXPECT_THAT(session.owners(), ElementsAre("FLASH1", "base"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "base"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "base"));
    EXPECT_THAT(session.properties(), ElementsAre(Pair("base_VENDOR", ElementsAre("any"))));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
}

TEST(Loading, OfAnSpiFlashRaisesWhereBaseIsNotSupported) {
    LoadingSession session("spi", "spi",
                           {{"spi.acd", "DEVICE_FAMILY = FLASHES\nFLASHES_DEVICES = FLASH1\n"}});
    EXPECT_EQ(session.raises<OutOfRangeException>("FLASH1"), 1999);
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "base"));
}

TEST(Loading, OfAnSpiFlashThatIsASectionTooLoadsThatSectionsFamily) {
    LoadingSession session("kestrel,spi", "kestrel,spi",
                           {{"kestrel.acd", KESTREL}, {"spi.acd", "DEVICE_FAMILY = KS50\n"}});
    session.load("KS50");
    EXPECT_EQ(text(session->getPartFamily("KS50")), "spi");
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
}

TEST(Loading, OfAnUnknownDeviceLoadsTheBaseFamily) {
    LoadingSession session("kestrel", "kestrel",
                           {{"base.acd", "PROPERTY = VENDOR,any\nOPERATION = PROGRAM,BS,USB2\n"}});
    session->setExceptions(false);
    session.load("nobody");
    EXPECT_THAT(session.owners(), ElementsAre("base", "nobody"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "base"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "base"));
    EXPECT_THAT(session.properties(), ElementsAre(Pair("base_VENDOR", ElementsAre("any"))));
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(Loading, OfNullIsThatOfTheEmptyName) {
    LoadingSession session("kestrel", "kestrel", {});
    session->setExceptions(false);
    session.load(view(static_cast<const char*>(nullptr)));
    EXPECT_THAT(session.owners(), ElementsAre("", "base"));
}

TEST(Loading, OfSpiReadsNoTableTwice) {
    LoadingSession session("spi", "spi",
                           {{"spi.acd", "OPERATION = PROGRAM,SPI,USB2\nPROGRAM_OPTION = ERASE,SPI,USB2\n"
                                        "PROPERTY = VENDOR,any\n"}});
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 0, 5, 2}));
    session.load("spi");
    EXPECT_THAT(session.owners(), ElementsAre("spi"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi"));
    EXPECT_THAT(session.properties(), ElementsAre(Pair("spi_VENDOR", ElementsAre("any"))));
}

TEST(OptionOwner, IsTheDeviceWithItsPackageWhereTheyAreListedTogether) {
    LoadingSession session(
        "kestrel", "KS50PQ,kestrel",
        {{"kestrel.acd", "PROGRAM_OPTION = ERASE,BS,USB2\n[KS50]\nPROGRAM_OPTION = VERIFY,SS,SVF\n"}});
    session.load("KS50", "PQ");
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "KS50PQ", "kestrel"));
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel"));
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 1, 1, 3}, Cell{1, 0, 0, 2}));
}

TEST(OptionOwner, IsTheDeviceWhereItIsListedAndNoPackageIsGiven) {
    for (const char* package : {static_cast<const char*>(nullptr), ""}) {
        LoadingSession session("kestrel", "KS50,kestrel", {{"kestrel.acd", KESTREL}});
        session.load("KS50", package);
        EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "KS50", "kestrel"));
    }
}

TEST(OptionOwner, IsTheResolvedFamilyWhereDeviceAndPackageAreNotListedTogether) {
    LoadingSession session("kestrel", "KS50,KS50_PQ,kestrel", {{"kestrel.acd", KESTREL}});
    session.load("KS50", "PQ");
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
}

TEST(OptionOwner, JoinsDeviceAndPackageWithoutASeparator) {
    LoadingSession session("kestrel", "KS50_PQ,kestrel", {{"kestrel.acd", KESTREL}});
    session.load("KS50", "_PQ");
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "KS50_PQ", "kestrel"));
}

TEST(OptionOwner, FirstDeviceOfAFamilyGivesTheFamilyItsOptions) {
    LoadingSession session("kestrel", "kestrel",
                           {{"kestrel.acd", "PROGRAM_OPTION = ERASE,BS,USB2\n"
                                            "[KS50]\nPROGRAM_OPTION = VERIFY,SS,SVF\n[KS100]\n"}});
    session.load("KS50");
    session.load("KS100");
    session.load("kestrel");
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 1, 1, 3}));
}

TEST(OptionOwner, OfAFamilyTakesNoNoticeOfThePackage) {
    LoadingSession session("kestrel", "kestrel,kestrelPQ", {{"kestrel.acd", KESTREL}});
    session.load("kestrel", "PQ");
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
}

TEST(FailedLoading, UnsupportedPackageRaisesWithoutAnEntryAndAnswersTheSecondTime) {
    LoadingSession session("kestrel", "merlin", {{"kestrel.acd", "[KS50]\n"}});
    EXPECT_EQ(session.raises<OutOfRangeException>("kestrel"), 2024);
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_EQ(session.raises<TarvikException>("kestrel"), -1);
}

TEST(FailedLoading, DeviceOfAnUnlistedFamilyRaisesForItsOptionsThenForItsFamilyThenAnswers) {
    LoadingSession session("merlin", "merlin", {{"kestrel.acd", KESTREL}});
    EXPECT_EQ(session.raises<OutOfRangeException>("KS50"), 2024);
    EXPECT_THAT(session.owners(), ElementsAre("KS50"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_EQ(session.raises<OutOfRangeException>("KS50"), 1999);
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_EQ(session.raises<TarvikException>("KS50"), -1);
    EXPECT_THAT(operationCells(session.members()), IsEmpty());
}

TEST(FailedLoading, BadOperationEntryIsNotReadAgain) {
    LoadingSession session("kestrel", "kestrel",
                           {{"kestrel.acd", "OPERATION = ERASE,BS,USB2:PROGRAM:VERIFY,BS,USB2\n"
                                            "BSDL_OPERATION = BYPASS,SVF\n"
                                            "PROGRAM_OPTION = ERASE,BS,USB2\n"}});
    EXPECT_EQ(session.raises<DataMismatchException>("kestrel"), 1638);
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi"));
    EXPECT_EQ(session.raises<TarvikException>("kestrel"), -1);
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 4, 0, 2}));
    EXPECT_THAT(bsdlOperationCells(session.members()), IsEmpty());
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
}

TEST(FailedLoading, BadBsdlOperationEntryIsNotReadAgain) {
    LoadingSession session("kestrel", "kestrel",
                           {{"kestrel.acd", "OPERATION = ERASE,BS,USB2\nBSDL_OPERATION = BYPASS\n"}});
    EXPECT_EQ(session.raises<DataMismatchException>("kestrel"), 1695);
    EXPECT_EQ(session.raises<TarvikException>("kestrel"), -1);
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 4, 0, 2}));
}

TEST(FailedLoading, BadOptionEntryIsNotReadAgain) {
    LoadingSession session(
        "kestrel", "kestrel",
        {{"kestrel.acd", "OPERATION = ERASE,BS,USB2\n"
                         "PROGRAM_OPTION = ERASE,BS,USB2:OTP,BS,USB2:VERIFY,BS,USB2\n[KS50]\n"}});
    session->setExceptions(false);
    EXPECT_EQ(session.raises<DataMismatchException>("KS50"), 1500);
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi", "kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi"));
    EXPECT_EQ(session.raises<TarvikException>("KS50"), -1);
    EXPECT_THAT(programOptionCells(session.members()), ElementsAre(Cell{0, 0, 0, 2}));
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 4, 0, 2}));
}

TEST(FailedLoading, BadPropertyEntryIsNotReadAgain) {
    LoadingSession session(
        "kestrel", "kestrel",
        {{"kestrel.acd", "PROPERTY = A,1:B:C,3\nPROPERTIES = D,1,4\nOPERATION = ERASE,BS,USB2\n"}});
    EXPECT_EQ(session.raises<DataMismatchException>("kestrel"), 1011);
    EXPECT_THAT(session.owners(), ElementsAre("kestrel"));
    EXPECT_THAT(session.operationsLoaded(), ElementsAre("spi"));
    EXPECT_EQ(session.raises<TarvikException>("kestrel"), -1);
    const auto properties = session.properties();
    EXPECT_THAT(properties.at("kestrel_A"), ElementsAre("1"));
    EXPECT_EQ(properties.count("kestrel_C"), 0U);
    EXPECT_EQ(properties.count("kestrel_D"), 0U);
    EXPECT_THAT(operationCells(session.members()), ElementsAre(Cell{0, 4, 0, 2}));
}

TEST(FailedLoading, OfADevicesPropertiesComesBeforeAnythingOfItsFamily) {
    LoadingSession session("kestrel", "kestrel", {{"kestrel.acd", "PROPERTY = A,1\n[KS50]\nPROPERTY = B\n"}});
    EXPECT_EQ(session.raises<DataMismatchException>("KS50"), 1011);
    EXPECT_THAT(session.owners(), ElementsAre("KS50"));
    EXPECT_THAT(session.optionsLoaded(), ElementsAre("spi"));
    EXPECT_EQ(session.raises<TarvikException>("KS50"), -1);
    EXPECT_THAT(session.owners(), ElementsAre("KS50", "kestrel"));
}

TEST(FailedLoading, UnreadableFamilyPassesThroughEvenWhileExceptionsAreOff) {
    const DatabaseDirectory directory;
    directory.writeFile("base.acd", "DEVICE_SUPPORTED = kestrel\nPROGRAM_OPTION_PACKAGE = kestrel\n");
    directory.makeDirectory("kestrel.acd");
    ManagerFixture session(directory);
    session->setExceptions(false);
    EXPECT_THROW(session.members().loadDeviceData("kestrel", {}), DataNotFoundException);
}

} // namespace
