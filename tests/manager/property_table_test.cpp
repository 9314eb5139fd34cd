#include "Members.h"

// The hash table of the properties by itself.

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

constexpr PropertyValues::Owner OWNER{};

void add(PropertyTable& table, std::string_view owner, const std::string& name, const char* value) {
    std::vector<ParsedProperty> found;
    found.push_back({name.c_str(), PropertyValues(value, OWNER)});
    table.assign(owner, std::move(found));
}

std::string valueOf(const PropertyTable& table, std::string_view owner, std::string_view property) {
    const PropertyValues* const values = table.find(owner, property);
    return values == nullptr ? "none" : text(values->first());
}

TEST(PropertyTable, StartsEmptyWith193Buckets) {
    const PropertyTable table;
    EXPECT_TRUE(table.empty());
    EXPECT_THAT(lists(table), IsEmpty());
    EXPECT_EQ(table.bucketCount(), 193U);
    EXPECT_EQ(table.find("", ""), nullptr);
}

TEST(PropertyTable, PlacesAKeyByItsCrc32) {
    const PropertyTable table;
    for (const auto& [owner, property] : std::map<std::string, std::string>{
             {"", ""}, {"KS50", "FLASH"}, {"kestrel", "VENDOR"}, {"\xff", "\xff"}}) {
        const StringBase key((owner + "_" + property).c_str());
        EXPECT_EQ(table.bucket(owner, property), key.CRC32() % 193) << owner;
    }
}

TEST(PropertyTable, HoldsOnePropertyForEachJoinedText) {
    PropertyTable table;
    add(table, "a", "b_c", "1");
    EXPECT_EQ(valueOf(table, "a_b", "c"), "1");
    add(table, "a_b", "c", "2");
    EXPECT_EQ(valueOf(table, "a", "b_c"), "2");
    EXPECT_THAT(lists(table), ElementsAre(Pair("a_b_c", ElementsAre("2"))));
    EXPECT_EQ(valueOf(table, "a", "b"), "none");
    EXPECT_EQ(valueOf(table, "", "a_b_c"), "none");
}

TEST(PropertyTable, TellsTextsOfTheSameChecksumApart) {
    ASSERT_EQ(StringBase("dev_VYJKSYC").CRC32(), StringBase("dev_ZELGRWE").CRC32());
    PropertyTable table;
    add(table, "dev", "VYJKSYC", "1");
    EXPECT_EQ(valueOf(table, "dev", "ZELGRWE"), "none");
    add(table, "dev", "ZELGRWE", "2");
    EXPECT_EQ(valueOf(table, "dev", "VYJKSYC"), "1");
    EXPECT_EQ(valueOf(table, "dev", "ZELGRWE"), "2");
    EXPECT_EQ(valueOf(table, "de", "v_VYJKSY"), "none");
}

TEST(PropertyTable, TakesOfTheSameNameTheLastWhereverItStands) {
    for (const int between : {0, 1, 31, 32, 100}) {
        PropertyTable table;
        std::vector<ParsedProperty> found;
        found.push_back({"A", PropertyValues("1", OWNER)});
        for (int number = 0; number < between; ++number) {
            found.push_back({("B" + std::to_string(number)).c_str(), PropertyValues("x", OWNER)});
        }
        found.push_back({"A", PropertyValues("2", OWNER)});
        table.assign("dev", std::move(found));
        EXPECT_EQ(valueOf(table, "dev", "A"), "2") << between;
        EXPECT_EQ(table.size(), static_cast<std::size_t>(between) + 1);
    }
}

TEST(PropertyTable, FindsEachOfManyAndLeavesThemWhereTheyAre) {
    constexpr int COUNT = 3000;
    PropertyTable table;
    std::vector<const PropertyValues*> places;
    for (int number = 0; number < COUNT; ++number) {
        const std::string name = std::to_string(number);
        add(table, "dev", name, name.c_str());
        places.push_back(table.find("dev", name));
        EXPECT_GE(table.bucketCount(), table.size());
        EXPECT_LE(table.bucketCount(), std::max<std::size_t>(193, 2 * table.size() + 1));
    }
    for (int number = 0; number < COUNT; ++number) {
        const std::string name = std::to_string(number);
        EXPECT_EQ(table.find("dev", name), places[static_cast<std::size_t>(number)]);
        EXPECT_EQ(valueOf(table, "dev", name), name);
    }
}

TEST(PropertyTable, KeepsReplacedEntriesAsTheyAre) {
    PropertyTable table;
    add(table, "a", "b_c", "1");
    const PropertyValues* const replaced = table.find("a", "b_c");
    const char* const text = replaced->first().c_str();
    const auto& set = replaced->set();
    add(table, "a_b", "c", "2");
    EXPECT_NE(table.find("a", "b_c"), replaced);
    EXPECT_STREQ(text, "1");
    EXPECT_THAT(texts(set), ElementsAre("1"));
    EXPECT_EQ(table.size(), 1U);
}

TEST(PropertyTable, HoldsKeysOfAnyLength) {
    PropertyTable table;
    for (const std::size_t length : {0U, 1U, 4094U, 4095U, 4096U, 10000U, 5U}) {
        const std::string name(length, 'x');
        add(table, "dev", name, name.c_str());
        EXPECT_EQ(valueOf(table, "dev", name), name);
    }
    EXPECT_EQ(table.size(), 7U);
}

TEST(PropertyTable, GivesItsEntriesInTheOrderInWhichTheyCame) {
    PropertyTable table;
    add(table, "z", "1", "x");
    add(table, "a", "2", "y");
    add(table, "z", "1", "z");
    std::vector<std::string> keys;
    for (const auto& [key, values] : table) {
        keys.emplace_back(key);
    }
    EXPECT_THAT(keys, ElementsAre("z_1", "a_2"));
}

} // namespace
