#include "DatabaseFixtures.h"

#include "database/SearchPath.h"
#include "platform/Platform.h"

#include <AcdLines.h>

#include <array>
#include <cstdio>
#include <utility>

#include <dlfcn.h>
#include <sys/stat.h>
#include <unistd.h>

// Where databases are looked for.

using std::nullopt;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Optional;
using testing::SizeIs;
using namespace std::string_view_literals;

class SearchPaths : public DatabaseTest {
protected:
    SearchPaths() {
        unsetenv("TARVIK_DATABASE");
        directory.write("a/kestrel.acd", "KEY = a\n");
        directory.write("b/kestrel.acd", "KEY = b\nB = b\n");
    }

    TemporaryDirectory directory;
    std::string a = directory.path("a");
    std::string b = directory.path("b");
};

TEST_F(SearchPaths, AreWhatWasSet) {
    AcdStore::setSearchPath({a, "relative", ""});
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a, "relative", ""));
}

TEST_F(SearchPaths, ComeFromTheEnvironment) {
    setenv("TARVIK_DATABASE", (a + ":" + b).c_str(), 1);
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a, b));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "B"), Optional("b"sv));
}

TEST_F(SearchPaths, OfTheEnvironmentLeaveOutEmptyParts) {
    setenv("TARVIK_DATABASE", ("::" + a + "::" + b + ":").c_str(), 1);
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a, b));
}

TEST_F(SearchPaths, OfTheEnvironmentWithoutAnyPartDoNotCount) {
    const acd::SearchPath unset = acd::defaultSearchPath();
    setenv("TARVIK_DATABASE", "::", 1);
    EXPECT_EQ(acd::defaultSearchPath().directories, unset.directories);
    EXPECT_EQ(acd::defaultSearchPath().tried, unset.tried);
}

TEST_F(SearchPaths, OtherwiseComeFromWhereTheCodeStands) {
    // Here the code is part of the test program.
    const acd::SearchPath beside = acd::installedSearchPath(std::filesystem::read_symlink("/proc/self/exe"));
    EXPECT_THAT(beside.tried, SizeIs(2));
    EXPECT_EQ(acd::defaultSearchPath().directories, beside.directories);
    EXPECT_EQ(acd::defaultSearchPath().tried, beside.tried);
}

TEST_F(SearchPaths, ThatLeadNowhereAreNamed) {
    const std::vector<std::string> tried = acd::defaultSearchPath().tried;
    ASSERT_THAT(tried, SizeIs(2));
    EXPECT_THROW(AcdReader(), DataNotFoundException);
    EXPECT_THAT(messages.take(),
                ElementsAre(info(acd::location::BASE_MISSING, "no base.acd in " + tried[0] + ", " + tried[1] +
                                                                  ", and TARVIK_DATABASE is not set\n")));
}

TEST_F(SearchPaths, ThatWereSetGoBeforeTheEnvironment) {
    setenv("TARVIK_DATABASE", a.c_str(), 1);
    AcdStore::setSearchPath({b});
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(b));
}

TEST_F(SearchPaths, ThatWereSetEmptyStayEmpty) {
    setenv("TARVIK_DATABASE", a.c_str(), 1);
    AcdStore::setSearchPath({});
    EXPECT_THAT(AcdStore::searchPath(), IsEmpty());
    EXPECT_THAT(AcdStore::families(), IsEmpty());
}

TEST_F(SearchPaths, AreSettledOnce) {
    setenv("TARVIK_DATABASE", a.c_str(), 1);
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a));
    setenv("TARVIK_DATABASE", b.c_str(), 1);
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a));
}

TEST_F(SearchPaths, AreNoneForMemoryFiles) {
    setenv("TARVIK_DATABASE", a.c_str(), 1);
    AcdStore::setMemoryFiles({});
    EXPECT_THAT(AcdStore::searchPath(), IsEmpty());
    EXPECT_THAT(AcdStore::families(), IsEmpty());
}

