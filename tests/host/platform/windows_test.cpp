#include "../database/DatabaseFixtures.h"

#include "database/FileNames.h"
#include "database/FileReading.h"
#include "database/SearchPath.h"
#include "platform/Platform.h"

#include <windows.h>

// What only Windows has: drives, two separators, devices in every directory, and locks on open files.

namespace {

using testing::Contains;
using testing::ElementsAre;

std::string reasonOf(const std::string& path) {
    try {
        const acd::FileSource source(path);
    } catch (const acd::ReadError& unreadable) {
        return unreadable.what();
    }
    return "none";
}

std::string contentOf(const std::string& path) {
    acd::FileSource source(path);
    const acd::Text text = acd::readAll(source);
    return {text.bytes.get(), text.size};
}

TEST(WindowsPaths, ThatNameADriveOrARootAreAbsolute) {
    for (const char* const path : {"C:/a", "c:\\a", "C:", "\\\\server\\share", "/a", "\\a"}) {
        EXPECT_TRUE(acd::platform::isAbsolute(path)) << path;
    }
    for (const char* const path : {"", "a", "a/b", "..\\a", ".", "C"}) {
        EXPECT_FALSE(acd::platform::isAbsolute(path)) << path;
    }
}

TEST(WindowsPaths, HaveTwoSeparators) {
    EXPECT_EQ(acd::fileNameOf("C:\\a\\b.acd"), "b.acd");
    EXPECT_EQ(acd::fileNameOf("C:\\a/b.acd"), "b.acd");
    EXPECT_EQ(acd::directoryOf("a\\b/c.acd"), "a\\b");
    EXPECT_EQ(acd::joinPath("a\\", "b"), "a\\b");
    EXPECT_EQ(acd::joinPath("a", "b"), "a/b");
}

TEST(WindowsPaths, AreSeparatedBySemicolons) {
    EXPECT_THAT(acd::splitDirectories("C:\\a;;D:/b;"), ElementsAre("C:\\a", "D:/b"));
}

TEST(WindowsEnvironment, IsUtf8AndThatOfTheSystem) {
    ASSERT_NE(::SetEnvironmentVariableW(L"TARVIK_TEST", L"\u00e4\u20ac"), 0);
    EXPECT_EQ(acd::platform::trustedVariable("TARVIK_TEST"), "\xC3\xA4\xE2\x82\xAC");
    ASSERT_NE(::SetEnvironmentVariableW(L"TARVIK_TEST", std::wstring(5000, L'x').c_str()), 0);
    EXPECT_EQ(acd::platform::trustedVariable("TARVIK_TEST"), std::string(5000, 'x'));
    ASSERT_NE(::SetEnvironmentVariableW(L"TARVIK_TEST", nullptr), 0);
    EXPECT_EQ(acd::platform::trustedVariable("TARVIK_TEST"), std::nullopt);
}

TEST(WindowsProgram, KnowsItsFile) {
    const std::string file = acd::platform::findOwnFile();
    EXPECT_TRUE(acd::platform::isAbsolute(file));
    EXPECT_THAT(acd::listDirectory(acd::fromPath(acd::toPath(file).parent_path())),
                Contains(std::string(acd::fileNameOf(file))));
}

class WindowsFiles : public testing::Test {
protected:
    TemporaryDirectory directory;
};

TEST_F(WindowsFiles, AreReadAsBytes) {
    directory.write("a.acd", "a\r\n\x1A z\n");
    EXPECT_EQ(contentOf(directory.path("a.acd")), "a\r\n\x1A z\n");
}

TEST_F(WindowsFiles, HaveNamesInUtf8) {
    const std::string name = "\xC3\xA4\xE2\x82\xAC.acd";
    const std::string path = directory.path() + "/" + name;
    std::ofstream(acd::toPath(path)) << "text";
    EXPECT_THAT(acd::listDirectory(directory.path()), Contains(name));
    EXPECT_EQ(contentOf(path), "text");
    EXPECT_TRUE(acd::DirectoryStatus(directory.path()).ofReadableFile(name).has_value());
}

TEST_F(WindowsFiles, CanBeRemovedAndReplacedWhileTheyAreRead) {
    directory.write("a.acd", "old");
    directory.write("b.acd", "new");
    acd::FileSource source(directory.path("a.acd"));
    ASSERT_NE(::MoveFileExW(acd::toPath(directory.path("a.acd")).c_str(),
                            acd::toPath(directory.path("c.acd")).c_str(), 0),
              0);
    EXPECT_NE(::DeleteFileW(acd::toPath(directory.path("c.acd")).c_str()), 0);
    const acd::Text text = acd::readAll(source);
    EXPECT_EQ(std::string(text.bytes.get(), text.size), "old");
}

TEST_F(WindowsFiles, ThatAreWrittenByOthersCanBeRead) {
    directory.write("a.acd", "text");
    std::ofstream writer(directory.path("a.acd"), std::ios::app);
    EXPECT_EQ(contentOf(directory.path("a.acd")), "text");
}

TEST_F(WindowsFiles, AreNoDevices) {
    for (const char* const name : {"NUL", "con", "COM1.acd", "aux.acd", "lpt1"}) {
        EXPECT_NE(reasonOf(name), "none") << name;
        EXPECT_NE(reasonOf(directory.path() + "/" + name), "none") << name;
        EXPECT_FALSE(acd::DirectoryStatus(directory.path()).ofReadableFile(name).has_value()) << name;
    }
}

TEST_F(WindowsFiles, AreNoDirectories) { EXPECT_EQ(reasonOf(directory.path()), "not a regular file"); }

TEST_F(WindowsFiles, ThatAreMissingFail) {
    EXPECT_EQ(reasonOf(directory.path("missing.acd")), "No such file or directory");
}

TEST_F(WindowsFiles, ThatAreNamedInNoUtf8Fail) {
    EXPECT_NE(reasonOf(directory.path() + "/\xFF.acd"), "none");
}

TEST_F(WindowsFiles, ShowEachChangeInTheirStatus) {
    directory.write("a.acd", "text");
    const acd::DirectoryStatus status(directory.path());
    const std::optional<acd::FileStatus> before = status.ofReadableFile("a.acd");
    ASSERT_TRUE(before.has_value());
    EXPECT_EQ(acd::FileSource(directory.path("a.acd")).status(), *before);
    EXPECT_EQ(before->size, 4U);
    directory.write("a.acd", "texts");
    EXPECT_FALSE(status.ofReadableFile("a.acd") == before);
}

TEST_F(WindowsFiles, AreListedInADirectoryOnly) {
    directory.write("a.acd", "");
    const auto failureOf = [](const std::string& path) -> std::string {
        try {
            return std::to_string(acd::listDirectory(path).size());
        } catch (const acd::ReadError& unreadable) {
            return unreadable.what();
        }
    };
    EXPECT_EQ(failureOf(""), "No such file or directory");
    EXPECT_EQ(failureOf(directory.path("missing")), "No such file or directory");
    EXPECT_EQ(failureOf(directory.path("a.acd")), "Not a directory");
}

} // namespace
