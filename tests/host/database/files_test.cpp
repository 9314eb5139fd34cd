#include "DatabaseFixtures.h"

#include "support/Sanitizers.h"

#include <algorithm>

#include <sys/resource.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

// Databases on disk: which directory entries count, and what becomes of those that can't be read.

using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_view_literals;

namespace {

constexpr int BASE_MISSING = 101;
constexpr int FILE_UNREADABLE = 102;
constexpr int DIRECTORY_UNREADABLE = 103;

} // namespace

class Files : public DatabaseTest {
protected:
    Files() { useDirectories({directory.path()}); }

    void write(const std::string& name, std::string_view text) { directory.write(name, text); }

    [[nodiscard]] IssuedMessage unreadable(const std::string& name, const std::string& reason) {
        return info(FILE_UNREADABLE, directory.path(name) + ": can't be read: " + reason + "\n");
    }

    /// Expects that the family can't be opened by name, whichever way, and that the scan for a device of another
    /// family passes over it, with one report for all that.
    void expectUnreadable(const std::string& file, const std::string& reason) {
        write("zz.acd", "[Z]\nKEY = z\n");
        EXPECT_THAT(AcdStore::families(), testing::Contains("bad"));
        EXPECT_THROW(AcdReader("bad"), DataNotFoundException);
        EXPECT_THAT(messages.take(), ElementsAre(unreadable(file, reason)));

        EXPECT_THROW(AcdReader("BAD.acd"), DataNotFoundException);
        EXPECT_THROW((void)AcdStore::devices("bad"), DataNotFoundException);
        EXPECT_THROW((void)AcdStore::value("bad", "KEY"), DataNotFoundException);
        const PicConfig configuration("bad", 1, PM_PARTNAME_BINDING::BY_NAME);
        EXPECT_STREQ(configuration.get_pm(), "bad");
        EXPECT_THROW(PM_DEVKEY("bad.acd", configuration, 1, 1, 1), DataNotFoundException);
        EXPECT_THAT(valueOf("Z", "KEY"), Optional("z"sv));
        EXPECT_THAT(messages.take(), IsEmpty());

        acd::Store::resetForTesting();
        useDirectories({directory.path()});
        EXPECT_THAT(valueOf("Z", "KEY"), Optional("z"sv));
        EXPECT_THAT(messages.take(), ElementsAre(unreadable(file, reason)));
        EXPECT_THROW(AcdReader("bad"), DataNotFoundException);
        EXPECT_THAT(messages.take(), IsEmpty());
    }

    TemporaryDirectory directory;
};

TEST_F(Files, WhoseNamesBeginWithADotAreIgnored) {
    directory.write("kestrel.acd", "KEY = a\n");
    directory.write(".kestrel.acd", "KEY = hidden\n[KS50]\n");
    directory.write(".#merlin.acd", "");
    std::filesystem::create_symlink("nowhere", directory.path(".osprey.acd"));
    EXPECT_THAT(AcdStore::families(), ElementsAre("kestrel"));
    EXPECT_EQ(familyOf("KS50"), nullopt);
    EXPECT_EQ(familyOf(".kestrel.acd"), nullopt);
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Files, AreRead) {
    write("base.acd", "KEY = a\n");
    EXPECT_STREQ(AcdReader().getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0), "a");
    EXPECT_STREQ(AcdReader().getPM(), "base");
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Files, CountByTheirEndingInAnyCase) {
    write("a.acd", "");
    write("B.ACD", "");
    write("c.aCd", "");
    write("d.acd~", "");
    write("e.txt", "");
    write(".acd", "");
    write(".f.acd", "");
    write("gacd", "");
    EXPECT_THAT(AcdStore::families(), ElementsAre("B", "a", "c"));
}

TEST_F(Files, OfTwoThatDifferInCaseTheFirstInByteOrderCounts) {
    write("kestrel.acd", "KEY = a\n[A]\n");
    write("Kestrel.acd", "KEY = b\n[B]\n");
    write("KESTREL.acd", "KEY = c\n[C]\n");
    EXPECT_THAT(AcdStore::families(), ElementsAre("KESTREL"));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("c"sv));
    EXPECT_EQ(familyOf("A"), nullopt);
    EXPECT_THAT(familyOf("C"), Optional("KESTREL"sv));
}

