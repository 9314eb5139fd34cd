// `dump`: the manager's smoke-test tables, byte for byte.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;

/// What a request of a batch answers.
json result(const SmallDatabase& database, const std::string& requests) {
    ProcessOptions start = database.start({"batch"});
    start.input = requests;
    const std::string output = runTool(start).output;
    return json::parse(output.substr(output.rfind('\n', output.size() - 2) + 1))["result"];
}

TEST(Dump, RecordedTablesAreWhatTheManagerRecords) {
    const SmallDatabase database;
    const std::map<std::string, std::string> methods{{"operations", "dumpOperationsTable"},
                                                     {"bsdl", "dumpBsdlOperationsTable"},
                                                     {"options", "dumpProgramOptionsTable"},
                                                     {"families", "dumpCachedDeviceFamilies"}};
    for (const auto& [table, method] : methods) {
        const ProcessResult outcome = database.run({"dump", table});
        EXPECT_EQ(outcome.status, 0);
        EXPECT_EQ(
            outcome.error,
            "tarvik: no device is loaded, so the table has only what the manager reads when it starts\n");
        EXPECT_EQ(
            outcome.output,
            result(database, R"({"call": ")" + method + R"(", "args": ["recorder"]})").get<std::string>());
    }
}

TEST(Dump, OperationsShowWhatStartUpLoaded) {
    const SmallDatabase database;
    const std::string output = database.run({"dump", "operations"}).output;
    EXPECT_EQ(std::count(output.begin(), output.end(), '\n'), 5);
    EXPECT_THAT(output, HasSubstr("\nfinch          0 0 0 "));
}

TEST(Dump, DevicesAreLoadedFirst) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"dump", "operations", "FN10"}).output,
                HasSubstr("\nfinch          1 0 1 0 0 0 "));
    EXPECT_EQ(database.run({"dump", "families"}).output, "");
    EXPECT_EQ(database.run({"dump", "families", "FN10", "FN20"}).output,
              "Device fn10 belongs to finch\nDevice fn20 belongs to finch\n");
}

TEST(Dump, MultibootComesFromTheStatusChannel) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"dump", "multiboot"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, testing::StartsWith("TYPE_BPI_PARALLEL_CHAIN:\n"));
    EXPECT_THAT(outcome.output, HasSubstr("\nTYPE_MB_SPI_NONE_LEAD: FLA FN10\n"));
    EXPECT_EQ(outcome.error, "");
}

TEST(Dump, JsonHoldsTheText) {
    const SmallDatabase database;
    for (const char* const table : {"operations", "multiboot"}) {
        const json answer = database.json({"dump", table});
        EXPECT_EQ(answer["table"], table);
        EXPECT_EQ(answer["text"], database.run({"dump", table}).output);
        EXPECT_EQ(answer["messages"], json::array());
    }
}

TEST(Dump, UnknownTableIsAFault) {
    const ProcessResult outcome = SmallDatabase().run({"dump", "operation"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("did you mean \"operations\"?"));
    EXPECT_THAT(outcome.error, HasSubstr("multiboot, bsdl, families, operations, options"));
}

TEST(Dump, UnknownDeviceIsANo) { EXPECT_EQ(SmallDatabase().run({"dump", "operations", "FN99"}).status, 1); }

} // namespace
