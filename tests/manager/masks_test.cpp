#include <tarvik/Masks.h>

#include <tarvik/ConstraintsManager.h>

#include <gmock/gmock.h>

#include <algorithm>
#include <climits>
#include <map>
#include <string>
#include <string_view>
#include <vector>

// Masks and sets as an application reads them.

using TARVIKNS::OP_TYPE;
using TARVIKNS::PROGRAM_OPTION;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

template <typename Value>
[[nodiscard]] std::vector<Value> valuesOf(int mask) {
    std::vector<Value> values;
    for (const Value value : MaskValues<Value>(mask)) {
        values.push_back(value);
    }
    return values;
}

} // namespace

TEST(Masks, HoldTheValuesOfTheirBits) {
    EXPECT_TRUE(maskHolds(0b101, OP_TYPE{2}));
    EXPECT_FALSE(maskHolds(0b101, OP_TYPE{1}));
    EXPECT_TRUE(maskHolds(1, PROGRAM_OPTION{0}));
    EXPECT_FALSE(maskHolds(0, 0));
}

TEST(Masks, HoldTheValueOfTheHighestBit) {
    EXPECT_TRUE(maskHolds(INT_MIN, OP_TYPE{31}));
    EXPECT_FALSE(maskHolds(INT_MIN, OP_TYPE{30}));
    EXPECT_TRUE(maskHolds(-1, 31));
}

TEST(Masks, HoldNoValuesOutsideTheirBits) {
    EXPECT_FALSE(maskHolds(-1, 32));
    EXPECT_FALSE(maskHolds(-1, -1));
    EXPECT_FALSE(maskHolds(-1, OP_TYPE{33}));
}

TEST(Masks, AreRangesOfValues) {
    EXPECT_THAT(valuesOf<OP_TYPE>(0b10001001), ElementsAre(OP_TYPE{0}, OP_TYPE{3}, OP_TYPE{7}));
    EXPECT_THAT(valuesOf<int>(INT_MIN | 1), ElementsAre(0, 31));
    EXPECT_THAT(valuesOf<int>(0), IsEmpty());
    EXPECT_EQ(valuesOf<int>(-1).size(), 32U);
}

TEST(Masks, TellWhetherTheyAreEmpty) {
    EXPECT_TRUE(MaskValues<OP_TYPE>(0).empty());
    EXPECT_FALSE(MaskValues<OP_TYPE>(INT_MIN).empty());
}

TEST(Masks, CanBeUsedWithAlgorithmsAndAtCompileTime) {
    static_assert(*MaskValues<int>(INT_MIN).begin() == 31);
    static_assert(maskHolds(4, OP_TYPE{2}));
    const MaskValues<int> values(0b110);
    EXPECT_EQ(std::count_if(values.begin(), values.end(), [](int value) { return value == 2; }), 1);
    auto value = values.begin();
    EXPECT_EQ(*value++, 1);
    EXPECT_EQ(*value, 2);
}

TEST(TextSets, AreSearchedByEveryKindOfText) {
    const ConstraintsManager::TextSet set = {"FALSE", "TRUE"};
    const std::map<StringBase, StringBase, ltptstr> map = {{"KS50", "0101"}};
    EXPECT_EQ(set.count("TRUE"), 1U);
    EXPECT_EQ(set.count(std::string("TRUE")), 1U);
    EXPECT_EQ(set.count(std::string_view("TRUE")), 1U);
    EXPECT_EQ(set.count(StringBase("TRUE")), 1U);
    const char* const text = "KS50";
    EXPECT_EQ(map.count(text), 1U);
    EXPECT_NE(map.find("KS50"), map.end());
    EXPECT_NE(map.find(std::string("KS50")), map.end());
    EXPECT_NE(map.find(std::string_view("KS50")), map.end());
    EXPECT_NE(map.find(StringBase("KS50")), map.end());
    EXPECT_EQ(map.find("KS5"), map.end());
    EXPECT_EQ(set.count(static_cast<const char*>(nullptr)), 0U);
}
