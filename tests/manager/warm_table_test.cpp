// Every exported method, asked a second time about names of up to 15 bytes: it takes nothing from the heap, unless the
// table says why it has to. The methods come from the recorded interface, so that none is forgotten.
#include "ManagerFixture.h"

#include "host/database/CountedAllocations.h"

#include <TarvikSmokeMgr.h>

#include <cxxabi.h>

#include <cstdlib>
#include <fstream>
#include <functional>
#include <set>

namespace {

using testing::ContainerEq;

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto USB2 = OUTPUT_TYPE::USB2;

// Each is 15 bytes long: the longest that a text holds without memory from the heap.
constexpr const char* FAMILY = "familyname12345";
constexpr const char* DEVICE = "devicename12345";
constexpr const char* OTHER_DEVICE = "othername123456";
constexpr const char* PACKAGE = "packagename1234";
constexpr const char* PROPERTY = "PROPERTYNAME123";
constexpr const char* FAMILY_PROPERTY = "FAMILYPROP12345";
constexpr const char* FLASH = "FLASHNAME123456";

const Files DATABASES{
    {"base.acd", "DEVICE_SUPPORTED = familyname12345,spi\n"
                 "PROGRAM_OPTION_PACKAGE = familyname12345,spi,devicename12345packagename1234\n"
                 "BS = outs,USB2:fams,familyname12345\nSPI = outs,USB2:fams,spi\n"
                 "NOT_SUPPORTED_PART_IN_MODE = SS_devicename12345_packagename1234\n"},
    {"familyname12345.acd", "OPERATION = PROGRAM,Bscan,USB2\nBSDL_OPERATION = BYPASS,USB2\n"
                            "PROGRAM_OPTION = ERASE,Bscan,USB2\nPROPERTY = FAMILYPROP12345,44\n"
                            "[devicename12345]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\n"
                            "PROPERTY = PROPERTYNAME123,TRUE\n"
                            "PROPERTIES = LOADCONFIGURATIONREVISION,1,BS:OP_LOADCONFIGURATIONREVISION,"
                            "1,fast:READUSERCODE,1,BS:OP_READUSERCODE,1,fast\n"
                            "[othername123456]\n"
                            "PROPERTIES = READUSERCODE,1,BS:OP_READUSERCODE_BS,1,fast\n"},
    {"spi.acd", "DEVICE_FAMILY = FLASHFAMILY1234\nFLASHFAMILY1234_DEVICES = FLASHNAME123456\n"
                "FLASHNAME123456_PROPERTY = PROPERTYNAME123,16\nAT1_DEVICES = FLASHNAME123456\n"
                "TYPE_MB_BPI_PARALLEL_CHAIN = FLASHNAME123456\nOPERATION = ERASE,SPI,USB2\n"
                "PROGRAM_OPTION = UES,SPI,USB2\n"}};

/// Questions to one method, with what each has to answer.
using Questions = std::function<void(ConstraintsManager&)>;

/// Methods that may allocate.
const Questions RETURNS_A_TEXT = nullptr;
const Questions WRITES_TEXT = nullptr;
const Questions MAKES_OR_REMOVES_THE_MANAGER = nullptr;

const std::map<std::string, Questions>& methods() {
    static const std::map<std::string, Questions> METHODS{
        {"getConstraintsManager()",
         [](ConstraintsManager& m) { EXPECT_EQ(ConstraintsManager::getConstraintsManager(), &m); }},
        {"RemoveConstraintsManager()", MAKES_OR_REMOVES_THE_MANAGER},
        {"setExceptions(bool)", [](ConstraintsManager& m) { m.setExceptions(true); }},
        {"getOperationOrders() const",
         [](ConstraintsManager& m) { EXPECT_EQ(m.getOperationOrders().size(), 32U); }},
        {"getProgramOptionOrders() const",
         [](ConstraintsManager& m) { EXPECT_EQ(m.getProgramOptionOrders().size(), 24U); }},
        {"modeString2Type(char const*)",
         [](ConstraintsManager& m) { EXPECT_EQ(m.modeString2Type("compactflash"), MODE_TYPE::KITECF); }},
        {"modeType2String(TARVIKNS::MODE_TYPE)", RETURNS_A_TEXT},
        {"cableString2Type(char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.cableString2Type("EXPRESSQSVF"), OUTPUT_TYPE::EXPRESSQSVF);
         }},
        {"cableType2String(TARVIKNS::OUTPUT_TYPE)", RETURNS_A_TEXT},
        {"operationString2Type(char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.operationString2Type("expressqsvf"), OP_TYPE::EXPRESSQSVF);
         }},
        {"operationDisplayString2Type(char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.operationDisplayString2Type("One Step QSVF"), OP_TYPE::EXPRESSQSVF);
         }},
        {"operationType2String(TARVIKNS::OP_TYPE)", RETURNS_A_TEXT},
        {"operationType2DisplayString(TARVIKNS::OP_TYPE)", RETURNS_A_TEXT},
        {"optionString2Type(char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.optionString2Type("SECTOR_LOCKDOWN"), PROGRAM_OPTION::SECTOR_LOCKDOWN);
         }},
        {"optionType2String(TARVIKNS::PROGRAM_OPTION)", RETURNS_A_TEXT},
        {"removePackageName(StringBase&)",
         [](ConstraintsManager& m) {
             StringBase device("dev_package1234");
             m.removePackageName(device);
             EXPECT_EQ(device.GetLength(), 3U);
         }},
        {"checkConstraints(TARVIKNS::MODE_TYPE, TARVIKNS::OUTPUT_TYPE)",
         [](ConstraintsManager& m) { EXPECT_TRUE(m.checkConstraints(BS, USB2)); }},
        {"checkConstraints(TARVIKNS::MODE_TYPE, char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.checkConstraints(BS, DEVICE, nullptr));
             EXPECT_TRUE(m.checkConstraints(BS, DEVICE, PACKAGE));
         }},
        {"checkConstraints(TARVIKNS::MODE_TYPE, TARVIKNS::OUTPUT_TYPE, char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.checkConstraints(BS, USB2, DEVICE, nullptr));
             EXPECT_TRUE(m.checkConstraints(BS, USB2, DEVICE, PACKAGE));
             EXPECT_TRUE(m.checkConstraints(MODE_TYPE::SPI, USB2, DEVICE, PACKAGE));
         }},
        {"checkConstraints(TARVIKNS::MODE_TYPE, TARVIKNS::OUTPUT_TYPE, char const*, TARVIKNS::OP_TYPE, char "
         "const*)",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.checkConstraints(BS, USB2, DEVICE, OP_TYPE::PROGRAM, FAMILY));
             EXPECT_TRUE(m.checkConstraints(MODE_TYPE::SPI, USB2, DEVICE, OP_TYPE::ERASE, nullptr));
         }},
        {"checkConstraints(char const*, TARVIKNS::MODE_TYPE, TARVIKNS::OP_TYPE, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.checkConstraints(DEVICE, BS, OP_TYPE::LOADCONFIGURATIONREVISION, nullptr));
             EXPECT_FALSE(m.checkConstraints(DEVICE, MODE_TYPE::KITEMPM, OP_TYPE::VERIFY, nullptr));
         }},
        {"getDeviceOperations(char const*, TARVIKNS::MODE_TYPE, TARVIKNS::OUTPUT_TYPE)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.getDeviceOperations(DEVICE, BS, USB2), maskOf(0));
             EXPECT_EQ(m.getDeviceOperations(FAMILY, BS, USB2), maskOf(0));
             EXPECT_EQ(m.getDeviceOperations(DEVICE, MODE_TYPE::SPI, USB2), maskOf(4));
         }},
        {"getProgramOptions(char const*, TARVIKNS::MODE_TYPE, TARVIKNS::OUTPUT_TYPE, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.getProgramOptions(OTHER_DEVICE, BS, USB2, nullptr), maskOf(0));
             EXPECT_EQ(m.getProgramOptions(OTHER_DEVICE, BS, USB2, PACKAGE), maskOf(0));
             EXPECT_EQ(m.getProgramOptions(DEVICE, BS, USB2, PACKAGE), maskOf(1));
             EXPECT_EQ(m.getProgramOptions(DEVICE, MODE_TYPE::SPI, USB2, PACKAGE), maskOf(10));
         }},
        {"getBsdlOperations(char const*, TARVIKNS::OUTPUT_TYPE)",
         [](ConstraintsManager& m) { EXPECT_EQ(m.getBsdlOperations(DEVICE, USB2), maskOf(19)); }},
        {"getDeviceOperationOptions(char const*, char const*, TARVIKNS::MODE_TYPE)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.getDeviceOperationOptions(DEVICE, "READUSERCODE", BS).size(), 1U);
             EXPECT_EQ(m.getDeviceOperationOptions(OTHER_DEVICE, "READUSERCODE", BS).size(), 1U);
             EXPECT_EQ(m.getDeviceOperationOptions(DEVICE, "READUSERCODE", MODE_TYPE::KITEMPM).size(), 0U);
         }},
        {"getDeviceStringProperties(char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.getDeviceStringProperties(DEVICE, PROPERTY).size(), 1U);
             EXPECT_EQ(m.getDeviceStringProperties(DEVICE, FAMILY_PROPERTY).size(), 1U);
             EXPECT_EQ(m.getDeviceStringProperties(DEVICE, "NOTHING").size(), 0U);
         }},
        {"getDeviceStringProperty(char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_STREQ(m.getDeviceStringProperty(DEVICE, PROPERTY), "TRUE");
             EXPECT_STREQ(m.getDeviceStringProperty(DEVICE, FAMILY_PROPERTY), "44");
             EXPECT_STREQ(m.getDeviceStringProperty(FLASH, PROPERTY), "16");
         }},
        {"getDeviceBoolProperty(char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.getDeviceBoolProperty(DEVICE, PROPERTY));
             EXPECT_FALSE(m.getDeviceBoolProperty(DEVICE, "NOTHING"));
         }},
        {"getDeviceLongProperty(char const*, char const*)",
         [](ConstraintsManager& m) {
             EXPECT_EQ(m.getDeviceLongProperty(DEVICE, FAMILY_PROPERTY), 44);
             EXPECT_EQ(m.getDeviceLongProperty(FLASH, PROPERTY), 16);
         }},
        {"getPartFamily(char const*)", RETURNS_A_TEXT},
        {"addCachedDeviceFamily(char const*, char const*)",
         [](ConstraintsManager& m) { m.addCachedDeviceFamily(DEVICE, FAMILY); }},
        {"isKorvelDevice(char const*)", [](ConstraintsManager& m) { EXPECT_TRUE(m.isKorvelDevice(DEVICE)); }},
        {"getAllDeviceIdcodes() const",
         [](ConstraintsManager& m) { EXPECT_TRUE(m.getAllDeviceIdcodes().empty()); }},
        {"isSpiDevice(StringBase) const", [](ConstraintsManager& m) { EXPECT_TRUE(m.isSpiDevice(FLASH)); }},
        {"getSpiDeviceStringProperty(char const*, char const*) const",
         [](ConstraintsManager& m) {
             EXPECT_STREQ(m.getSpiDeviceStringProperty(FLASH, PROPERTY), "16");
             EXPECT_STREQ(m.getSpiDeviceStringProperty(FLASH, "NOTHING"), "");
         }},
        {"getSpiDeviceBoolProperty(char const*, char const*) const",
         [](ConstraintsManager& m) { EXPECT_FALSE(m.getSpiDeviceBoolProperty(FLASH, PROPERTY)); }},
        {"getSpiDeviceLongProperty(char const*, char const*) const",
         [](ConstraintsManager& m) { EXPECT_EQ(m.getSpiDeviceLongProperty(FLASH, PROPERTY), 16); }},
        {"isMbBpiSpiSupport(char const*, char const*, char const*, bool) const",
         [](ConstraintsManager& m) {
             EXPECT_TRUE(m.isMbBpiSpiSupport(FLASH, "type_mb_bpi", "parallel", false));
         }},
        {"dumpOperationsTable(TarvikSmokeMgr*)", WRITES_TEXT},
        {"dumpBsdlOperationsTable(TarvikSmokeMgr*)", WRITES_TEXT},
        {"dumpProgramOptionsTable(TarvikSmokeMgr*)", WRITES_TEXT},
        {"dumpCachedDeviceFamilies(TarvikSmokeMgr*)", WRITES_TEXT},
        {"dumpMbBpiSpi() const", WRITES_TEXT},
    };
    return METHODS;
}

