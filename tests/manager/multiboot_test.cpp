#include "Members.h"

// The six flash class lists, the twelve multiboot types, the question about them and their dump.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

namespace {

struct MultibootSession : ManagerFixture {
    explicit MultibootSession(const std::string& spi)
        : ManagerFixture({{"base.acd", ""}, {"spi.acd", spi}}) {}

    bool supports(const char* device, const char* typePrefix, const char* width, bool lead) {
        return (*this)->isMbBpiSpiSupport(device, typePrefix, width, lead);
    }
};

struct TypeRow {
    const char* name;
    const char* prefix;
    const char* width;
    bool lead;
};
constexpr TypeRow TYPES[] = {
    {"TYPE_BPI_SERIAL_LEAD", "TYPE_BPI", "SERIAL", true},
    {"TYPE_BPI_SERIAL_CHAIN", "TYPE_BPI", "SERIAL", false},
    {"TYPE_BPI_PARALLEL_LEAD", "TYPE_BPI", "PARALLEL", true},
    {"TYPE_BPI_PARALLEL_CHAIN", "TYPE_BPI", "PARALLEL", false},
    {"TYPE_MB_SPI_NONE_LEAD", "TYPE_MB_SPI", "NONE", true},
    {"TYPE_MB_SPI_NONE_CHAIN", "TYPE_MB_SPI", "NONE", false},
    {"TYPE_MB_BPI_SERIAL_LEAD", "TYPE_MB_BPI", "SERIAL", true},
    {"TYPE_MB_BPI_SERIAL_CHAIN", "TYPE_MB_BPI", "SERIAL", false},
    {"TYPE_MB_BPI_PARALLEL_LEAD", "TYPE_MB_BPI", "PARALLEL", true},
    {"TYPE_MB_BPI_PARALLEL_CHAIN", "TYPE_MB_BPI", "PARALLEL", false},
    {"TYPE_MB_QPRM_NONE_LEAD", "TYPE_MB_QPRM", "NONE", true},
    {"TYPE_MB_QPRM_NONE_CHAIN", "TYPE_MB_QPRM", "NONE", false},
};

TEST(FlashClassLists, HoldTheirDevicesInFileOrder) {
    MultibootSession session(R"(
AT1_DEVICES = a2,a1,a2
ST1_DEVICES = b
ST2_DEVICES = c
BPI1_DEVICES = d,,e
BPI2_DEVICES = f
BPI3_DEVICES = g
)");
    EXPECT_THAT(texts(session.members().m_at1Devices), ElementsAre("a2", "a1", "a2"));
    EXPECT_THAT(texts(session.members().m_st1Devices), ElementsAre("b"));
    EXPECT_THAT(texts(session.members().m_st2Devices), ElementsAre("c"));
    EXPECT_THAT(texts(session.members().m_bpi1Devices), ElementsAre("d", "", "e"));
    EXPECT_THAT(texts(session.members().m_bpi2Devices), ElementsAre("f"));
    EXPECT_THAT(texts(session.members().m_bpi3Devices), ElementsAre("g"));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(FlashClassLists, WithoutTheirKeysAreEmpty) {
    MultibootSession session("AT1_DEVICES =\n");
    EXPECT_THAT(session.members().m_at1Devices, IsEmpty());
    EXPECT_THAT(session.members().m_st1Devices, IsEmpty());
    EXPECT_THAT(session.members().m_st2Devices, IsEmpty());
    EXPECT_THAT(session.members().m_bpi1Devices, IsEmpty());
    EXPECT_THAT(session.members().m_bpi2Devices, IsEmpty());
    EXPECT_THAT(session.members().m_bpi3Devices, IsEmpty());
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(FlashClassLists, EndAtIndex32767) {
    MultibootSession session("AT1_DEVICES = " + numberedList("d", 40000) + "\n");
    EXPECT_THAT(session.members().m_at1Devices, SizeIs(32768));
}

TEST(MultibootTypes, AreAlwaysTheTwelve) {
    for (const char* spi : {"", "TYPE_BPI_NONE_LEAD = KS50\nTYPE_MB_QPRM_NONE_LEAD =\n"}) {
        MultibootSession session(spi);
        const auto types = lists(session.members().m_multibootTypes);
        EXPECT_THAT(types, SizeIs(12));
        for (const TypeRow& row : TYPES) {
            ASSERT_EQ(types.count(row.name), 1U) << row.name;
            EXPECT_THAT(types.at(row.name), IsEmpty());
        }
    }
}

TEST(MultibootTypes, HoldTheirDevicesInFileOrder) {
    for (const TypeRow& row : TYPES) {
        MultibootSession session(std::string(row.name) + " = z,a,,z, b\n");
        for (const auto& [name, devices] : lists(session.members().m_multibootTypes)) {
            if (name == row.name) {
                EXPECT_THAT(devices, ElementsAre("z", "a", "", "z", " b"));
            } else {
                EXPECT_THAT(devices, IsEmpty()) << name;
            }
        }
    }
}

TEST(MultibootTypes, EndAtIndex32767) {
    MultibootSession session("TYPE_MB_SPI_NONE_LEAD = " + numberedList("d", 40000) + "\n");
    EXPECT_TRUE(session.supports("d32767", "TYPE_MB_SPI", "NONE", true));
    EXPECT_FALSE(session.supports("d32768", "TYPE_MB_SPI", "NONE", true));
}

TEST(MultibootTypes, AreReadFromTheSpiDatabaseAlone) {
    ManagerFixture session(Base{"TYPE_BPI_SERIAL_LEAD = KS50\nAT1_DEVICES = F1\n"});
    EXPECT_FALSE(session->isMbBpiSpiSupport("KS50", "TYPE_BPI", "SERIAL", true));
    EXPECT_THAT(session.members().m_at1Devices, IsEmpty());
    EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
}

TEST(MultibootSupport, IsThatOfTheOneTypeThatTheArgumentsName) {
    for (const TypeRow& row : TYPES) {
        MultibootSession session(std::string(row.name) + " = KS50\n");
        for (const TypeRow& asked : TYPES) {
            EXPECT_EQ(session.supports("KS50", asked.prefix, asked.width, asked.lead), &asked == &row)
                << row.name << " asked for as " << asked.name;
        }
    }
}

TEST(MultibootSupport, IgnoresCaseInEveryArgument) {
    MultibootSession session("TYPE_MB_SPI_NONE_LEAD = KS100,Ks50\n");
    EXPECT_TRUE(session.supports("kS50", "type_mb_spi", "none", true));
    EXPECT_TRUE(session.supports("KS100", "Type_Mb_Spi", "None", true));
    EXPECT_FALSE(session.supports("ks50", "type_mb_spi", "none", false));
}

TEST(MultibootSupport, IsFalseForOtherDevices) {
    MultibootSession session("TYPE_MB_SPI_NONE_LEAD = KS50\n");
    for (const char* device : {"", "KS5", "KS500", "KS50_PQ"}) {
        EXPECT_FALSE(session.supports(device, "TYPE_MB_SPI", "NONE", true)) << device;
    }
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(MultibootSupport, IsFalseForTypesThatAreNone) {
    MultibootSession session("TYPE_BPI_NONE_LEAD = KS50\nTYPE_MB_SPI_SERIAL_LEAD = KS50\n__LEAD = KS50\n");
    EXPECT_FALSE(session.supports("KS50", "TYPE_BPI", "NONE", true));
    EXPECT_FALSE(session.supports("KS50", "TYPE_MB_SPI", "SERIAL", true));
    EXPECT_FALSE(session.supports("KS50", "", "", true));
    EXPECT_FALSE(session.supports("KS50", "TYPE_MB_SPI_NONE", "LEAD", true));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(MultibootSupport, JoinsPrefixAndWidthWithAnUnderscore) {
    MultibootSession session("TYPE_MB_SPI_NONE_LEAD = KS50\n");
    EXPECT_TRUE(session.supports("KS50", "TYPE_MB", "SPI_NONE", true));
    EXPECT_FALSE(session.supports("KS50", "TYPE_MB_SPI_", "NONE", true));
}

TEST(MultibootSupport, NullTextsAreEmptyTexts) {
    MultibootSession session("TYPE_MB_SPI_NONE_LEAD = KS50,,KS100\n");
    EXPECT_TRUE(session.supports("", "TYPE_MB_SPI", "NONE", true));
    EXPECT_TRUE(session.supports(nullptr, "TYPE_MB_SPI", "NONE", true));
    EXPECT_FALSE(session.supports("KS50", nullptr, "NONE", true));
    EXPECT_FALSE(session.supports("KS50", "TYPE_MB_SPI", nullptr, true));
    EXPECT_FALSE(session.supports(nullptr, nullptr, nullptr, false));
}

TEST(MultibootDump, ListsTheTypesInByteOrderAPieceAtATime) {
    MultibootSession session("TYPE_BPI_SERIAL_LEAD = z,50%d\nTYPE_MB_QPRM_NONE_CHAIN = %s%n\n");
    session->dumpMbBpiSpi();
    std::vector<IssuedMessage> expected;
    for (const char* piece : {"TYPE_BPI_PARALLEL_CHAIN:",
                              "\n",
                              "TYPE_BPI_PARALLEL_LEAD:",
                              "\n",
                              "TYPE_BPI_SERIAL_CHAIN:",
                              "\n",
                              "TYPE_BPI_SERIAL_LEAD:",
                              " z",
                              " 50%d",
                              "\n",
                              "TYPE_MB_BPI_PARALLEL_CHAIN:",
                              "\n",
                              "TYPE_MB_BPI_PARALLEL_LEAD:",
                              "\n",
                              "TYPE_MB_BPI_SERIAL_CHAIN:",
                              "\n",
                              "TYPE_MB_BPI_SERIAL_LEAD:",
                              "\n",
                              "TYPE_MB_QPRM_NONE_CHAIN:",
                              " %s%n",
                              "\n",
                              "TYPE_MB_QPRM_NONE_LEAD:",
                              "\n",
                              "TYPE_MB_SPI_NONE_CHAIN:",
                              "\n",
                              "TYPE_MB_SPI_NONE_LEAD:",
                              "\n"}) {
        expected.push_back(status(piece));
    }
    EXPECT_EQ(withoutLines(session.messages()), expected);
}

TEST(MultibootDump, OfAStartUpThatDidNotReachTheTypesIsEmpty) {
    MultibootSession session("PROGRAM_OPTION = OTP,SPI,USB2\nTYPE_BPI_SERIAL_LEAD = KS50\n");
    (void)session.messages();
    EXPECT_THAT(session.members().m_multibootTypes, IsEmpty());
    session->dumpMbBpiSpi();
    EXPECT_THAT(session.messages(), IsEmpty());
    EXPECT_FALSE(session.supports("KS50", "TYPE_BPI", "SERIAL", true));
}

} // namespace
