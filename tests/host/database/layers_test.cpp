#include "DatabaseFixtures.h"

#include "database/Database.h"

// Directories as layers: what stands on top replaces or extends what lies below.

using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_view_literals;

class Layers : public DatabaseTest {
protected:
    void write(const std::string& name, std::string_view text) { directory.write(name, text); }

    /// Searches the layers in this order, the first one on top.
    void search(std::vector<std::string> layers) {
        for (std::string& layer : layers) {
            std::filesystem::create_directories(directory.path(layer));
            layer = directory.path(layer);
        }
        useDirectories(std::move(layers));
    }

    TemporaryDirectory directory;
};

TEST_F(Layers, KeysOnTopReplace) {
    write("low/kestrel.acd", "A = a\nB = b\n");
    write("top/kestrel.acd", "B = c\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("kestrel", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "B"), Optional("c"sv));
}

TEST_F(Layers, AppendsOnTopExtend) {
    write("low/base.acd", "DEVICE_SUPPORTED = kestrel\n");
    write("middle/base.acd", "DEVICE_SUPPORTED += ,merlin\n");
    write("top/base.acd", "DEVICE_SUPPORTED += ,osprey\n");
    search({"top", "middle", "low"});
    EXPECT_THAT(valueOf("base", "DEVICE_SUPPORTED"), Optional("kestrel,merlin,osprey"sv));
}

TEST_F(Layers, AnAppendToNothingBelowAssigns) {
    write("low/base.acd", "A = a\n");
    write("top/base.acd", "B += b\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("base", "B"), Optional("b"sv));
}

TEST_F(Layers, AnAppendWithoutAFileBelowAssigns) {
    write("top/base.acd", "B += b\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("base", "B"), Optional("b"sv));
}

TEST_F(Layers, AnAssignmentOnTopUndoesAppendsBelow) {
    write("low/base.acd", "A = a\nA += b\n");
    write("top/base.acd", "A = c\nA += d\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("base", "A"), Optional("cd"sv));
}

TEST_F(Layers, MergeSectionBySection) {
    write("low/kestrel.acd", "KEY = f\n[A]\nKEY = a\nX = x\n[B]\nKEY = b\n");
    write("top/kestrel.acd", "[b]\nKEY += 2\n[C]\nKEY = c\n[a]\nX += y\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("A", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("A", "X"), Optional("xy"sv));
    EXPECT_THAT(valueOf("B", "KEY"), Optional("b2"sv));
    EXPECT_THAT(valueOf("C", "KEY"), Optional("c"sv));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("f"sv));
    EXPECT_THAT(AcdStore::devices("kestrel"), ElementsAre("A", "B", "C"));
}

TEST_F(Layers, KeysBeforeTheFirstSectionOnTopAreTheFamilys) {
    write("low/kestrel.acd", "[A]\nKEY = a\n");
    write("top/kestrel.acd", "KEY = f\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("A", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("f"sv));
}

TEST_F(Layers, AnOverlayAddsAFamily) {
    write("low/base.acd", "DEVICE_SUPPORTED = kestrel\n");
    write("top/base.acd", "DEVICE_SUPPORTED += ,mine\n");
    write("top/mine.acd", "KEY = m\n[M1]\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("base", "DEVICE_SUPPORTED"), Optional("kestrel,mine"sv));
    EXPECT_THAT(valueOf("M1", "KEY"), Optional("m"sv));
}

TEST_F(Layers, AnOverlayAddsADevice) {
    write("low/kestrel.acd", "KEY = f\n[A]\n");
    write("top/kestrel.acd", "[B]\n");
    search({"top", "low"});
    EXPECT_THAT(familyOf("B"), Optional("kestrel"sv));
    EXPECT_THAT(valueOf("B", "KEY"), Optional("f"sv));
}

TEST_F(Layers, AnOverlayDoesNotRenameAFamily) {
    write("low/Kestrel.acd", "A = a\n");
    write("top/KESTREL.ACD", "B = b\n");
    search({"top", "low"});
    EXPECT_THAT(AcdStore::families(), ElementsAre("Kestrel"));
    EXPECT_THAT(valueOf("kestrel", "A"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "B"), Optional("b"sv));
}

TEST_F(Layers, AnOverlayDoesNotRenameADevice) {
    write("low/kestrel.acd", "[Ks50]\n");
    write("top/kestrel.acd", "[KS50]\n");
    search({"top", "low"});
    EXPECT_THAT(AcdStore::devices("kestrel"), ElementsAre("Ks50"));
}

TEST_F(Layers, FamiliesStandInByteOrderWhateverLayerTheyComeFrom) {
    write("low/b.acd", "");
    write("low/d.acd", "");
    write("top/a.acd", "");
    write("top/C.acd", "");
    search({"top", "low"});
    EXPECT_THAT(AcdStore::families(), ElementsAre("C", "a", "b", "d"));
}

TEST_F(Layers, AFaultOnTopNamesTheFileOnTop) {
    write("low/kestrel.acd", "A = a\n");
    write("top/kestrel.acd", "\nbroken\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("kestrel", "A"), Optional("a"sv));
    EXPECT_THAT(messages.take(),
                ElementsAre(info(2, directory.path("top/kestrel.acd") + ":2:1: no '=' in 'broken'\n")));
}

TEST_F(Layers, ABrokenHeaderOnTopDropsKeysOnTopOnly) {
    write("low/kestrel.acd", "[A]\nKEY = a\n[B\n");
    write("top/kestrel.acd", "KEY = f\n");
    search({"top", "low"});
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("f"sv));
}

// Sizes

namespace {

std::vector<acd::LayerText> lowAndTop(const std::string& low, const std::string& top) {
    std::vector<acd::LayerText> layers;
    for (const auto& [path, text] : {std::pair("low", low), std::pair("top", top)}) {
        acd::MemorySource source(text);
        layers.push_back({path, acd::readAll(source)});
    }
    return layers;
}

} // namespace

TEST(LongestValues, AnAppendThatGrowsOverThemIsLeftOut) {
    std::vector<acd::LayerText> layers =
        lowAndTop("KEY = 1234\nKEY += 5678\n", "KEY += 9ab\nKEY += 9a\nOTHER = 12345678901\n");
    std::vector<acd::LayerError> faults;
    const acd::Database database(std::move(layers), faults, 10);

    EXPECT_EQ(database.find(nullptr, "KEY")->text(), "123456789a");
    EXPECT_EQ(database.spans(*database.find(nullptr, "KEY")).size(), 3U);
    EXPECT_EQ(database.find(nullptr, "OTHER")->text(), "12345678901");
    ASSERT_EQ(faults.size(), 1U);
    EXPECT_EQ(database.path(faults[0].layer), "top");
    EXPECT_EQ(faults[0].error.location.line, 1U);
    EXPECT_EQ(faults[0].error.location.column, 8U);
    EXPECT_EQ(acd::describe(faults[0].error), "the value would grow over 1 GiB by '9ab'");
}

TEST(LongestValues, AnAppendThatIsHiddenIsLeftOutWithoutAWord) {
    std::vector<acd::LayerText> layers =
        lowAndTop("KEY = 1234\nKEY += 5678901\nKEY += 567890\n", "KEY = 1\n");
    std::vector<acd::LayerError> faults;
    const acd::Database database(std::move(layers), faults, 10);

    const acd::Value& standing = *database.find(nullptr, "KEY");
    EXPECT_EQ(standing.text(), "1");
    ASSERT_EQ(database.replaced(standing).size(), 1U);
    EXPECT_EQ(database.replaced(standing)[0].text(), "1234567890");
    EXPECT_THAT(faults, IsEmpty());
}

namespace {

/// The texts that a value hides in the layers below, with the ends of their directories.
std::vector<std::string> hiddenBy(const char* name, const char* key) {
    std::vector<std::string> texts;
    const std::optional<AcdStore::Value> value = AcdStore::value(name, key);
    for (std::size_t i = 0; value && i < value->replaced.size(); ++i) {
        const AcdStore::Value& hidden = value->replaced[i];
        const AcdStore::SourceSpan& place = hidden.spans.front();
        texts.push_back(std::filesystem::path(place.layer).filename().string() + ':' +
                        std::to_string(place.line) + ':' + std::to_string(place.column) + ' ' +
                        std::string(hidden.text));
    }
    return texts;
}

} // namespace

TEST_F(Layers, KnowWhatTheyHide) {
    write("low/kestrel.acd", "A = a\nB = b\n[KS50]\nA = s\n");
    write("middle/kestrel.acd", "A = m\nA += n\n");
    write("top/kestrel.acd", "\nA = t\nB += c\n[ks50]\nA = u\n");
    search({"top", "middle", "low"});
    EXPECT_THAT(hiddenBy("kestrel", "A"), ElementsAre("middle:1:5 mn", "low:1:5 a"));
    EXPECT_THAT(hiddenBy("kestrel", "B"), IsEmpty());
    EXPECT_THAT(hiddenBy("KS50", "A"), ElementsAre("low:4:5 s"));
}

TEST_F(Layers, HideWholeValuesThatLinesOfTheirOwnAddedTo) {
    write("low/kestrel.acd", "A = a\n");
    write("top/kestrel.acd", "A += b\nA = c\nA = d\n");
    search({"top", "low"});
    EXPECT_THAT(hiddenBy("kestrel", "A"), ElementsAre("low:1:5 ab"));
}

TEST_F(Layers, HideNothingOfTheirOwn) {
    write("top/kestrel.acd", "A = a\nA = b\nA = c\n");
    search({"top", "low"});
    EXPECT_THAT(hiddenBy("kestrel", "A"), IsEmpty());
}

TEST_F(Layers, AreNamedByTheirDirectories) {
    write("top/kestrel.acd", "A = a\n");
    search({"top"});
    EXPECT_EQ(AcdStore::value("kestrel", "A")->spans.front().layer, directory.path("top"));
    write("t/kestrel.acd", "A = a\n");
    std::filesystem::current_path(directory.path());
    useDirectories({"t"});
    EXPECT_EQ(AcdStore::value("kestrel", "A")->spans.front().layer, "t");
    std::filesystem::current_path("/");
    useFiles({{"kestrel.acd", "A = a\n"}});
    EXPECT_EQ(AcdStore::value("kestrel", "A")->spans.front().layer, "");
    useFiles({{"/kestrel.acd", "A = a\n"}});
    EXPECT_EQ(AcdStore::value("/kestrel", "A")->spans.front().layer, "/");
}
