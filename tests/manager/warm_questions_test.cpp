#include "Members.h"

#include "host/database/CountedAllocations.h"

// Questions that were asked before: they take nothing from the heap, and leave all that the first one left.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

namespace {

const Files DATABASES = {
    {"base.acd", R"(
DEVICE_SUPPORTED = fam1,fam2,spi
PROGRAM_OPTION_PACKAGE = fam1,fam2,spi
)"},
    {"spi.acd", ""},
    {"fam1.acd", R"(
OPERATION = PROGRAM,Bscan,USB2
BSDL_OPERATION = BYPASS,USB2
PROGRAM_OPTION = ERASE,Bscan,USB2
PROPERTY = VENDOR,a vendor whose name is longer than short texts are
[dev1]
PROPERTY = A_PROPERTY,a value that is longer than short texts are
[dev2]
[longdevicenameforoperations]
[longdevicenameforoptions]
[longdevicenameforchecks]
[longdevicenameforscans]
)"},
    {"fam2.acd", R"(
OPERATION = VERIFY,Bscan,USB2
PROGRAM_OPTION = VERIFY,Bscan,USB2
[dev3]
)"},
};

constexpr int PROGRAM = maskOf(0);
constexpr int VERIFY = maskOf(3);

int operations(const ManagerFixture& manager, const char* device) {
    return manager->getDeviceOperations(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2);
}

int options(const ManagerFixture& manager, const char* device) {
    return manager->getProgramOptions(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2, nullptr);
}

bool mayProgram(const ManagerFixture& manager, const char* device) {
    return manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2, device, OP_TYPE::PROGRAM, nullptr);
}

/// What the second of two same questions takes from the heap.
template <typename Question>
std::size_t allocationsWhenWarm(Question question) {
    question();
    return countAllocations(question);
}

TEST(WarmQuestions, AboutMasksAllocateNothing) {
    const ManagerFixture manager(DATABASES);
    EXPECT_EQ(allocationsWhenWarm([&] { EXPECT_EQ(operations(manager, "dev1"), PROGRAM); }), 0U);
    EXPECT_EQ(allocationsWhenWarm([&] { EXPECT_EQ(options(manager, "dev1"), maskOf(0)); }), 0U);
    EXPECT_EQ(allocationsWhenWarm([&] { EXPECT_TRUE(mayProgram(manager, "dev1")); }), 0U);
    EXPECT_EQ(allocationsWhenWarm(
                  [&] { EXPECT_EQ(manager->getBsdlOperations("dev1", OUTPUT_TYPE::USB2), maskOf(19)); }),
              0U);
}

TEST(WarmQuestions, AboutMasksOfLongNamesAllocateNothing) {
    // Each name is longer than short texts are, and asked about in one way only.
    const ManagerFixture manager(DATABASES);
    EXPECT_EQ(
        allocationsWhenWarm([&] { EXPECT_EQ(operations(manager, "longdevicenameforoperations"), PROGRAM); }),
        0U);
    EXPECT_EQ(
        allocationsWhenWarm([&] { EXPECT_EQ(options(manager, "longdevicenameforoptions"), maskOf(0)); }), 0U);
    EXPECT_EQ(allocationsWhenWarm([&] { EXPECT_TRUE(mayProgram(manager, "longdevicenameforchecks")); }), 0U);
    EXPECT_EQ(allocationsWhenWarm([&] {
                  EXPECT_EQ(manager->getBsdlOperations("longdevicenameforscans", OUTPUT_TYPE::USB2),
                            maskOf(19));
              }),
              0U);
}

TEST(WarmQuestions, AboutPropertiesAllocateNothing) {
    const ManagerFixture manager(DATABASES);
    for (const char* const key : {"A_PROPERTY", "VENDOR"}) {
        EXPECT_EQ(
            allocationsWhenWarm([&] { EXPECT_NE(manager->getDeviceStringProperty("dev1", key), nullptr); }),
            0U);
        EXPECT_EQ(allocationsWhenWarm(
                      [&] { EXPECT_EQ(manager->getDeviceStringProperties("dev1", key).size(), 1U); }),
                  0U);
        EXPECT_EQ(allocationsWhenWarm([&] { EXPECT_FALSE(manager->getDeviceBoolProperty("dev1", key)); }),
                  0U);
    }
}

