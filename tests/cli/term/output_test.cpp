// Standard input that cannot be read; standard output without a reader, or on a full disk.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <cstdlib>
#include <sys/wait.h>

namespace {

using testing::HasSubstr;

TEST(Output, FullDiskIsAFault) {
    const SmallDatabase database;
    for (const std::vector<std::string>& arguments :
         {std::vector<std::string>{"devices"}, {"devices", "--json"}, {"batch"}, {"--help"}}) {
        ProcessOptions start = database.start(arguments);
        start.input = "{\"call\": \"getOperationOrders\"}\n";
        start.outputPath = "/dev/full";
        const ProcessResult outcome = runTool(start);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_EQ(outcome.error, "tarvik: can't write to standard output: No space left on device\n");
    }
}

TEST(Output, ReaderThatLeavesEndsABatchQuietly) {
    const SmallDatabase database;
    InteractiveProcess batch(database.start({"batch"}));
    batch.write("{\"id\": 1, \"call\": \"getOperationOrders\"}\n");
    EXPECT_THAT(batch.readLine(), HasSubstr("\"id\":1"));
    batch.closeOutput();
    batch.write("{\"id\": 2, \"call\": \"getOperationOrders\"}\n");
    // It ends although its input is still open.
    EXPECT_EQ(batch.wait(), 0);
}

TEST(Output, ReaderThatLeavesAtOnceIsNoFault) {
    const SmallDatabase database;
    InteractiveProcess devices(database.start({"dump", "operations"}));
    devices.closeOutput();
    EXPECT_EQ(devices.wait(), 0);
}

TEST(Input, ThatCannotBeReadIsAFault) {
    const SmallDatabase database;
    const std::string shell = std::string(TARVIK_TOOL) + " --database " + database.path() + " batch <" +
                              database.path() + " >/dev/null 2>&1";
    EXPECT_EQ(WEXITSTATUS(std::system(shell.c_str())), 2);
}

} // namespace
