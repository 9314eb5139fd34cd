#include "DatabaseFixtures.h"

#include <memory>

// What `what()` says of the value that was read last.

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;

namespace {

[[nodiscard]] std::string whatNow() { return OutOfRangeException("Tarvik", "s/Example", "1.0", 1631).what(); }

class Causes : public DatabaseTest {
protected:
    static void read(const char* name, const char* key, short item, const char* subSeparator = nullptr,
                     short field = 0) {
        static_cast<void>(AcdReader(name).getDevkey()->getstringbykey(key, ":", item, subSeparator, field));
    }
};

} // namespace

TEST_F(Causes, WithoutAReadAreTypeAndLocation) {
    EXPECT_EQ(whatNow(), "OutOfRangeException at s/Example, line 1631");
    EXPECT_STREQ(TarvikException("Tarvik", "x", "1.0", 1).what(), "TarvikException at x, line 1");
    EXPECT_STREQ(LogicException("Tarvik", "x", "1.0", 1).what(), "LogicException at x, line 1");
    EXPECT_STREQ(DataMismatchException("Tarvik", "x", "1.0", 1).what(), "DataMismatchException at x, line 1");
    EXPECT_STREQ(DataNotFoundException("Tarvik", "x", "1.0", 1).what(), "DataNotFoundException at x, line 1");
}

TEST_F(Causes, NameTheFieldThatWasReadLast) {
    useFiles({{"kestrel.acd", "OPERATION = PROGRAM,BS:PROGRM,BS\n"}});
    read("kestrel", "OPERATION", 1, ",", 0);
    EXPECT_EQ(whatNow(),
              "OutOfRangeException at s/Example, line 1631; last read: kestrel.acd:1:24: OPERATION, "
              "item 1, field 0: 'PROGRM'");
}

TEST_F(Causes, NameTheItemWhoseFieldIsMissing) {
    useFiles({{"kestrel.acd", "[KS50]\nOPERATION = PROGRAM,BS:VERIFY\n"}});
    read("KS50", "OPERATION", 1, ",", 1);
    EXPECT_THAT(whatNow(),
                EndsWith("; last read: kestrel.acd:2:24: [KS50]: OPERATION, item 1, field 1: missing"));
}

TEST_F(Causes, NameTheFamilyWhoseKeyOrItemIsMissing) {
    useFiles({{"kestrel.acd", "A = a\n"}});
    read("kestrel", "B", 0);
    EXPECT_THAT(whatNow(), EndsWith("; last read: kestrel: B, item 0: missing"));
    read("kestrel", "A", 1);
    EXPECT_THAT(whatNow(), EndsWith("; last read: kestrel: A, item 1: missing"));
}

TEST_F(Causes, AreOneLineWhateverTheValueHolds) {
    useFiles({{"k\n.acd", "A = \x1b[2J" + std::string(100, 'x') + "\n"}});
    read("k\n", "A", 0);
    EXPECT_THAT(whatNow(), EndsWith("k\\x0a.acd:1:5: A, item 0: '\\x1b[2J" + std::string(56, 'x') + "...'"));
}

TEST_F(Causes, AreForgottenWhenAnotherNameIsOpened) {
    useFiles({{"kestrel.acd", "A = a\n"}});
    read("kestrel", "A", 0);
    EXPECT_EQ(familyOf("unknown"), std::nullopt);
    EXPECT_THAT(whatNow(), Not(HasSubstr("last read")));
}

TEST_F(Causes, OfAFileThatCannotBeReadAreNotWhatWasReadBefore) {
    const TemporaryDirectory directory;
    directory.write("kestrel.acd", "A = a\n");
    std::filesystem::create_directory(directory.path("merlin.acd"));
    useDirectories({directory.path()});
    read("kestrel", "A", 0);
    try {
        AcdReader("merlin");
        FAIL();
    } catch (const DataNotFoundException& unreadable) {
        EXPECT_STREQ(unreadable.what(), "DataNotFoundException at host/database, line 102");
    }
}

TEST_F(Causes, OutliveTheAccessorThatWasRead) {
    useFiles({{"kestrel.acd", "A = a\n"}});
    const PicConfig configuration("kestrel", 1, PM_PARTNAME_BINDING::BY_NAME);
    auto accessor = std::make_unique<PM_DEVKEY>("kestrel.acd", configuration, 0, 0, 0);
    static_cast<void>(accessor->getstringbykey("A", ",", 0, nullptr, 0));
    const OutOfRangeException raised("Tarvik", "s/Example", "1.0", 1631);
    const std::string before = raised.what();
    EXPECT_THAT(before, EndsWith("kestrel.acd:1:5: A, item 0: 'a'"));
    accessor.reset();
    acd::Store::resetForTesting();
    EXPECT_EQ(raised.what(), before);
    EXPECT_THAT(whatNow(), Not(HasSubstr("last read")));
    const OutOfRangeException copy = raised; // NOLINT(performance-unnecessary-copy-initialization)
    EXPECT_EQ(copy.what(), before);
}
