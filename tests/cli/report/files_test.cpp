// Where a report goes, and that it goes there whole or not at all.
#include "cli/support/SmallDatabase.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

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

TEST(ReportFiles, AFullDeviceIsAFault) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"report", "--file", "/dev/full"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("No space left on device"));
    EXPECT_TRUE(std::filesystem::is_character_file("/dev/full"));
}

TEST(ReportFiles, AFailedRunKeepsTheFormerPage) {
    const DatabaseDirectory place(DatabaseDirectory::Files{{"report.html", "former"}});
    const ProcessResult outcome =
        runTool({"--database", place.path("missing"), "report", "--file", place.path("report.html")});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(textOf(place.path("report.html")), "former");
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, ReplacesTheFileBehindALink) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", "former"}});
    std::filesystem::create_symlink("page.html", place.path("latest.html"));
    EXPECT_EQ(database.run({"report", "--file", place.path("latest.html")}).status, 0);
    EXPECT_TRUE(std::filesystem::is_symlink(place.path("latest.html")));
    EXPECT_THAT(textOf(place.path("page.html")), StartsWith("<!DOCTYPE html>"));
}

TEST(ReportFiles, KeepsThePermissionsOfAFormerPage) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"report.html", "former"}});
    const auto permissions = std::filesystem::perms::owner_read | std::filesystem::perms::owner_write;
    std::filesystem::permissions(place.path("report.html"), permissions);
    EXPECT_EQ(database.run({"report", "--file", place.path("report.html")}).status, 0);
    EXPECT_EQ(std::filesystem::status(place.path("report.html")).permissions(), permissions);
}

TEST(ReportFiles, StandardOutputByItsPath) {
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", ""}});
    ProcessOptions options = database.start({"report", "--file", "/dev/stdout"});
    EXPECT_EQ(runTool(options).output, database.run({"report", "--file", "-"}).output);
    options.outputPath = place.path("page.html");
    EXPECT_EQ(runTool(options).status, 0);
    EXPECT_EQ(textOf(place.path("page.html")), database.run({"report", "--file", "-"}).output);
}

TEST(ReportFiles, NamedPipe) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    ASSERT_EQ(::mkfifo(place.path("pipe").c_str(), 0600), 0);
    std::string read;
    std::thread reader([&] { read = textOf(place.path("pipe")); });
    EXPECT_EQ(database.run({"report", "--file", place.path("pipe")}).status, 0);
    reader.join();
    EXPECT_THAT(read, StartsWith("<!DOCTYPE html>"));
    EXPECT_TRUE(std::filesystem::is_fifo(place.path("pipe")));
}

TEST(ReportFiles, DanglingLinkLeadsToItsTarget) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    std::filesystem::create_symlink("other.html", place.path("second.html"));
    std::filesystem::create_symlink("second.html", place.path("first.html"));
    EXPECT_EQ(database.run({"report", "--file", place.path("first.html")}).status, 0);
    EXPECT_TRUE(std::filesystem::is_symlink(place.path("first.html")));
    EXPECT_TRUE(std::filesystem::is_symlink(place.path("second.html")));
    EXPECT_THAT(textOf(place.path("other.html")), StartsWith("<!DOCTYPE html>"));
    EXPECT_EQ(filesIn(place.path()), 3U);
}

TEST(ReportFiles, LinksInACircleAreAFault) {
    const SmallDatabase database;
    const DatabaseDirectory place;
    std::filesystem::create_symlink("b.html", place.path("a.html"));
    std::filesystem::create_symlink("a.html", place.path("b.html"));
    EXPECT_EQ(database.run({"report", "--file", place.path("a.html")}).status, 2);
    EXPECT_EQ(filesIn(place.path()), 2U);
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

// Only root can give a file to somebody else.
TEST(ReportFiles, OwnerStays) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root";
    }
    const SmallDatabase database;
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", "former"}});
    ASSERT_EQ(::chown(place.path("page.html").c_str(), 1, 1), 0);
    EXPECT_EQ(database.run({"report", "--file", place.path("page.html")}).status, 0);
    struct stat status {};
    ASSERT_EQ(::stat(place.path("page.html").c_str(), &status), 0);
    EXPECT_EQ(status.st_uid, 1U);
    EXPECT_EQ(status.st_gid, 1U);
    EXPECT_THAT(textOf(place.path("page.html")), StartsWith("<!DOCTYPE html>"));
}

TEST(ReportFiles, WritableFileInADirectoryThatIsNot) {
    const DatabaseDirectory place(DatabaseDirectory::Files{{"page.html", "former"}});
    // Root may write everywhere, so the test becomes somebody else for a moment.
    constexpr uid_t NOBODY = 65534;
    const bool isRoot = ::geteuid() == 0;
    if (isRoot) {
        ASSERT_EQ(::chown(place.path("page.html").c_str(), NOBODY, 0), 0);
    }
    ASSERT_EQ(::chmod(place.path().c_str(), 0555), 0);
    ASSERT_EQ(isRoot ? ::seteuid(NOBODY) : 0, 0);
    EXPECT_NO_THROW(writeFile(place.path("page.html"), "page"));
    EXPECT_THROW(writeFile(place.path("other.html"), "page"), CommandError);
    ASSERT_EQ(isRoot ? ::seteuid(0) : 0, 0);
    ASSERT_EQ(::chmod(place.path().c_str(), 0755), 0);
    EXPECT_EQ(textOf(place.path("page.html")), "page");
    EXPECT_EQ(filesIn(place.path()), 1U);
}

TEST(ReportFiles, NeedsAFile) { EXPECT_EQ(SmallDatabase().run({"report"}).status, 2); }

} // namespace
