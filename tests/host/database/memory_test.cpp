#include "CountedAllocations.h"
#include "DatabaseFixtures.h"

#include <cstddef>
#include <functional>
#include <iterator>

// What is asked of the memory: nothing for questions that were asked before, and when it runs out the store stays
// usable.

namespace {

[[nodiscard]] std::ptrdiff_t openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd");
    return std::distance(begin(all), end(all));
}

} // namespace

class MemoryUse : public testing::Test {
protected:
    MemoryUse() {
        acd::Store::resetForTesting();
        // Takes messages without asking for memory itself.
        Port_MsgManData::setSink([this](const Port_MsgManData::Message&) { ++messages; });
        directory.write("low/base.acd", "LIST = a,b\nLIST += ,c\n");
        directory.write("low/kestrel.acd",
                        "LONG = " + std::string(200, 'x') + "\nbroken\n[KS50]\nKEY = a\\\n  b\n[KS100]\n");
        directory.write("top/kestrel.acd", "[KS50]\nKEY += c\n[broken\n[KS200]\n");
        directory.write("top/merlin.acd", "[ML1]\\\n\n[ML2\n");
        std::filesystem::create_directory(directory.path("top/bad.acd"));
    }
    ~MemoryUse() override { Port_MsgManData::setSink({}); }

    void useDirectories() const {
        ::useDirectories({directory.path("top"), directory.path("low"), "/nowhere"});
    }
    static void useMemory() {
        useFiles({{"base.acd", "LIST = a,b\nLIST += ,c\n"},
                  {"kestrel.acd", "broken\n[KS50]\nKEY = a\\\n  b\nKEY += c\n[broken\n[KS200]\n"},
                  {"merlin.acd", "[ML1]\\\n\n[ML2\n"}});
    }

    /// Asks all that can be asked.
    [[nodiscard]] static std::string answers() {
        std::string text;
        for (const std::string& family : AcdStore::families()) {
            text += family + ' ';
        }
        for (const std::string& device : AcdStore::devices("kestrel")) {
            text += device + ' ';
        }
        for (const char* const item :
             {AcdReader().getDevkey()->getstringbykey("LIST", ",", 2, nullptr, 0),
              AcdReader("KS50_PKG").getDevkey()->getstringbykey("KEY", ":", 0, ",", 0),
              AcdReader("KS50_PKG").getPM(), AcdReader("none").getPM(),
              PicConfig("ml1", 1, PM_PARTNAME_BINDING::BY_NAME).get_pm()}) {
            text += std::string(item) + ' ';
        }
        const std::optional<AcdStore::Value> value = AcdStore::value("ks50", "KEY");
        text += std::to_string(value->at(1).line) + ' ' + std::to_string(value->at(2).column);
        try {
            const AcdReader reader("bad");
        } catch (const DataNotFoundException&) {
            text += " bad";
        }
        return text;
    }

    /// Lets each allocation fail once, and expects the same answers afterwards.
    void expectUsable(const std::function<void()>& prepare) {
        prepare();
        const std::string expected = answers();
        const int expectedMessages = std::exchange(messages, 0);
        const std::ptrdiff_t descriptors = openDescriptors();
        std::size_t failing = 0;
        bool isDone = false;
        while (!isDone) {
            ++failing;
            acd::Store::resetForTesting();
            messages = 0;
            prepare();
            isDone = runFailing(failing, [&] { (void)answers(); });
            ASSERT_EQ(answers(), expected) << failing;
            ASSERT_LE(messages, expectedMessages) << failing;
            ASSERT_EQ(openDescriptors(), descriptors) << failing;
        }
        EXPECT_GT(failing, 30U);
    }

    TemporaryDirectory directory;
    int messages = 0;
};

TEST_F(MemoryUse, RunningOutLeavesTheStoreUsableOnDirectories) {
    expectUsable([this] { useDirectories(); });
}

TEST_F(MemoryUse, RunningOutLeavesTheStoreUsableOnMemoryFiles) {
    expectUsable([] { useMemory(); });
}

TEST_F(MemoryUse, RunningOutWhileTheInstalledDatabaseIsLookedForRaises) {
    directory.write("lib/libTarvikHost.so", "");
    std::filesystem::create_directories(directory.path("share/tarvik/database"));
    for (const char* const library : {"lib/libTarvikHost.so", "low/base.acd"}) {
        const std::string path = directory.path(library);
        std::size_t failing = 1;
        while (!runFailing(failing, [&] { (void)acd::installedSearchPath(path); })) {
            ++failing;
        }
        EXPECT_GT(failing, 5U);
    }
}

TEST_F(MemoryUse, RunningOutWhileFilesAreSetKeepsTheFormerOnes) {
    useMemory();
    const std::string expected = answers();
    std::map<std::string, std::string> files = {{"osprey.acd", "KEY = a\n"}};
    for (std::size_t failing = 1;; ++failing) {
        useMemory();
        auto copy = files;
        if (runFailing(failing, [&] { AcdStore::setMemoryFiles(std::move(copy)); })) {
            break;
        }
        ASSERT_EQ(answers(), expected);
    }
    EXPECT_THAT(AcdStore::families(), testing::ElementsAre("osprey"));
}

TEST_F(MemoryUse, ReadersOpenedAgainAskForNone) {
    useDirectories();
    const auto ask = [] {
        const AcdReader base;
        const AcdReader device("KS50_PKG");
        const AcdReader family("kestrel");
        const AcdReader none("none");
        const PicConfig configuration("KS200", 1, PM_PARTNAME_BINDING::BY_NAME);
    };
    // The table of devices is made after a few look-ups.
    for (int time = 0; time < 10; ++time) {
        ask();
    }
    EXPECT_EQ(countAllocations(ask), 0U);
}

TEST_F(MemoryUse, ValuesReadAgainAskForNone) {
    useDirectories();
    PM_DEVKEY& accessor = *AcdReader("KS50").getDevkey();
    const auto ask = [&] {
        for (short item = 0; item < 3; ++item) {
            (void)accessor.getstringbykey("LONG", ",", item, nullptr, 0);
            (void)accessor.getstringbykey("A_KEY_THAT_IS_LONG_AND_NOT_THERE", ":", item, ",", 1);
            (void)accessor.getstringbykey("KEY", ":", item, ",", 1);
        }
    };
    ask();
    EXPECT_EQ(countAllocations(ask), 0U);
}

TEST_F(MemoryUse, RunningOutWhileAnExceptionIsMadeLeavesItItsType) {
    useDirectories();
    (void)AcdReader("KS50").getDevkey()->getstringbykey("KEY", ":", 0, ",", 0);
    int typesAlone = 0;
    for (std::size_t failing = 1; failing != 20; ++failing) {
        EXPECT_TRUE(runFailing(failing, [&typesAlone] {
            const OutOfRangeException raised("Tarvik", "s/Example", "1.0", 1631);
            const std::string_view text = raised.what();
            EXPECT_EQ(text.substr(0, 19), "OutOfRangeException");
            typesAlone += text.size() == 19 ? 1 : 0;
        }));
    }
    EXPECT_GT(typesAlone, 1);
    EXPECT_LT(typesAlone, 19);
}
