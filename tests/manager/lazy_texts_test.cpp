// The map that is sorted when it is first read.
#include "Members.h"

#include <LazyTexts.h>

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

namespace {

TEST(LazyTexts, AreEmptyAtFirst) { EXPECT_THAT(LazyTexts().get(), IsEmpty()); }

TEST(LazyTexts, AreSortedByJoinedKeysAndTheLastValueCounts) {
    LazyTexts texts;
    texts.set("b", "", "1");
    texts.set("a", "b", "2");
    texts.set("", "ab", "3");
    texts.set("", "", "");
    texts.set("B", "", "4");
    EXPECT_THAT(entries(texts.get()),
                ElementsAre(Pair("", ""), Pair("B", "4"), Pair("ab", "3"), Pair("b", "1")));
}

TEST(LazyTexts, AreTheSameObjectThatKeepsItsTexts) {
    LazyTexts texts;
    texts.set("a", "", "1");
    const auto& map = texts.get();
    const char* const value = map.begin()->second.c_str();
    texts.set("b", "", "2");
    texts.set("b", "", "3");
    EXPECT_EQ(&texts.get(), &map);
    EXPECT_EQ(texts.get().begin()->second.c_str(), value);
    EXPECT_THAT(entries(map), ElementsAre(Pair("a", "1"), Pair("b", "3")));
}

TEST(LazyTexts, MayBeManyAndLong) {
    LazyTexts texts;
    const std::string longText(300'000, 'x');
    for (int number = 0; number != 10'000; ++number) {
        texts.set("key", std::to_string(number), number == 5'000 ? longText : std::to_string(number + 1));
    }
    ASSERT_EQ(texts.get().size(), 10'000U);
    for (const auto& [key, value] : entries(texts.get())) {
        const std::string number = key.substr(3);
        EXPECT_EQ(value, number == "5000" ? longText : std::to_string(std::stoi(number) + 1));
    }
}

} // namespace
