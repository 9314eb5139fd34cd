// What the queries answer when the start-up ended early, so that lists are empty or tables were never built.
#include "Members.h"

#include <TarvikSmokeMgr.h>

#include <gmock/gmock.h>

#include <filesystem>

#include <unistd.h>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;

const Files WITHOUT_BASE = {
    {"fam1.acd",
     "OPERATION = VERIFY,Bscan,PARALLEL\nBSDL_OPERATION = BYPASS,PARALLEL\n"
     "PROGRAM_OPTION = ERASE,Bscan,PARALLEL\nPROPERTY = K,theirs:VERIFY,BS:OP_VERIFY,fast\n[dev1]\n"},
    {"spi.acd", "DEVICE_FAMILY = AT\nOPERATION = VERIFY,SPI,PARALLEL\n"}};

Files withBase() {
    auto files = WITHOUT_BASE;
    files["base.acd"] = "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n";
    return files;
}

// A directory whose base.acd can't be read, since it is a directory itself.
class UnreadableBase {
public:
    UnreadableBase() { std::filesystem::create_directories(m_directory / "base.acd"); }
    ~UnreadableBase() { std::filesystem::remove_all(m_directory); }
    UnreadableBase(const UnreadableBase&) = delete;
    UnreadableBase& operator=(const UnreadableBase&) = delete;

    [[nodiscard]] std::string path() const { return m_directory.string(); }

private:
    std::filesystem::path m_directory =
        std::filesystem::temp_directory_path() / ("tarvik-unreadable-" + std::to_string(getpid()));
};

// Puts the tables back to how they are before the start-up gives them their size.
void unbuildTables(const ManagerFixture& manager) {
    manager.members().m_operationTable = PermissionTable();
    manager.members().m_bsdlOperationTable = PermissionTable();
    manager.members().m_programOptionTable = PermissionTable();
}

// Expects 0 or false of every query of the permission tables, for every value of every argument.
void expectNothingAllowed(const ManagerFixture& manager) {
    for (const char* device : {"dev1", "fam1", "spi", "nobody", "", static_cast<const char*>(nullptr)}) {
        for (const int output : BOUNDARY_VALUES) {
            EXPECT_EQ(manager->getBsdlOperations(device, OUTPUT_TYPE{output}), 0);
            for (const int mode : BOUNDARY_VALUES) {
                EXPECT_EQ(manager->getDeviceOperations(device, MODE_TYPE{mode}, OUTPUT_TYPE{output}), 0);
                EXPECT_EQ(manager->getProgramOptions(device, MODE_TYPE{mode}, OUTPUT_TYPE{output}, nullptr),
                          0);
                EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE{output}, device,
                                                       OP_TYPE::VERIFY, nullptr));
            }
        }
    }
}

} // namespace

TEST(StartupFailure, WithoutABaseDatabaseNothingIsAllowed) {
    ManagerFixture manager(WITHOUT_BASE);
    manager->setExceptions(false);
    expectNothingAllowed(manager);
}

TEST(StartupFailure, WithoutABaseDatabaseUnknownNamesAreRaised) {
    ManagerFixture manager(WITHOUT_BASE);
    expectRaises<OutOfRangeException>(
        1999, [&] { return manager->getDeviceOperations("dev1", MODE_TYPE::SPI, OUTPUT_TYPE::PARALLEL); });
    expectRaises<OutOfRangeException>(2024, [&] {
        return manager->getProgramOptions("dev1", MODE_TYPE::SPI, OUTPUT_TYPE::PARALLEL, nullptr);
    });
    expectRaises<OutOfRangeException>(
        2024, [&] { return manager->getDeviceOperations("dev1", MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL); });
}

TEST(StartupFailure, WithoutABaseDatabaseOnlyTheFormatterModeAcceptsAnything) {
    ManagerFixture manager(WITHOUT_BASE);
    for (int mode = 0; mode < 9; ++mode) {
        EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::PARALLEL), mode == 8);
        EXPECT_EQ(manager->checkConstraints(MODE_TYPE{mode}, "dev1", nullptr), mode == 5 || mode == 8);
        EXPECT_FALSE(manager->checkConstraints(MODE_TYPE{mode}, OUTPUT_TYPE::PARALLEL, "dev1", nullptr));
    }
}

TEST(StartupFailure, WithoutABaseDatabasePropertiesAreStillFound) {
    ManagerFixture manager(WITHOUT_BASE);
    manager->setExceptions(false);
    EXPECT_STREQ(manager->getDeviceStringProperty("dev1", "K"), "theirs");
    EXPECT_TRUE(manager->checkConstraints("dev1", MODE_TYPE::BS, OP_TYPE::VERIFY, nullptr));
    EXPECT_THAT(texts(manager->getDeviceOperationOptions("dev1", "VERIFY", MODE_TYPE::BS)),
                ElementsAre("fast"));
    EXPECT_EQ(manager->getDeviceLongProperty("dev1", "NONE"), -1);
}