TEST_F(Files, MayBeLinks) {
    write("elsewhere/kestrel.txt", "KEY = a\n");
    std::filesystem::create_symlink(directory.path("elsewhere/kestrel.txt"), directory.path("kestrel.acd"));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
}

TEST_F(Files, InDirectoriesBelowDoNotCount) {
    write("below/kestrel.acd", "KEY = a\n");
    EXPECT_THAT(AcdStore::families(), IsEmpty());
}

TEST_F(Files, AreFoundByNameNotByPath) {
    write("database/kestrel.acd", "KEY = a\n");
    write("x.acd", "KEY = b\n");
    useDirectories({directory.path("database")});
    for (const std::string& name : {std::string("../x"), std::string("../x.acd"), directory.path("x"),
                                    directory.path("x.acd"), std::string("./kestrel")}) {
        EXPECT_EQ(familyOf(name.c_str()), nullopt) << name;
    }
}

TEST_F(Files, OfAFamilyAreReadOnce) {
    write("kestrel.acd", "KEY = a\n");
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    write("kestrel.acd", "KEY = b\n");
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
}

TEST_F(Files, ThatShrinkAfterwardsDoNoHarm) {
    write("kestrel.acd", "KEY = " + std::string(100000, 'a') + "\n");
    PM_DEVKEY& accessor = *AcdReader("kestrel").getDevkey();
    std::filesystem::resize_file(directory.path("kestrel.acd"), 0);
    EXPECT_EQ(accessor.getstringbykey("KEY", nullptr, 0, nullptr, 0), std::string(100000, 'a'));
}

