#include "DirectoryIndexes.h"
#include "PackedNames.h"

#include "database/DeviceIndex.h"

#include <sys/stat.h>
#include <unistd.h>

// When the index of a directory answers in place of its files, and when it does not. An index that names a section that
// no file has tells the two apart.

using acd::DirectoryIndex;
using acd::IndexContents;
using acd::IndexState;
using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_literals;

class DirectoryIndexes : public DatabaseTest {
protected:
    DirectoryIndexes() {
        ::unsetenv("TARVIK_INDEX");
        directory.write("base.acd", "KEY = b\n");
        directory.write("kestrel.acd", "[KS50]\n[KS100]\n");
        directory.write("merlin.acd", "[ML1]\n[KS50]\n");
    }
    ~DirectoryIndexes() override { ::unsetenv("TARVIK_INDEX"); }

    [[nodiscard]] IndexContents withGhost() const {
        IndexContents contents = describe(directory);
        addGhost(contents, "kestrel.acd");
        return contents;
    }

    void writeIndex(const IndexContents& contents) const {
        directory.write(acd::indexFormat::FILE_NAME, acd::indexFormat::encode(contents));
    }

    /// Whether a process that starts now takes the sections of kestrel.acd from the index.
    [[nodiscard]] bool isUsed() {
        useDirectories({directory.path()});
        const std::optional<std::string> ghost = familyOf("GHOST");
        EXPECT_THAT(familyOf("ks100"), Optional("kestrel"s));
        EXPECT_THAT(familyOf("KS50"), Optional("kestrel"s));
        EXPECT_THAT(familyOf("ML1"), Optional("merlin"s));
        EXPECT_EQ(familyOf("NONE"), nullopt);
        return ghost == "kestrel";
    }

    TemporaryDirectory directory;
};

