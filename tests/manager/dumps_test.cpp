// The dumps of the tables and of the cached families: every byte of them, with and without a recorder.
#include "DumpFormat.h"
#include "Members.h"

#include <TarvikSmokeMgr.h>

#include <gmock/gmock.h>

namespace {

using dump::operator+;
using dump::joined;
using dump::place;
using dump::row;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::size_t OPERATION_CELLS = 32 * 6 * 5;
constexpr std::size_t BSDL_CELLS = 32 * 5;
constexpr std::size_t OPTION_CELLS = 24 * 6 * 5;

const Files DATABASES = {
    {"base.acd", "DEVICE_SUPPORTED = spi,a,a_name_of_16_byte,exactly_15_byte\n"
                 "PROGRAM_OPTION_PACKAGE = spi,a,b\n"},
    {"a.acd", "OPERATION = PROGRAM,Bscan,PARALLEL,USB2:EXPRESSQSVF,SPI,STAPL:VERIFY,Smap,ZORVA\n"
              "BSDL_OPERATION = BYPASS,PARALLEL,STAPL:EXPRESSQSVF,SVF:PROGRAM,ZORVA\n"
              "PROGRAM_OPTION = ERASE,Bscan,PARALLEL:SECTOR_LOCKDOWN,SPI,STAPL:UES,DTCONFIG,SVF\n[dev1]\n"}};

using Dump = void (ConstraintsManager::*)(TarvikSmokeMgr*);

std::string recorded(const ManagerFixture& manager, Dump dump) {
    TarvikSmokeMgr recorder;
    ((*manager).*dump)(&recorder);
    return {recorder.text().c_str(), recorder.text().GetLength()};
}

// What is issued in place of these pieces when there is no recorder.
std::vector<IssuedMessage> issued(const dump::Pieces& pieces) {
    std::vector<IssuedMessage> messages;
    for (const auto& piece : pieces) {
        messages.push_back(status(1777, piece));
    }
    return messages;
}

// The pieces of the dumps of `DATABASES` once family "a" is loaded.
dump::Pieces operationsOfA() {
    return dump::moddedHeader(dump::OPERATIONS) +
           row("a", OPERATION_CELLS, {place(0, 0, 0), place(0, 0, 2), place(31, 5, 4), place(3, 2, 1)}) +
           row("a_name_of_16_byte", OPERATION_CELLS, {}) + row("exactly_15_byte", OPERATION_CELLS, {}) +
           row("spi", OPERATION_CELLS, {});
}
dump::Pieces bsdlOperationsOfA() {
    return dump::bsdlHeader() + row("a", BSDL_CELLS, {19 * 5 + 0, 19 * 5 + 4, 31 * 5 + 3, 0 * 5 + 1}) +
           row("a_name_of_16_byte", BSDL_CELLS, {}) + row("exactly_15_byte", BSDL_CELLS, {}) +
           row("spi", BSDL_CELLS, {});
}
dump::Pieces programOptionsOfA() {
    return dump::moddedHeader(dump::OPTIONS) +
           row("a", OPTION_CELLS, {place(0, 0, 0), place(16, 5, 4), place(10, 4, 3)}) +
           row("b", OPTION_CELLS, {}) + row("spi", OPTION_CELLS, {});
}

void loadA(const ManagerFixture& manager) {
    static_cast<void>(manager->getDeviceOperations("a", MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL));
}

} // namespace

TEST(Dumps, TheFirstLinesOfTheOperationsByHand) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    const std::string text = recorded(manager, &ConstraintsManager::dumpOperationsTable);
    const std::size_t line = 15 + 32 * 60 + 1;
    ASSERT_EQ(text.size(), 3 * line);
    EXPECT_EQ(text.substr(0, 90), "               "
                                  "PROGRAM                                                     "
                                  "PROGRAMFLASH   ");
    EXPECT_EQ(text.substr(line - 1, 91), "\n               "
                                         "BS        SS        SM        BSFILE    DP770     SPI       "
                                         "BS        SS   ");
    EXPECT_EQ(text.substr(2 * line - 1, 36), "\n               P Z U S S P Z U S S ");
}

TEST(Dumps, TheFirstLinesOfTheBoundaryScanOperationsByHand) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    const std::string text = recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable);
    const std::size_t line = 15 + 32 * 10 + 1;
    ASSERT_EQ(text.size(), 2 * line);
    EXPECT_EQ(text.substr(0, 65), "               PROGRA    PROGRA    PROGRA    VERIFY    ERASE     ");
    EXPECT_EQ(text.substr(line - 1, 36), "\n               P Z U S S P Z U S S ");
}

