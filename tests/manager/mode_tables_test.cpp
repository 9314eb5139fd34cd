#include "Members.h"

// The nine mode tables: which outputs and which families the base database lists for each mode.

using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

namespace {

constexpr std::size_t MODES = 9;

std::vector<int> values(const std::set<OUTPUT_TYPE>& outputs) {
    std::vector<int> result;
    for (const OUTPUT_TYPE output : outputs) {
        result.push_back(static_cast<int>(output));
    }
    return result;
}

TEST(ModeTables, EachKeyFillsTheSetsOfItsMode) {
    for (std::size_t mode = 0; mode < MODES; ++mode) {
        ManagerFixture session(Base{std::string(MODE_KEYS[mode]) + " = outs,USB2:fams,kestrel\n"});
        for (std::size_t other = 0; other < MODES; ++other) {
            SCOPED_TRACE(std::string(MODE_KEYS[mode]) + " seen in " + MODE_KEYS[other]);
            if (other == mode) {
                EXPECT_THAT(values(*modeOutputs(session.members())[other]), ElementsAre(2));
                EXPECT_THAT(texts(*modeDevices(session.members())[other]), ElementsAre("kestrel"));
            } else {
                EXPECT_THAT(values(*modeOutputs(session.members())[other]), IsEmpty());
                EXPECT_THAT(texts(*modeDevices(session.members())[other]), IsEmpty());
            }
        }
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(ModeTables, KeysAreMatchedExactly) {
    ManagerFixture session(Base{"bs = outs,USB2:fams,kestrel\nBscan = outs,USB2:fams,kestrel\n"});
    EXPECT_THAT(session.members().m_bsCables, IsEmpty());
    EXPECT_EQ(session.members().m_bsDevices.size(), 0U);
}

TEST(ModeTables, OutputNamesGiveTheirValues) {
    ManagerFixture session(Base{"BS = outs,EXPRESSQSVF,EXPRESSSVF,STAPL,SVF,USB2,ZORVA,PARALLEL\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(0, 1, 2, 3, 4, 6, 7));
}

TEST(ModeTables, OutputListedTwiceCountsOnce) {
    ManagerFixture session(Base{"BS = outs,PARALLEL,PARALLEL,USB2:fams,kestrel,merlin,kestrel\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(0, 2));
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("kestrel", "merlin"));
}

TEST(ModeTables, UnknownOutputIsStoredAs9Silently) {
    for (const char* name : {"QSVF", "NULLCABLE", "NONE", "usb2", "Usb2", "nonsense", "", " USB2", "%s"}) {
        ManagerFixture session(Base{std::string("BS = outs,") + name + ":fams\n"});
        EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(9)) << name;
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(ModeTables, UnknownOutputDoesNotEndTheList) {
    ManagerFixture session(Base{"BS = outs,USB2,nonsense,,PARALLEL\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(0, 2, 9));
}

TEST(ModeTables, LabelsAreNotUsed) {
    ManagerFixture session(Base{"BS = PARALLEL,USB2:kestrel,merlin\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(2));
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("merlin"));
}

TEST(ModeTables, LabelsMayBeEmpty) {
    ManagerFixture session(Base{"BS = ,USB2:,kestrel\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(2));
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("kestrel"));
}

TEST(ModeTables, EmptyFirstItemDoesNotHinderTheSecond) {
    ManagerFixture session(Base{"BS = :fams,kestrel\n"});
    EXPECT_THAT(session.members().m_bsCables, IsEmpty());
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("kestrel"));
}

TEST(ModeTables, MissingSecondItemLeavesTheFamiliesEmpty) {
    ManagerFixture session(Base{"BS = outs,USB2\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(2));
    EXPECT_EQ(session.members().m_bsDevices.size(), 0U);
}

TEST(ModeTables, FurtherItemsAreNotRead) {
    ManagerFixture session(Base{"BS = outs,USB2:fams,kestrel:more,SVF,merlin\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(2));
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("kestrel"));
}

TEST(ModeTables, MissingOrEmptyKeyLeavesBothSetsEmptyAndTheOthersFilled) {
    for (const char* entry : {"", "SM =\n", "SM = outs:fams\n", "SM = :\n"}) {
        ManagerFixture session(
            Base{std::string("SS = outs,USB2:fams,kestrel\n") + entry + "BSFILE = outs,SVF:fams,merlin\n"});
        EXPECT_THAT(session.members().m_smCables, IsEmpty()) << entry;
        EXPECT_EQ(session.members().m_smDevices.size(), 0U) << entry;
        EXPECT_THAT(values(session.members().m_ssCables), ElementsAre(2));
        EXPECT_THAT(values(session.members().m_bsFileCables), ElementsAre(3));
        EXPECT_THAT(texts(session.members().m_bsFileDevices), ElementsAre("merlin"));
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(ModeTables, FamilyNamesAreTakenExactlyAsStored) {
    ManagerFixture session(Base{"BS = outs:fams,Kestrel, merlin ,,KESTREL,%n\n"});
    EXPECT_THAT(texts(session.members().m_bsDevices),
                ElementsAre("", " merlin ", "%n", "KESTREL", "Kestrel"));
}

TEST(ModeTables, FamiliesNeedNotBeSupported) {
    ManagerFixture session(Base{"DEVICE_SUPPORTED = merlin\nBS = outs:fams,kestrel\n"});
    EXPECT_THAT(texts(session.members().m_bsDevices), ElementsAre("kestrel"));
}

TEST(ModeTables, FieldsBehindIndex32767DoNotExist) {
    std::string outputs = "BS = outs";
    for (int field = 1; field < 32767; ++field) {
        outputs += ",PARALLEL";
    }
    ManagerFixture session(Base{outputs + ",USB2,SVF:fams," + numberedList("d", 40000) + "\n"});
    EXPECT_THAT(values(session.members().m_bsCables), ElementsAre(0, 2));
    EXPECT_EQ(session.members().m_bsDevices.size(), 32767U);
    EXPECT_THAT(session.messages(), IsEmpty());
}

} // namespace
