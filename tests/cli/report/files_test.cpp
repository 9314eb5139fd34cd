// Where a report goes, and that it goes there whole or not at all.
#include "ReportFiles.h"
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

TEST(ReportFiles, WritesAWholePageAndSaysSo) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const std::string file = place.path("report.html");
    const ProcessResult outcome = database.run({"report", "--file", file});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "");
    EXPECT_EQ(outcome.output, file + ": 5 devices in 2 families\n");
    EXPECT_THAT(textOf(file), StartsWith("<!DOCTYPE html>"));
    EXPECT_THAT(textOf(file), EndsWith("</html>\n"));
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, SameDatabaseGivesSamePage) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"report", "--file", "-"}).output, database.run({"report", "--file", "-"}).output);
}

TEST(ReportFiles, StandardOutputGetsThePageAlone) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"report", "--file", "-"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("<!DOCTYPE html>"));
    EXPECT_THAT(outcome.output, EndsWith("</html>\n"));
}

TEST(ReportFiles, JsonTellsWhatWasWritten) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const nlohmann::json answer = database.json({"report", "--file", place.path("r.html")});
    EXPECT_EQ(answer, nlohmann::json({{"version", 1},
                                      {"file", place.path("r.html")},
                                      {"devices", 5},
                                      {"families", 2},
                                      {"faults", nlohmann::json::array()},
                                      {"messages", nlohmann::json::array()}}));
}

TEST(ReportFiles, JsonAndThePageCantShareStandardOutput) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"--json", "report", "--file", "-"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_TRUE(nlohmann::json::parse(outcome.output).contains("error"));
}

TEST(ReportFiles, AnUnwritableFileIsAFault) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const ProcessResult outcome = database.run({"report", "--file", place.path("no/such/report.html")});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.error, HasSubstr("can't write \"" + place.path("no/such/report.html") +
                                         "\": No such file or directory"));
}

TEST(ReportFiles, ADirectoryIsAFault) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    EXPECT_EQ(database.run({"report", "--file", place.path()}).status, 2);
    EXPECT_EQ(filesIn(place.path()), 0U);
}

TEST(ReportFiles, AFailedRunKeepsTheFormerPage) {
    const DatabaseDirectory place(DatabaseDirectory::Files{{"report.html", "former"}});
    const ProcessResult outcome =
        runTool({"--database", place.path("missing"), "report", "--file", place.path("report.html")});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(textOf(place.path("report.html")), "former");
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, LongestName) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const std::string file = place.path(std::string(255, 'x'));
    for (int run = 0; run < 2; ++run) {
        EXPECT_EQ(database.run({"report", "--file", file}).status, 0);
        EXPECT_THAT(textOf(file), StartsWith("<!DOCTYPE html>"));
        EXPECT_EQ(filesIn(place.path()), 1U);
    }
}

TEST(ReportFiles, OtherNamesOfAFileStayNamesOfIt) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", std::string(100000, 'x')}});
    std::filesystem::create_hard_link(place.path("page.html"), place.path("other.html"));
    EXPECT_EQ(database.run({"report", "--file", place.path("page.html")}).status, 0);
    EXPECT_EQ(std::filesystem::hard_link_count(place.path("page.html")), 2U);
    EXPECT_THAT(textOf(place.path("other.html")), StartsWith("<!DOCTYPE html>"));
    EXPECT_THAT(textOf(place.path("other.html")), EndsWith("</html>\n"));
}

TEST(ReportFiles, NeedsAFile) { EXPECT_EQ(SmallDatabase().run({"report"}).status, 2); }

} // namespace
