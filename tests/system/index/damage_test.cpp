// An index that is cut or changed anywhere gives no other answer than none.
#include "VirtualTime.h"

#include "cli/support/DatabaseDirectory.h"
#include "support/Fixtures.h"

#include "commands/IndexWriter.h"
#include "database/Catalogue.h"
#include "database/DirectoryIndex.h"
#include "generate/DatabaseText.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <iterator>
#include <optional>
#include <string_view>

namespace {

/// Each how many cases are tried: all of them when TARVIK_PROPERTY_CALLS asks for a million.
std::size_t stride() {
    const char* const calls = std::getenv("TARVIK_PROPERTY_CALLS");
    return calls != nullptr && std::strtol(calls, nullptr, 10) >= 1'000'000 ? 1 : 50;
}

std::optional<acd::DirectoryIndex> decodeIndex(std::string_view bytes) {
    acd::MemorySource source(bytes);
    return acd::DirectoryIndex::decode(acd::readAll(source));
}

/// Ten families with three hundred devices, and their index.
class DamagedIndex : public testing::Test {
protected:
    DamagedIndex() : m_directory(bench::databaseText(m_facts)) {
        ::unsetenv("TARVIK_INDEX");
        virtualTime::reset();
        virtualTime::advance(2 * virtualTime::TICK);
        // Written again, since it is not until now that their times are virtual.
        for (const auto& [name, text] : bench::databaseText(m_facts)) {
            virtualTime::write(m_directory.path(name), text);
        }
        virtualTime::advance(2 * virtualTime::TICK);
        (void)writeIndex(m_directory.path());
        std::ifstream file(m_directory.path("index.acx"), std::ios::binary);
        m_bytes.assign(std::istreambuf_iterator<char>(file), {});
    }

    /// The families of some devices as a new process finds them, and its messages.
    [[nodiscard]] std::string answers() const {
        MessageRecorder recorder;
        acd::DeferredMessages messages;
        acd::Catalogue catalogue({m_directory.path()}, messages);
        std::string text;
        for (const bench::Family& family : m_facts.families) {
            for (const std::string& name : {family.devices.front().name, family.devices.back().name + "X"}) {
                const acd::Family* const found = catalogue.familyOfDevice(name, messages);
                text += name + ' ' + (found == nullptr ? "-" : found->name) + '\n';
            }
        }
        messages.issue();
        for (const IssuedMessage& message : recorder.take()) {
            text += message.text;
        }
        return text;
    }

    void useBytes(const std::string& bytes) const {
        std::ofstream(m_directory.path("index.acx"), std::ios::binary)
            .write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    }

    bench::Facts m_facts = bench::makeFacts(*bench::sizeNamed("S"), bench::USUAL_SEED);
    DatabaseDirectory m_directory;
    std::string m_bytes;
};

TEST_F(DamagedIndex, IsUsedAsLongAsItIsWhole) {
    const auto index = decodeIndex(m_bytes);
    ASSERT_TRUE(index);
    EXPECT_EQ(index->contents().files.size(), 12U);
    for (const acd::IndexedFile& file : index->contents().files) {
        EXPECT_TRUE(index->contents().isSettled(file)) << file.name;
    }
    const std::string expected = answers();
    ::setenv("TARVIK_INDEX", "off", 1);
    EXPECT_EQ(answers(), expected);
    ::unsetenv("TARVIK_INDEX");
}

TEST_F(DamagedIndex, IsRefusedWhereverItEnds) {
    const std::string expected = answers();
    for (std::size_t size = 0; size != m_bytes.size(); ++size) {
        ASSERT_FALSE(decodeIndex(std::string_view(m_bytes).substr(0, size))) << size;
        if (size % stride() == 0) {
            useBytes(m_bytes.substr(0, size));
            ASSERT_EQ(answers(), expected) << size;
        }
    }
}

TEST_F(DamagedIndex, IsRefusedWhicheverByteDiffers) {
    const std::string expected = answers();
    for (std::size_t place = 0; place != m_bytes.size(); ++place) {
        std::string changed = m_bytes;
        for (std::size_t value = 1 + place % stride(); value < 256; value += stride()) {
            changed[place] = static_cast<char>(static_cast<std::size_t>(m_bytes[place]) ^ value);
            ASSERT_FALSE(decodeIndex(changed)) << place << " by " << value;
        }
        if (place % stride() == 0) {
            useBytes(changed);
            ASSERT_EQ(answers(), expected) << place;
        }
    }
}

} // namespace
