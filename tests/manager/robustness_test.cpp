#include "Members.h"

#include <random>
#include <sstream>

// Databases that lack keys, are missing, empty or nonsense, and null texts in the whole exported interface.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::IsEmpty;
using testing::SizeIs;

namespace {

const std::vector<std::string> BASE_LINES = {
    "DEVICE_SUPPORTED = kestrel,spi",
    "PROGRAM_OPTION_PACKAGE = kestrel,spi",
    "BS = outs,USB2:fams,kestrel",
    "SS = outs,USB2:fams,kestrel",
    "SM = outs,USB2:fams,kestrel",
    "BSFILE = outs,SVF:fams,kestrel",
    "DP770 = outs,USB2:fams,kestrel",
    "SPI = outs,USB2:fams,spi",
    "KITECF = outs,USB2:fams,kestrel",
    "KITEMPM = outs,USB2:fams,kestrel",
    "PFF = outs,USB2:fams,kestrel",
    "IDCODE = KS50,0x1",
    "NOT_SUPPORTED_PART_IN_MODE = SS_KS50_PQ",
};
const std::vector<std::string> SPI_LINES = {
    "DEVICE_FAMILY = FLASHES,ST1",  "FLASHES_DEVICES = FLASH1",    "FLASH1_PROPERTY = SIZE,4",
    "AT1_DEVICES = FLASH1",         "ST1_DEVICES = FLASH1",        "ST2_DEVICES = FLASH1",
    "BPI1_DEVICES = FLASH1",        "BPI2_DEVICES = FLASH1",       "BPI3_DEVICES = FLASH1",
    "OPERATION = PROGRAM,SPI,USB2", "BSDL_OPERATION = BYPASS,SVF", "PROGRAM_OPTION = ERASE,SPI,USB2",
    "TYPE_BPI_SERIAL_LEAD = KS50",
};
const char* const KESTREL = "OPERATION = PROGRAM,BS,USB2\nBSDL_OPERATION = BYPASS,SVF\n"
                            "PROGRAM_OPTION = ERASE,BS,USB2\nPROPERTY = VENDOR,Korvel\n[KS50]\n";

/// The lines, without line number `left`.
std::string without(const std::vector<std::string>& lines, std::size_t left) {
    std::string result;
    for (std::size_t line = 0; line < lines.size(); ++line) {
        result += line == left ? "" : lines[line] + "\n";
    }
    return result;
}
std::string all(const std::vector<std::string>& lines) { return without(lines, lines.size()); }

/// What the exported methods answer for a device: one line each, exceptions included.
std::string answers(ConstraintsManager& manager, const char* device, const char* other) {
    std::ostringstream out;
    const auto ask = [&](const char* name, const auto& question) {
        out << name << ": ";
        try {
            out << question() << '\n';
        } catch (const TarvikException& exception) {
            out << exception.typeName() << ' ' << exception.line() << '\n';
        }
    };
    const auto list = [](const ConstraintsManager::TextSet& set) {
        return testing::PrintToString(texts(set));
    };
    const auto orNull = [](const char* value) { return value == nullptr ? std::string("null") : value; };

    ask("getPartFamily", [&] { return text(manager.getPartFamily(device)); });
    ask("isKorvelDevice", [&] { return manager.isKorvelDevice(device); });
    ask("isSpiDevice", [&] { return manager.isSpiDevice(device); });
    ask("checkConstraints device",
        [&] { return manager.checkConstraints(MODE_TYPE::BS, device, static_cast<const char*>(nullptr)); });
    ask("checkConstraints package", [&] { return manager.checkConstraints(MODE_TYPE::BS, device, "PQ"); });
    ask("checkConstraints output device",
        [&] { return manager.checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2, device, "PQ"); });
    ask("checkConstraints operation", [&] {
        return manager.checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2, device, OP_TYPE::PROGRAM, other);
    });
    ask("checkConstraints property",
        [&] { return manager.checkConstraints(device, MODE_TYPE::BS, OP_TYPE::PROGRAM, other); });
    ask("getDeviceOperations",
        [&] { return manager.getDeviceOperations(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2); });
    ask("getDeviceOperations SPI",
        [&] { return manager.getDeviceOperations(device, MODE_TYPE::SPI, OUTPUT_TYPE::USB2); });
    ask("getProgramOptions",
        [&] { return manager.getProgramOptions(device, MODE_TYPE::BS, OUTPUT_TYPE::USB2, other); });
    ask("getProgramOptions SPI",
        [&] { return manager.getProgramOptions(device, MODE_TYPE::SPI, OUTPUT_TYPE::USB2, other); });
    ask("getBsdlOperations", [&] { return manager.getBsdlOperations(device, OUTPUT_TYPE::SVF); });
    ask("getDeviceOperationOptions",
        [&] { return list(manager.getDeviceOperationOptions(device, other, MODE_TYPE::BS)); });
    ask("getDeviceStringProperties", [&] { return list(manager.getDeviceStringProperties(device, other)); });
    ask("getDeviceStringProperty", [&] { return orNull(manager.getDeviceStringProperty(device, other)); });
    ask("getDeviceBoolProperty", [&] { return manager.getDeviceBoolProperty(device, other); });
    ask("getDeviceLongProperty", [&] { return manager.getDeviceLongProperty(device, other); });
    ask("getSpiDeviceStringProperty", [&] { return manager.getSpiDeviceStringProperty(device, other); });
    ask("getSpiDeviceBoolProperty", [&] { return manager.getSpiDeviceBoolProperty(device, other); });
    ask("getSpiDeviceLongProperty", [&] { return manager.getSpiDeviceLongProperty(device, other); });
    ask("isMbBpiSpiSupport", [&] { return manager.isMbBpiSpiSupport(device, other, other, true); });
    return out.str();
}

