#include <StringBase.h>

#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <string>
#include <string_view>
#include <unordered_set>

// What makes `StringBase` at home among the texts of the standard library.

using namespace std::string_view_literals;

TEST(StringBaseInterface, IsMadeFromAndBecomesAStringView) {
    const StringBase text("a\0b"sv);
    EXPECT_EQ(text.GetLength(), 3U);
    const std::string_view view = text;
    EXPECT_EQ(view, "a\0b"sv);
    EXPECT_EQ(view.data(), text.c_str());
    EXPECT_EQ(std::string(std::string_view(StringBase(std::string("long enough for the heap, surely")))),
              "long enough for the heap, surely");
    static_assert(!std::is_convertible_v<std::string_view, StringBase>);
}

template <typename Text>
void compare(const Text& same, const Text& greater) {
    const StringBase text("KS50");
    EXPECT_TRUE(text == same);
    EXPECT_TRUE(same == text);
    EXPECT_FALSE(text == greater);
    EXPECT_FALSE(greater == text);
    EXPECT_FALSE(text != same);
    EXPECT_FALSE(same != text);
    EXPECT_TRUE(text != greater);
    EXPECT_TRUE(greater != text);
    EXPECT_FALSE(text < same);
    EXPECT_FALSE(same < text);
    EXPECT_TRUE(text < greater);
    EXPECT_FALSE(greater < text);
}

TEST(StringBaseInterface, ComparesWithEveryKindOfText) {
    compare<const char*>("KS50", "KS60");
    compare<char[5]>({'K', 'S', '5', '0', 0}, {'K', 'S', '6', '0', 0});
    compare<std::string>("KS50", "KS60");
    compare<std::string_view>("KS50", "KS60");
    compare<StringBase>("KS50", "KS60");
    EXPECT_TRUE(StringBase("KS50") == "KS50");
    EXPECT_TRUE("KS50" < StringBase("KS51"));
}

TEST(StringBaseInterface, TakesNullForTheEmptyText) {
    const char* const null = nullptr;
    EXPECT_TRUE(StringBase() == null);
    EXPECT_TRUE(null == StringBase());
    EXPECT_TRUE(null < StringBase("a"));
    EXPECT_TRUE(StringBase("a") != null);
}

TEST(StringBaseInterface, ComparesNulsAndUnsignedBytes) {
    EXPECT_FALSE(StringBase("a\0b"sv) == "a");
    EXPECT_TRUE(StringBase("a") < "a\0b"sv);
    EXPECT_TRUE(StringBase("z") < "\x80");
}

TEST(StringBaseInterface, IsWrittenToStreams) {
    std::ostringstream stream;
    stream << StringBase("a\0b"sv) << '|' << StringBase();
    EXPECT_EQ(stream.str(), "a\0b|"sv);
}

TEST(StringBaseInterface, IsAKeyOfHashContainersAndMaps) {
    EXPECT_EQ(std::hash<StringBase>()("KS50"), std::hash<std::string_view>()("KS50"));
    const std::unordered_set<StringBase> names = {"KS50", "KS100", "KS50"};
    EXPECT_EQ(names.size(), 2U);
    const std::map<StringBase, int> ordered = {{"b", 2}, {"a", 1}};
    EXPECT_EQ(ordered.begin()->second, 1);
}

TEST(StringBaseInterface, IsARangeOfBytes) {
    EXPECT_TRUE(StringBase().empty());
    EXPECT_FALSE(StringBase("\0"sv).empty());
    std::string bytes;
    const StringBase text("a\0b"sv);
    for (const char byte : text) {
        bytes += byte;
    }
    EXPECT_EQ(bytes, "a\0b"sv);
    const StringBase none;
    EXPECT_EQ(none.begin(), none.end());
}
