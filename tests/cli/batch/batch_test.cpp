// `batch` as a protocol: lines, ids, messages, exceptions, faults, and when answers come.
#include "cli/support/BatchRun.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;

std::string error(const std::string& line) { return answerTo(line + "\n")["error"].get<std::string>(); }

TEST(Batch, AnswerHasIdResultAndMessagesInThisOrder) {
    const SmallDatabase database;
    ProcessOptions start = database.start({"batch"});
    start.input = "{\"id\": 7, \"call\": \"getDeviceOperations\", \"args\": [\"FN10\", 0, 2]}\n";
    const ProcessResult outcome = runTool(start);
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "{\"id\":7,\"result\":1,\"messages\":[]}\n");
    EXPECT_EQ(outcome.error, "");
}

TEST(Batch, IdIsEchoedWhateverItIs) {
    EXPECT_EQ(answerTo(R"({"id": "a", "call": "getOperationOrders"})")["id"], "a");
    EXPECT_EQ(answerTo(R"({"id": [1, {"b": null}], "call": "getOperationOrders"})")["id"],
              json::parse(R"([1, {"b": null}])"));
    EXPECT_EQ(answerTo(R"({"id": 18446744073709551615, "call": "getOperationOrders"})")["id"],
              18446744073709551615U);
    EXPECT_TRUE(answerTo(R"({"call": "getOperationOrders"})")["id"].is_null());
}

TEST(Batch, MessagesOfAllChannelsStandInOrder) {
    EXPECT_EQ(answerTo(R"({"id": 1, "call": "checkConstraints", "args": [0, 1]})")["messages"],
              json::parse(R"([{"channel": "info", "line": 201,
                               "text": "ZORVA cable is not supported in Boundary Scan mode\n"}])"));
    EXPECT_EQ(answerTo(R"({"id": 1, "call": "getBsdlOperations", "args": ["FN10", 5]})")["messages"],
              json::parse(R"([{"channel": "debug", "line": 0,
                               "text": "Outstream(Cable or file type) is out of range -- 5.\n"}])"));
    const json messages = answerTo(R"({"call": "dumpMbBpiSpi"})")["messages"];
    EXPECT_EQ(messages[0]["channel"], "status");
    EXPECT_EQ(messages[0]["line"], 1777);
    EXPECT_EQ(messages[0]["text"], "TYPE_BPI_PARALLEL_CHAIN:");
    EXPECT_EQ(messages[1]["text"], "\n");
}

TEST(Batch, ExceptionsAreOnAndStandInPlaceOfTheResult) {
    const json answer = answerTo(R"({"id": 1, "call": "getDeviceOperations", "args": ["NONE", 0, 2]})");
    EXPECT_EQ(answer["exception"], json::parse(R"({"type": "OutOfRangeException", "line": 2024})"));
    EXPECT_FALSE(answer.contains("result"));
    EXPECT_EQ(answer["messages"], json::array());
}

TEST(Batch, ExceptionKeepsTheMessagesBeforeIt) {
    const json answer = answerTo(R"({"call": "getDeviceStringProperty", "args": ["FN10", "NO"]})");
    EXPECT_EQ(answer["exception"], json::parse(R"({"type": "DataNotFoundException", "line": 437})"));
    EXPECT_EQ(answer["messages"], json::parse(R"([{"channel": "info", "line": 437,
                               "text": "ACD entry  NO not found for device family FN10.\n"}])"));
}

TEST(Batch, OneManagerAnswersAll) {
    const std::vector<json> answers =
        batch("{\"call\": \"setExceptions\", \"args\": [false]}\n"
              "{\"call\": \"getDeviceStringProperty\", \"args\": [\"FN10\", \"NO\"]}\n");
    EXPECT_TRUE(answers[0]["result"].is_null());
    EXPECT_TRUE(answers[1]["result"].is_null());
    EXPECT_EQ(answers[1]["messages"].size(), 1U);
}

TEST(Batch, StartUpMessagesStandInTheFirstAnswer) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{{"base.acd", "nonsense\n"}});
    std::filesystem::create_directory(directory.path("spi.acd"));
    ProcessOptions start{{"--database", directory.path(), "batch"}, "", {}, ""};
    start.input = "not a request\n"
                  "{\"id\": 1, \"call\": \"modeType2String\", \"args\": [1]}\n"
                  "{\"id\": 2, \"call\": \"modeType2String\", \"args\": [1]}\n";
    const ProcessResult outcome = runTool(start);
    EXPECT_EQ(outcome.error, "");
    std::istringstream lines(outcome.output);
    std::string line;
    std::getline(lines, line);
    EXPECT_FALSE(json::parse(line).contains("messages"));
    std::getline(lines, line);
    const json messages = json::parse(line)["messages"];
    ASSERT_GE(messages.size(), 2U);
    EXPECT_THAT(messages.front()["text"].get<std::string>(), HasSubstr("base.acd:1"));
    EXPECT_THAT(messages.back()["text"].get<std::string>(), HasSubstr("DataNotFoundException"));
    std::getline(lines, line);
    EXPECT_EQ(json::parse(line)["messages"], json::array());
}

