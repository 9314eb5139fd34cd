// Every call of `batch`: its result, and how its arguments are given.
#include "cli/support/BatchRun.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <fstream>
#include <set>

namespace {

using nlohmann::json;
using testing::HasSubstr;

std::string request(const std::string& call, const std::string& arguments) {
    std::string line = R"({"call": ")" + call + R"(", "args": )" + arguments + "}";
    std::replace(line.begin(), line.end(), '\n', ' ');
    return line + '\n';
}

json result(const std::string& call, const std::string& arguments,
            const SmallDatabase& database = SmallDatabase()) {
    return answerTo(request(call, arguments), database).at("result");
}

std::string error(const std::string& call, const std::string& arguments) {
    return answerTo(request(call, arguments)).at("error").get<std::string>();
}

json numbers(int count) {
    json list = json::array();
    for (int value = 0; value < count; ++value) {
        list.push_back(value);
    }
    return list;
}

/// The names of the methods that the exported header declares as public.
std::set<std::string> exportedMethods() {
    std::ifstream header(TARVIK_SOURCE_DIRECTORY "/include/tarvik/ConstraintsManager.h");
    std::string code;
    for (std::string line; std::getline(header, line) && line != "private:";) {
        if (line.find("= delete") == std::string::npos) {
            code = line == "public:" ? "" : code + line.substr(0, line.find("//")) + '\n';
        }
    }
    std::set<std::string> names;
    for (std::size_t open = code.find('('); open != std::string::npos; open = code.find('(', open + 1)) {
        const std::size_t before = code.find_last_of(" *&", open);
        names.insert(code.substr(before + 1, open - before - 1));
    }
    return names;
}

TEST(BatchCalls, EveryExportedMethodIsACall) {
    const std::set<std::string> names = exportedMethods();
    ASSERT_EQ(names.size(), 39U);
    for (const std::string& name : names) {
        // A fault in the arguments shows that the call is known, without making it.
        EXPECT_THAT(error(name, R"([[], [], [], [], [], []])"), testing::StartsWith(name + " takes ("))
            << name;
    }
}

TEST(BatchCalls, Lifecycle) {
    EXPECT_EQ(result("getConstraintsManager", "[]"), true);
    EXPECT_EQ(result("RemoveConstraintsManager", "[]"), nullptr);
    EXPECT_EQ(result("setExceptions", "[true]"), nullptr);
    EXPECT_EQ(result("getOperationOrders", "[]"), numbers(32));
    EXPECT_EQ(result("getProgramOptionOrders", "[]"), numbers(24));
}

TEST(BatchCalls, Converters) {
    EXPECT_EQ(result("modeString2Type", R"(["sserial"])"), 1);
    EXPECT_EQ(result("modeString2Type", "[null]"), 0);
    EXPECT_EQ(result("modeType2String", "[8]"), "PFF");
    EXPECT_EQ(result("modeType2String", "[-5]"), "BS");
    EXPECT_EQ(result("cableString2Type", R"(["QSVF"])"), 9);
    EXPECT_EQ(result("cableType2String", "[5]"), "QSVF");
    EXPECT_EQ(result("operationString2Type", R"(["verify"])"), 3);
    EXPECT_EQ(result("operationDisplayString2Type", R"(["get device id"])"), 9);
    EXPECT_EQ(result("operationType2String", "[3]"), "VERIFY");
    EXPECT_EQ(result("operationType2DisplayString", "[2]"), "Program FPGA Only ");
    EXPECT_EQ(result("optionString2Type", R"(["UES"])"), 10);
    EXPECT_EQ(result("optionType2String", "[19]"), "OTP");
    EXPECT_EQ(result("removePackageName", R"(["a_b_c"])"), "a");
}

TEST(BatchCalls, ConverterExceptionsAndMessages) {
    EXPECT_EQ(answerTo(request("optionString2Type", R"(["OTP"])"))["exception"]["line"], 1500);
    EXPECT_EQ(answerTo(request("optionType2String", "[24]"))["exception"]["line"], 1413);
    const json answer = answerTo(request("operationType2String", "[32]"));
    EXPECT_EQ(answer["result"], "");
    EXPECT_EQ(answer["messages"][0]["text"], "Operation 32 is not defined.\n");
}

TEST(BatchCalls, CountAndKindPickTheCheck) {
    EXPECT_EQ(result("checkConstraints", "[0, 2]"), true);
    EXPECT_EQ(result("checkConstraints", R"([1, "FN10", "P48"])"), false);
    EXPECT_EQ(result("checkConstraints", R"([1, "FN10", null])"), true);
    EXPECT_EQ(result("checkConstraints", R"([1, 0, "FN10", "P48"])"), false);
    EXPECT_EQ(result("checkConstraints", R"([1, 0, "FN10", null])"), true);
    EXPECT_EQ(result("checkConstraints", R"([0, 2, "FN10", 0, null])"), true);
    EXPECT_EQ(result("checkConstraints", R"([0, 2, "FN10", 3, null])"), false);
    EXPECT_EQ(result("checkConstraints", R"(["FN10", 1, 0, null])"), true);
    EXPECT_EQ(answerTo(request("checkConstraints", R"([null, 1, 0, null])"))["exception"]["line"], 2024);
}

TEST(BatchCalls, NamesPickTheCheckToo) {
    EXPECT_EQ(result("checkConstraints", R"({"mode": 0, "output": 2})"), true);
    EXPECT_EQ(result("checkConstraints", R"({"output": "USB2", "mode": "BS"})"), true);
    EXPECT_EQ(result("checkConstraints", R"({"mode": "SS", "device": "FN10", "package": "P48"})"), false);
    EXPECT_EQ(result("checkConstraints",
                     R"({"mode": "SS", "output": "PARALLEL", "device": "FN10", "package": null})"),
              true);
    EXPECT_EQ(result("checkConstraints", R"({"mode": "BS", "output": "USB2", "device": "FN10",
                                              "operation": "PROGRAM", "family": null})"),
              true);
    EXPECT_EQ(result("checkConstraints",
                     R"({"device": "FN10", "mode": "SS", "operation": "PROGRAM", "family": null})"),
              true);
}