TEST_F(SearchPaths, ReplaceMemoryFiles) {
    AcdStore::setMemoryFiles({{"merlin.acd", ""}});
    AcdStore::setSearchPath({a});
    EXPECT_THAT(AcdStore::families(), ElementsAre("kestrel"));
}

TEST_F(SearchPaths, AreReplacedByMemoryFiles) {
    AcdStore::setSearchPath({a});
    AcdStore::setMemoryFiles({{"merlin.acd", ""}});
    EXPECT_THAT(AcdStore::families(), ElementsAre("merlin"));
}

TEST_F(SearchPaths, SetAfterTheFirstReaderAreIgnoredWithAMessage) {
    AcdStore::setSearchPath({a});
    PM_DEVKEY& accessor = *AcdReader("kestrel").getDevkey();
    AcdStore::setSearchPath({b});
    EXPECT_THAT(messages.take(),
                ElementsAre(info(acd::location::SET_TOO_LATE,
                                 "the search path can't be set after databases were looked for: ignored\n")));
    AcdStore::setMemoryFiles({});
    EXPECT_THAT(
        messages.take(),
        ElementsAre(info(acd::location::SET_TOO_LATE,
                         "the files in memory can't be set after databases were looked for: ignored\n")));
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 0, nullptr, 0), "a");
}

TEST_F(SearchPaths, AreSettledByEveryWayToLookForADatabase) {
    const std::vector<std::pair<const char*, void (*)()>> ways = {
        {"AcdReader()", [] { EXPECT_THROW(AcdReader(), DataNotFoundException); }},
        {"AcdReader(name)", [] { AcdReader("nothing"); }},
        {"PicConfig", [] { PicConfig("nothing", 1, PM_PARTNAME_BINDING::BY_NAME); }},
        {"families", [] { static_cast<void>(AcdStore::families()); }},
        {"devices", [] { static_cast<void>(AcdStore::devices("nothing")); }},
        {"value", [] { static_cast<void>(AcdStore::value("nothing", "KEY")); }},
        {"lines", [] { static_cast<void>(AcdLines::ofDatabase()); }},
    };
    for (const auto& [name, look] : ways) {
        acd::Store::resetForTesting();
        AcdStore::setSearchPath({directory.path()});
        look();
        static_cast<void>(messages.take());
        AcdStore::setSearchPath({b});
        EXPECT_THAT(AcdStore::searchPath(), ElementsAre(directory.path())) << name;
        EXPECT_THAT(messages.take(), SizeIs(1)) << name;
    }
}

TEST_F(SearchPaths, CanBeSetAgainBeforeTheFirstReader) {
    AcdStore::setSearchPath({a});
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(a));
    AcdStore::setSearchPath({b});
    EXPECT_THAT(AcdStore::searchPath(), ElementsAre(b));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(SearchPaths, AreForgottenWithAllThatWasRead) {
    AcdStore::setSearchPath({a});
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    directory.write("a/kestrel.acd", "KEY = c\n");
    setenv("TARVIK_DATABASE", a.c_str(), 1);
    acd::Store::resetForTesting();
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("c"sv));
}

// Memory files

TEST_F(SearchPaths, MemoryFilesCountByTheirEnding) {
    AcdStore::setMemoryFiles({{"a.acd", ""}, {"b.txt", ""}, {".acd", ""}, {"C.ACD", ""}});
    EXPECT_THAT(AcdStore::families(), ElementsAre("C", "a"));
}

TEST_F(SearchPaths, OfTwoMemoryFilesThatDifferInCaseTheFirstInByteOrderCounts) {
    AcdStore::setMemoryFiles({{"a.acd", "KEY = a\n"}, {"A.acd", "KEY = A\n"}});
    EXPECT_THAT(valueOf("a", "KEY"), Optional("A"sv));
}

// The installed database

class InstalledDatabases : public DatabaseTest {
protected:
    void install(const std::string& place) {
        directory.write(place + "/share/tarvik/database/base.acd", "KEY = installed\n");
    }
    [[nodiscard]] acd::SearchPath from(const std::string& library) {
        directory.write(library, "");
        return acd::installedSearchPath(directory.path(library));
    }

