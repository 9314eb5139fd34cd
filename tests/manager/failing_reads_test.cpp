#include "Members.h"

#include <functional>
#include <new>
#include <stdexcept>

// A host whose reads fail at will: the order of the start-up's reads, and what each failure leaves.
//
// The linker puts `hookedRead` in front of the accessor's reading method, which is why these tests are an
// executable of their own.

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

namespace {

/// Called before each read of an item; throws in place of the read.
std::function<void(const std::string& key, short index)> g_beforeRead;

} // namespace

extern "C" {
const char* realRead(PM_DEVKEY* accessor, const char* key, const char* separator, short index,
                     const char* subSeparator,
                     short subIndex) asm("__real__ZN9PM_DEVKEY14getstringbykeyEPKcS1_sS1_s");
const char* hookedRead(PM_DEVKEY* accessor, const char* key, const char* separator, short index,
                       const char* subSeparator,
                       short subIndex) asm("__wrap__ZN9PM_DEVKEY14getstringbykeyEPKcS1_sS1_s");

const char* hookedRead(PM_DEVKEY* accessor, const char* key, const char* separator, short index,
                       const char* subSeparator, short subIndex) {
    if (g_beforeRead) {
        g_beforeRead(key, index);
    }
    return realRead(accessor, key, separator, index, subSeparator, subIndex);
}
}

namespace {

const Files DATABASES = {
    {"base.acd", R"(
DEVICE_SUPPORTED = kestrel
PROGRAM_OPTION_PACKAGE = kestrel
BS = outs,USB2:fams,kestrel
PFF = outs,SVF:fams,kestrel
IDCODE = KS50,0x1
NOT_SUPPORTED_PART_IN_MODE = SS_KS50_PQ
)"},
    {"spi.acd", R"(
DEVICE_FAMILY = FLASHES
FLASHES_DEVICES = FLASH1
FLASH1_PROPERTY = SIZE,4
AT1_DEVICES = FLASH1
TYPE_BPI_SERIAL_LEAD = KS50
)"},
    {"kestrel.acd", "PROPERTY = VENDOR,Korvel\nOPERATION = PROGRAM,BS,USB2\n[KS50]\n"},
};

/// Counts how often it was asked to report itself.
class CountingException : public TarvikException {
public:
    CountingException() : TarvikException("Tarvik", "test", "1", 4711) {}
    void report() const override { ++s_reports; }
    static inline int s_reports = 0;
};

template <typename Exception>
auto failingAt(const std::string& key, short index, Exception exception) {
    return [=](const std::string& readKey, short readIndex) {
        if (readKey == key && readIndex == index) {
            throw exception;
        }
    };
}
DataMismatchException fault() { return {"Tarvik", "test", "1", 4711}; }

/// A manager whose start-up met a fault at an item of a key.
struct FailedStart {
    FailedStart(const char* key, short index) { g_beforeRead = failingAt(key, index, fault()); }
    ~FailedStart() { g_beforeRead = nullptr; }
};
struct FailedSession : FailedStart, ManagerFixture {
    explicit FailedSession(const char* key, short index = 0)
        : FailedStart(key, index), ManagerFixture(DATABASES) {
        g_beforeRead = nullptr;
    }
};

/// The steps of the start-up, in order, that fill members of their own.
enum Step { SUPPORTED_LISTS, MODE_OUTPUTS, MODE_DEVICES, IDCODES, NOT_SUPPORTED, TABLES, SPI_NAMES, ALL };

/// The steps before `end` have filled their members, those from it on have not.
void expectStepsBefore(Step end, TarvikTestPeer::Members& members) {
    const auto done = [&](Step step) { return step < end ? 1U : 0U; };
    EXPECT_EQ(members.m_supportedDevices.size(), done(SUPPORTED_LISTS));
    EXPECT_EQ(members.m_programOptionPackages.size(), done(SUPPORTED_LISTS));
    EXPECT_THAT(members.m_bsCables, SizeIs(done(MODE_OUTPUTS)));
    EXPECT_THAT(members.m_pffCables, SizeIs(done(MODE_OUTPUTS)));
    EXPECT_EQ(members.m_bsDevices.size(), done(MODE_DEVICES));
    EXPECT_EQ(members.m_pffDevices.size(), done(MODE_DEVICES));
    EXPECT_THAT(members.m_deviceIdcodes.get(), SizeIs(done(IDCODES)));
    EXPECT_EQ(members.m_notSupportedPartInMode.size(), done(NOT_SUPPORTED));
    EXPECT_EQ(members.m_operationTable.blocks(), done(TABLES));
    EXPECT_EQ(members.m_bsdlOperationTable.blocks(), done(TABLES));
    EXPECT_EQ(members.m_programOptionTable.blocks(), done(TABLES));
    EXPECT_THAT(members.m_operationOrders, SizeIs(done(TABLES) * 32));
    EXPECT_THAT(members.m_programOptionOrders, SizeIs(done(TABLES) * 24));
    EXPECT_THAT(members.m_spiFamilies, SizeIs(done(SPI_NAMES)));
}

/// What every start-up that a fault ended has in common.
void expectUsableAfterOneReport(ManagerFixture& session) {
    EXPECT_TRUE(session.members().m_exceptions);
    const auto messages = session.messages();
    ASSERT_THAT(messages, SizeIs(1));
    EXPECT_EQ(messages[0].line, 4711);
    EXPECT_THAT(messages[0].text, HasSubstr("DataMismatchException"));
    EXPECT_EQ(text(session->getPartFamily("KS50")), "kestrel");
}

TEST(ReadOrder, OfTheStartUp) {
    std::string keys;
    std::string latest;
    g_beforeRead = [&](const std::string& key, short index) {
        const bool laterFamily = key == "DEVICE_FAMILY" && index > 0; // all at once or one by one: no matter
        if (key != latest && !laterFamily) {
            keys += key + ' ';
            latest = key;
        }
    };
    ManagerFixture session(DATABASES);
    g_beforeRead = nullptr;
    EXPECT_EQ(keys,
              "DEVICE_SUPPORTED PROGRAM_OPTION_PACKAGE "
              "BS SS SM BSFILE DP770 SPI KITECF KITEMPM PFF BS SS SM BSFILE DP770 SPI KITECF KITEMPM PFF "
              "IDCODE NOT_SUPPORTED_PART_IN_MODE "
              "DEVICE_FAMILY FLASHES_DEVICES "
              "AT1_DEVICES ST1_DEVICES ST2_DEVICES BPI1_DEVICES BPI2_DEVICES BPI3_DEVICES "
              "FLASHES_PROPERTY FLASH1_PROPERTY "
              "OPERATION BSDL_OPERATION PROGRAM_OPTION "
              "TYPE_BPI_SERIAL_LEAD TYPE_BPI_SERIAL_CHAIN TYPE_BPI_PARALLEL_LEAD TYPE_BPI_PARALLEL_CHAIN "
              "TYPE_MB_SPI_NONE_LEAD TYPE_MB_SPI_NONE_CHAIN "
              "TYPE_MB_BPI_SERIAL_LEAD TYPE_MB_BPI_SERIAL_CHAIN "
              "TYPE_MB_BPI_PARALLEL_LEAD TYPE_MB_BPI_PARALLEL_CHAIN "
              "TYPE_MB_QPRM_NONE_LEAD TYPE_MB_QPRM_NONE_CHAIN ");
    expectStepsBefore(ALL, session.members());
}

TEST(ReadOrder, SecondCallReadsNothing) {
    ManagerFixture session(DATABASES);
    g_beforeRead = [](const std::string& key, short) { ADD_FAILURE() << key; };
    EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &*session);
    g_beforeRead = nullptr;
}