TEST(Batch, RemovalEndsTheRun) {
    const std::vector<json> answers = batch("{\"id\": 1, \"call\": \"RemoveConstraintsManager\"}\n"
                                            "{\"id\": 2, \"call\": \"getOperationOrders\"}\n");
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0], json::parse(R"({"id": 1, "result": null, "messages": []})"));
}

TEST(Batch, FaultsDoNotEndTheRun) {
    const std::vector<json> answers = batch("{\"id\": 1}\n"
                                            "{\"id\": 2, \"call\": \"getConstraintsManager\"}\n");
    EXPECT_EQ(answers[0], json::parse(R"({"id": 1, "error": "a request has a \"call\""})"));
    EXPECT_EQ(answers[1]["result"], true);
}

TEST(Batch, LinesThatAreNoJsonAreFaults) {
    for (const char* const line :
         {"{", "nonsense", "{\"call\": \"getOperationOrders\"} x", "{'call': 1}", "{\"call\": \"\xFF\"}",
          "{\"call\": \"\\ud800\"}", "[1,]", "\"", "1e999"}) {
        const json answer = answerTo(std::string(line) + "\n");
        EXPECT_TRUE(answer["id"].is_null());
        EXPECT_THAT(answer["error"].get<std::string>(), HasSubstr("not JSON")) << line;
    }
}

TEST(Batch, IdIsKeptWhereItCouldBeRead) {
    EXPECT_EQ(answerTo(R"({"id": 5, "call": "getOperationOrders")")["id"], 5);
    EXPECT_EQ(answerTo(R"({"id": 5, "call": "a", "call": "b"})")["id"], 5);
    EXPECT_TRUE(answerTo(R"({"id": [5, )")["id"].is_null());
}

TEST(Batch, RequestIsAnObjectOfIdCallAndArguments) {
    EXPECT_EQ(error("[]"), "a request is an object");
    EXPECT_EQ(error("7"), "a request is an object");
    EXPECT_EQ(error("{}"), "a request has a \"call\"");
    EXPECT_EQ(error(R"({"call": 7})"), "\"call\" is a text");
    EXPECT_EQ(error(R"({"call": "getOperationOrders", "args": 7})"), "\"args\" is an array or an object");
    EXPECT_EQ(error(R"({"call": "getOperationOrders", "arguments": []})"), "a request has no \"arguments\"");
}

TEST(Batch, NameGivenTwiceIsAFault) {
    EXPECT_EQ(error(R"({"call": "getOperationOrders", "call": "getOperationOrders"})"),
              "the name \"call\" is given twice");
    EXPECT_EQ(error(R"({"call": "isKorvelDevice", "args": {"device": "a", "device": "b"}})"),
              "the name \"device\" is given twice");
}

TEST(Batch, NulByteIsAFault) {
    EXPECT_EQ(error(std::string("{\"call\": \"getOperationOrders\"}\0garbage", 39)), "a NUL byte");
}

TEST(Batch, EmptyLinesAreNothing) {
    EXPECT_EQ(batch("\n \t\r\n\n{\"call\": \"getOperationOrders\"}\n\n").size(), 1U);
    EXPECT_EQ(batch("").size(), 0U);
}

TEST(Batch, LineEndsMayHaveACarriageReturnOrBeMissingAtTheEnd) {
    EXPECT_EQ(batch("{\"call\": \"getOperationOrders\"}\r\n{\"call\": \"getOperationOrders\"}").size(), 2U);
}

TEST(Batch, DeepNestingIsAFaultNotACrash) {
    for (const std::size_t depth : {std::size_t{33}, std::size_t{1000000}}) {
        EXPECT_EQ(error(std::string(depth, '[')), "nested too deep");
        EXPECT_EQ(error("{\"id\": " + std::string(depth, '[') + std::string(depth, ']') + "}"),
                  "nested too deep");
    }
    EXPECT_EQ(answerTo("{\"id\": " + std::string(20, '[') + std::string(20, ']') +
                       ", \"call\": \"getOperationOrders\"}")["id"]
                  .size(),
              1U);
}

TEST(Batch, LongLinesAreRead) {
    const std::string name(1000000, 'x');
    const json answer = answerTo("{\"call\": \"removePackageName\", \"args\": [\"" + name + "_y\"]}");
    EXPECT_EQ(answer["result"], name);
}

