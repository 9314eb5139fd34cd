// What becomes of permissions and of links, and what happens on a full disk.
#include "DirectoryFiles.h"

#include "edit/FileWriter.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

#include <csignal>
#include <sys/resource.h>
#include <sys/stat.h>

using edit::writeAll;
using testing::HasSubstr;

namespace {

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

TEST(FileWriter, KeepsThePermissionsOfARenamedFile) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{{"b", "2"}});
    ASSERT_EQ(::chmod(directory.path("b").c_str(), 0640), 0);
    writeAll({{directory.path("d"), "renamed", directory.path("b")}});
    struct stat status {};
    ASSERT_EQ(::stat(directory.path("d").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0640U);
}

TEST(FileWriter, KeepsPermissionsAndLinks) {
    const DatabaseDirectory elsewhere(DatabaseDirectory::Files{{"real", "1"}});
    const DatabaseDirectory directory(DatabaseDirectory::Files{{"b", "2"}});
    std::filesystem::create_symlink(elsewhere.path("real"), directory.path("a"));
    ASSERT_EQ(::chmod(directory.path("b").c_str(), 0640), 0);
    writeAll({{directory.path("a"), "new"}, {directory.path("b"), "new"}});
    struct stat status {};
    ASSERT_EQ(::stat(directory.path("b").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777U, 0640U);
    EXPECT_TRUE(std::filesystem::is_symlink(directory.path("a")));
    EXPECT_EQ(textsIn(elsewhere), (DatabaseDirectory::Files{{"real", "new"}}));
    EXPECT_EQ(textsIn(directory), (DatabaseDirectory::Files{{"a", "new"}, {"b", "new"}}));
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
    EXPECT_EQ(textsIn(directory), files);
}
