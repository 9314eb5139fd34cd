// What differs on a terminal: colours, and the width that lines fit. A terminal here is a real one.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <sstream>

namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

constexpr const char* ESCAPE = "\x1b[";

/// Runs the tool on the demonstration, on a terminal.
std::string shown(std::vector<std::string> arguments, unsigned short columns,
                  std::map<std::string, std::string> environment = {{"TERM", "xterm"}}) {
    arguments.insert(arguments.begin(), {"--database", TARVIK_SOURCE_DIRECTORY "/database"});
    return runTool({std::move(arguments), {}, std::move(environment), {}, columns}).output;
}

std::string withoutColours(const std::string& text) {
    std::string plain;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text.compare(i, 2, ESCAPE) == 0) {
            i = text.find('m', i);
        } else {
            plain += text[i];
        }
    }
    return plain;
}

std::size_t longestLine(const std::string& text) {
    std::size_t longest = 0;
    std::istringstream lines(withoutColours(text));
    for (std::string line; std::getline(lines, line);) {
        longest = std::max(longest, line.size());
    }
    return longest;
}

const std::vector<std::vector<std::string>> COMMANDS{
    {"devices"},
    {"families"},
    {"vocabulary"},
    {"show", "KS50"},
    {"operations", "KS50", "--mode", "BS", "--output", "USB2"},
    {"check", "KS50", "--mode", "BS"},
    {"why", "KS50", "--mode", "SS", "--output", "USB2", "--operation", "VERIFY"},
    {"which", "--property", "VENDOR=Korvel"},
    {"spi"},
    {"spi", "OVD16"},
    {"lint", "--explain", "T105"},
};

TEST(Terminals, HeadingsAndVerdictsAreColoured) {
    EXPECT_THAT(shown({"devices"}, 80), StartsWith("\x1b[1mDEVICE   FAMILY   IDCODE\x1b[0m\n"));
    EXPECT_THAT(shown({"check", "KS50", "--mode", "BS"}, 80), StartsWith("\x1b[32myes:\x1b[0m KS50"));
    EXPECT_THAT(shown({"check", "KS50", "--mode", "DP770"}, 80), HasSubstr("\x1b[31mno:\x1b[0m KS50"));
    EXPECT_THAT(shown({"show", "KS50"}, 80), HasSubstr("\n\x1b[1mOperations\x1b[0m\n"));
}

TEST(Terminals, FindingsAndDifferencesAreColoured) {
    const SmallDatabase database;
    const DatabaseDirectory changed(DatabaseDirectory::Files{{"finch.acd", "PROPERTY = VENDOR,Other\n"}});
    const auto onTerminal = [](std::vector<std::string> arguments) {
        return runTool({std::move(arguments), {}, {{"TERM", "xterm"}}, {}, 80}).output;
    };
    EXPECT_THAT(onTerminal({"diff", database.path(), changed.path() + ':' + database.path()}),
                AllOf(HasSubstr("\x1b[31m-Korvel\x1b[0m"), HasSubstr("\x1b[32m+Other\x1b[0m")));
    EXPECT_THAT(onTerminal({"lint", TARVIK_SOURCE_DIRECTORY "/tests/data/bad/T101"}),
                AllOf(HasSubstr(" \x1b[31merror:\x1b[0m "), HasSubstr("\x1b[32m^~")));
}

TEST(Terminals, ColoursLeaveTheTextAsItIs) {
    for (const std::vector<std::string>& command : COMMANDS) {
        std::vector<std::string> onDatabase{"--database", TARVIK_SOURCE_DIRECTORY "/database"};
        onDatabase.insert(onDatabase.end(), command.begin(), command.end());
        EXPECT_EQ(withoutColours(shown(command, 1000)),
                  runTool({onDatabase, {}, {{"COLUMNS", "1000"}}, {}, 0}).output)
            << command.front();
    }
}

TEST(Terminals, TextsOfADatabaseDoNotControlThem) {
    const DatabaseDirectory database({{"base.acd", "DEVICE_SUPPORTED = finch\n"},
                                      {"finch.acd", "PROPERTY = VENDOR,\x1b[2J\xC2\x9B\xC3\xBC\n[FN10]\n"},
                                      {"spi.acd", ""}});
    for (const std::vector<std::string>& question : {std::vector<std::string>{"property", "FN10", "VENDOR"},
                                                     {"show", "FN10"},
                                                     {"why", "FN10", "--property", "VENDOR"}}) {
        std::vector<std::string> arguments{"--database", database.path(), "--color", "never"};
        arguments.insert(arguments.end(), question.begin(), question.end());
        EXPECT_THAT(runTool({arguments, {}, {}, {}, 80}).output,
                    AllOf(HasSubstr("?[2J?\xC3\xBC"), Not(HasSubstr("\x1b"))));
        EXPECT_THAT(runTool(arguments).output, HasSubstr("\x1b[2J\xC2\x9B\xC3\xBC"));
    }
}

