// The exit status of every command: 0 for yes and done, 1 for no, 2 for a mistake in the command line or database.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <sstream>

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

using Words = std::vector<std::string>;

const std::string GOOD = TARVIK_SOURCE_DIRECTORY "/database";

/// Command lines by their exit status. A list is empty if no command line has that status.
struct Endings {
    std::string command;
    std::vector<Words> yes;
    std::vector<Words> no;
    std::vector<Words> mistake;
};

/// @param database a good one
std::vector<Endings> endings(const std::string& database) {
    return {
        {"devices",
         {{}, {"fn*"}, {"--family", "finch"}},
         {{"zz*"}, {"--family", "zz"}},
         {{"--family"}, {"a", "b"}}},
        {"identify", {{"0x0010"}, {"0x10", "0x20"}}, {{"0x0011"}, {"0x10", "0x11"}}, {{}, {"FN10"}, {"0x"}}},
        {"families", {{}}, {}, {{"--zz"}, {"finch"}}},
        {"vocabulary", {{}}, {}, {{"--zz"}, {"modes"}}},
        {"show", {{"FN10"}, {"finch"}, {"FLA"}}, {{"ZZ"}}, {{}, {"FN10", "FN20"}}},
        {"operations",
         {{"FN10", "--mode", "BS", "--output", "USB2"}, {"FN10", "--mode", "SPI", "--output", "USB2"}},
         {{"ZZ", "--mode", "BS", "--output", "USB2"}},
         {{"FN10", "--mode", "ZZ", "--output", "USB2"},
          {"FN10", "--mode", "BS", "--output", "ZZ"},
          {"FN10", "--mode", "BS"},
          {"--mode", "BS", "--output", "USB2"}}},
        {"options",
         {{"FN10", "--mode", "BS", "--output", "USB2"}},
         {{"ZZ", "--mode", "BS", "--output", "USB2"},
          {"FN10", "--mode", "BS", "--output", "USB2", "--package", "P48"}},
         {{"FN10", "--mode", "ZZ", "--output", "USB2"}, {"FN10", "--output", "USB2"}}},
        {"bsdl",
         {{"FN10", "--output", "USB2"}},
         {{"ZZ", "--output", "USB2"}},
         {{"FN10", "--output", "ZZ"}, {"FN10"}}},
        {"operation-options",
         {{"FN10", "PROGRAM", "--mode", "BS"}},
         {{"ZZ", "PROGRAM", "--mode", "BS"}, {"FN10", "VERIFY", "--mode", "BS"}},
         {{"FN10", "ZZ", "--mode", "BS"}, {"FN10", "PROGRAM", "--mode", "ZZ"}, {"FN10", "--mode", "BS"}}},
        {"check",
         {{"FN10", "--mode", "BS"},
          {"--mode", "BS", "--output", "USB2"},
          {"FN10", "--mode", "BS", "--output", "USB2", "--operation", "PROGRAM"}},
         {{"FN10", "--mode", "DP770"},
          {"ZZ", "--mode", "BS"},
          {"FN10", "--mode", "SS", "--package", "P48"},
          {"FN10", "--mode", "BS", "--output", "USB2", "--operation", "VERIFY"}},
         {{"FN10"},
          {"FN10", "--mode", "ZZ"},
          {"FN10", "--mode", "BS", "--output", "ZZ"},
          {"FN10", "--mode", "BS", "--operation", "ZZ"},
          {"--mode", "BS"}}},
        {"why",
         {{"FN10", "--mode", "BS"}, {"FN10", "--property", "VENDOR"}},
         {{"FN10", "--mode", "DP770"}, {"ZZ", "--mode", "BS"}, {"FN10", "--property", "ZZ"}},
         {{},
          {"FN10", "--mode", "ZZ"},
          {"FN10", "--mode", "BS", "--output", "USB2", "--option", "ZZ"},
          {"FN10", "--mode", "BS", "--property", "VENDOR"}}},
        {"which",
         {{"--operation", "PROGRAM", "--mode", "BS", "--output", "USB2"}, {"--property", "VENDOR=Korvel"}},
         {{"--operation", "READBACK", "--mode", "BS", "--output", "USB2"}, {"--property", "VENDOR=ZZ"}},
         {{},
          {"--operation", "ZZ", "--mode", "BS"},
          {"--property", "VENDOR"},
          {"--property", "VENDOR=Korvel", "--mode", "BS"}}},
        {"property",
         {{"FN10", "VENDOR"}, {"FLA", "DENSITY"}},
         {{"FN10", "ZZ"}, {"ZZ", "VENDOR"}},
         {{"FN10"}, {}}},
        {"spi", {{}, {"FLA"}, {"FLA", "DENSITY"}}, {{"ZZ"}, {"FLA", "ZZ"}}, {{"FLA", "DENSITY", "ZZ"}}},
        {"multiboot",
         {{"FLA", "--type", "MB_SPI", "--width", "NONE", "--lead"}},
         {{"FLA", "--type", "MB_SPI", "--width", "NONE", "--chain"},
          {"ZZ", "--type", "MB_SPI", "--width", "NONE", "--lead"}},
         {{"FLA", "--type", "MB_SPI", "--width", "NONE"},
          {"FLA", "--type", "ZZ", "--width", "NONE", "--lead"},
          {"FLA", "--type", "MB_SPI", "--width", "ZZ", "--lead"},
          {"FLA", "--type", "MB_SPI", "--width", "NONE", "--lead", "--chain"}}},
        {"dump",
         {{"operations"}, {"bsdl", "FN10"}, {"options"}, {"families"}, {"multiboot"}},
         {{"operations", "ZZ"}},
         {{}, {"zz"}}},
        {"lint",
         {{GOOD}, {"--explain", "T101"}},
         {{}, {database}},
         {{"/nowhere"}, {"--select", "ZZ"}, {"--format", "zz"}, {"--explain", "ZZ"}}},
        {"format", {{"--check", GOOD}, {"--diff", database}}, {{"--check", database}}, {{"/nowhere"}}},
        {"new",
         {{"flash", "FN90", "--like", "FLA", "--dry-run"}},
         {{"flash", "FN90", "--like", "ZZ"}},
         {{}, {"zz", "FN90"}, {"device", "F_90", "--like", "FN10"}, {"flash", "FN90"}}},
        {"rename",
         {{"FN10", "FN90", "--dry-run"}},
         {{"ZZ", "FN90"}},
         {{}, {"FN10"}, {"FN10", "F_90"}, {"FN10", "FN10"}, {"spi", "FN90"}}},
        {"remove", {{"FLA", "--dry-run"}}, {{"ZZ"}}, {{}, {"base"}}},
        {"diff",
         {{database, database}},
         {{GOOD, database}},
         {{database}, {database, "/nowhere"}, {"/nowhere", database}}},
        {"index",
         {{database}, {"--show", database}},
         {{"--show", GOOD}},
         {{}, {"/nowhere"}, {"--show", "/nowhere"}, {"--show", database, database}}},
        {"report", {{"--file", "/dev/null"}}, {}, {{}, {"--file", "/nowhere/page.html"}}},
        {"batch", {{}}, {}, {{"zz"}}},
        {"lsp", {}, {{}, {"--stdio"}}, {{"zz"}}},
        {"help", {{}, {"check"}}, {}, {{"zz"}}},
    };
}