TEST(BatchCalls, DeviceQueries) {
    EXPECT_EQ(result("getDeviceOperations", R"(["FN10", 0, 2])"), 1);
    EXPECT_EQ(result("getDeviceOperations", R"({"device": "FN10", "mode": "BS", "output": "USB2"})"), 1);
    EXPECT_EQ(result("getProgramOptions", R"(["FN10", 0, 0, "P48"])"), 2);
    EXPECT_EQ(result("getBsdlOperations", R"(["FN10", 3])"), 1 << 20);
    EXPECT_EQ(result("getDeviceOperationOptions", R"(["FN10", "PROGRAM", 1])"), json({"ERASE", "VERIFY"}));
}

// Here the operation is a text by its own right, so no key name is made of it.
TEST(BatchCalls, TextsAreNoEnumerations) {
    EXPECT_EQ(
        result("getDeviceOperationOptions", R"({"device": "FN10", "operation": "PROGRAM", "mode": "SS"})"),
        json({"ERASE", "VERIFY"}));
}

TEST(BatchCalls, MasksAreSigned) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", "OPERATION = EXPRESSQSVF,BS,USB2\n[FN10]\n"}});
    ProcessOptions start{{"--database", directory.path(), "batch"}, "", {}, ""};
    start.input = request("getDeviceOperations", R"(["FN10", 0, 2])");
    EXPECT_EQ(json::parse(runTool(start).output)["result"], -2147483648LL);
}

TEST(BatchCalls, Properties) {
    EXPECT_EQ(result("getDeviceStringProperties", R"(["FN10", "PROGRAM"])"), json({"BS", "SS"}));
    EXPECT_EQ(result("getDeviceStringProperties", R"(["FN10", "NO"])"), json::array());
    EXPECT_EQ(result("getDeviceStringProperty", R"(["FN10", "CORE"])"), "1.8");
    EXPECT_EQ(result("getDeviceBoolProperty", R"(["FN10", "CORE"])"), false);
    EXPECT_EQ(result("getDeviceLongProperty", R"(["FN10", "PINS"])"), 44);
}

TEST(BatchCalls, Families) {
    EXPECT_EQ(result("getPartFamily", R"(["FN10_P48"])"), "finch");
    EXPECT_EQ(result("getPartFamily", "[null]"), "base");
    EXPECT_EQ(result("isKorvelDevice", R"(["FN99"])"), false);
    EXPECT_EQ(result("getAllDeviceIdcodes", "[]"), json({{"FN10", "0x0010"}, {"fn20", "0x0020"}}));
    const std::vector<json> answers = batch(request("addCachedDeviceFamily", R"(["fn99", "finch"])") +
                                            request("getPartFamily", R"(["FN99"])"));
    EXPECT_TRUE(answers[0].at("result").is_null());
    EXPECT_EQ(answers[1].at("result"), "finch");
}