TEST_F(DirectoryIndexes, AnswerInPlaceOfTheFiles) {
    EXPECT_FALSE(isUsed());
    writeIndex(withGhost());
    EXPECT_TRUE(isUsed());
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(DirectoryIndexes, AreIgnoredOnRequest) {
    writeIndex(withGhost());
    ::setenv("TARVIK_INDEX", "off", 1);
    EXPECT_FALSE(isUsed());
    ::setenv("TARVIK_INDEX", "on", 1);
    EXPECT_TRUE(isUsed());
}

TEST_F(DirectoryIndexes, GiveADeviceToTheFirstFamilyAsTheFilesDo) {
    IndexContents contents = describe(directory);
    addGhost(contents, "merlin.acd");
    addGhost(contents, "kestrel.acd", "ghost");
    writeIndex(contents);
    useDirectories({directory.path()});
    EXPECT_THAT(familyOf("Ghost"), Optional("kestrel"s));
}

TEST_F(DirectoryIndexes, AreNotUsedIfAnyPartOfAStatusDiffers) {
    const std::vector<void (*)(acd::FileStatus&)> changes{
        [](acd::FileStatus& status) { ++status.inode; },
        [](acd::FileStatus& status) { ++status.size; },
        [](acd::FileStatus& status) { --status.modified.seconds; },
        [](acd::FileStatus& status) { status.modified.nanoseconds ^= 1; },
        [](acd::FileStatus& status) { --status.changed.seconds; },
        [](acd::FileStatus& status) { status.changed.nanoseconds ^= 1; },
        [](acd::FileStatus& status) { ++status.device; },
    };
    for (std::size_t change = 0; change != changes.size(); ++change) {
        IndexContents contents = withGhost();
        changes[change](contents.files.back().status);
        writeIndex(contents);
        EXPECT_FALSE(isUsed()) << "change " << change;
        EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::STALE) << "change " << change;
    }
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(DirectoryIndexes, AreNotUsedAfterAFileIsReplacedByOneOfTheSameSizeAndTime) {
    writeIndex(withGhost());
    ASSERT_TRUE(isUsed());
    directory.write("new", "[ML1]\n[KS51]\n");
    std::filesystem::last_write_time(directory.path("new"),
                                     std::filesystem::last_write_time(directory.path("merlin.acd")));
    std::filesystem::rename(directory.path("new"), directory.path("merlin.acd"));
    EXPECT_FALSE(isUsed());
    EXPECT_THAT(familyOf("KS51"), Optional("merlin"s));
}

TEST_F(DirectoryIndexes, AreNotUsedAfterAFileIsAdded) {
    writeIndex(withGhost());
    directory.write("notes.txt", "[NOTE]\n");
    EXPECT_TRUE(isUsed());
    directory.write("osprey.acd", "");
    EXPECT_FALSE(isUsed());
}

TEST_F(DirectoryIndexes, AreNotUsedAfterAFileIsRemoved) {
    directory.write("osprey.acd", "");
    writeIndex(withGhost());
    ASSERT_TRUE(isUsed());
    std::filesystem::remove(directory.path("osprey.acd"));
    EXPECT_FALSE(isUsed());
}

TEST_F(DirectoryIndexes, AreNotUsedAfterAFileIsRenamed) {
    if (std::filesystem::exists(directory.path("BASE.acd"))) {
        GTEST_SKIP() << "names in any case are the same here";
    }
    directory.write("osprey.acd", "");
    writeIndex(withGhost());
    std::filesystem::rename(directory.path("osprey.acd"), directory.path("OSPREY.acd"));
    EXPECT_FALSE(isUsed());
}

TEST_F(DirectoryIndexes, AreNotUsedInAnotherDirectory) {
    writeIndex(withGhost());
    for (const char* const name : {"base.acd", "kestrel.acd", "merlin.acd", "index.acx"}) {
        std::filesystem::create_directories(directory.path("copy"));
        std::filesystem::copy(directory.path(name), directory.path("copy/"s + name));
    }
    useDirectories({directory.path("copy")});
    EXPECT_EQ(familyOf("GHOST"), nullopt);
}

TEST_F(DirectoryIndexes, DescribeFilesThatDifferInCaseAlone) {
    if (std::filesystem::exists(directory.path("BASE.acd"))) {
        GTEST_SKIP() << "names in any case are the same here";
    }
    directory.write("KESTREL.acd", "[KS50]\n[KS100]\n");
    IndexContents contents = describe(directory);
    addGhost(contents, "KESTREL.acd");
    addGhost(contents, "kestrel.acd", "HIDDEN"); // of a file that is not read
    writeIndex(contents);
    useDirectories({directory.path()});
    EXPECT_THAT(familyOf("GHOST"), Optional("KESTREL"s));
    EXPECT_EQ(familyOf("HIDDEN"), nullopt);
}

TEST_F(DirectoryIndexes, LeaveFilesToBeReadThatAreAsYoungAsThey) {
    IndexContents contents = withGhost();
    addGhost(contents, "merlin.acd", "SPECTRE");
    contents.created = {1000, 5};
    for (const auto& [changed, isSettled] : {std::pair(acd::FileTime{1000, 4}, true),
                                             {{999, 6}, true},
                                             {{1000, 5}, false},
                                             {{1000, 6}, false},
                                             {{1001, 0}, false}}) {
        contents.files[1].status.changed = changed;
        EXPECT_EQ(contents.isSettled(contents.files[1]), isSettled);
    }
    contents = withGhost();
    addGhost(contents, "merlin.acd", "SPECTRE");
    // One of the two is as young as the index.
    contents.created = contents.files[1].status.changed;
    const acd::FileTime merlin = contents.files[2].status.changed;
    writeIndex(contents);
    EXPECT_FALSE(isUsed());
    EXPECT_EQ(familyOf("SPECTRE").has_value(), merlin < contents.created);
}

TEST_F(DirectoryIndexes, LeaveFilesToBeReadThatAreOnAnotherDevice) {
    IndexContents contents = withGhost();
    ++contents.device;
    writeIndex(contents);
    EXPECT_FALSE(isUsed());
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::CURRENT);
}

TEST_F(DirectoryIndexes, BelongToALayerEach) {
    const TemporaryDirectory top;
    top.write("kestrel.acd", "[KS200]\n");
    writeIndex(withGhost());
    useDirectories({top.path(), directory.path()});
    EXPECT_THAT(familyOf("GHOST"), Optional("kestrel"s));
    EXPECT_THAT(familyOf("KS200"), Optional("kestrel"s));

    IndexContents ofTop = describe(top);
    addGhost(ofTop, "kestrel.acd", "SPECTRE");
    top.write("index.acx", acd::indexFormat::encode(ofTop));
    useDirectories({top.path() + "/", directory.path()});
    EXPECT_THAT(familyOf("GHOST"), Optional("kestrel"s));
    EXPECT_THAT(familyOf("SPECTRE"), Optional("kestrel"s));

    directory.write("merlin.acd", "");
    useDirectories({directory.path(), top.path()});
    EXPECT_EQ(familyOf("GHOST"), nullopt);
    EXPECT_THAT(familyOf("SPECTRE"), Optional("kestrel"s));
}

