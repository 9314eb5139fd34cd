#include "PackedNames.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

/// What the bytes are taken for; "refused" alone if they are no packed names.
[[nodiscard]] std::vector<std::string> namesIn(const std::string& bytes) {
    const std::shared_ptr<char[]> owner(new char[bytes.size()]);
    bytes.copy(owner.get(), bytes.size());
    const auto packed = acd::PackedStrings::from(owner, {owner.get(), bytes.size()});
    return packed ? namesOf(*packed) : std::vector{"refused"s};
}

} // namespace

TEST(PackedStrings, FollowTheirLengths) {
    EXPECT_EQ(pack({"KS50", "M"}).bytes(), "\x04\0\0\0KS50\x01\0\0\0M"s);
    EXPECT_EQ(pack({}).bytes(), "");
    EXPECT_THAT(namesIn(""), IsEmpty());
    EXPECT_THAT(namesIn("\x04\0\0\0KS50\x01\0\0\0M"s), ElementsAre("KS50", "M"));
    const std::string large(0x01020304, 'x');
    EXPECT_THAT(namesIn("\x04\x03\x02\x01" + large), ElementsAre(large));
}

TEST(PackedStrings, AreRefusedIfTheyDoNotFitTogether) {
    EXPECT_THAT(namesIn("\x01\0\0"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\x01\0\0\0"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\x02\0\0\0M"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\x01\0\0\0MM"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\xFF\xFF\xFF\xFFM"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\0\0\0\0"s), ElementsAre("refused"));
    EXPECT_THAT(namesIn("\x01\0\0\0M\0\0\0\0"s), ElementsAre("refused"));
}

TEST(PackedStrings, OutliveThePackerAndEachOther) {
    acd::PackedStrings kept;
    {
        acd::StringPacker packer;
        packer.add("KS50");
        const acd::PackedStrings packed = packer.pack();
        kept = packed;
        packer.clear();
        packer.add("ML1");
        EXPECT_THAT(namesOf(packer.pack()), ElementsAre("ML1"));
    }
    EXPECT_THAT(namesOf(kept), ElementsAre("KS50"));
    EXPECT_EQ(kept.count(), 1U);
    EXPECT_EQ(acd::PackedStrings().count(), 0U);
}

TEST(PackedStrings, AreFoundWhateverTheirCase) {
    const acd::PackedStrings names = pack({"KS50", "ks100", "\xE9"});
    EXPECT_TRUE(names.containsIgnoreCase("ks50"));
    EXPECT_TRUE(names.containsIgnoreCase("KS100"));
    EXPECT_TRUE(names.containsIgnoreCase("\xE9"));
    EXPECT_FALSE(names.containsIgnoreCase("\xC9"));
    EXPECT_FALSE(names.containsIgnoreCase("KS5"));
    EXPECT_FALSE(names.containsIgnoreCase("ML50"));
    EXPECT_FALSE(names.containsIgnoreCase("KS51"));
    EXPECT_FALSE(names.containsIgnoreCase(""));
}