/// What a manager that knows nothing answers, exceptions off.
const char* const NOTHING = R"(getPartFamily: base
isKorvelDevice: 0
isSpiDevice: 0
checkConstraints device: 0
checkConstraints package: 0
checkConstraints output device: 0
checkConstraints operation: 0
checkConstraints property: 0
getDeviceOperations: 0
getDeviceOperations SPI: 0
getProgramOptions: 0
getProgramOptions SPI: 0
getBsdlOperations: 0
getDeviceOperationOptions: {}
getDeviceStringProperties: {}
getDeviceStringProperty: null
getDeviceBoolProperty: 0
getDeviceLongProperty: -1
getSpiDeviceStringProperty: 
getSpiDeviceBoolProperty: 0
getSpiDeviceLongProperty: 0
isMbBpiSpiSupport: 0
)";

void expectToAnswerNothing(ManagerFixture& session) {
    EXPECT_TRUE(session.members().m_exceptions);
    (void)answers(*session, "KS50", "VENDOR"); // may raise, each as it does, but nothing else
    session->setExceptions(false);
    EXPECT_EQ(answers(*session, "KS50", "VENDOR"), NOTHING);
    EXPECT_THAT(session->getAllDeviceIdcodes(), IsEmpty());
    TarvikSmokeMgr* const none = nullptr;
    session->dumpOperationsTable(none);
    session->dumpBsdlOperationsTable(none);
    session->dumpProgramOptionsTable(none);
    session->dumpCachedDeviceFamilies(none);
    session->dumpMbBpiSpi();
}

/// Bytes of all values, the same at every run.
std::string randomBytes(unsigned seed) {
    std::mt19937 generator(seed);
    std::string bytes(20000, '\0');
    for (char& byte : bytes) {
        byte = static_cast<char>(generator() & 0xFFU);
    }
    return bytes;
}

TEST(IncompleteDatabase, WithAllKeysAnswers) {
    ManagerFixture session(
        {{"base.acd", all(BASE_LINES)}, {"spi.acd", all(SPI_LINES)}, {"kestrel.acd", KESTREL}});
    EXPECT_THAT(session.messages(), IsEmpty());
    EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
    EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::SPI, OUTPUT_TYPE::USB2), 1);
    EXPECT_EQ(session->getProgramOptions("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2, nullptr), 1);
    EXPECT_STREQ(session->getSpiDeviceStringProperty("FLASH1", "SIZE"), "4");
}

TEST(IncompleteDatabase, WithoutAnyOneBaseKeyGivesAUsableManager) {
    for (std::size_t line = 0; line < BASE_LINES.size(); ++line) {
        SCOPED_TRACE(BASE_LINES[line]);
        ManagerFixture session(
            {{"base.acd", without(BASE_LINES, line)}, {"spi.acd", all(SPI_LINES)}, {"kestrel.acd", KESTREL}});
        EXPECT_THAT(session.messages(), IsEmpty());
        EXPECT_TRUE(session.members().m_exceptions);
        EXPECT_THAT(session->getOperationOrders(), SizeIs(32));
        EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
        EXPECT_EQ(text(session->getPartFamily("KS50")), "kestrel");
        session->setExceptions(false);
        EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2), line == 0 ? 0 : 1);
        EXPECT_EQ(session->getProgramOptions("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2, nullptr),
                  line == 1 ? 0 : 1);
        EXPECT_STREQ(session->getDeviceStringProperty("KS50", "VENDOR"), "Korvel");
    }
}