TEST(Dumps, TheOperationsOfAFamily) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpOperationsTable), joined(operationsOfA()));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(Dumps, TheBoundaryScanOperationsOfAFamily) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable), joined(bsdlOperationsOfA()));
}

TEST(Dumps, TheProgramOptionsOfAFamily) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpProgramOptionsTable), joined(programOptionsOfA()));
}

TEST(Dumps, WithoutARecorderEveryPieceOfTheOperationsIsAMessage) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    manager->dumpOperationsTable(nullptr);
    EXPECT_EQ(manager.messages(), issued(operationsOfA()));
}

TEST(Dumps, WithoutARecorderEveryPieceOfTheBoundaryScanOperationsIsAMessage) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    manager->dumpBsdlOperationsTable(nullptr);
    EXPECT_EQ(manager.messages(), issued(bsdlOperationsOfA()));
}

TEST(Dumps, WithoutARecorderEveryPieceOfTheProgramOptionsIsAMessage) {
    ManagerFixture manager(DATABASES);
    loadA(manager);
    manager->dumpProgramOptionsTable(nullptr);
    EXPECT_EQ(manager.messages(), issued(programOptionsOfA()));
}

TEST(Dumps, APieceTellsItsOriginInFull) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    std::set<std::string> origins;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        origins.insert(std::string(message.product) + " " + std::string(message.source));
    });
    manager->dumpBsdlOperationsTable(nullptr);
    EXPECT_THAT(origins, ElementsAre("Tarvik ../s/ConstraintsManager"));
}

TEST(Dumps, EmptyListsGiveTheHeadersAlone) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpOperationsTable),
              joined(dump::moddedHeader(dump::OPERATIONS)));
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable), joined(dump::bsdlHeader()));
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpProgramOptionsTable),
              joined(dump::moddedHeader(dump::OPTIONS)));
}

TEST(Dumps, WithoutCachedFamiliesNothingIsDumped) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = spi\n"}});
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpCachedDeviceFamilies), "");
    manager->dumpCachedDeviceFamilies(nullptr);
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(Dumps, TheStartUpCachesSpiWhereItIsNotSupported) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpCachedDeviceFamilies),
              "Device spi belongs to spi\n");
}

TEST(Dumps, WithoutABaseDatabaseTheHeadersStandToo) {
    ManagerFixture manager(Files{});
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpOperationsTable),
              joined(dump::moddedHeader(dump::OPERATIONS)));
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable), joined(dump::bsdlHeader()));
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpProgramOptionsTable),
              joined(dump::moddedHeader(dump::OPTIONS)));
}

TEST(Dumps, NothingIsLoadedForADump) {
    ManagerFixture manager(DATABASES);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpOperationsTable),
              joined(dump::moddedHeader(dump::OPERATIONS) + row("a", OPERATION_CELLS, {}) +
                     row("a_name_of_16_byte", OPERATION_CELLS, {}) +
                     row("exactly_15_byte", OPERATION_CELLS, {}) + row("spi", OPERATION_CELLS, {})));
    EXPECT_TRUE(manager.members().m_loadedFamilies.empty());
    EXPECT_TRUE(manager.members().m_deviceFamilyCache.empty());
}

TEST(Dumps, ANameIsCutAndPaddedToFifteenBytes) {
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = ,x,0123456789abcde,0123456789abcdef\n"}});
    const std::string zeros = joined(row("", BSDL_CELLS, {})).substr(15);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable),
              joined(dump::bsdlHeader()) + "               " + zeros + "0123456789abcde" + zeros +
                  "0123456789abcde" + zeros + "x              " + zeros);
}

TEST(Dumps, APieceIsHandedOverAsAFormat) {
    // The cell is padded with the name as it stands; then the sink reads "%%" as "%", and drops nothing else.
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = 50%%x,a%s%n%d,cut_in_percen%%t\n"}});
    const std::string zeros = joined(row("", BSDL_CELLS, {})).substr(15);
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable),
              joined(dump::bsdlHeader()) + "50%x          " + zeros + "a%s%n%d        " + zeros +
                  "cut_in_percen%" + zeros);
}

TEST(Dumps, APieceIsHandedOverAsAFormatWithoutARecorderToo) {
    ManagerFixture manager(Files{{"base.acd", "PROGRAM_OPTION_PACKAGE = 50%%x,a%s%n%d,fourteen_bytes%%\n"}});
    manager->dumpProgramOptionsTable(nullptr);
    const auto messages = manager.messages();
    const std::size_t header = dump::moddedHeader(dump::OPTIONS).size();
    const std::size_t line = OPTION_CELLS + 2;
    ASSERT_EQ(messages.size(), header + 3 * line);
    EXPECT_EQ(messages[header], status(1777, "50%x          "));
    EXPECT_EQ(messages[header + line], status(1777, "a%s%n%d        "));
    EXPECT_EQ(messages[header + 2 * line], status(1777, "fourteen_bytes%"));
}

