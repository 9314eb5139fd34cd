// The command line itself: help, versions, and what is no command.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

TEST(CommandLine, VersionNamesTheTool) {
    const ProcessResult outcome = runTool({"--version"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("tarvik "));
}

TEST(CommandLine, VersionHasAShortName) { EXPECT_EQ(runTool({"-V"}).output, runTool({"--version"}).output); }

TEST(CommandLine, WithoutArgumentsTheHelpIsShown) {
    const ProcessResult outcome = runTool(std::vector<std::string>{});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, runTool({"--help"}).output);
    EXPECT_THAT(outcome.output, HasSubstr("\nCommands:\n"));
}

TEST(CommandLine, NoCommandIsAFault) {
    const ProcessResult outcome = runTool({"--verbose"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.error, StartsWith("tarvik: a command is required\nsee: tarvik --help\n"));
}

TEST(CommandLine, HelpIsACommandToo) {
    EXPECT_EQ(runTool({"help"}).output, runTool({"--help"}).output);
    EXPECT_EQ(runTool({"help", "check"}).output, runTool({"check", "--help"}).output);
    const ProcessResult outcome = runTool({"help", "chek"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.error, "tarvik: unknown command \"chek\"; did you mean \"check\"?\nsee: tarvik help\n");
}

TEST(CommandLine, HelpNamesPossibleValues) {
    EXPECT_THAT(runTool({"help", "check"}).output,
                testing::AllOf(HasSubstr("BS, SS, SM, BSFILE"), HasSubstr("PARALLEL, ZORVA"),
                               HasSubstr("PROGRAM, PROGRAMFLASH")));
    EXPECT_THAT(runTool({"help", "why"}).output, HasSubstr("READPROTECT"));
    EXPECT_THAT(runTool({"help", "lint"}).output, HasSubstr("text, json, sarif"));
}

TEST(CommandLine, HelpIsShownWithoutWhatIsRequired) {
    EXPECT_EQ(runTool({"show", "--help"}).status, 0);
    EXPECT_EQ(runTool({"show", "-h", "--version"}).output, runTool({"help", "show"}).output);
}

TEST(CommandLine, OptionsAfterTwoDashesAreReported) {
    const ProcessResult outcome = runTool({"check", "--", "KS50", "--mode", "BS"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.error, "tarvik: \"--mode\" comes after \"--\", so it is not read as an option\n"
                             "see: tarvik check --help\n");
}

TEST(CommandLine, UnknownChoicesAreFaultsThatSayWhatIsAccepted) {
    const ProcessResult outcome = runTool({"dump", "operation"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error,
                StartsWith("tarvik: TABLE cannot be \"operation\"; did you mean \"operations\"?\n"
                           "accepted: "));
    EXPECT_THAT(runTool({"families", "--color", "red"}).error,
                StartsWith("tarvik: --color cannot be \"red\"\naccepted: auto, always, never\n"));
}

TEST(CommandLine, UnknownCommandIsAFaultWithASuggestion) {
    const ProcessResult outcome = runTool({"devises"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error,
                StartsWith("tarvik: unknown command \"devises\"; did you mean \"devices\"?\n"));
}

TEST(CommandLine, UnknownOptionIsAFaultWithASuggestion) {
    EXPECT_EQ(runTool({"--frob"}).error, "tarvik: unknown option \"--frob\"\nsee: tarvik --help\n");
    EXPECT_THAT(runTool({"--jsn", "devices"}).error,
                StartsWith("tarvik: unknown option \"--jsn\"; did you mean \"--json\"?\n"));
    const ProcessResult outcome = runTool({"devices", "--famly", "finch"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.error, "tarvik: unknown option \"--famly\"; did you mean \"--family\"?\n"
                             "see: tarvik devices --help\n");
}

TEST(CommandLine, TooManyArgumentsAreAFault) {
    const ProcessResult outcome = runTool({"show", "FN10", "FN20"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.error, "tarvik: unexpected argument \"FN20\"\nsee: tarvik show --help\n");
}

TEST(CommandLine, FaultsAreToldInJsonToo) {
    EXPECT_EQ(runTool({"show", "--json"}).output,
              "{\"version\":1,\"error\":\"DEVICE is required\\nsee: tarvik show --help\",\"messages\":[]}\n");
}

TEST(CommandLine, MissingArgumentIsAFaultThatNamesTheHelp) {
    const ProcessResult outcome = runTool({"show"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("DEVICE"));
    EXPECT_THAT(outcome.error, HasSubstr("see: tarvik show --help"));
}

TEST(CommandLine, OptionsOfTheToolMayStandBehindTheCommand) {
    const SmallDatabase database;
    const ProcessResult outcome = runTool({"families", "--json", "--database", database.path()});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("{\"version\":1,"));
}

TEST(CommandLine, ADeviceMayBeNamedAsACommand) {
    const SmallDatabase database;
    EXPECT_THAT(database.run({"check", "spi", "--mode", "SPI"}).output, StartsWith("yes: spi "));
}

TEST(CommandLine, VocabularyNeedsNoDatabase) {
    const ProcessResult outcome = runTool({"--database", "/nowhere", "vocabulary"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.error, IsEmpty());
}

} // namespace