TEST(IncompleteDatabase, WithoutAnyOneSpiKeyGivesAUsableManager) {
    for (std::size_t line = 0; line < SPI_LINES.size(); ++line) {
        SCOPED_TRACE(SPI_LINES[line]);
        ManagerFixture session(
            {{"base.acd", all(BASE_LINES)}, {"spi.acd", without(SPI_LINES, line)}, {"kestrel.acd", KESTREL}});
        EXPECT_THAT(session.messages(), IsEmpty());
        EXPECT_TRUE(session.members().m_exceptions);
        EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
        EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
        EXPECT_EQ(text(session->getPartFamily("KS50")), "kestrel");
    }
}

TEST(NonsenseDatabase, MissingBaseAnswersNothing) {
    ManagerFixture session(Files{});
    expectToAnswerNothing(session);
}

TEST(NonsenseDatabase, EmptyBaseAnswersNothing) {
    ManagerFixture session(Base{""});
    EXPECT_THAT(session.messages(), IsEmpty());
    expectToAnswerNothing(session);
}

TEST(NonsenseDatabase, BaseOfRandomBytesAnswersNothing) {
    for (unsigned seed = 0; seed < 10; ++seed) {
        ManagerFixture session(Base{randomBytes(seed)});
        expectToAnswerNothing(session);
    }
}

TEST(NonsenseDatabase, EmptySpiLeavesTheOthersAnswers) {
    ManagerFixture session({{"base.acd", all(BASE_LINES)}, {"spi.acd", ""}, {"kestrel.acd", KESTREL}});
    EXPECT_THAT(session.messages(), IsEmpty());
    EXPECT_TRUE(session.members().m_exceptions);
    EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
    EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::SPI, OUTPUT_TYPE::USB2), 0);
}

TEST(NonsenseDatabase, SpiOfRandomBytesLeavesTheOthersAnswers) {
    for (unsigned seed = 100; seed < 110; ++seed) {
        ManagerFixture session(
            {{"base.acd", all(BASE_LINES)}, {"spi.acd", randomBytes(seed)}, {"kestrel.acd", KESTREL}});
        EXPECT_TRUE(session.members().m_exceptions);
        EXPECT_THAT(session.members().m_spiNames, IsEmpty());
        EXPECT_THAT(session.members().m_multibootTypes, SizeIs(12));
        EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
        EXPECT_EQ(session->getDeviceOperations("KS50", MODE_TYPE::SPI, OUTPUT_TYPE::USB2), 0);
    }
}

TEST(NonsenseDatabase, FamilyOfRandomBytesOffersNothing) {
    for (unsigned seed = 200; seed < 210; ++seed) {
        ManagerFixture session({{"base.acd", all(BASE_LINES)}, {"kestrel.acd", randomBytes(seed)}});
        EXPECT_EQ(session->getDeviceOperations("kestrel", MODE_TYPE::BS, OUTPUT_TYPE::USB2), 0);
        EXPECT_EQ(session->getProgramOptions("kestrel", MODE_TYPE::BS, OUTPUT_TYPE::USB2, nullptr), 0);
    }
}

TEST(NonsenseDatabase, CutShortAnywhereGivesAManager) {
    const std::string base = all(BASE_LINES);
    const std::string spi = all(SPI_LINES);
    for (std::size_t length = 0; length < base.size(); length += 7) {
        ManagerFixture session({{"base.acd", base.substr(0, length)}, {"spi.acd", spi.substr(0, length)}});
        EXPECT_TRUE(session.members().m_exceptions);
        EXPECT_EQ(text(session->getPartFamily("nobody")), "base");
        (void)answers(*session, "FLASH1", "SIZE");
    }
}

TEST(NullTexts, AnswerAsEmptyTextsInEveryMethod) {
    for (const bool exceptions : {false, true}) {
        const auto ask = [&](const char* device, const char* other) {
            ManagerFixture session(
                {{"base.acd", all(BASE_LINES)}, {"spi.acd", all(SPI_LINES)}, {"kestrel.acd", KESTREL}});
            session->setExceptions(exceptions);
            return answers(*session, device, other);
        };
        EXPECT_EQ(ask(nullptr, nullptr), ask("", ""));
        EXPECT_EQ(ask("KS50", nullptr), ask("KS50", ""));
        EXPECT_EQ(ask(nullptr, "VENDOR"), ask("", "VENDOR"));
    }
}

TEST(NullTexts, NullPackageIsNoPackageAndAnEmptyOneIs) {
    ManagerFixture session({{"base.acd", "SS = outs:fams,kestrel\nNOT_SUPPORTED_PART_IN_MODE = SS_KS50_\n"},
                            {"kestrel.acd", "[KS50]\n"}});
    EXPECT_TRUE(session->checkConstraints(MODE_TYPE::SS, "KS50", static_cast<const char*>(nullptr)));
    EXPECT_FALSE(session->checkConstraints(MODE_TYPE::SS, "KS50", ""));
}

} // namespace