TEST_F(DirectoryIndexes, AreFoundAfterTheProcessLeavesItsDirectory) {
    writeIndex(withGhost());
    const std::filesystem::path former = std::filesystem::current_path();
    std::filesystem::current_path(directory.path());
    useDirectories({"."});
    EXPECT_THAT(AcdStore::families(), ElementsAre("base", "kestrel", "merlin"));
    std::filesystem::current_path(former);
    EXPECT_THAT(familyOf("GHOST"), Optional("kestrel"s));
}

TEST_F(DirectoryIndexes, DoNotHideThatAFileCannotBeRead) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only the superuser can take another user's place";
    }
    ::chmod(directory.path().c_str(), 0755);
    ::chmod(directory.path("merlin.acd").c_str(), 0600);
    writeIndex(withGhost());
    EXPECT_TRUE(isUsed());

    constexpr uid_t NOBODY = 65534;
    ASSERT_EQ(::seteuid(NOBODY), 0);
    useDirectories({directory.path()});
    EXPECT_EQ(familyOf("GHOST"), nullopt);
    EXPECT_EQ(familyOf("ML1"), nullopt);
    ASSERT_EQ(::seteuid(0), 0);
    EXPECT_THAT(messages.take(), ElementsAre(info(102, directory.path("merlin.acd") +
                                                           ": can't be read: Permission denied\n")));
}

TEST_F(DirectoryIndexes, DoNotRestoreAFileThatCouldNotBeReadBefore) {
    writeIndex(withGhost());
    useDirectories({directory.path()});
    EXPECT_THAT(AcdStore::families(), ElementsAre("base", "kestrel", "merlin"));
    std::filesystem::rename(directory.path("kestrel.acd"), directory.path("kestrel"));
    EXPECT_THROW(AcdReader("kestrel"), DataNotFoundException);
    std::filesystem::rename(directory.path("kestrel"), directory.path("kestrel.acd"));
    IndexContents contents = withGhost();
    writeIndex(contents);
    EXPECT_EQ(familyOf("GHOST"), nullopt);
    EXPECT_THAT(familyOf("ML1"), Optional("merlin"s));
}

TEST_F(DirectoryIndexes, AreNotUsedIfTheyCannotBeRead) {
    const std::string index = directory.path("index.acx");
    std::filesystem::create_directory(index);
    EXPECT_FALSE(isUsed());
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::INVALID);
    std::filesystem::remove(index);
    ASSERT_EQ(::mkfifo(index.c_str(), 0600), 0);
    EXPECT_FALSE(isUsed());
    std::filesystem::remove(index);
    directory.write("index.acx", "");
    std::filesystem::resize_file(index, (std::size_t{256} << 20) + 1);
    EXPECT_FALSE(isUsed());
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(DirectoryIndexes, AreNotUsedIfTheDirectoryCannotBeOpened) {
    IndexContents contents = withGhost();
    const std::vector<std::string_view> names{"base.acd", "kestrel.acd", "merlin.acd"};
    const auto index = decodeIndex(acd::indexFormat::encode(contents));
    EXPECT_TRUE(index->isCurrent(directory.path(), names));
    EXPECT_FALSE(index->isCurrent(directory.path("gone"), names));
    EXPECT_EQ(index->sections("gone.acd"), nullptr);
    EXPECT_EQ(index->sections("zz.acd"), nullptr);
}

TEST_F(DirectoryIndexes, AreMadeOfWhatTheFilesSay) {
    directory.write("osprey.acd", "KEY = a \\\n  b\n[OS\\\n1]\n[OS2]\n[bad\n[OS2]\n");
    const IndexContents contents = acd::describeDirectory(directory.path(), 7, {8, 9});
    EXPECT_EQ(contents.device, 7U);
    EXPECT_EQ(contents.created, (acd::FileTime{8, 9}));
    ASSERT_EQ(contents.files.size(), 4U);
    const acd::IndexedFile& osprey = contents.files.back();
    EXPECT_EQ(osprey.name, "osprey.acd");
    EXPECT_EQ(osprey.status, acd::FileSource(directory.path("osprey.acd")).status());
    EXPECT_THAT(namesOf(osprey.sections), ElementsAre("OS1", "OS2", "OS2"));
}