TEST(Dumps, BytesOver127AreBytes) {
    // A name of two-byte characters is cut inside the eighth.
    const std::string name = "\xc3\xa4\xc3\xa4\xc3\xa4\xc3\xa4\xc3\xa4\xc3\xa4\xc3\xa4\xc3\xa4";
    ManagerFixture manager(Files{{"base.acd", "DEVICE_SUPPORTED = " + name + "\n"}});
    const std::string text = recorded(manager, &ConstraintsManager::dumpBsdlOperationsTable);
    EXPECT_EQ(text.substr(joined(dump::bsdlHeader()).size(), 16), name.substr(0, 15) + "0");
}

TEST(Dumps, CachedFamiliesInTheOrderOfTheDevices) {
    ManagerFixture manager(DATABASES);
    for (const char* device : {"zebra", "Dev1_x", "DEV1", "a"}) {
        static_cast<void>(manager->getPartFamily(device));
    }
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpCachedDeviceFamilies),
              "Device a belongs to a\nDevice dev1 belongs to a\nDevice zebra belongs to base\n");
}

TEST(Dumps, EachCachedFamilyIsOnePieceWithoutARecorder) {
    ManagerFixture manager(DATABASES);
    static_cast<void>(manager->getPartFamily("zebra"));
    static_cast<void>(manager->getPartFamily("dev1"));
    manager->dumpCachedDeviceFamilies(nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(status(1777, "Device dev1 belongs to a\n"),
                                                status(1777, "Device zebra belongs to base\n")));
}

TEST(Dumps, CachedNamesOfAnyLengthWithPercentSigns) {
    ManagerFixture manager(DATABASES);
    const std::string name(1000, 'x');
    manager->addCachedDeviceFamily((name + "%%").c_str(), "100%s");
    EXPECT_EQ(recorded(manager, &ConstraintsManager::dumpCachedDeviceFamilies),
              "Device " + name + "% belongs to 100%s\n");
    manager->dumpCachedDeviceFamilies(nullptr);
    EXPECT_THAT(manager.messages(), ElementsAre(status(1777, "Device " + name + "% belongs to 100%s\n")));
}

TEST(Dumps, DumpsOfOneRecorderFollowEachOther) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    TarvikSmokeMgr recorder;
    manager->dumpBsdlOperationsTable(&recorder);
    manager->dumpBsdlOperationsTable(&recorder);
    EXPECT_EQ(recorder.text().c_str(), joined(dump::bsdlHeader()) + joined(dump::bsdlHeader()));
}

TEST(Dumps, AFailingSinkPassesThrough) {
    ManagerFixture manager(Files{{"base.acd", ""}});
    struct Refusal {};
    int pieces = 0;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message&) {
        if (++pieces == 3) {
            throw Refusal();
        }
    });
    EXPECT_THROW(manager->dumpOperationsTable(nullptr), Refusal);
    EXPECT_EQ(pieces, 3);
}

TEST(NamesByPosition, EachPositionHasItsName) {
    ManagerFixture manager(DATABASES);
    EXPECT_STREQ(manager.members().supportedDeviceNameAt(0).c_str(), "a");
    EXPECT_STREQ(manager.members().supportedDeviceNameAt(3).c_str(), "spi");
    EXPECT_STREQ(manager.members().programOptionPackageNameAt(1).c_str(), "b");
}

TEST(NamesByPosition, PositionsOutOfRangeAreRaisedWhileExceptionsAreOn) {
    ManagerFixture manager(DATABASES);
    for (const int position : {4, 5, 2147483647, -1, -2147483647 - 1}) {
        expectRaises<OutOfRangeException>(1959,
                                          [&] { return manager.members().supportedDeviceNameAt(position); });
        expectRaises<OutOfRangeException>(
            1975, [&] { return manager.members().programOptionPackageNameAt(position); });
    }
    expectRaises<OutOfRangeException>(1975, [&] { return manager.members().programOptionPackageNameAt(3); });
}

TEST(NamesByPosition, PositionsOutOfRangeAreEmptyWhileExceptionsAreOff) {
    ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    for (const int position : {4, 5, 2147483647, -1, -2147483647 - 1}) {
        EXPECT_STREQ(manager.members().supportedDeviceNameAt(position).c_str(), "");
        EXPECT_STREQ(manager.members().programOptionPackageNameAt(position).c_str(), "");
    }
}