TEST(WarmQuestions, LeaveTheLatestResolution) {
    const ManagerFixture manager(DATABASES);
    operations(manager, "dev1");
    options(manager, "dev1");
    for (const auto& question : {operations, options}) {
        manager.members().m_partFamily = "something else";
        question(manager, "dev1");
        EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
    }
    manager.members().m_partFamily = "something else";
    mayProgram(manager, "dev1");
    EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam1");
}

TEST(WarmQuestions, AboutAFamilyLeaveTheLatestResolutionAlone) {
    const ManagerFixture manager(DATABASES);
    operations(manager, "fam1");
    manager.members().m_partFamily = "something else";
    EXPECT_EQ(operations(manager, "fam1"), PROGRAM);
    EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "something else");
}

TEST(WarmQuestions, MayHoldTheLatestResolutionItself) {
    const ManagerFixture manager(DATABASES);
    operations(manager, "dev1");
    manager.members().m_partFamily = "dev1";
    EXPECT_EQ(operations(manager, manager.members().m_partFamily.get().c_str()), PROGRAM);
}

TEST(WarmQuestions, FollowAFamilyThatIsSeededLater) {
    const ManagerFixture manager(DATABASES);
    EXPECT_EQ(operations(manager, "dev1"), PROGRAM);
    EXPECT_EQ(options(manager, "dev1"), maskOf(0));
    manager->addCachedDeviceFamily("dev1", "fam2");
    EXPECT_EQ(operations(manager, "dev1"), VERIFY);
    EXPECT_EQ(options(manager, "dev1"), maskOf(1));
    EXPECT_FALSE(mayProgram(manager, "dev1"));
}

TEST(WarmQuestions, OfAFamilyThatIsSeededWithAnotherAnswerAlike) {
    // "fam3" is no supported family, but counts as "fam2": what is asked about "dev4" is answered for that.
    Files databases = DATABASES;
    databases["fam3.acd"] = "OPERATION = ERASE,Bscan,USB2\n[dev4]\n";
    const ManagerFixture manager(std::move(databases));
    manager->setExceptions(false);
    manager->addCachedDeviceFamily("fam3", "fam2");
    EXPECT_EQ(operations(manager, "dev3"), VERIFY);
    const int first = operations(manager, "dev4");
    manager.members().m_partFamily = "something else";
    EXPECT_EQ(operations(manager, "dev4"), first);
    EXPECT_STREQ(manager.members().m_partFamily.get().c_str(), "fam2");
}

TEST(WarmQuestions, AboutADeviceOfAFamilyWithoutADatabaseAnswerAlike) {
    const ManagerFixture manager(DATABASES);
    manager->setExceptions(false);
    manager->addCachedDeviceFamily("dev1", "nowhere");
    for (int time = 0; time != 3; ++time) {
        EXPECT_EQ(operations(manager, "dev1"), 0);
        EXPECT_EQ(options(manager, "dev1"), 0);
        EXPECT_FALSE(mayProgram(manager, "dev1"));
    }
}

TEST(WarmQuestions, AboutTheEmptyNameAreAnsweredForTheFamilyOfThatName) {
    // An empty item is a name like any other.
    const ManagerFixture manager(
        Files{{"base.acd",
               "DEVICE_SUPPORTED = ,fam1\nPROGRAM_OPTION_PACKAGE = ,fam1\nOPERATION = VERIFY,Bscan,USB2\n"},
              {"fam1.acd", "OPERATION = PROGRAM,Bscan,USB2\n[dev1]\n"}});
    manager->setExceptions(false);
    for (const char* const name : {"", "", "_p", "_p"}) {
        EXPECT_EQ(operations(manager, name), 0) << name;
    }
    EXPECT_EQ(operations(manager, "dev1"), PROGRAM);
}

TEST(WarmQuestions, FindTheOwnPropertyWhereNamesRunTogether) {
    // "a" with "b_c" and "a_b" with "c" are stored in the same place: the one that is loaded last stands there.
    const ManagerFixture manager(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam1,spi\nPROGRAM_OPTION_PACKAGE = fam1,spi\n"},
              {"fam1.acd", "[a]\nPROPERTY = b_c,1\n[a_b]\nPROPERTY = c,2\n"}});
    EXPECT_STREQ(manager->getDeviceStringProperty("a", "b_c"), "1");
    EXPECT_STREQ(manager->getDeviceStringProperty("a_b", "c"), "2");
    EXPECT_STREQ(manager->getDeviceStringProperty("a", "b_c"), "2");
}

} // namespace
