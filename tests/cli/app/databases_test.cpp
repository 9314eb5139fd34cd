// Which database the tool answers from.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr const char* DEMONSTRATION_NOTE =
    "tarvik: no database given: answering from the built-in demonstration\n";

ProcessResult runOn(const std::vector<std::string>& directories, const std::vector<std::string>& command) {
    std::vector<std::string> arguments;
    for (const std::string& directory : directories) {
        arguments.insert(arguments.end(), {"--database", directory});
    }
    arguments.insert(arguments.end(), command.begin(), command.end());
    return runTool(arguments);
}

TEST(Databases, GivenDirectoryIsAnsweredFromWithoutANote) {
    const SmallDatabase database;
    const ProcessResult outcome = runOn({database.path()}, {"devices"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("FN10"));
    EXPECT_THAT(outcome.error, IsEmpty());
}

TEST(Databases, EnvironmentNamesOne) {
    const SmallDatabase database;
    const ProcessResult outcome =
        runTool(ProcessOptions{{"devices"}, "", {{"TARVIK_DATABASE", database.path()}}, ""});
    EXPECT_THAT(outcome.output, HasSubstr("FN10"));
    EXPECT_THAT(outcome.error, IsEmpty());
}

TEST(Databases, OptionOutranksTheEnvironment) {
    const SmallDatabase database;
    const ProcessResult outcome = runTool(ProcessOptions{
        {"--database", database.path(), "devices"}, "", {{"TARVIK_DATABASE", "/nowhere"}}, ""});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("FN10"));
}

TEST(Databases, NoneGivenIsTheDemonstrationWithANote) {
    const ProcessResult outcome = runTool({"families"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, HasSubstr("kestrel"));
    EXPECT_EQ(outcome.error, DEMONSTRATION_NOTE);
}

TEST(Databases, EmptyEnvironmentNamesNone) {
    EXPECT_EQ(runTool(ProcessOptions{{"families"}, "", {{"TARVIK_DATABASE", ""}}, ""}).error,
              DEMONSTRATION_NOTE);
}

TEST(Databases, FirstLayerIsOnTop) {
    const DatabaseDirectory overlay(DatabaseDirectory::Files{{"finch.acd", "[FN10]\nPROPERTY = PINS,99\n"}});
    const SmallDatabase database;
    EXPECT_EQ(runOn({overlay.path(), database.path()}, {"property", "FN10", "PINS"}).output, "99\n");
    EXPECT_EQ(runOn({database.path(), overlay.path()}, {"property", "FN10", "PINS"}).output, "44\n");
}

TEST(Databases, MissingDirectoryIsAFaultThatNamesThePath) {
    const ProcessResult outcome = runOn({"/nowhere/at all"}, {"devices"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.output, IsEmpty());
    EXPECT_THAT(outcome.error, HasSubstr("\"/nowhere/at all\""));
    EXPECT_THAT(outcome.error, Not(HasSubstr("demonstration")));
}

TEST(Databases, MissingLayerIsAFaultThatNamesAllPaths) {
    const SmallDatabase database;
    const ProcessResult outcome = runOn({database.path(), "/nowhere"}, {"devices"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("tried: \"" + database.path() + "\", \"/nowhere\"\n"));
}

TEST(Databases, MissingDirectoryOfTheEnvironmentIsAFault) {
    const ProcessResult outcome =
        runTool(ProcessOptions{{"devices"}, "", {{"TARVIK_DATABASE", "/nowhere:/neither"}}, ""});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("tried: \"/nowhere\", \"/neither\"\n"));
}

TEST(Databases, FileIsNoDirectory) {
    const SmallDatabase database;
    EXPECT_EQ(runOn({database.path("base.acd")}, {"devices"}).status, 2);
}

TEST(Databases, EmptyNameIsNoDirectory) { EXPECT_EQ(runOn({""}, {"devices"}).status, 2); }

TEST(Databases, DirectoryWithoutABaseIsAFault) {
    const DatabaseDirectory empty;
    const ProcessResult outcome = runOn({empty.path()}, {"devices"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("base.acd"));
    EXPECT_THAT(outcome.error, HasSubstr(empty.path()));
}

TEST(Databases, BaseThatCannotBeReadIsAFault) {
    const DatabaseDirectory directory;
    std::filesystem::create_directory(directory.path("base.acd"));
    EXPECT_EQ(runOn({directory.path()}, {"devices"}).status, 2);
}

TEST(Databases, FamilyThatCannotBeReadIsAFault) {
    const SmallDatabase database;
    std::filesystem::create_directory(database.path("broken.acd"));
    const ProcessResult outcome = database.run({"devices"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("broken.acd"));
}

TEST(Databases, FaultIsToldInJsonToo) {
    const nlohmann::json answer = nlohmann::json::parse(runOn({"/nowhere"}, {"devices", "--json"}).output);
    EXPECT_EQ(answer["version"], 1);
    EXPECT_THAT(answer["error"].get<std::string>(), HasSubstr("/nowhere"));
}

TEST(Databases, MalformedLineIsReportedOnce) {
    const DatabaseDirectory directory(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nnonsense\n"}, {"finch.acd", "[FN10]\n"}});
    const ProcessResult outcome = runOn({directory.path()}, {"devices"});
    EXPECT_EQ(outcome.status, 0);
    const std::string place = directory.path("base.acd") + ":2";
    EXPECT_THAT(outcome.error, HasSubstr(place));
    EXPECT_EQ(outcome.error.find(place), outcome.error.rfind(place));
}

} // namespace
