// Reports in links, pipes and devices, and in files of other owners.
#include "ReportFiles.h"
#include "cli/support/SmallDatabase.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

#include <sys/stat.h>
#include <thread>
#include <unistd.h>

namespace {

using testing::HasSubstr;
using testing::StartsWith;

TEST(ReportFiles, AFullDeviceIsAFault) {
    const SmallDatabase database;
    const ProcessResult outcome = database.run({"report", "--file", "/dev/full"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("No space left on device"));
    EXPECT_TRUE(std::filesystem::is_character_file("/dev/full"));
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

} // namespace