TEST(Batch, LineThatIsFarTooLongIsAFaultAndTheRunGoesOn) {
    const std::vector<json> answers = batch("{\"id\": \"" + std::string(17 * 1024 * 1024, 'x') +
                                            "\"}\n{\"id\": 1, \"call\": \"getOperationOrders\"}\n");
    ASSERT_EQ(answers.size(), 2U);
    EXPECT_EQ(answers[0]["error"], "a line longer than 16777216 bytes");
    EXPECT_EQ(answers[1]["id"], 1);
}

TEST(Batch, FarTooLongLastLineIsAFaultToo) {
    EXPECT_EQ(batch(std::string(17 * 1024 * 1024, 'x')).size(), 1U);
}

TEST(Batch, ManyNamesAreAFault) {
    std::string request = "{\"id\": {";
    for (int i = 0; i < 100; ++i) {
        request += "\"" + std::to_string(i) + "\": 0,";
    }
    EXPECT_EQ(error(request + "\"x\": 0}}"), "too many names");
}

TEST(Batch, BytesThatAreNoTextShowAsReplaced) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", "[FN10]\nPROPERTY = KEY,a\xFF"
                       "b\n"}});
    ProcessOptions start{{"--database", directory.path(), "batch"}, "", {}, ""};
    start.input = "{\"call\": \"getDeviceStringProperty\", \"args\": [\"FN10\", \"KEY\"]}\n";
    EXPECT_EQ(json::parse(runTool(start).output)["result"], "a\xEF\xBF\xBD"
                                                            "b");
}

TEST(Batch, AnswersComeBeforeTheNextRequestIsAsked) {
    const SmallDatabase database;
    InteractiveProcess batch(database.start({"batch"}));
    for (int id = 0; id < 3; ++id) {
        batch.write("{\"id\": " + std::to_string(id) + ", \"call\": \"getOperationOrders\"}\n");
        EXPECT_EQ(json::parse(batch.readLine())["id"], id);
    }
    batch.write("{\"id\": 3, ");
    batch.write("\"call\": \"getOperationOrders\"}\n{\"id\"");
    EXPECT_EQ(json::parse(batch.readLine())["id"], 3);
    batch.write(": 4, \"call\": \"getOperationOrders\"}");
    batch.closeInput();
    EXPECT_EQ(json::parse(batch.readLine())["id"], 4);
    EXPECT_EQ(batch.wait(), 0);
}

TEST(Batch, ManyRequestsAreAnsweredInOrder) {
    std::string requests;
    for (int id = 0; id < 20000; ++id) {
        requests +=
            "{\"id\": " + std::to_string(id) + ", \"call\": \"isKorvelDevice\", \"args\": [\"FN10\"]}\n";
    }
    const std::vector<json> answers = batch(requests);
    ASSERT_EQ(answers.size(), 20000U);
    for (std::size_t id = 0; id < answers.size(); ++id) {
        EXPECT_EQ(answers[id], json({{"id", id}, {"result", true}, {"messages", json::array()}}));
    }
}

// A double would not give these back.
TEST(Batch, IdIsGivenBackAsItWasWritten) {
    const SmallDatabase database;
    const std::string call = R"("call": "getPartFamily", "args": ["FN10"])";
    for (const std::string id :
         {"1.0", "1e3", "-0", "123456789012345678901234567890", "0.1000", R"("\u00e9 \"a\": }")",
          R"([1, 2.50, {"id": 7.0}])", R"({"call": 1.10, "b": [  ]})", "true", "null"}) {
        ProcessOptions options = database.start({"batch"});
        options.input = "{\"id\": " + id + " , " + call + "}\n{" + call + ", \"id\":" + id +
                        "}\n{\"i\\u0064\": " + id + ", " + call + "}\n{\"id\": " + id +
                        ", \"call\": \"zz\"}\n{\"id\": " + id + ", \"call\": 1 2}\n";
        const std::string start = "{\"id\":" + id + ",\"";
        const std::string answer = start + "result\":\"finch\",\"messages\":[]}\n";
        const std::string output = runTool(options).output;
        EXPECT_THAT(output, testing::StartsWith(answer + answer + answer + start + "error\":"));
        EXPECT_THAT(output, HasSubstr('\n' + start + "error\":\"not JSON"));
    }
}

TEST(Batch, DatabaseIsOpenedBeforeTheFirstRequest) {
    ProcessOptions start{{"--database", "/nowhere", "batch"}, "{\"call\": \"getOperationOrders\"}\n", {}, ""};
    const ProcessResult outcome = runTool(start);
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "");
}

} // namespace
