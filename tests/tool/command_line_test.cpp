// The command line itself: help, versions, and what is no command.
#include "tool/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

TEST(CommandLine, HelpListsEveryCommand) {
    const Outcome outcome = runTool({"--help"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.error, IsEmpty());
    for (const char* const command :
         {"devices", "families", "vocabulary", "show", "operations", "options", "bsdl", "operation-options",
          "check", "property", "spi", "multiboot", "dump", "batch"}) {
        EXPECT_THAT(outcome.output, HasSubstr(std::string("\n  ") + command + " "));
    }
}

TEST(CommandLine, HelpFits80Columns) {
    for (const char* const command :
         {"devices", "families", "vocabulary", "show", "operations", "options", "bsdl", "operation-options",
          "check", "property", "spi", "multiboot", "dump", "batch"}) {
        const Outcome outcome = runTool({command, "--help"});
        EXPECT_EQ(outcome.status, 0);
        std::istringstream lines(outcome.output + runTool({"--help"}).output);
        for (std::string line; std::getline(lines, line);) {
            EXPECT_LE(line.size(), 80U) << command << ": " << line;
        }
    }
}

TEST(CommandLine, HelpOfEachCommandHasAnExampleOfIt) {
    for (const std::string command :
         {"devices", "families", "vocabulary", "show", "operations", "options", "bsdl", "operation-options",
          "check", "property", "spi", "multiboot", "dump", "batch"}) {
        EXPECT_THAT(runTool({command, "--help"}).output,
                    testing::ContainsRegex("Examples:\n  [^\n]*tarvik " + command));
    }
}

TEST(CommandLine, VersionNamesTheTool) {
    const Outcome outcome = runTool({"--version"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("tarvik "));
}

TEST(CommandLine, NoCommandIsAFault) {
    const Outcome outcome = runTool(std::vector<std::string>{});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.error, StartsWith("tarvik: a command is required\nsee: tarvik --help\n"));
}

TEST(CommandLine, UnknownCommandIsAFaultWithASuggestion) {
    const Outcome outcome = runTool({"devises"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error,
                StartsWith("tarvik: unknown command \"devises\"; did you mean \"devices\"?\n"));
}

TEST(CommandLine, UnknownOptionIsAFault) {
    EXPECT_EQ(runTool({"--frob"}).status, 2);
    EXPECT_EQ(runTool({"devices", "--frob"}).status, 2);
}

TEST(CommandLine, TooManyArgumentsAreAFault) { EXPECT_EQ(runTool({"show", "FN10", "FN20"}).status, 2); }

TEST(CommandLine, MissingArgumentIsAFaultThatNamesTheHelp) {
    const Outcome outcome = runTool({"show"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("DEVICE"));
    EXPECT_THAT(outcome.error, HasSubstr("see: tarvik show --help"));
}

TEST(CommandLine, OptionsOfTheToolMayStandBehindTheCommand) {
    const SmallDatabase database;
    const Outcome outcome = runTool({"families", "--json", "--database", database.path()});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("{\"version\":1,"));
}

TEST(CommandLine, ADeviceMayBeNamedAsACommand) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"check", "spi", "--mode", "SPI"}).output, StartsWith("yes: spi "));
}

TEST(CommandLine, VocabularyNeedsNoDatabase) {
    const Outcome outcome = runTool({"--database", "/nowhere", "vocabulary"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.error, IsEmpty());
}

} // namespace
