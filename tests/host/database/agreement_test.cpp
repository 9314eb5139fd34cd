#include "DatabaseFixtures.h"
#include "HostileTexts.h"
#include "PackedNames.h"
#include "ReferenceParser.h"

#include "database/Database.h"
#include "database/LineReader.h"
#include "database/SectionScanner.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <set>

// Three readers of the same grammar must agree: the product's, the scan for the device index, and a plain one
// written for this purpose. Texts come from fixed seeds.

namespace {

constexpr int ROUNDS = 8000;

[[nodiscard]] acd::Text copyOf(std::string_view text) {
    acd::MemorySource source(text);
    return acd::readAll(source);
}

[[nodiscard]] acd::LayerText layerOf(const std::string& path, std::string_view text) {
    return {path, copyOf(text)};
}

/// Hands its text out in portions of random size.
class ChunkedSource final : public acd::ByteSource {
public:
    ChunkedSource(std::string_view text, unsigned seed) : m_rest(text), m_random(seed) {}

    [[nodiscard]] std::size_t expectedSize() const noexcept override { return 0; }
    [[nodiscard]] std::size_t read(char* buffer, std::size_t size) override {
        const std::size_t count = m_rest.copy(buffer, std::min<std::size_t>(size, 1 + m_random.pick(7)));
        m_rest.remove_prefix(count);
        return count;
    }

private:
    std::string_view m_rest;
    HostileTexts m_random;
};

/// The names of all headers, by the full reader.
[[nodiscard]] std::vector<std::string> parsedNames(std::string_view text) {
    const acd::Text copy = copyOf(text);
    acd::LineReader reader(copy.bytes.get(), copy.size);
    acd::Line line;
    std::vector<std::string> names;
    while (reader.next(line)) {
        if (line.kind == acd::Line::Kind::HEADER) {
            names.emplace_back(line.name);
        }
    }
    return names;
}

void expectScanAgrees(acd::SectionScanner& scan, std::string_view text, unsigned seed) {
    const auto open = [&] { return std::make_unique<ChunkedSource>(text, seed); };
    ASSERT_EQ(namesOf(scan.names(open)), parsedNames(text)) << testing::PrintToString(std::string(text));
}

/// The keys of all sections.
[[nodiscard]] std::set<std::string> keysOf(const ReferenceParser& reference) {
    std::set<std::string> keys;
    for (const ReferenceParser::Section& section : reference.sections) {
        for (const ReferenceParser::Entry& entry : section.entries) {
            keys.insert(entry.key);
        }
    }
    return keys;
}

/// Compares what a section itself has for a key, and where each byte of it stands.
/// @param expected null when it has none
void expectSameValue(const acd::Database& database, const acd::Section* section, const std::string& key,
                     const ReferenceParser::Entry* expected) {
    const acd::Value* const value = database.find(section, key);
    const bool isOwn = value != nullptr && (section == nullptr || database.holds(*section, *value));
    ASSERT_EQ(isOwn, expected != nullptr);
    if (!isOwn) {
        ASSERT_EQ(value, database.find(nullptr, key));
        return;
    }
    ASSERT_EQ(value->text().size(), expected->value.size());
    AcdStore::Value placed{value->text(), {}, false, {}};
    for (const acd::LayerSpan& fragment : database.spans(*value)) {
        placed.spans.push_back({fragment.offset, "", "", fragment.location.line, fragment.location.column});
    }
    ASSERT_FALSE(placed.spans.empty());
    for (std::size_t offset = 0; offset != expected->value.size(); ++offset) {
        ASSERT_EQ(value->text()[offset], expected->value[offset].value);
        ASSERT_EQ(placed.at(offset).line, expected->value[offset].line);
        ASSERT_EQ(placed.at(offset).column, expected->value[offset].column);
    }
}

void expectSameDatabase(const std::vector<std::string>& layers) {
    ReferenceParser reference;
    std::vector<acd::LayerText> texts;
    for (const std::string& layer : layers) {
        reference.add(layer);
        texts.push_back(layerOf("", layer));
    }
    std::vector<acd::LayerError> faults;
    const acd::Database database(std::move(texts), faults);

    ASSERT_EQ(database.sectionNames().size() + 1, reference.sections.size());
    for (std::uint32_t index = 0; index != reference.sections.size(); ++index) {
        const ReferenceParser::Section& expected = reference.sections[index];
        const acd::Section* section = nullptr;
        if (index != 0) {
            ASSERT_EQ(database.sectionNames()[index - 1], expected.name);
            section = database.section(expected.name);
            ASSERT_EQ(database.ordinal(section), index);
        }
        for (const std::string& key : keysOf(reference)) {
            const auto entry = std::find_if(expected.entries.begin(), expected.entries.end(),
                                            [&](const auto& candidate) { return candidate.key == key; });
            ASSERT_NO_FATAL_FAILURE(
                expectSameValue(database, section, key, entry == expected.entries.end() ? nullptr : &*entry))
                << key;
        }
    }
    ASSERT_EQ(faults.size(), reference.faultLines.size());
    for (std::size_t index = 0; index != faults.size(); ++index) {
        ASSERT_GE(faults[index].error.location.line, reference.faultLines[index]);
    }
}

} // namespace

