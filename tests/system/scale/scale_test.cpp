// Databases at the size where something ends: 32,768 items of a list, 16 MiB of a line.
#include "support/Fixtures.h"
#include "support/TarvikTestPeer.h"

#include <Implementation.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using Files = std::map<std::string, std::string>;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::IsEmpty;
using testing::SizeIs;

constexpr int MOST_ITEMS = 32768;
constexpr std::size_t LONGEST_LINE = std::size_t{16} << 20;

/// NAME00000, NAME00001, ...: of one length, so that numbers and bytes sort alike.
std::string numbered(const std::string& name, int number) {
    const std::string digits = std::to_string(number);
    return name + std::string(5 - digits.size(), '0') + digits;
}

std::string list(const std::string& name, int count, char separator = ',') {
    std::string text;
    for (int number = 0; number < count; ++number) {
        text += (number == 0 ? "" : std::string(1, separator)) + numbered(name, number);
    }
    return text;
}

class Scale : public testing::Test {
protected:
    ~Scale() override { TarvikTestPeer::reset(); }

    ConstraintsManager& start(Files files) {
        AcdStore::setMemoryFiles(std::move(files));
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        EXPECT_THAT(m_messages.take(), IsEmpty());
        return *manager;
    }

    MessageRecorder m_messages;
};

TEST_F(Scale, ThirtyTwoThousandDevicesOfOneFamily) {
    std::string family = "OPERATION = PROGRAM,Bscan,USB2\n";
    for (int number = 0; number < MOST_ITEMS; ++number) {
        family += '[' + numbered("DV", number) + "]\nPROPERTY = PINS," + std::to_string(number) + '\n';
    }
    ConstraintsManager& manager = start(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"}, {"finch.acd", family}});
    EXPECT_THAT(AcdStore::devices("finch"), SizeIs(MOST_ITEMS));
    for (int number = 0; number < MOST_ITEMS; number += 997) {
        const std::string device = numbered("DV", number);
        EXPECT_EQ(manager.getDeviceOperations(device.c_str(), MODE_TYPE::BS, OUTPUT_TYPE::USB2), 1);
        EXPECT_EQ(manager.getDeviceLongProperty(device.c_str(), "PINS"), number);
    }
}

TEST_F(Scale, AThousandFamilies) {
    constexpr int FAMILIES = 1000;
    const std::string families = list("fam", FAMILIES);
    Files files{
        {"base.acd", "DEVICE_SUPPORTED = " + families + "\nPROGRAM_OPTION_PACKAGE = " + families + '\n'}};
    for (int number = 0; number < FAMILIES; ++number) {
        files[numbered("fam", number) + ".acd"] =
            (number % 2 == 0 ? "OPERATION = PROGRAM,Bscan,USB2\n[" : "OPERATION = VERIFY,Bscan,USB2\n[") +
            numbered("DV", number) + "]\n";
    }
    ConstraintsManager& manager = start(std::move(files));
    for (int number = 0; number < FAMILIES; ++number) {
        const std::string device = numbered("DV", number);
        EXPECT_EQ(manager.getDeviceOperations(device.c_str(), MODE_TYPE::BS, OUTPUT_TYPE::USB2),
                  number % 2 == 0 ? 1 : 8);
        EXPECT_EQ(std::string(manager.getPartFamily(device.c_str()).c_str()), numbered("fam", number));
    }
}

/// Items are numbered by a signed 16-bit index: what stands behind the last of them is never reached.
class ScaleOfLists : public Scale, public testing::WithParamInterface<int> {
protected:
    const int m_count = GetParam();
    const std::size_t m_reached = static_cast<std::size_t>(std::min(m_count, MOST_ITEMS));
};

TEST_P(ScaleOfLists, OfItems) {
    ConstraintsManager& manager = start({{"base.acd", "DEVICE_SUPPORTED = " + list("fam", m_count) + '\n'}});
    EXPECT_EQ(TarvikTestPeer::members(manager).m_supportedDevices.size(), m_reached);
}

TEST_P(ScaleOfLists, OfRecords) {
    ConstraintsManager& manager = start({{"base.acd", "IDCODE = " + list("DV", m_count, ':') + '\n'}});
    EXPECT_THAT(manager.getAllDeviceIdcodes(), SizeIs(m_reached));
}

TEST_P(ScaleOfLists, OfFields) {
    // Two fields stand before the values: the name and how many there are.
    const std::string property =
        "PROPERTIES = K," + std::to_string(m_count) + ',' + list("v", m_count) + '\n';
    ConstraintsManager& manager =
        start({{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
               {"finch.acd", property}});
    manager.setExceptions(false);
    const auto& values = manager.getDeviceStringProperties("finch", "K");
    // Behind the last field that is reached there is one missing, which stands as the empty text.
    const bool isCut = m_count > MOST_ITEMS - 2;
    EXPECT_EQ(values.size(), isCut ? static_cast<std::size_t>(MOST_ITEMS - 2) + 1 : m_reached);
    EXPECT_EQ(values.begin()->GetLength() == 0, isCut);
}

INSTANTIATE_TEST_SUITE_P(AroundTheEnd, ScaleOfLists,
                         testing::Values(MOST_ITEMS - 1, MOST_ITEMS, MOST_ITEMS + 1));

TEST_F(Scale, AValueThatFillsTheLongestLine) {
    const std::string opening = "PROPERTY = TEXT,";
    const std::string value(LONGEST_LINE - opening.size(), 'x');
    ConstraintsManager& manager =
        start({{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
               {"finch.acd", opening + value + "\n"}});
    const char* const text = manager.getDeviceStringProperty("finch", "TEXT");
    ASSERT_NE(text, nullptr);
    EXPECT_TRUE(text == value);
}

TEST_F(Scale, AValueOfMoreThanThatByAppending) {
    const std::string half(std::size_t{10} << 20, 'x');
    ConstraintsManager& manager =
        start({{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
               {"finch.acd", "PROPERTY = TEXT," + half + "\nPROPERTY += " + half + '\n'}});
    EXPECT_TRUE(manager.getDeviceStringProperty("finch", "TEXT") == half + half);
}

TEST_F(Scale, ALineOverTheLongestIsRefusedAndTheRestServes) {
    AcdStore::setMemoryFiles(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", "LONG = " + std::string(LONGEST_LINE, 'x') + "\nPROPERTY = K,v\n"}});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    EXPECT_STREQ(manager->getDeviceStringProperty("finch", "K"), "v");
    EXPECT_THAT(m_messages.take(), SizeIs(1));
}

} // namespace