TEST_F(DirectoryIndexes, AreNotMadeOfFilesThatCannotBeRead) {
    std::filesystem::create_directory(directory.path("osprey.acd"));
    try {
        (void)acd::describeDirectory(directory.path(), 7, {8, 9});
        FAIL();
    } catch (const acd::ReadError& unreadable) {
        EXPECT_STREQ(unreadable.what(), "osprey.acd: not a regular file");
    }
    EXPECT_THROW((void)acd::databaseFiles(directory.path("gone")), acd::ReadError);
}

TEST_F(DirectoryIndexes, HaveAState) {
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::MISSING);
    directory.write("index.acx", "no index");
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::INVALID);
    writeIndex(describe(directory));
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::CURRENT);
    directory.write("osprey.acd", "");
    EXPECT_EQ(acd::checkIndex(directory.path()).state, IndexState::STALE);
}

namespace {

/// An index that is whole as far as the checksum goes.
[[nodiscard]] std::string sealed(std::string bytes) {
    acd::indexFormat::Writer writer;
    writer.bytes() = std::move(bytes);
    writer.number(acd::indexFormat::checksum(writer.bytes()));
    return writer.bytes();
}

[[nodiscard]] std::string unsealed(const std::string& bytes) {
    return bytes.substr(0, bytes.size() - sizeof(acd::indexFormat::checksum({})));
}

} // namespace

class IndexBytes : public DirectoryIndexes {
protected:
    std::string bytes = acd::indexFormat::encode(withGhost());
};

TEST_F(IndexBytes, GiveBackWhatWasWritten) {
    const auto index = decodeIndex(bytes);
    ASSERT_TRUE(index);
    EXPECT_EQ(acd::indexFormat::encode(index->contents()), bytes);
    EXPECT_EQ(index->contents().created, MUCH_LATER);
    EXPECT_EQ(index->contents().files[1].name, "kestrel.acd");
}

TEST_F(IndexBytes, AreRefusedIfOneIsMissingOrDiffers) {
    for (std::size_t size = 0; size != bytes.size(); ++size) {
        EXPECT_FALSE(decodeIndex(bytes.substr(0, size))) << size;
    }
    for (std::size_t place = 0; place != bytes.size(); ++place) {
        for (int value = 1; value != 256; ++value) {
            std::string changed = bytes;
            changed[place] = static_cast<char>(changed[place] ^ value);
            EXPECT_FALSE(decodeIndex(changed)) << place;
        }
    }
    EXPECT_FALSE(decodeIndex(bytes + '\0'));
    EXPECT_FALSE(decodeIndex(sealed(unsealed(bytes) + '\0')));
}

TEST_F(IndexBytes, AreRefusedIfTheyEndEarlyWithTheRightChecksum) {
    const std::string contents = unsealed(bytes);
    for (std::size_t size = 0; size != contents.size(); ++size) {
        EXPECT_FALSE(decodeIndex(sealed(contents.substr(0, size)))) << size;
    }
    EXPECT_TRUE(decodeIndex(sealed(contents)));
}

TEST_F(IndexBytes, AskForNoMoreMemoryThanTheyFill) {
    const std::string contents = unsealed(bytes);
    const std::size_t count = acd::indexFormat::SIGNATURE.size() + 8 + 12;
    for (const char* const number : {"\xFF\xFF\xFF\xFF", "\xFF\xFF\xFF\x7F"}) {
        for (std::size_t place = count; place + 4 <= contents.size(); ++place) {
            // With any number replaced it ends somewhere else, or describes something else of the same size.
            const auto index = decodeIndex(sealed(std::string(contents).replace(place, 4, number, 4)));
            EXPECT_TRUE(!index || acd::indexFormat::encode(index->contents()).size() == bytes.size());
        }
        EXPECT_FALSE(decodeIndex(sealed(std::string(contents).replace(count, 4, number, 4))));
    }
}

TEST(DeviceIndex, AnswersTheFirstLookUpsAsAllOthers) {
    acd::DeviceIndex index;
    index.add(pack({"KS50", "ks100"}), 3);
    index.add(pack({"KS100", "ML1"}), 5);
    for (int round = 0; round != 4; ++round) {
        EXPECT_EQ(index.family("ks50"), 3U) << round;
        EXPECT_EQ(index.family("KS100"), 3U) << round;
        EXPECT_EQ(index.family("ml1"), 5U) << round;
        EXPECT_EQ(index.family("ML2"), acd::DeviceIndex::NONE) << round;
        EXPECT_EQ(index.family(""), acd::DeviceIndex::NONE) << round;
    }
}