TEST(StartupFailure, WithoutAnyDatabaseEveryQueryAnswers) {
    ManagerFixture manager(Files{});
    manager->setExceptions(false);
    expectNothingAllowed(manager);
    EXPECT_EQ(manager->getDeviceStringProperty("dev1", "K"), nullptr);
    EXPECT_FALSE(manager->getDeviceBoolProperty("dev1", "K"));
    EXPECT_TRUE(manager->getDeviceOperationOptions("dev1", "VERIFY", MODE_TYPE::BS).empty());
}

TEST(StartupFailure, WithAnUnreadableBaseDatabaseNothingIsAllowed) {
    const UnreadableBase directory;
    ManagerFixture manager(SearchPath(directory.path()));
    manager->setExceptions(false);
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::SPI, OUTPUT_TYPE::PARALLEL), 0);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL));
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::BS, "dev1", nullptr));
}

TEST(StartupFailure, AnUnreadableBaseDatabaseIsRaisedForEachUnknownDevice) {
    // Its family would be "base". A failure to read is no gated one.
    const UnreadableBase directory;
    ManagerFixture manager(SearchPath(directory.path()));
    manager->setExceptions(false);
    for (const char* device : {"dev1", "dev2", "dev1"}) {
        EXPECT_THROW(
            static_cast<void>(manager->getDeviceOperations(device, MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL)),
            DataNotFoundException);
        EXPECT_THROW(static_cast<void>(manager->getDeviceStringProperties(device, "K")),
                     DataNotFoundException);
    }
}

TEST(StartupFailure, AnSpiDatabaseThatFailsAtItsOptionsLeavesTheTablesUsable) {
    auto files = withBase();
    files["spi.acd"] += "PROGRAM_OPTION = NOSUCH,SPI,PARALLEL\n";
    ManagerFixture manager(files);
    EXPECT_EQ(manager->getDeviceOperations("x", MODE_TYPE::SPI, OUTPUT_TYPE::PARALLEL), maskOf(3));
    EXPECT_EQ(manager->getProgramOptions("x", MODE_TYPE::SPI, OUTPUT_TYPE::PARALLEL, nullptr), 0);
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::BS, OUTPUT_TYPE::PARALLEL), maskOf(3));
    EXPECT_FALSE(holds(manager.members().m_programOptionsLoaded, "spi"));
}

TEST(StartupFailure, TablesThatWereNeverBuiltAllowNothing) {
    ManagerFixture manager(withBase());
    unbuildTables(manager);
    manager->setExceptions(false);
    expectNothingAllowed(manager);
}

TEST(StartupFailure, TablesThatWereNeverBuiltAllowNothingWhileExceptionsAreOn) {
    ManagerFixture manager(withBase());
    unbuildTables(manager);
    const auto PARALLEL = OUTPUT_TYPE::PARALLEL;
    EXPECT_EQ(manager->getDeviceOperations("dev1", MODE_TYPE::BS, PARALLEL), 0);
    EXPECT_EQ(manager->getBsdlOperations("dev1", PARALLEL), 0);
    EXPECT_EQ(manager->getProgramOptions("dev1", MODE_TYPE::BS, PARALLEL, nullptr), 0);
    EXPECT_FALSE(manager->checkConstraints(MODE_TYPE::BS, PARALLEL, "dev1", OP_TYPE::VERIFY, nullptr));
    EXPECT_THAT(manager.messages(), IsEmpty());
}

TEST(StartupFailure, TablesThatWereNeverBuiltDumpAsZeros) {
    ManagerFixture manager(withBase());
    unbuildTables(manager);
    const auto zeros = [](int cells) {
        std::string text;
        for (int cell = 0; cell < cells; ++cell) {
            text += "0 ";
        }
        return text + "\n";
    };
    const auto lastLines = [](const TarvikSmokeMgr& recorder, std::size_t length) {
        const std::string text(recorder.text().c_str());
        return text.substr(text.size() - std::min(length, text.size()));
    };
    const std::string fam1 = "fam1           ";
    const std::string spi = "spi            ";

    TarvikSmokeMgr operations;
    manager->dumpOperationsTable(&operations);
    const std::string expected = fam1 + zeros(32 * 6 * 5) + spi + zeros(32 * 6 * 5);
    EXPECT_EQ(lastLines(operations, expected.size()), expected);

    TarvikSmokeMgr bsdl;
    manager->dumpBsdlOperationsTable(&bsdl);
    const std::string expectedBsdl = fam1 + zeros(32 * 5) + spi + zeros(32 * 5);
    EXPECT_EQ(lastLines(bsdl, expectedBsdl.size()), expectedBsdl);

    TarvikSmokeMgr options;
    manager->dumpProgramOptionsTable(&options);
    const std::string expectedOptions = fam1 + zeros(24 * 6 * 5) + spi + zeros(24 * 6 * 5);
    EXPECT_EQ(lastLines(options, expectedOptions.size()), expectedOptions);
}