    TemporaryDirectory directory;
};

TEST_F(InstalledDatabases, StandBesideTheLibrarysDirectory) {
    install("usr");
    EXPECT_THAT(from("usr/lib/libTarvikHost.so").directories,
                ElementsAre(directory.path("usr/share/tarvik/database")));
}

TEST_F(InstalledDatabases, StandOneLevelFurtherUpForAnArchitecturesLibrary) {
    install("usr");
    EXPECT_THAT(from("usr/lib/x86_64-linux-gnu/libTarvikHost.so").directories,
                ElementsAre(directory.path("usr/share/tarvik/database")));
}

TEST_F(InstalledDatabases, AreTheNearestOfTwo) {
    install("");
    install("usr");
    EXPECT_THAT(from("usr/lib/libTarvikHost.so").directories,
                ElementsAre(directory.path("usr/share/tarvik/database")));
}

TEST_F(InstalledDatabases, ThatAreMissingLeaveThePlacesTried) {
    const acd::SearchPath path = from("usr/lib/libTarvikHost.so");
    EXPECT_THAT(path.directories, IsEmpty());
    EXPECT_THAT(path.tried, ElementsAre(directory.path("usr/share/tarvik/database"),
                                        directory.path("share/tarvik/database")));
}

TEST_F(InstalledDatabases, AreDirectories) {
    directory.write("usr/share/tarvik/database", "");
    EXPECT_THAT(from("usr/lib/libTarvikHost.so").directories, IsEmpty());
}

TEST_F(InstalledDatabases, AreNotLookedForBesideABareName) {
    const acd::SearchPath path = acd::installedSearchPath("libTarvikHost.so");
    EXPECT_THAT(path.directories, IsEmpty());
    EXPECT_THAT(path.tried, IsEmpty());
}

// The library itself, from another process: it must look around its own file, not around the program's.

namespace {

enum class Loader { AS_IT_IS, UNKNOWING, NAMELESS, BARE_NAME };

/// What the loader makes of the question which file this code is from.
Loader& loader() {
    static Loader loader = Loader::AS_IT_IS;
    return loader;
}

} // namespace

extern "C" {

// The names that the linker gives (--wrap).
// NOLINTBEGIN(bugprone-reserved-identifier)

int __real_dladdr(const void* address, Dl_info* information);

int __wrap_dladdr(const void* address, Dl_info* information) {
    if (loader() == Loader::UNKNOWING) {
        return 0;
    }
    const int result = __real_dladdr(address, information);
    if (loader() == Loader::NAMELESS) {
        information->dli_fname = nullptr;
    } else if (loader() == Loader::BARE_NAME) {
        information->dli_fname = "program";
    }
    return result;
}

// NOLINTEND(bugprone-reserved-identifier)

} // extern "C"

TEST_F(SearchPaths, AreEmptyWhereTheLoaderCannotTellTheLibrarysPlace) {
    for (const Loader answer : {Loader::UNKNOWING, Loader::NAMELESS}) {
        loader() = answer;
        EXPECT_EQ(acd::platform::findOwnFile(), "");
    }
    loader() = Loader::AS_IT_IS;
    EXPECT_NE(acd::platform::findOwnFile(), "");
    EXPECT_THAT(acd::installedSearchPath("").directories, IsEmpty());
    EXPECT_THAT(acd::installedSearchPath("").tried, IsEmpty());
}

TEST_F(SearchPaths, ComeFromTheProgramWhereTheLoaderNamesItAsItWasTyped) {
    loader() = Loader::BARE_NAME;
    EXPECT_EQ(acd::platform::findOwnFile(), std::filesystem::read_symlink("/proc/self/exe").string());
    loader() = Loader::AS_IT_IS;
}