TEST(BatchCalls, Flashes) {
    EXPECT_EQ(result("isSpiDevice", R"(["fla"])"), true);
    EXPECT_EQ(result("isSpiDevice", "[null]"), false);
    EXPECT_EQ(result("getSpiDeviceStringProperty", R"(["FLB", "BUS"])"), "SPI");
    EXPECT_EQ(result("getSpiDeviceStringProperty", R"(["FLB", "NO"])"), "");
    EXPECT_EQ(result("getSpiDeviceBoolProperty", R"(["FLB", "BUS"])"), false);
    EXPECT_EQ(result("getSpiDeviceLongProperty", R"(["FLA", "DENSITY"])"), 1024);
}

TEST(BatchCalls, Multiboot) {
    EXPECT_EQ(result("isMbBpiSpiSupport", R"(["fn10", "type_mb_spi", "none", true])"), true);
    EXPECT_EQ(result("isMbBpiSpiSupport",
                     R"({"device": "fn10", "typePrefix": "type_mb_spi", "width": "none", "lead": false})"),
              false);
}

TEST(BatchCalls, DumpsAnswerTheRecordersTextOrMessages) {
    for (const std::string call : {"dumpOperationsTable", "dumpBsdlOperationsTable",
                                   "dumpProgramOptionsTable", "dumpCachedDeviceFamilies"}) {
        const std::string load = request("getDeviceOperations", R"(["FN10", 0, 2])");
        const json recorded = answerTo(load + request(call, R"(["recorder"])"));
        EXPECT_EQ(recorded["messages"], json::array());
        EXPECT_EQ(answerTo(load + request(call, R"({"recorder": "recorder"})")), recorded);
        for (const char* const none : {"[]", "[null]", R"({"recorder": null})"}) {
            const json issued = answerTo(load + request(call, none));
            EXPECT_TRUE(issued.at("result").is_null());
            std::string text;
            for (const json& message : issued["messages"]) {
                EXPECT_EQ(message["channel"], "status");
                text += message["text"];
            }
            EXPECT_EQ(recorded["result"], text);
            EXPECT_NE(text, "");
        }
    }
    EXPECT_THAT(error("dumpOperationsTable", R"(["tape"])"), HasSubstr("recorder"));
    EXPECT_TRUE(result("dumpMbBpiSpi", "[]").is_null());
}

TEST(BatchCalls, UnknownCallIsAFaultWithASuggestion) {
    EXPECT_EQ(error("getPartFamilie", "[]"),
              "there is no call \"getPartFamilie\"; did you mean \"getPartFamily\"?");
    EXPECT_EQ(error("", "[]"), "there is no call \"\"");
}

TEST(BatchCalls, WrongCountsNamesAndKindsAreFaultsThatSayWhatIsTaken) {
    const std::string taken = "getBsdlOperations takes (device: text or null, output: integer)";
    for (const char* const arguments :
         {"[]", R"(["FN10"])", R"(["FN10", 1, 2])", R"([1, 1])", R"(["FN10", "SVF"])", R"(["FN10", null])",
          R"(["FN10", 1.0])", R"(["FN10", true])", R"(["FN10", [1]])", R"({"device": "FN10"})",
          R"({"device": "FN10", "outputs": 1})", R"({"device": "FN10", "output": 1, "mode": 1})",
          R"({"device": 1, "output": 1})", R"({"device": "FN10", "output": null})"}) {
        EXPECT_EQ(error("getBsdlOperations", arguments), taken) << arguments;
    }
    EXPECT_EQ(error("setExceptions", "[1]"), "setExceptions takes (exceptions: true or false)");
    EXPECT_EQ(error("getOperationOrders", "[1]"), "getOperationOrders takes ()");
}

TEST(BatchCalls, NumbersAreThoseOfInt) {
    EXPECT_EQ(result("cableType2String", "[2147483647]"), "");
    EXPECT_EQ(result("cableType2String", "[-2147483648]"), "");
    for (const char* const number :
         {"2147483648", "-2147483649", "4294967296", "9223372036854775808", "-9223372036854775808"}) {
        EXPECT_EQ(error("cableType2String", "[" + std::string(number) + "]"), "\"output\" is out of range");
    }
    EXPECT_EQ(error("cableType2String", "[99999999999999999999]"),
              "cableType2String takes (output: integer)");
}