TEST(WarmMethods, AllocateNothing) {
    ManagerFixture fixture(DATABASES);
    for (const auto& [name, ask] : methods()) {
        if (ask != nullptr) {
            ask(*fixture);
            EXPECT_EQ(countAllocations([&, &warm = ask] { warm(*fixture); }), 0U) << name;
        }
    }
    EXPECT_THAT(fixture.messages(), testing::IsEmpty());
}

/// The exported methods, from the interface that is checked against the library.
std::set<std::string> exportedMethods() {
    constexpr std::string_view CLASS = "ConstraintsManager::";
    std::ifstream symbols(TARVIK_SOURCE_DIRECTORY "/tests/system/interface/ConstraintsManager.symbols");
    std::set<std::string> methods;
    for (std::string symbol; std::getline(symbols, symbol);) {
        char* const demangled = abi::__cxa_demangle(symbol.c_str(), nullptr, nullptr, nullptr);
        const std::string name = demangled == nullptr ? symbol : demangled;
        std::free(demangled);
        methods.insert(name.starts_with(CLASS) ? name.substr(CLASS.size()) : name);
    }
    return methods;
}

TEST(WarmMethods, AreAllThatAreExported) {
    std::set<std::string> listed;
    for (const auto& [name, ask] : methods()) {
        listed.insert(name);
    }
    EXPECT_THAT(listed, ContainerEq(exportedMethods()));
}

} // namespace
