// An index that can't be made is not made: the message names it, and the former one stays.
#include "VirtualTime.h"

#include "cli/support/DatabaseDirectory.h"

#include "commands/IndexWriter.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

#include <cerrno>
#include <cstring>
#include <iterator>

#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class IndexFailures : public testing::Test {
protected:
    IndexFailures() { virtualTime::reset(); }
    ~IndexFailures() override { virtualTime::stopInterrupting(); }

    /// What the tool says when the index can't be made; empty if it can.
    [[nodiscard]] std::string failure() const {
        try {
            (void)writeIndex(m_directory.path());
        } catch (const CommandError& error) {
            EXPECT_EQ(error.status(), ExitCode::FAULT);
            return error.what();
        }
        return {};
    }

    [[nodiscard]] std::string cannotWrite(int error) const {
        return "can't write \"" + m_directory.path("index.acx") + "\": " + std::strerror(error);
    }

    [[nodiscard]] std::string index() const {
        std::ifstream file(m_directory.path("index.acx"), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    }

    [[nodiscard]] std::vector<std::string> files() const {
        std::vector<std::string> names;
        for (const auto& entry : std::filesystem::directory_iterator(m_directory.path())) {
            names.push_back(entry.path().filename());
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    DatabaseDirectory m_directory{{{"base.acd", ""}, {"kestrel.acd", "[KS50]\n"}}};
};

TEST_F(IndexFailures, OfTheSystemAreReportedAndLeaveNothing) {
    int calls = 0;
    for (bool isOver = false; !isOver; ++calls) {
        ASSERT_LT(calls, 100);
        virtualTime::interrupt(calls + 1, [] { return ENOSPC; });
        const std::string said = failure();
        isOver = virtualTime::stopInterrupting();
        EXPECT_EQ(said.empty(), isOver) << "call " << calls + 1;
        if (!isOver) {
            EXPECT_THAT(said, testing::EndsWith("No space left on device")) << "call " << calls + 1;
            EXPECT_THAT(files(), ElementsAre("base.acd", "kestrel.acd")) << "call " << calls + 1;
        }
    }
    EXPECT_GT(calls, 8);
    EXPECT_THAT(files(), ElementsAre("base.acd", "index.acx", "kestrel.acd"));
}

TEST_F(IndexFailures, LeaveTheFormerIndex) {
    ASSERT_EQ(failure(), "");
    const std::string former = index();
    std::ofstream(m_directory.path("kestrel.acd")) << "[KS100]\n";
    for (int call = 1;; ++call) {
        virtualTime::interrupt(call, [] { return EROFS; });
        if (failure().empty()) {
            break;
        }
        EXPECT_EQ(index(), former) << "call " << call;
        EXPECT_THAT(files(), ElementsAre("base.acd", "index.acx", "kestrel.acd"));
    }
    EXPECT_NE(index(), former);
}

TEST_F(IndexFailures, OfRunsThatWereKilledAreCleanedUpLater) {
    constexpr std::int64_t SECOND = 1'000'000'000;
    const std::vector<std::string> others{".index.acx", ".kestrel.acd.x", ".tarvik", "index.acx.a1b2c3"};
    for (const std::string& name : others) {
        virtualTime::write(m_directory.path(name), "");
    }
    virtualTime::write(m_directory.path(".index.acx.a1b2c3"), "");
    virtualTime::write(m_directory.path(".tarvik.a1b2c3"), "half an ind");
    std::filesystem::create_directory(m_directory.path(".tarvik.direct"));
    std::filesystem::create_symlink("gone", m_directory.path(".tarvik.nolink"));
    virtualTime::advance(598 * SECOND);
    virtualTime::write(m_directory.path(".tarvik.d4e5f6"), "");
    virtualTime::advance(SECOND);

    std::vector<std::string> expected{"base.acd",          "index.acx",      "kestrel.acd",
                                      ".index.acx.a1b2c3", ".tarvik.a1b2c3", ".tarvik.d4e5f6",
                                      ".tarvik.direct",    ".tarvik.nolink"};
    expected.insert(expected.end(), others.begin(), others.end());
    EXPECT_EQ(failure(), "");
    EXPECT_THAT(files(), testing::UnorderedElementsAreArray(expected));

    virtualTime::advance(2 * SECOND);
    std::erase(expected, ".index.acx.a1b2c3");
    std::erase(expected, ".tarvik.a1b2c3");
    EXPECT_EQ(failure(), "");
    EXPECT_THAT(files(), testing::UnorderedElementsAreArray(expected));
}

TEST_F(IndexFailures, OfAFileThatMayNotGrow) {
    ASSERT_EQ(failure(), "");
    const std::string former = index();
    rlimit limit{};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &limit), 0);
    const auto handler = ::signal(SIGXFSZ, SIG_IGN);
    const rlimit small{former.size() / 2, limit.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &small), 0);
    const std::string said = failure();
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &limit), 0);
    ::signal(SIGXFSZ, handler);
    EXPECT_EQ(said, cannotWrite(EFBIG));
    EXPECT_EQ(index(), former);
    EXPECT_THAT(files(), ElementsAre("base.acd", "index.acx", "kestrel.acd"));
}

TEST_F(IndexFailures, OfADirectoryWithoutPermission) {
    ::chmod(m_directory.path().c_str(), 0555);
    constexpr uid_t NOBODY = 65534;
    const bool isSuperuser = ::geteuid() == 0;
    ASSERT_TRUE(!isSuperuser || ::seteuid(NOBODY) == 0);
    const std::string said = failure();
    ASSERT_TRUE(!isSuperuser || ::seteuid(0) == 0);
    EXPECT_EQ(said, cannotWrite(EACCES));
    EXPECT_THAT(files(), ElementsAre("base.acd", "kestrel.acd"));
    ::chmod(m_directory.path().c_str(), 0755);
}

TEST_F(IndexFailures, OfAFileThatCannotBeRead) {
    std::filesystem::create_directory(m_directory.path("merlin.acd"));
    EXPECT_EQ(failure(), "can't read \"" + m_directory.path() + "\": merlin.acd: not a regular file");
    EXPECT_THAT(files(), ElementsAre("base.acd", "kestrel.acd", "merlin.acd"));
}

TEST_F(IndexFailures, OfADirectoryWithoutADatabase) {
    EXPECT_THAT(failure(), IsEmpty());
    std::filesystem::remove(m_directory.path("base.acd"));
    std::filesystem::remove(m_directory.path("kestrel.acd"));
    EXPECT_EQ(failure(), "no .acd file in \"" + m_directory.path() + "\"");
    std::filesystem::remove(m_directory.path("index.acx"));
    std::filesystem::remove(m_directory.path());
    EXPECT_EQ(failure(), "can't read \"" + m_directory.path() + "\": No such file or directory");
}

} // namespace