TEST(BatchCalls, NamedArgumentsTakeTheWordsOfTheCommands) {
    EXPECT_EQ(result("modeType2String", R"({"mode": "ss"})"), "SS");
    EXPECT_EQ(result("modeType2String", R"({"mode": "Smap"})"), "SM");
    EXPECT_EQ(result("modeType2String", R"({"mode": "Slave Serial"})"), "SS");
    EXPECT_EQ(error("modeType2String", R"({"mode": "SR"})"), "unknown mode \"SR\"; did you mean \"SS\"?");
    EXPECT_EQ(result("cableType2String", R"({"output": "NULLCABLE"})"), "NULLCABLE");
    EXPECT_EQ(result("optionType2String", R"({"option": "RS_PIN0"})"), "RS_PIN0");
    EXPECT_EQ(result("operationType2String", R"({"operation": "EXPRESSQSVF"})"), "EXPRESSQSVF");
    EXPECT_EQ(result("operationType2String", R"({"operation": "Get Device ID"})"), "READIDCODE");
    EXPECT_EQ(error("operationType2String", R"({"operation": "PROGRAMM"})"),
              "unknown operation \"PROGRAMM\"; did you mean \"PROGRAM\"?");
}

TEST(BatchCalls, NulInATextIsAFaultWhereMethodsWouldNotSeeIt) {
    EXPECT_EQ(error("getPartFamily", R"(["FN10\u0000x"])"), "\"device\" holds a NUL");
    EXPECT_EQ(result("isSpiDevice", R"(["FLA\u0000"])"), false);
    EXPECT_EQ(result("removePackageName", R"(["a\u0000b_c"])"), std::string("a\0b", 3));
}

TEST(BatchCalls, HelpListsEveryCallWithItsArguments) {
    const json calls = result("help", "[]");
    std::size_t checks = 0;
    for (const json& call : calls) {
        checks += call["call"] == "checkConstraints" ? 1U : 0U;
        if (call["call"] == "help" || call["call"] == "show" || call["call"] == "why") {
            continue;
        }
        // With one argument too many a call names what it takes: exactly the arguments that the help lists.
        json arguments = json::array();
        for (int i = 0; i < 9; ++i) {
            arguments.push_back(nullptr);
        }
        const std::string taken = error(call["call"], arguments.dump());
        for (const json& argument : call["args"]) {
            EXPECT_THAT(taken, HasSubstr(argument["name"].get<std::string>() + ": ")) << call;
        }
    }
    EXPECT_EQ(checks, 5U);
    EXPECT_EQ(calls.at(7),
              json::parse(R"({"call": "cableString2Type", "args": [{"name": "text", "type": "text or null"}],
                                            "result": "integer"})"));
    EXPECT_EQ(error("help", R"(["getPartFamily"])"), "help takes ()");
}

TEST(BatchCalls, ShowAndWhyAnswerAsTheCommands) {
    const SmallDatabase database;
    EXPECT_EQ(result("show", R"({"device": "FN10"})", database), database.json({"show", "FN10"}));
    EXPECT_EQ(result("why", R"({"device": "FN10", "mode": "slave serial", "package": "P48"})", database),
              database.json({"why", "FN10", "--mode", "SS", "--package", "P48"}));
    EXPECT_EQ(
        result("why",
               R"({"device": "FLA", "multiboot": "MB_SPI", "width": "NONE", "lead": true, "chain": false})",
               database),
        database.json({"why", "FLA", "--multiboot", "MB_SPI", "--width", "NONE", "--lead"}));
    EXPECT_EQ(error("show", R"({"device": "FN11"})"),
              "the database has no device \"FN11\"; did you mean \"FN10\"?");
    for (const char* const arguments :
         {"[]", R"(["FN10"])", R"({"device": 1})", R"({"device": "FN10", "x": "y"})"}) {
        EXPECT_EQ(error("show", arguments), "show takes an object of texts: device") << arguments;
    }
}

TEST(BatchCalls, ShowAndWhyLeaveTheManagerAsItIs) {
    const std::vector<json> answers =
        batch(request("getPartFamily", R"(["FN10"])") + request("show", R"({"device": "FN10"})") +
              request("why", R"({"device": "FN10", "mode": "BS"})") +
              request("getDeviceOperations", R"(["NONE", 0, 2])"));
    EXPECT_TRUE(answers[3].contains("exception"));
}

TEST(BatchCalls, FaultyArgumentsCallNothing) {
    const std::vector<json> answers =
        batch(request("setExceptions", "[false, 1]") + request("getDeviceOperations", R"(["NONE", 0, 2])"));
    EXPECT_TRUE(answers[1].contains("exception"));
}

} // namespace
