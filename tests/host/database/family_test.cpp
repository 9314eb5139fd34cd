#include "DatabaseFixtures.h"

#include <AcdFamily.h>

// The merge of a family's layers as tools see it: the readers' values, and where every byte was written.

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// A family of several layers, the bottom one first.
class Layers {
public:
    explicit Layers(const std::vector<std::string>& texts) {
        m_files.reserve(texts.size());
        for (const std::string& text : texts) {
            m_files.emplace_back(text, "layer" + std::to_string(m_files.size()), "k");
        }
    }

    [[nodiscard]] std::vector<const AcdLines*> files() const {
        std::vector<const AcdLines*> all;
        for (const AcdLines& file : m_files) {
            all.push_back(&file);
        }
        return all;
    }

private:
    std::vector<AcdLines> m_files;
};

[[nodiscard]] std::string shown(const AcdFamily::Location& location) {
    return location.file->path() + ':' + std::to_string(location.line) + ':' +
           std::to_string(location.column);
}

[[nodiscard]] std::vector<std::string> keysOf(const AcdFamily::Section& section) {
    std::vector<std::string> keys;
    for (const AcdFamily::Entry& entry : section.entries) {
        keys.push_back(std::string(entry.key()) + '=' + std::string(entry.value()));
    }
    return keys;
}

} // namespace

TEST(AcdFamily, HasItsOwnKeysAndThoseOfItsSections) {
    const Layers layers({"B = b\nA = a\n[KS100]\nC = c\n[KS50]\n"});
    const AcdFamily family(layers.files());
    ASSERT_EQ(family.sections().size(), 3U);
    EXPECT_THAT(keysOf(family.own()), ElementsAre("A=a", "B=b"));
    EXPECT_EQ(family.sections()[1].name, "KS100");
    EXPECT_THAT(keysOf(family.sections()[1]), ElementsAre("C=c"));
    EXPECT_EQ(shown(family.sections()[2].location), "layer0:5:2");
    EXPECT_THAT(keysOf(family.sections()[2]), IsEmpty());
}

TEST(AcdFamily, FindsKeysByTheirWholeName) {
    const Layers layers({"B = b\nD = d\n"});
    const AcdFamily family(layers.files());
    ASSERT_NE(family.own().find("B"), nullptr);
    EXPECT_EQ(family.own().find("B")->value(), "b");
    for (const char* const key : {"A", "C", "E", "BB", ""}) {
        EXPECT_EQ(family.own().find(key), nullptr) << key;
    }
}

TEST(AcdFamily, LocatesSectionsThatOneLayerHas) {
    const Layers layers({"A = a\n[KS50]\n", "B = b\n\n[KS100]\n"});
    const AcdFamily family(layers.files());
    ASSERT_EQ(family.sections().size(), 3U);
    EXPECT_EQ(shown(family.sections()[1].location), "layer0:2:2");
    EXPECT_EQ(shown(family.sections()[2].location), "layer1:3:2");
}

TEST(AcdFamily, MergesLayersAndRepeatedSections) {
    const Layers layers({"A = low\n[KS50]\nB = b\n[OTHER]\n[ks50]\nC = c\n", "A = top\n[Ks50]\nB += ,d\n"});
    const AcdFamily family(layers.files());
    EXPECT_THAT(keysOf(family.own()), ElementsAre("A=top"));
    EXPECT_EQ(family.sections().size(), 3U);
    EXPECT_EQ(family.sections()[1].name, "KS50");
    EXPECT_THAT(keysOf(family.sections()[1]), ElementsAre("B=b,d", "C=c"));
}

TEST(AcdFamily, LocatesEveryByteOfAValue) {
    const Layers layers({"KEY = a\\\n  b\n", "KEY += cd\n"});
    const AcdFamily family(layers.files());
    const AcdFamily::Entry& entry = *family.own().find("KEY");
    std::vector<std::string> locations;
    for (std::size_t offset = 0; offset <= entry.value().size(); ++offset) {
        locations.push_back(shown(entry.locationOf(offset)));
    }
    EXPECT_THAT(locations,
                ElementsAre("layer0:1:7", "layer0:2:3", "layer1:1:8", "layer1:1:9", "layer1:1:10"));
}

