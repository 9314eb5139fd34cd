#include "DatabaseFixtures.h"

#include "database/FileReading.h"

#include <cerrno>
#include <cstring>
#include <deque>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

// What the system may do while a file is read: interrupt, hand out little, fail, or show another size than before.

namespace {

/// What the next calls of the system's read do: give so many bytes, or fail with an error when negative.
std::deque<ssize_t>& script() {
    static std::deque<ssize_t> steps;
    return steps;
}

/// Reads for real, but no more than the script says; all there is once the script is over.
ssize_t scriptedRead(int descriptor, void* buffer, std::size_t size) {
    if (script().empty()) {
        return ::read(descriptor, buffer, size);
    }
    const ssize_t step = script().front();
    script().pop_front();
    if (step < 0) {
        errno = static_cast<int>(-step);
        return -1;
    }
    return ::read(descriptor, buffer, std::min(size, static_cast<std::size_t>(step)));
}

/// Nothing, unless the descriptor is closed in what the process starts, blocks nobody and can only be read.
ssize_t examiningRead(int descriptor, void*, std::size_t) {
    const int status = ::fcntl(descriptor, F_GETFL);
    const bool isAsWanted = (::fcntl(descriptor, F_GETFD) & FD_CLOEXEC) != 0 && (status & O_NONBLOCK) != 0 &&
                            (status & O_ACCMODE) == O_RDONLY;
    errno = EBADF;
    return isAsWanted ? 0 : -1;
}

/// A file without end; nothing is written, as nobody looks.
ssize_t endlessRead(int, void*, std::size_t size) { return static_cast<ssize_t>(size); }

std::string reasonOf(const std::function<void()>& action) {
    try {
        action();
    } catch (const acd::ReadError& unreadable) {
        return unreadable.what();
    }
    return "none";
}

TEST(Directories, OneThatWasRemovedSinceItWasOpenedIsEmpty) {
    // Not even "." is left in it, and what an earlier call failed with is none of its faults.
    const std::string path = testing::TempDir() + "tarvik_removed_" + std::to_string(getpid());
    ASSERT_EQ(::mkdir(path.c_str(), 0700), 0);
    const int descriptor = ::open(path.c_str(), O_RDONLY | O_DIRECTORY);
    ASSERT_NE(descriptor, -1);
    ASSERT_EQ(::rmdir(path.c_str()), 0);
    errno = EACCES;
    EXPECT_TRUE(acd::listDirectory("/proc/self/fd/" + std::to_string(descriptor)).empty());
    ::close(descriptor);
}

} // namespace

class FileReading : public testing::Test {
protected:
    FileReading() { directory.write("file", "0123456789"); }

    [[nodiscard]] std::string readAll(std::deque<ssize_t> steps) {
        script() = std::move(steps);
        acd::FileSource source(path, scriptedRead);
        const acd::Text text = acd::readAll(source);
        return {text.bytes.get(), text.size};
    }

    TemporaryDirectory directory;
    std::string path = directory.path("file");
};

TEST_F(FileReading, TakesShortReads) { EXPECT_EQ(readAll({1, 2, 3}), "0123456789"); }

TEST_F(FileReading, GoesOnAfterInterruptions) {
    EXPECT_EQ(readAll({-EINTR, 4, -EINTR, -EINTR, 4, -EINTR}), "0123456789");
}

TEST_F(FileReading, FailsWhenTheSystemFails) {
    EXPECT_EQ(reasonOf([&] { (void)readAll({4, -EIO}); }), "Input/output error");
}

TEST_F(FileReading, KeepsTheFileFromOtherProgramsAndBlocksNobody) {
    acd::FileSource source(path, examiningRead);
    char byte = 0;
    EXPECT_EQ(reasonOf([&] { EXPECT_EQ(source.read(&byte, 1), 0U); }), "none");
}

TEST_F(FileReading, ReadsNoMoreThanIsThereWhenTheFileShrinks) {
    acd::FileSource source(path);
    EXPECT_EQ(source.expectedSize(), 10U);
    std::filesystem::resize_file(path, 3);
    const acd::Text text = acd::readAll(source);
    EXPECT_EQ(std::string(text.bytes.get(), text.size), "012");
}

TEST_F(FileReading, ReadsAllWhenTheFileGrows) {
    acd::FileSource source(path);
    const std::string larger(100000, 'x');
    directory.write("file", larger);
    const acd::Text text = acd::readAll(source);
    EXPECT_EQ(std::string(text.bytes.get(), text.size), larger);
}

TEST_F(FileReading, ReadsAnEmptyFile) {
    directory.write("file", "");
    EXPECT_EQ(readAll({}), "");
}

TEST_F(FileReading, StopsWhenTheFileGrowsOverAGibibyte) {
    acd::FileSource source(path, endlessRead);
    char byte = 0;
    EXPECT_EQ(source.read(&byte, acd::MAX_FILE_SIZE), acd::MAX_FILE_SIZE);
    EXPECT_EQ(reasonOf([&] { (void)source.read(&byte, 1); }), "larger than 1 GiB");
}

TEST_F(FileReading, AcceptsAFileOfAGibibyte) {
    std::filesystem::resize_file(path, acd::MAX_FILE_SIZE);
    EXPECT_EQ(acd::FileSource(path).expectedSize(), acd::MAX_FILE_SIZE);
}

TEST_F(FileReading, RefusesAMissingFile) {
    EXPECT_EQ(reasonOf([&] { const acd::FileSource source(path + "s"); }), "No such file or directory");
}

TEST_F(FileReading, ReadsMemoryPortionByPortion) {
    acd::MemorySource source("abcde");
    char buffer[3];
    EXPECT_EQ(source.read(buffer, 3), 3U);
    EXPECT_EQ(source.read(buffer, 3), 2U);
    EXPECT_EQ(buffer[1], 'e');
    EXPECT_EQ(source.read(buffer, 3), 0U);
}

TEST_F(FileReading, AcceptsATextOfAGibibyte) {
    const char byte = 0;
    EXPECT_EQ(acd::MemorySource({&byte, acd::MAX_FILE_SIZE}).expectedSize(), acd::MAX_FILE_SIZE);
}

TEST_F(FileReading, RefusesATextOverAGibibyte) {
    const char byte = 0;
    EXPECT_EQ(reasonOf([&] {
                  const acd::MemorySource source({&byte, acd::MAX_FILE_SIZE + 1});
              }),
              "larger than 1 GiB");
}

TEST(FileStatus, DiffersIfOneFieldDoes) {
    const acd::FileStatus status{1, 2, 3, {4, 5}, {6, 7}};
    const acd::FileStatus same = status;
    EXPECT_TRUE(status == same);
    EXPECT_FALSE((status == acd::FileStatus{0, 2, 3, {4, 5}, {6, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 0, 3, {4, 5}, {6, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 2, 0, {4, 5}, {6, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 2, 3, {0, 5}, {6, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 2, 3, {4, 0}, {6, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 2, 3, {4, 5}, {0, 7}}));
    EXPECT_FALSE((status == acd::FileStatus{1, 2, 3, {4, 5}, {6, 0}}));
}

TEST(DirectoryStatus, AFileThatIsGoneHasNone) {
    const TemporaryDirectory directory;
    directory.write("a.acd", "KEY = a\n");
    const acd::DirectoryStatus status(directory.path());
    EXPECT_TRUE(status.ofReadableFile("a.acd").has_value());
    EXPECT_FALSE(status.ofReadableFile("b.acd").has_value());
}