TEST_F(Files, ThatAreNotAskedForStayClosed) {
    write("kestrel.acd", "broken\n");
    write("merlin.acd", "KEY = a\n");
    EXPECT_THAT(valueOf("merlin", "KEY"), Optional("a"sv));
    EXPECT_THAT(familyOf("kestrel"), Optional("kestrel"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Files, ThatVanishedAreUnreadable) {
    write("kestrel.acd", "");
    EXPECT_THAT(AcdStore::families(), ElementsAre("kestrel"));
    std::filesystem::remove(directory.path("kestrel.acd"));
    EXPECT_THROW(AcdReader("kestrel"), DataNotFoundException);
    EXPECT_THAT(messages.take(), ElementsAre(unreadable("kestrel.acd", "No such file or directory")));
}

TEST_F(Files, WhoseDeviceVanishedAnswerAsTheFamily) {
    write("kestrel.acd", "KEY = f\n[A]\n");
    EXPECT_THAT(familyOf("A"), Optional("kestrel"sv));
    write("kestrel.acd", "KEY = f\n");
    EXPECT_THAT(valueOf("A", "KEY"), Optional("f"sv));
}

TEST_F(Files, ADirectoryIsUnreadable) {
    std::filesystem::create_directory(directory.path("bad.acd"));
    expectUnreadable("bad.acd", "not a regular file");
}

TEST_F(Files, ADanglingLinkIsUnreadable) {
    std::filesystem::create_symlink("nowhere", directory.path("bad.acd"));
    expectUnreadable("bad.acd", "No such file or directory");
}

TEST_F(Files, ALinkToItselfIsUnreadable) {
    std::filesystem::create_symlink("bad.acd", directory.path("bad.acd"));
    expectUnreadable("bad.acd", "Too many levels of symbolic links");
}

TEST_F(Files, AFifoIsUnreadableAndDoesNotBlock) {
    ASSERT_EQ(mkfifo(directory.path("bad.acd").c_str(), 0600), 0);
    expectUnreadable("bad.acd", "not a regular file");
}

TEST_F(Files, ADeviceIsUnreadable) {
    std::filesystem::create_symlink("/dev/zero", directory.path("bad.acd"));
    expectUnreadable("bad.acd", "not a regular file");
}

TEST_F(Files, ASocketIsUnreadable) {
    const int descriptor = socket(AF_UNIX, SOCK_STREAM, 0);
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    const std::string path = directory.path("bad.acd");
    ASSERT_LT(path.size(), sizeof address.sun_path);
    path.copy(address.sun_path, path.size());
    ASSERT_EQ(bind(descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    close(descriptor);
    expectUnreadable("bad.acd", "No such device or address");
}

TEST_F(Files, OneWithoutPermissionIsUnreadable) {
    write("bad.acd", "KEY = a\n");
    std::filesystem::permissions(directory.path("bad.acd"), std::filesystem::perms::none);
    if (access(directory.path("bad.acd").c_str(), R_OK) == 0) {
        GTEST_SKIP() << "this user may read everything";
    }
    expectUnreadable("bad.acd", "Permission denied");
}

TEST_F(Files, OneOverAGibibyteIsUnreadable) {
    write("bad.acd", "KEY = a\n");
    std::filesystem::resize_file(directory.path("bad.acd"), (std::uintmax_t{1} << 30) + 1);
    expectUnreadable("bad.acd", "larger than 1 GiB");
}

TEST_F(Files, OneForWhichNoDescriptorIsLeftIsUnreadable) {
    if (isSanitized()) {
        GTEST_SKIP() << "the sanitizers need descriptors too";
    }
    write("bad.acd", "KEY = a\n");
    EXPECT_THAT(AcdStore::families(), ElementsAre("bad"));
    rlimit former{};
    getrlimit(RLIMIT_NOFILE, &former);
    const rlimit none{0, former.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    EXPECT_THROW(AcdReader("bad"), DataNotFoundException);
    setrlimit(RLIMIT_NOFILE, &former);
    EXPECT_THAT(messages.take(), ElementsAre(unreadable("bad.acd", "Too many open files")));
}

TEST_F(Files, AnUnreadableOverlayMakesTheFamilyUnreadable) {
    write("low/bad.acd", "KEY = a\n[A]\n");
    std::filesystem::create_directories(directory.path("top/bad.acd"));
    useDirectories({directory.path("top"), directory.path("low")});
    EXPECT_THAT(familyOf("A"), Optional("bad"sv));
    EXPECT_THROW(AcdReader("A"), DataNotFoundException);
    EXPECT_THAT(messages.take(), ElementsAre(unreadable("top/bad.acd", "not a regular file")));
}

TEST_F(Files, AllUnreadableLayersAreReported) {
    std::filesystem::create_directories(directory.path("low/bad.acd"));
    std::filesystem::create_directories(directory.path("top/bad.acd"));
    useDirectories({directory.path("top"), directory.path("low")});
    EXPECT_THROW(AcdReader("bad"), DataNotFoundException);
    EXPECT_THAT(messages.take(), ElementsAre(unreadable("low/bad.acd", "not a regular file"),
                                             unreadable("top/bad.acd", "not a regular file")));
}

TEST_F(Files, ExceptionsSayWhereTheyComeFrom) {
    std::filesystem::create_directory(directory.path("bad.acd"));
    try {
        const AcdReader reader("bad");
        FAIL() << "nothing raised";
    } catch (const DataNotFoundException& exception) {
        EXPECT_STREQ(exception.product(), "Tarvik");
        EXPECT_STREQ(exception.source(), "host/database");
        EXPECT_STREQ(exception.revision(), "1.0");
        EXPECT_EQ(exception.line(), FILE_UNREADABLE);
    }
}

TEST_F(Files, NamesInMessagesAreHarmless) {
    write("\x1B[2J%n.acd", "broken\n");
    const AcdReader reader("\x1B[2J%n");
    EXPECT_THAT(messages.take(),
                ElementsAre(info(1, directory.path() + "/\\x1b[2J%n.acd:1:1: no '=' in 'broken'\n")));
}

// The base database

TEST_F(Files, AMissingBaseNamesTheDirectoriesTried) {
    useDirectories({directory.path(), directory.path() + "/"});
    try {
        const AcdReader reader;
        FAIL() << "nothing raised";
    } catch (const DataNotFoundException& exception) {
        EXPECT_STREQ(exception.source(), "host/database");
        EXPECT_EQ(exception.line(), BASE_MISSING);
    }
    EXPECT_THAT(messages.take(), ElementsAre(info(BASE_MISSING, "no base.acd in " + directory.path() + ", " +
                                                                    directory.path() + "/\n")));
}

TEST_F(Files, AMissingBaseInMemorySaysSo) {
    useFiles({{"kestrel.acd", ""}});
    EXPECT_THROW(AcdReader(), DataNotFoundException);
    EXPECT_THAT(messages.take(), ElementsAre(info(BASE_MISSING, "no base.acd among the files in memory\n")));
}

TEST_F(Files, AMissingBaseWithoutADirectorySaysSo) {
    useDirectories({});
    EXPECT_THROW(AcdReader(), DataNotFoundException);
    EXPECT_THAT(messages.take(),
                ElementsAre(info(BASE_MISSING, "no base.acd since there is no directory to search\n")));
}

TEST_F(Files, AnUnreadableBaseRaises) {
    std::filesystem::create_directory(directory.path("base.acd"));
    EXPECT_THROW(AcdReader(), DataNotFoundException);
    EXPECT_THAT(messages.take(), ElementsAre(unreadable("base.acd", "not a regular file")));
    EXPECT_THROW(AcdReader(), DataNotFoundException);
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Files, TheBaseIsFoundInAnyCase) {
    write("Base.ACD", "KEY = a\n");
    EXPECT_STREQ(AcdReader().getPM(), "Base");
}

// Directories

TEST_F(Files, AMissingDirectoryIsReportedOnceAndTheOthersServe) {
    write("kestrel.acd", "KEY = a\n");
    useDirectories({directory.path("none"), directory.path()});
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    EXPECT_THAT(familyOf("nothing"), nullopt);
    EXPECT_THAT(messages.take(),
                ElementsAre(info(DIRECTORY_UNREADABLE,
                                 directory.path("none") + ": can't be read: No such file or directory\n")));
}

TEST_F(Files, AFileIsNoDirectory) {
    write("kestrel.acd", "KEY = a\n");
    useDirectories({directory.path("kestrel.acd")});
    EXPECT_THAT(AcdStore::families(), IsEmpty());
    EXPECT_THAT(messages.take(),
                ElementsAre(info(DIRECTORY_UNREADABLE,
                                 directory.path("kestrel.acd") + ": can't be read: Not a directory\n")));
}

TEST_F(Files, AreListedOnce) {
    EXPECT_THAT(AcdStore::families(), IsEmpty());
    write("kestrel.acd", "");
    EXPECT_THAT(AcdStore::families(), IsEmpty());
}

TEST_F(Files, OfARelativeDirectoryAreFoundFromElsewhereToo) {
    write("database/kestrel.acd", "KEY = a\n[A]\nbroken\n");
    std::filesystem::current_path(directory.path());
    useDirectories({"database"});
    EXPECT_THAT(AcdStore::families(), ElementsAre("kestrel"));
    std::filesystem::current_path("/");
    EXPECT_THAT(valueOf("A", "KEY"), Optional("a"sv));
    EXPECT_THAT(messages.take(), ElementsAre(info(3, "database/kestrel.acd:3:1: no '=' in 'broken'\n")));
}

TEST_F(Files, LeaveNoDescriptorOpen) {
    const auto descriptors = [] {
        const std::filesystem::directory_iterator all("/proc/self/fd");
        return std::distance(begin(all), end(all));
    };
    write("kestrel.acd", "[A]\n");
    std::filesystem::create_directory(directory.path("bad.acd"));
    const auto before = descriptors();
    EXPECT_THAT(familyOf("A"), Optional("kestrel"sv));
    EXPECT_THROW(AcdReader("bad"), DataNotFoundException);
    EXPECT_EQ(descriptors(), before);
}

// Many files

TEST_F(Files, ManyFamiliesOfManyDevicesAreAllFound) {
    for (int family = 0; family < 200; ++family) {
        std::string text = "KEY = f\n";
        for (int device = 0; device < 30; ++device) {
            text += "[D" + std::to_string(family) + "x" + std::to_string(device) +
                    "]\nKEY = " + std::to_string(device) + "\n";
        }
        write("family" + std::to_string(family) + ".acd", text);
    }
    for (int family = 0; family < 200; ++family) {
        const std::string device = "d" + std::to_string(family) + "X" + std::to_string(family % 30);
        ASSERT_THAT(familyOf(device.c_str()), Optional("family" + std::to_string(family)));
        ASSERT_THAT(valueOf((device + "_PKG").c_str(), "KEY"), Optional(std::to_string(family % 30)));
    }
    EXPECT_EQ(familyOf("D0x30"), nullopt);
}