TEST(AcdFamily, LocatesKeysWhereTheyAreSetLast) {
    const Layers layers({"broken\nA = a\n  \\\n  B = x\n# comment\nC = c\nA += b\n", "\n C += d\n"});
    const AcdFamily family(layers.files());
    EXPECT_EQ(shown(family.own().find("A")->keyLocation()), "layer0:7:1");
    EXPECT_EQ(shown(family.own().find("B")->keyLocation()), "layer0:4:3");
    EXPECT_EQ(shown(family.own().find("C")->keyLocation()), "layer1:2:2");
    EXPECT_EQ(family.own().find("D"), nullptr);
}

TEST(AcdFamily, DropsKeysAfterAMalformedHeader) {
    const Layers layers({"[KS50]\nA = a\n[KS 51]\nB = b\n[KS52]\nC = c\n"});
    const AcdFamily family(layers.files());
    EXPECT_EQ(family.sections().size(), 3U);
    EXPECT_THAT(keysOf(family.sections()[1]), ElementsAre("A=a"));
    EXPECT_THAT(keysOf(family.sections()[2]), ElementsAre("C=c"));
}

TEST(AcdFamily, ReportsAppendsThatMakeAValueTooLong) {
    const Layers layers({"KEY = abc\nKEY += de\n", "KEY += f\n"});
    const AcdFamily family(layers.files(), 4);
    EXPECT_EQ(family.own().find("KEY")->value(), "abcf");
    EXPECT_EQ(shown(family.own().find("KEY")->keyLocation()), "layer1:1:1");
    ASSERT_EQ(family.droppedAppends().size(), 1U);
    EXPECT_EQ(family.droppedAppends()[0].key, "KEY");
    EXPECT_EQ(family.droppedAppends()[0].text, "de");
    EXPECT_EQ(shown(family.droppedAppends()[0].location), "layer0:2:8");
}

TEST(AcdFamily, OfAnEmptyFileHasNoKeys) {
    const Layers layers({""});
    const AcdFamily family(layers.files());
    EXPECT_THAT(keysOf(family.own()), IsEmpty());
    EXPECT_EQ(shown(family.own().location), "layer0:1:1");
}

TEST(AcdFamily, AgreesWithTheReaders) {
    const std::string low = "A = a\nA += b\nX\n[D1]\nA += c\nB = \\\n d\n[]\nC = lost\n[d2]\nC = c\n";
    const std::string top = "A += z\n[D1]\nB += e\n[D3]\nA = only\n";
    const TemporaryDirectory directory;
    directory.write("low/k.acd", low);
    directory.write("top/k.acd", top);
    acd::Store::resetForTesting();
    MessageRecorder messages;
    useDirectories({directory.path("top"), directory.path("low")});
    const std::vector<AcdLines> files = AcdLines::ofDatabase();
    ASSERT_EQ(files.size(), 2U);
    const AcdFamily family({&files[0], &files[1]});
    ASSERT_EQ(family.sections().size(), 4U);
    for (const AcdFamily::Section& section : family.sections()) {
        const std::string name(section.name.empty() ? "k" : section.name);
        for (const AcdFamily::Entry& entry : section.entries) {
            const auto value = AcdStore::value(name.c_str(), std::string(entry.key()).c_str());
            ASSERT_TRUE(value);
            EXPECT_EQ(value->text, entry.value());
            for (std::size_t offset = 0; offset != entry.value().size(); ++offset) {
                const AcdStore::SourceSpan span = value->at(offset);
                EXPECT_EQ(shown(entry.locationOf(offset)), std::string(span.file) + ':' +
                                                               std::to_string(span.line) + ':' +
                                                               std::to_string(span.column));
            }
        }
    }
}