std::string joined(const Words& words) {
    std::string text;
    for (const std::string& word : words) {
        text += word + ' ';
    }
    return text;
}

TEST(ExitStatus, OfEveryCommand) {
    const SmallDatabase database;
    for (const Endings& each : endings(database.path())) {
        const auto expectAll = [&](const std::vector<Words>& lines, int status) {
            for (Words words : lines) {
                words.insert(words.begin(), each.command);
                const ProcessResult outcome = database.run(words);
                EXPECT_EQ(outcome.status, status) << joined(words) << '\n' << outcome;
                if (status == 2) {
                    EXPECT_THAT(outcome.error, StartsWith("tarvik: ")) << joined(words);
                    EXPECT_THAT(outcome.output, IsEmpty()) << joined(words);
                }
            }
        };
        expectAll(each.yes, 0);
        expectAll(each.no, 1);
        expectAll(each.mistake, 2);
    }
}

TEST(ExitStatus, OfEveryCommandWithoutItsDatabase) {
    const SmallDatabase database;
    const DatabaseDirectory empty;
    for (const Endings& each : endings(database.path())) {
        // Two are about the tool itself, one begins with an empty database, and the others name theirs.
        if (each.command == "vocabulary" || each.command == "help" || each.command == "diff" ||
            each.command == "format" || each.command == "index" || each.command == "new" ||
            each.command == "lsp") {
            continue;
        }
        Words words = each.command == "lint" ? Words{} : each.yes.front();
        words.insert(words.begin(), each.command);
        for (const std::string& path : {std::string("/nowhere"), empty.path()}) {
            const ProcessResult outcome = runTool({words, {}, {{"TARVIK_DATABASE", path}}, {}});
            EXPECT_EQ(outcome.status, 2) << joined(words);
            EXPECT_THAT(outcome.output, IsEmpty()) << joined(words);
            EXPECT_THAT(outcome.error, HasSubstr(path)) << joined(words);
        }
    }
}

TEST(ExitStatus, IsTheSameWithJson) {
    const SmallDatabase database;
    for (const Endings& each : endings(database.path())) {
        const auto expectAll = [&](const std::vector<Words>& lines, int status) {
            for (Words words : lines) {
                words.insert(words.begin(), {"--json", each.command});
                const ProcessResult outcome = database.run(words);
                EXPECT_EQ(outcome.status, status) << joined(words) << '\n' << outcome;
                // Help is text, batch writes one object for each request, and lsp speaks its own protocol.
                const bool hasOwnForm =
                    each.command == "batch" || each.command == "help" || each.command == "lsp";
                if (!hasOwnForm || status == 2) {
                    EXPECT_THAT(outcome.output, StartsWith("{\"version\":1,")) << joined(words);
                }
            }
        };
        expectAll(each.yes, 0);
        expectAll(each.no, 1);
        expectAll(each.mistake, 2);
    }
}

TEST(ExitStatus, IsTestedForEveryCommandOfTheHelp) {
    std::istringstream help(runTool({"--help"}).output);
    std::vector<std::string> listed;
    bool isCommand = false;
    for (std::string line; std::getline(help, line);) {
        if (isCommand && line.starts_with("  ") && line.at(2) != ' ') {
            listed.push_back(line.substr(2, line.find(' ', 2) - 2));
        }
        isCommand = isCommand || line.starts_with("Commands:");
    }
    std::vector<std::string> tested;
    for (const Endings& each : endings("")) {
        tested.push_back(each.command);
    }
    EXPECT_THAT(tested, testing::UnorderedElementsAreArray(listed));
}

} // namespace