TEST(Terminals, ArgumentsDoNotControlThem) {
    const SmallDatabase database;
    for (const std::vector<std::string>& question :
         {std::vector<std::string>{"show", "\x1b[2J"},
          {"check", "\x1b[2J", "--mode", "BS"},
          {"\x1b[2J"},
          {"operations", "FN10", "--mode", "\x1b[2J", "--output", "USB2"},
          {"--database", "\x1b[2J", "devices"}}) {
        std::vector<std::string> arguments{"--database", database.path(), "--color", "never"};
        arguments.insert(arguments.end(), question.begin(), question.end());
        EXPECT_THAT(runTool({arguments, {}, {}, {}, 80}).output,
                    AllOf(HasSubstr("?[2J"), Not(HasSubstr("\x1b"))))
            << question.front();
    }
}

TEST(Terminals, NoColoursWhereTheyAreNotWanted) {
    using Environment = std::map<std::string, std::string>;
    for (const Environment& environment :
         {Environment{{"TERM", "dumb"}}, Environment{}, Environment{{"TERM", "xterm"}, {"NO_COLOR", "1"}}}) {
        EXPECT_THAT(shown({"devices"}, 80, environment), Not(HasSubstr(ESCAPE)));
    }
    EXPECT_THAT(shown({"devices"}, 80, {{"TERM", "xterm"}, {"NO_COLOR", ""}}), HasSubstr(ESCAPE));
    EXPECT_THAT(shown({"devices", "--color", "never"}, 80), Not(HasSubstr(ESCAPE)));
    EXPECT_THAT(shown({"devices", "--json"}, 80), Not(HasSubstr(ESCAPE)));
    EXPECT_THAT(shown({"dump", "operations", "KS50"}, 80), Not(HasSubstr(ESCAPE)));
}

TEST(Terminals, NoColoursInAPipeUnlessAskedFor) {
    const SmallDatabase database;
    ProcessOptions start = database.start({"devices"});
    start.environment = {{"TERM", "xterm"}};
    EXPECT_THAT(runTool(start).output, Not(HasSubstr(ESCAPE)));
    start.arguments.insert(start.arguments.end(), {"--color", "always"});
    EXPECT_THAT(runTool(start).output, HasSubstr(ESCAPE));
    start.arguments.back() = "sometimes";
    EXPECT_EQ(runTool(start).status, 2);
}

TEST(Terminals, TextFitsTheirWidth) {
    for (const std::vector<std::string>& command : COMMANDS) {
        for (const unsigned short columns : std::initializer_list<unsigned short>{80, 132}) {
            // The file's path is what it is.
            if (command.front() != "show" && command.front() != "spi" && command.front() != "why") {
                EXPECT_LE(longestLine(shown(command, columns)), columns) << command.front();
            }
        }
    }
    EXPECT_LE(longestLine(shown({"families"}, 40)), 40U);
    EXPECT_LE(longestLine(shown({"devices", "--help"}, 70)), 70U);
    EXPECT_LE(longestLine(shown({"lint", "--explain", "all"}, 60)), 200U);
}

TEST(Terminals, RowsThatDoNotFitGoOnBelow) {
    const std::string families = withoutColours(shown({"families"}, 30));
    EXPECT_LE(longestLine(families), 30U);
    EXPECT_THAT(families, testing::ContainsRegex("\n                  [A-Z0-9]+"));
    // In a pipe a row is a line.
    EXPECT_GT(longestLine(runTool({{"families"}, {}, {{"COLUMNS", "30"}}, {}, 0}).output), 30U);
}

TEST(Terminals, NothingIsWrappedInAPipe) {
    EXPECT_GT(longestLine(runTool({"lint", "--explain", "T105"}).output), 120U);
    EXPECT_LE(longestLine(runTool({{"lint", "--explain", "T105"}, {}, {{"COLUMNS", "80"}}, {}, 0}).output),
              80U);
    EXPECT_LE(longestLine(runTool(std::vector<std::string>{"help", "lint"}).output), 80U);
}

TEST(Terminals, TheEnvironmentMayNameTheWidth) {
    const std::string wide = shown({"lint", "--explain", "T105"}, 80, {{"COLUMNS", "120"}});
    EXPECT_GT(longestLine(wide), 80U);
    for (const char* const nonsense : {"0", "-5", "many", "120x", ""}) {
        EXPECT_LE(longestLine(shown({"lint", "--explain", "T105"}, 80, {{"COLUMNS", nonsense}})), 80U);
    }
}

} // namespace