TEST(Agreement, OfReaderAndPlainReaderOnHostileTexts) {
    HostileTexts texts(1);
    for (int round = 0; round < ROUNDS; ++round) {
        const std::string text = texts.next();
        ASSERT_NO_FATAL_FAILURE(expectSameDatabase({text})) << testing::PrintToString(text);
    }
}

TEST(Agreement, OfReaderAndPlainReaderOnLayers) {
    HostileTexts texts(2);
    for (int round = 0; round < ROUNDS; ++round) {
        const std::vector<std::string> layers = {texts.next(), texts.next(), texts.next()};
        ASSERT_NO_FATAL_FAILURE(expectSameDatabase(layers)) << testing::PrintToString(layers);
    }
}

TEST(Agreement, OfReaderAndPlainReaderOnNoise) {
    HostileTexts texts(3);
    for (int round = 0; round < 200; ++round) {
        const std::string text = texts.noise(texts.pick(3000));
        ASSERT_NO_FATAL_FAILURE(expectSameDatabase({text})) << round;
    }
}

TEST(Agreement, OfScanAndReaderOnLinesThatABufferOfAnySizeCutsApart) {
    for (const std::string text : {"",
                                   "\n",
                                   "[A]",
                                   "[A]\n",
                                   "[A]\r\n[B]\r\n",
                                   " \t[A] \n\t [B]",
                                   "\r[A]\n",
                                   "x [A]\n[B]",
                                   "a[A]\n[B]",
                                   "[A\n[B]",
                                   "[]\n[A]",
                                   "[A]x\n[B]",
                                   "[A ]\n[B]",
                                   "\xEF\xBB\xBF[A]\n[B]",
                                   "K = 12\n\xEF\xBB\xBF[A]\n[B]",
                                   "\n\xEF\xBB\xBF[A]\n",
                                   "K = 1\\\n[A]\n[B]",
                                   "K = 1\\\r\n[A]\r\n[B]",
                                   "[A]\\\n[B]\n[C]",
                                   "#\\\n[A]\n[B]",
                                   "\\\n[A]\n[B]",
                                   "[A\\\n]\n[B]",
                                   "K = [A]\n[B]\nL = [C]\n"}) {
        for (std::size_t size = 1; size != 40; ++size) {
            acd::SectionScanner scan(size);
            ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, text, static_cast<unsigned>(size))) << size;
        }
    }
}

TEST(Agreement, OfScanAndReaderOnHostileTexts) {
    HostileTexts texts(4);
    acd::SectionScanner scan;
    for (unsigned round = 0; round < ROUNDS; ++round) {
        ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, texts.next(), round));
    }
}

TEST(Agreement, OfScanAndReaderWhateverTheBufferCutsApart) {
    HostileTexts texts(5);
    for (unsigned round = 0; round < ROUNDS; ++round) {
        acd::SectionScanner scan(1 + texts.pick(24));
        ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, texts.next(), round));
    }
}

TEST(Agreement, OfScanAndReaderOnNoise) {
    HostileTexts texts(6);
    acd::SectionScanner scan(200);
    for (unsigned round = 0; round < 500; ++round) {
        ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, texts.noise(texts.pick(3000)), round));
    }
}

TEST(Agreement, OfScanAndReaderAtEveryPlaceOfTheBuffersEnd) {
    for (const std::string header : {"[A]", " \t[A] ", "[A]\\\n", "\\\n[A]", "#\\\n[A]", "x\r\n[A]\r\n"}) {
        for (std::size_t room = 0; room != 16; ++room) {
            const std::string filler(acd::SectionScanner::BUFFER_SIZE - 2 - room, '#');
            acd::SectionScanner scan;
            ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, filler + "\n" + header + "\n[B]", 1));
            ASSERT_NO_FATAL_FAILURE(expectScanAgrees(scan, filler + "\n" + header, 1));
        }
    }
}

TEST(Agreement, OfScanAndReaderOnALineLongerThanTheBuffer) {
    acd::SectionScanner scan(16);
    expectScanAgrees(scan, "[A]\n" + std::string(100, 'x') + "\n[B]\n", 1);
    expectScanAgrees(scan, "[A]\n[" + std::string(100, 'x') + "]\n[B]\n", 1);
}

TEST(Agreement, OfScanAndReaderOnFilesOfUsualForm) {
    std::string text = "# kestrel\nOPERATION = PROGRAM,Bscan,USB2: \\\n  VERIFY,Bscan,USB2\n\n";
    std::vector<std::string> devices;
    for (int device = 0; text.size() < 3 * acd::SectionScanner::BUFFER_SIZE; ++device) {
        devices.push_back("KS" + std::to_string(device));
        text += "[" + devices.back() + "]\nPROPERTY = PINS,[7:0]:FLASH,TRUE\n";
    }
    acd::SectionScanner scan;
    int opened = 0;
    const auto open = [&] {
        ++opened;
        return std::make_unique<acd::MemorySource>(text);
    };
    EXPECT_EQ(namesOf(scan.names(open)), devices);
    EXPECT_EQ(opened, 1) << "the fast way is meant for such files";
}