class Processes : public InstalledDatabases {
protected:
    /// What the program that prints its search path prints.
    [[nodiscard]] static std::string run(const std::string& command) {
        std::string output;
        std::FILE* const pipe = popen(command.c_str(), "r");
        if (pipe != nullptr) {
            std::array<char, 4096> buffer{};
            output.assign(buffer.data(), std::fread(buffer.data(), 1, buffer.size(), pipe));
            pclose(pipe);
        }
        return output;
    }

    /// Puts the library where the test wants it to be loaded from.
    void placeLibrary(const std::string& place) {
        std::filesystem::create_directories(directory.path(place));
        std::filesystem::copy_file(TARVIK_HOST_LIBRARY, directory.path(place + "/" TARVIK_HOST_SONAME));
    }

    std::string program = TARVIK_SEARCH_PATH_PROGRAM;
};

TEST_F(Processes, FindTheDatabaseInstalledWithTheLibrary) {
    install("usr");
    placeLibrary("usr/lib");
    EXPECT_EQ(run("env -u TARVIK_DATABASE LD_LIBRARY_PATH=" + directory.path("usr/lib") + " " + program),
              directory.path("usr/share/tarvik/database") + "\n");
}

TEST_F(Processes, FindItFromARelativeLibraryPathAfterTheyChangedTheirDirectory) {
    install("usr");
    placeLibrary("usr/lib");
    EXPECT_EQ(run("cd " + directory.path("usr") + " && env -u TARVIK_DATABASE LD_LIBRARY_PATH=lib " +
                  program + " elsewhere"),
              directory.path("usr/share/tarvik/database") + "\n");
}

TEST_F(Processes, LinkedStaticallyFindItWhenTheyAreStartedThroughThePath) {
    install("usr");
    std::filesystem::create_directories(directory.path("usr/bin"));
    std::filesystem::copy_file(TARVIK_STATIC_SEARCH_PATH_PROGRAM, directory.path("usr/bin/search-path"));
    for (const char* const wish : {"", " elsewhere"}) {
        EXPECT_EQ(run("env -u TARVIK_DATABASE PATH=" + directory.path("usr/bin") + " search-path" + wish),
                  directory.path("usr/share/tarvik/database") + "\n");
        EXPECT_EQ(run("cd " + directory.path("usr") + " && env -u TARVIK_DATABASE bin/search-path" + wish),
                  directory.path("usr/share/tarvik/database") + "\n");
    }
}

TEST_F(Processes, PreferTheEnvironment) {
    install("usr");
    placeLibrary("usr/lib");
    EXPECT_EQ(run("env TARVIK_DATABASE=/x:/y LD_LIBRARY_PATH=" + directory.path("usr/lib") + " " + program),
              "/x\n/y\n");
}

TEST_F(Processes, WithoutAnyDatabaseSayWhereTheyLooked) {
    placeLibrary("usr/lib");
    EXPECT_EQ(run("env -u TARVIK_DATABASE LD_LIBRARY_PATH=" + directory.path("usr/lib") + " " + program +
                  " open 2>&1"),
              "no base.acd in " + directory.path("usr/share/tarvik/database") + ", " +
                  directory.path("share/tarvik/database") + ", and TARVIK_DATABASE is not set\n");
}

TEST_F(Processes, WithMoreRightsThanTheirUserIgnoreTheEnvironment) {
    if (geteuid() != 0) {
        GTEST_SKIP() << "only the administrator can give a program another user";
    }
    constexpr uid_t NOBODY = 65534;
    const std::string copy = directory.path("program");
    std::filesystem::copy_file(program, copy);
    ASSERT_EQ(chmod(directory.path().c_str(), 0755), 0);
    ASSERT_EQ(chown(copy.c_str(), NOBODY, NOBODY), 0);
    ASSERT_EQ(chmod(copy.c_str(), 04755), 0);
    // A leak checker can't look into such a process, and would say so.
    const std::string rights = run(copy + " user 2>/dev/null");
    if (rights != "65534\n") {
        GTEST_SKIP() << "programs can't change their user here: " << rights;
    }
    EXPECT_EQ(run("env TARVIK_DATABASE=/x " + copy + " 2>/dev/null"), "");
}