TEST(ReadOrder, LoadedDataIsNotReadAgain) {
    ManagerFixture session(DATABASES);
    session.members().loadDeviceData("KS50", {});
    g_beforeRead = [](const std::string& key, short) { ADD_FAILURE() << key; };
    session.members().loadDeviceData("KS50", {});
    session.members().loadDeviceData("kestrel", {});
    g_beforeRead = nullptr;
}

TEST(FailedStartUp, AtTheSupportedListsLeavesEverythingEmpty) {
    FailedSession session("DEVICE_SUPPORTED");
    expectStepsBefore(SUPPORTED_LISTS, session.members());
    EXPECT_NE(session.members().m_devKey, nullptr);
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheModeOutputsKeepsTheLists) {
    FailedSession session("BS");
    expectStepsBefore(MODE_OUTPUTS, session.members());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheModeDevicesKeepsTheOutputs) {
    FailedSession session("BS", 1);
    expectStepsBefore(MODE_DEVICES, session.members());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheIdcodesKeepsTheModeTables) {
    FailedSession session("IDCODE");
    expectStepsBefore(IDCODES, session.members());
    EXPECT_THAT(session.members().m_deviceFamilyCache, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheNotSupportedPartsKeepsTheIdcodes) {
    FailedSession session("NOT_SUPPORTED_PART_IN_MODE");
    expectStepsBefore(NOT_SUPPORTED, session.members());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheSpiNamesKeepsTablesAndOrders) {
    FailedSession session("DEVICE_FAMILY");
    expectStepsBefore(SPI_NAMES, session.members());
    EXPECT_THAT(session.members().m_operationsLoaded, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheClassListsKeepsTheSpiNames) {
    FailedSession session("AT1_DEVICES");
    expectStepsBefore(ALL, session.members());
    EXPECT_THAT(session.members().m_spiNames, SizeIs(3));
    EXPECT_THAT(session.members().m_spiProperties.get(), IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheSpiPropertiesKeepsTheClassLists) {
    FailedSession session("FLASHES_PROPERTY");
    EXPECT_THAT(session.members().m_at1Devices, SizeIs(1));
    EXPECT_THAT(session.members().m_spiProperties.get(), IsEmpty());
    EXPECT_THAT(session.members().m_operationsLoaded, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheSpiOperationsCountsThemAsNotLoaded) {
    FailedSession session("OPERATION");
    EXPECT_THAT(session.members().m_spiProperties.get(), SizeIs(1));
    EXPECT_THAT(session.members().m_operationsLoaded, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheSpiBsdlOperationsCountsTheOperationsAsLoaded) {
    FailedSession session("BSDL_OPERATION");
    EXPECT_THAT(texts(session.members().m_operationsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.members().m_programOptionsLoaded, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AtTheMultibootTypesCountsTheOptionsAsLoaded) {
    FailedSession session("TYPE_BPI_SERIAL_LEAD");
    EXPECT_THAT(texts(session.members().m_programOptionsLoaded), ElementsAre("spi"));
    EXPECT_THAT(session.members().m_multibootTypes, IsEmpty());
    expectUsableAfterOneReport(session);
}

TEST(FailedStartUp, AsksTheExceptionItselfToReportOnce) {
    g_beforeRead = failingAt("IDCODE", 0, CountingException());
    ManagerFixture session(DATABASES);
    g_beforeRead = nullptr;
    EXPECT_EQ(CountingException::s_reports, 1);
    EXPECT_THAT(session.messages(), IsEmpty());
    expectStepsBefore(IDCODES, session.members());
}

TEST(FailedCreation, AnyOtherExceptionPassesOutAndTheNextCallTriesAgain) {
    AcdStore::setMemoryFiles(DATABASES);
    MessageRecorder recorder;
    for (const char* key : {"DEVICE_SUPPORTED", "IDCODE", "DEVICE_FAMILY", "TYPE_MB_QPRM_NONE_CHAIN"}) {
        g_beforeRead = failingAt(key, 0, std::runtime_error("broken"));
        EXPECT_THROW((void)ConstraintsManager::getConstraintsManager(), std::runtime_error);
        EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
        g_beforeRead = failingAt(key, 0, Port::Exception());
        EXPECT_THROW((void)ConstraintsManager::getConstraintsManager(), Port::Exception);
        EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
        g_beforeRead = failingAt(key, 0, std::bad_alloc());
        EXPECT_THROW((void)ConstraintsManager::getConstraintsManager(), std::bad_alloc);
        EXPECT_EQ(TarvikTestPeer::instance(), nullptr);
    }
    g_beforeRead = nullptr;
    EXPECT_THAT(recorder.take(), IsEmpty());
    ManagerFixture session(DATABASES);
    expectStepsBefore(ALL, session.members());
    EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
}

TEST(FailedLoading, PassesOutWhateverTheSwitchSaysAndIsNotRepeated) {
    for (const char* key : {"PROPERTY", "PROPERTIES", "OPERATION", "BSDL_OPERATION", "PROGRAM_OPTION"}) {
        SCOPED_TRACE(key);
        ManagerFixture session(DATABASES);
        session->setExceptions(false);
        g_beforeRead = failingAt(key, 0, fault());
        EXPECT_THROW(session.members().loadDeviceData("kestrel", {}), DataMismatchException);
        EXPECT_NO_THROW(session.members().loadDeviceData("kestrel", {}));
        g_beforeRead = nullptr;
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

/// Turns exceptions at the first read of a record's number `index` of `key`.
void turnExceptionsAt(ConstraintsManager& manager, const std::string& key, short index, bool exceptions) {
    g_beforeRead = [&manager, key, index, exceptions](const std::string& read, short at) {
        if (read == key && at == index) {
            manager.setExceptions(exceptions);
        }
    };
}

struct FaultyRecord {
    const char* key;
    const char* records; ///< the second one is faulty
    int location;
};
constexpr FaultyRecord FAULTY_RECORDS[] = {
    {"PROPERTY", "VENDOR,Korvel:BROKEN", 1011},          {"PROPERTIES", "MODES,1,BS:BROKEN,1", 1051},
    {"OPERATION", "PROGRAM,BS,USB2:VERIFY,BS", 1649},    {"BSDL_OPERATION", "BYPASS,USB2:HIGHZ", 1695},
    {"PROGRAM_OPTION", "ERASE,BS,USB2:VERIFY,BS", 1750},
};

TEST(ExceptionsSwitch, TurnedWhileALoadReadsDecidesAboutTheRestOfThatLoad) {
    for (const FaultyRecord& faulty : FAULTY_RECORDS) {
        SCOPED_TRACE(faulty.key);
        Files files = DATABASES;
        files["kestrel.acd"] = std::string(faulty.key) + " = " + faulty.records + "\n";
        for (const bool exceptions : {false, true}) {
            ManagerFixture fixture(files);
            fixture->setExceptions(!exceptions);
            turnExceptionsAt(*fixture, faulty.key, 1, exceptions);
            const int raised =
                raisedLine<DataMismatchException>([&] { fixture.members().loadDeviceData("kestrel", {}); });
            EXPECT_EQ(raised, exceptions ? faulty.location : -1);
            g_beforeRead = nullptr;
        }
    }
}

} // namespace
