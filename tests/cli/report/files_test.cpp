// Where a report goes, and that it goes there whole or not at all.
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>
#include <iterator>

namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

std::string textOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

std::size_t filesIn(const std::string& directory) {
    const std::filesystem::directory_iterator files(directory);
    return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

TEST(ReportFiles, WritesAWholePageAndSaysSo) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const std::string file = place.path("report.html");
    const ProcessResult outcome = database.run({"report", "-o", file});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "");
    EXPECT_EQ(outcome.output, file + ": 5 devices in 2 families\n");
    EXPECT_THAT(textOf(file), StartsWith("<!DOCTYPE html>"));
    EXPECT_THAT(textOf(file), EndsWith("</html>\n"));
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, SameDatabaseGivesSamePage) {
    const SmallDatabase database;
    EXPECT_EQ(database.run({"report", "-o", "-"}).output, database.run({"report", "-o", "-"}).output);
}

TEST(ReportFiles, StandardOutputGetsThePageAlone) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"report", "-o", "-"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.output, StartsWith("<!DOCTYPE html>"));
    EXPECT_THAT(outcome.output, EndsWith("</html>\n"));
}

TEST(ReportFiles, JsonTellsWhatWasWritten) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const nlohmann::json answer = database.json({"report", "-o", place.path("r.html")});
    EXPECT_EQ(answer, nlohmann::json({{"version", 1},
                                      {"file", place.path("r.html")},
                                      {"devices", 5},
                                      {"families", 2},
                                      {"messages", nlohmann::json::array()}}));
}

TEST(ReportFiles, JsonAndThePageCantShareStandardOutput) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"--json", "report", "-o", "-"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_TRUE(nlohmann::json::parse(outcome.output).contains("error"));
}

TEST(ReportFiles, AnUnwritableFileIsAFault) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    const ProcessResult outcome = database.run({"report", "-o", place.path("no/such/report.html")});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "");
    EXPECT_THAT(outcome.error, HasSubstr("can't write \"" + place.path("no/such/report.html") +
                                         "\": No such file or directory"));
}

TEST(ReportFiles, ADirectoryIsAFault) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    EXPECT_EQ(database.run({"report", "-o", place.path()}).status, 2);
    EXPECT_EQ(filesIn(place.path()), 0U);
}

TEST(ReportFiles, AFullDeviceIsAFault) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"report", "-o", "/dev/full"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("No space left on device"));
    EXPECT_TRUE(std::filesystem::is_character_file("/dev/full"));
}

TEST(ReportFiles, AFailedRunKeepsTheFormerPage) {
    const DatabaseDirectory place(DatabaseDirectory::Files{{"report.html", "former"}});
    const ProcessResult outcome =
        runTool({"--database", place.path("missing"), "report", "-o", place.path("report.html")});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(textOf(place.path("report.html")), "former");
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, ReplacesTheFileBehindALink) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", "former"}});
    std::filesystem::create_symlink("page.html", place.path("latest.html"));
    EXPECT_EQ(database.run({"report", "-o", place.path("latest.html")}).status, 0);
    EXPECT_TRUE(std::filesystem::is_symlink(place.path("latest.html")));
    EXPECT_THAT(textOf(place.path("page.html")), StartsWith("<!DOCTYPE html>"));
}

TEST(ReportFiles, KeepsThePermissionsOfAFormerPage) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"report.html", "former"}});
    const auto permissions = std::filesystem::perms::owner_read | std::filesystem::perms::owner_write;
    std::filesystem::permissions(place.path("report.html"), permissions);
    EXPECT_EQ(database.run({"report", "-o", place.path("report.html")}).status, 0);
    EXPECT_EQ(std::filesystem::status(place.path("report.html")).permissions(), permissions);
}

TEST(ReportFiles, NeedsAFile) { EXPECT_EQ(SmallDatabase().run({"report"}).status, 2); }

} // namespace
