#include "Members.h"

// Whether a name is an SPI flash, its class, and its properties with the fallback to the class.

using testing::IsEmpty;

namespace {

struct FlashSession : ManagerFixture {
    explicit FlashSession(const std::string& spi) : ManagerFixture({{"base.acd", ""}, {"spi.acd", spi}}) {}

    std::string property(const char* device, const char* name) {
        return (*this)->getSpiDeviceStringProperty(device, name);
    }
    std::string classOf(const char* device) { return text(members().spiDeviceClass(device)); }
};

TEST(SpiDevices, NamesAreFoundInAnyCase) {
    FlashSession session("DEVICE_FAMILY = FLASHES\nFLASHES_DEVICES = FLASH25A,FLASH26\n");
    for (const char* name : {"FLASH25A", "flash25a", "Flash25A", "flash26", "FLASHES", "flashes"}) {
        EXPECT_TRUE(session->isSpiDevice(name)) << name;
    }
}

TEST(SpiDevices, OtherNamesAreNone) {
    FlashSession session("DEVICE_FAMILY = FLASHES\nFLASHES_DEVICES = FLASH25A\n");
    for (const char* name : {"", "FLASH25", "FLASH25AB", "FLASH25A_SO8", "spi", "KS50"}) {
        EXPECT_FALSE(session->isSpiDevice(name)) << name;
    }
    EXPECT_FALSE(session->isSpiDevice(nullptr));
    EXPECT_FALSE(session->isSpiDevice(StringBase("FLASH25A\0x", 10)));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiDevices, LowerCaseEntryCanNeverMatch) {
    FlashSession session("DEVICE_FAMILY = flashes,\xe4\nflashes_DEVICES = Flash1\n");
    EXPECT_FALSE(session->isSpiDevice("flashes"));
    EXPECT_FALSE(session->isSpiDevice("FLASHES"));
    EXPECT_FALSE(session->isSpiDevice("Flash1"));
    EXPECT_TRUE(session->isSpiDevice("\xe4"));
}

TEST(SpiDevices, ArgumentIsLeftAlone) {
    FlashSession session("DEVICE_FAMILY = FLASHES\n");
    const StringBase name("flashes");
    EXPECT_TRUE(session->isSpiDevice(name));
    EXPECT_EQ(text(name), "flashes");
}

TEST(SpiClass, IsThatOfTheListThatHoldsTheDevice) {
    FlashSession session(R"(
AT1_DEVICES = A
ST1_DEVICES = B
ST2_DEVICES = X,C
BPI1_DEVICES = D
BPI2_DEVICES = E
BPI3_DEVICES = F
)");
    EXPECT_EQ(session.classOf("A"), "AT1");
    EXPECT_EQ(session.classOf("B"), "ST1");
    EXPECT_EQ(session.classOf("c"), "ST2");
    EXPECT_EQ(session.classOf("D"), "BPI1");
    EXPECT_EQ(session.classOf("E"), "BPI2");
    EXPECT_EQ(session.classOf("F"), "BPI3");
    EXPECT_EQ(session.classOf("G"), "");
    EXPECT_EQ(session.classOf(""), "");
    EXPECT_EQ(session.classOf(nullptr), "");
}

TEST(SpiClass, IgnoresCaseOnBothSides) {
    FlashSession session("ST1_DEVICES = Flash1\n");
    EXPECT_EQ(session.classOf("fLASH1"), "ST1");
}

TEST(SpiClass, LastListWins) {
    FlashSession session(R"(
AT1_DEVICES = A,B,C
ST1_DEVICES = A
ST2_DEVICES = B
BPI1_DEVICES = a
BPI3_DEVICES = c
)");
    EXPECT_EQ(session.classOf("A"), "BPI1");
    EXPECT_EQ(session.classOf("B"), "ST2");
    EXPECT_EQ(session.classOf("C"), "BPI3");
}

TEST(SpiDeviceProperties, AreTheDevicesOwnFirst) {
    FlashSession session(R"(
DEVICE_FAMILY = F,ST1
F_DEVICES = F1,F2
F1_PROPERTY = SIZE,4
ST1_DEVICES = F1,F2
ST1_PROPERTY = SIZE,16
)");
    EXPECT_EQ(session.property("F1", "SIZE"), "4");
    EXPECT_EQ(session.property("F2", "SIZE"), "16");
}

TEST(SpiDeviceProperties, AreSearchedInUpperCase) {
    FlashSession session(
        "DEVICE_FAMILY = F1,ST1\nF1_PROPERTY = SIZE,4\nST1_PROPERTY = WIDTH,8\nST1_DEVICES = F1\n");
    EXPECT_EQ(session.property("f1", "Size"), "4");
    EXPECT_EQ(session.property("f1", "width"), "8");
}

TEST(SpiDeviceProperties, KeptInAnotherCaseAreNeverFound) {
    FlashSession session("DEVICE_FAMILY = F1,f2,ST1\nF1_PROPERTY = Size,4\nF2_PROPERTY = SIZE,4\n"
                         "ST1_DEVICES = F1\nST1_PROPERTY = Width,8\n");
    EXPECT_EQ(session.property("F1", "Size"), "");
    EXPECT_EQ(session.property("f2", "SIZE"), "");
    EXPECT_EQ(session.property("F1", "Width"), "");
}

TEST(SpiDeviceProperties, ClassGivesNoneUnlessItIsItselfAnSpiName) {
    const std::string spi = "F_DEVICES = F1\nST1_DEVICES = F1\nST1_PROPERTY = SIZE,16\n";
    {
        FlashSession session("DEVICE_FAMILY = F\n" + spi);
        EXPECT_EQ(session.property("F1", "SIZE"), "");
    }
    FlashSession session("DEVICE_FAMILY = F,ST1\n" + spi);
    EXPECT_EQ(session.property("F1", "SIZE"), "16");
}

TEST(SpiDeviceProperties, OfAClassThatIsAFamilyAreGivenToAllOfItsDevices) {
    FlashSession session("DEVICE_FAMILY = BPI2\nBPI2_DEVICES = F1,F2\nBPI2_PROPERTY = SIZE,16\n");
    EXPECT_EQ(session.property("F1", "SIZE"), "16");
    EXPECT_EQ(session.property("F2", "SIZE"), "16");
}

TEST(SpiDeviceProperties, ClassOfTheLastListWins) {
    FlashSession session(R"(
DEVICE_FAMILY = ST1,BPI1
ST1_DEVICES = F1
BPI1_DEVICES = F1
ST1_PROPERTY = SIZE,16:WIDTH,1
BPI1_PROPERTY = SIZE,32
)");
    EXPECT_EQ(session.property("F1", "SIZE"), "32");
    EXPECT_EQ(session.property("F1", "WIDTH"), "");
}

TEST(SpiDeviceProperties, EmptyValueOfTheDeviceHidesThatOfTheClass) {
    FlashSession session(
        "DEVICE_FAMILY = F1,ST1\nF1_PROPERTY = SIZE\nST1_DEVICES = F1\nST1_PROPERTY = SIZE,16\n");
    EXPECT_EQ(session.property("F1", "SIZE"), "");
}

TEST(SpiDeviceProperties, OfAFamilyAreItsOwn) {
    FlashSession session("DEVICE_FAMILY = F\nF_DEVICES = F1\nF_PROPERTY = SIZE,4\n");
    EXPECT_EQ(session.property("F", "SIZE"), "4");
    EXPECT_EQ(session.property("F1", "SIZE"), "");
}

TEST(SpiDeviceProperties, JoinNameAndPropertyWithoutASeparator) {
    FlashSession session("DEVICE_FAMILY = SI\nSI_PROPERTY = ZE,4\n");
    EXPECT_EQ(session.property("S", "IZE"), "4");
    EXPECT_EQ(session.property("", "SIZE"), "4");
    EXPECT_EQ(session.property("SIZE", ""), "4");
    EXPECT_EQ(session.property("nobody", "SIZE"), "4");
}

TEST(SpiDeviceProperties, AreEmptyForUnknownNamesAndKeysSilently) {
    FlashSession session("DEVICE_FAMILY = F1\nF1_PROPERTY = SIZE,4\n");
    EXPECT_EQ(session.property("F1", "WIDTH"), "");
    EXPECT_EQ(session.property("nobody", "WIDTH"), "");
    EXPECT_EQ(session.property("", ""), "");
    EXPECT_STREQ(session->getSpiDeviceStringProperty(nullptr, nullptr), "");
    EXPECT_STREQ(session->getSpiDeviceStringProperty("F1SIZE", nullptr), "4");
    EXPECT_STREQ(session->getSpiDeviceStringProperty(nullptr, "F1SIZE"), "4");
    EXPECT_FALSE(session->getSpiDeviceBoolProperty(nullptr, nullptr));
    EXPECT_EQ(session->getSpiDeviceLongProperty(nullptr, nullptr), 0);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(SpiDeviceProperties, TextLivesAsLongAsTheManager) {
    FlashSession session("DEVICE_FAMILY = F1,F2\nF1_PROPERTY = SIZE,4\nF2_PROPERTY = SIZE,8\n");
    const char* const size = session->getSpiDeviceStringProperty("F1", "SIZE");
    const char* const nothing = session->getSpiDeviceStringProperty("F1", "WIDTH");
    EXPECT_STREQ(session->getSpiDeviceStringProperty("F2", "SIZE"), "8");
    EXPECT_STREQ(session->getSpiDeviceStringProperty("F2", "WIDTH"), "");
    EXPECT_STREQ(size, "4");
    EXPECT_STREQ(nothing, "");
}

TEST(SpiDeviceProperties, AsBooleansAreTrueInAnyCase) {
    FlashSession session(
        "DEVICE_FAMILY = F1,ST1\nF1_PROPERTY = A,TRUE:B,true:C,True:D,yes:E,1:F,:G,TRUE :H,FALSE\n"
        "ST1_DEVICES = F1\nST1_PROPERTY = I,TRUE\n");
    for (const char* key : {"A", "B", "C", "I", "a"}) {
        EXPECT_TRUE(session->getSpiDeviceBoolProperty("F1", key)) << key;
    }
    for (const char* key : {"D", "E", "F", "G", "H", "missing"}) {
        EXPECT_FALSE(session->getSpiDeviceBoolProperty("F1", key)) << key;
    }
}

TEST(SpiDeviceProperties, AsNumbersAreDecimal) {
    FlashSession session("DEVICE_FAMILY = F1,ST1\nF1_PROPERTY = A,64:B,-7:C, 12kB:D,nonsense:E,:F,0x10:"
                         "G,99999999999:H,-99999999999\nST1_DEVICES = F1\nST1_PROPERTY = I,9\n");
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "A"), 64);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "B"), -7);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "C"), 12);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "D"), 0);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "E"), 0);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "F"), 0);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "G"), 2147483647);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "H"), -2147483647 - 1);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "I"), 9);
    EXPECT_EQ(session->getSpiDeviceLongProperty("F1", "missing"), 0);
}

TEST(SpiDeviceProperties, DoNotDependOnTheExceptionsSwitch) {
    FlashSession session("DEVICE_FAMILY = F1\nF1_PROPERTY = SIZE,4\n");
    for (const bool exceptions : {false, true}) {
        session->setExceptions(exceptions);
        EXPECT_EQ(session.property("F1", "SIZE"), "4");
        EXPECT_EQ(session.property("F1", "WIDTH"), "");
    }
}

} // namespace
