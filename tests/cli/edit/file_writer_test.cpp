// Several files are written together, or none of them.
#include "cli/support/DatabaseDirectory.h"

#include "edit/FileWriter.h"
#include "edit/SourceFile.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

#include <csignal>
#include <sys/resource.h>
#include <sys/stat.h>

using edit::Rewrite;
using edit::writeAll;
using testing::HasSubstr;

namespace {

/// The names and texts of a directory's files.
DatabaseDirectory::Files read(const DatabaseDirectory& directory) {
    DatabaseDirectory::Files files;
    for (const auto& entry : std::filesystem::directory_iterator(directory.path())) {
        files[entry.path().filename()] = edit::readFile(entry.path());
    }
    return files;
}

/// Files of this process cannot grow beyond a size, as on a full disk.
class FullDisk {
public:
    explicit FullDisk(rlim_t size) : m_action(std::signal(SIGXFSZ, SIG_IGN)) {
        ::getrlimit(RLIMIT_FSIZE, &m_former);
        const rlimit limit{size, m_former.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FullDisk() {
        ::setrlimit(RLIMIT_FSIZE, &m_former);
        std::signal(SIGXFSZ, m_action);
    }
    FullDisk(const FullDisk&) = delete;
    FullDisk& operator=(const FullDisk&) = delete;

private:
    rlimit m_former{};
    void (*m_action)(int);
};

} // namespace

TEST(FileWriter, WritesCreatesRenamesAndRemoves) {
    const DatabaseDirectory directory({{"a", "1"}, {"b", "2"}, {"c", "3"}});
    ASSERT_EQ(::chmod(directory.path("b").c_str(), 0640), 0);
    writeAll({{directory.path("a"), "new"},
              {directory.path("d"), "renamed", directory.path("b")},
              {directory.path("c"), std::nullopt},
              {directory.path("e"), "created"}});
    EXPECT_EQ(read(directory), (DatabaseDirectory::Files{{"a", "new"}, {"d", "renamed"}, {"e", "created"}}));
    struct stat status {};
    ASSERT_EQ(::stat(directory.path("d").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0640U);
}

TEST(FileWriter, PutsAllBackWhenOneFails) {
    const DatabaseDirectory::Files files{{"a", "1"}, {"b", "2"}, {"c", "3"}};
    const DatabaseDirectory directory(files);
    EXPECT_THROW(writeAll({{directory.path("a"), "new"},
                           {directory.path("d"), "renamed", directory.path("b")},
                           {directory.path("c"), std::nullopt},
                           {directory.path("e"), "created"},
                           {directory.path("nowhere/f"), "created"}}),
                 CommandError);
    EXPECT_EQ(read(directory), files);
}

TEST(FileWriter, PutsAllBackOnAFullDisk) {
    const DatabaseDirectory::Files files{{"a", "1"}, {"b", "2"}};
    const DatabaseDirectory directory(files);
    const std::string large(100'000, 'x');
    {
        const FullDisk full(1000);
        try {
            writeAll({{directory.path("a"), "new"},
                      {directory.path("c"), "renamed", directory.path("b")},
                      {directory.path("d"), large}});
            ADD_FAILURE() << "nothing is thrown";
        } catch (const CommandError& fault) {
            EXPECT_THAT(fault.what(), HasSubstr("File too large"));
        }
    }
    EXPECT_EQ(read(directory), files);
}

TEST(FileWriter, NeverReplacesAFileByARenamedOne) {
    const DatabaseDirectory::Files files{{"a", "1"}, {"b", "2"}};
    const DatabaseDirectory directory(files);
    EXPECT_THROW(writeAll({{directory.path("b"), "1", directory.path("a")}}), CommandError);
    EXPECT_EQ(read(directory), files);
}
