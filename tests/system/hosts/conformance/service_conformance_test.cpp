// What the manager relies on in the databases, messages and exceptions of whichever host it is built against.
#include "HostUnderTest.h"

#include <AcdReader.h>
#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>
#include <TarvikSmokeMgr.h>

#include <gtest/gtest.h>

#include <optional>

namespace {

using host_under_test::Channel;

/// A database "base" with these values.
class DatabaseConformance : public testing::Test {
protected:
    static void base(const std::map<std::string, std::string>& values) {
        host_under_test::install({{"base", {"base", values}}});
    }

    // As `getstringbykey` of the base database, as a text that compares.
    static std::optional<std::string> read(const char* key, const char* separator, int index,
                                           const char* subSeparator, int subIndex) {
        const AcdReader reader;
        const char* const text = reader.getDevkey()->getstringbykey(
            key, separator, static_cast<short>(index), subSeparator, static_cast<short>(subIndex));
        return text == nullptr ? std::nullopt : std::optional<std::string>(text);
    }
};

std::string told(const host_under_test::Message& message) {
    const char* const channels[] = {"info", "status", "debug"};
    return std::string(channels[static_cast<int>(message.channel)]) + " " + std::to_string(message.line) +
           " " + message.text;
}

} // namespace

TEST_F(DatabaseConformance, ListsAreReadItemByItem) {
    base({{"KEY", "one,two,three"}});
    EXPECT_EQ(read("KEY", ",", 0, nullptr, 0), "one");
    EXPECT_EQ(read("KEY", ",", 2, nullptr, 0), "three");
    EXPECT_EQ(read("KEY", ",", 3, nullptr, 0), std::nullopt);
    EXPECT_EQ(read("KEY", ",", -1, nullptr, 0), std::nullopt);
}

TEST_F(DatabaseConformance, RecordsAreReadFieldByField) {
    base({{"KEY", "a,b:c:d,e,f"}});
    EXPECT_EQ(read("KEY", ":", 0, ",", 1), "b");
    EXPECT_EQ(read("KEY", ":", 1, ",", 0), "c");
    EXPECT_EQ(read("KEY", ":", 1, ",", 1), std::nullopt);
    EXPECT_EQ(read("KEY", ":", 2, ",", 2), "f");
    EXPECT_EQ(read("KEY", ":", 3, ",", 0), std::nullopt);
    EXPECT_EQ(read("KEY", ":", 0, ",", -1), std::nullopt);
    EXPECT_EQ(read("KEY", ":", 2, nullptr, 0), "d,e,f");
}

TEST_F(DatabaseConformance, EmptyItemsAndFieldsAreTexts) {
    base({{"KEY", "a,,b"}, {"RECORDS", "x,:,y"}});
    EXPECT_EQ(read("KEY", ",", 1, nullptr, 0), "");
    EXPECT_EQ(read("RECORDS", ":", 0, ",", 1), "");
    EXPECT_EQ(read("RECORDS", ":", 1, ",", 0), "");
    EXPECT_EQ(read("RECORDS", ":", 1, ",", 1), "y");
}

TEST_F(DatabaseConformance, MissingAndEmptyKeysHaveNoItems) {
    base({{"EMPTY", ""}});
    EXPECT_EQ(read("EMPTY", ",", 0, nullptr, 0), std::nullopt);
    EXPECT_EQ(read("NOSUCH", ",", 0, nullptr, 0), std::nullopt);
    EXPECT_EQ(read("empty", ":", 0, ",", 0), std::nullopt);
}

TEST_F(DatabaseConformance, TheBaseAccessorOutlivesItsReader) {
    base({{"KEY", "value"}});
    PM_DEVKEY* accessor = nullptr;
    {
        const AcdReader reader;
        accessor = reader.getDevkey();
    }
    EXPECT_STREQ(accessor->getstringbykey("KEY", ",", 0, nullptr, 0), "value");
}

TEST_F(DatabaseConformance, WithoutABaseDatabaseTheReaderRaises) {
    host_under_test::install({});
    EXPECT_THROW(AcdReader(), DataNotFoundException);
}

TEST_F(DatabaseConformance, ANameOpensItsDatabase) {
    host_under_test::install(
        {{"base", {"base", {}}}, {"fam", {"fam", {{"KEY", "theirs"}}}}, {"dev", {"fam", {{"KEY", "mine"}}}}});
    const AcdReader device("dev");
    EXPECT_STREQ(device.getPM(), "fam");
    EXPECT_STREQ(device.getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0), "mine");
    const AcdReader family("fam");
    EXPECT_STREQ(family.getPM(), "fam");
    EXPECT_STREQ(family.getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0), "theirs");
}

TEST_F(DatabaseConformance, AnUnknownNameOpensAnEmptyDatabaseOfTheModuleBase) {
    base({{"KEY", "value"}});
    const AcdReader reader("nobody");
    EXPECT_STREQ(reader.getPM(), "base");
    EXPECT_EQ(reader.getDevkey()->getstringbykey("KEY", ",", 0, nullptr, 0), nullptr);
}

TEST_F(DatabaseConformance, PartsResolveToTheirFamily) {
    host_under_test::install({{"base", {"base", {}}}, {"fam", {"fam", {}}}, {"dev", {"fam", {}}}});
    const auto binding = static_cast<PM_PARTNAME_BINDING>(1);
    EXPECT_STREQ(PicConfig("dev", 1, binding).get_pm(), "fam");
    EXPECT_STREQ(PicConfig("fam", 1, binding).get_pm(), "fam");
    EXPECT_EQ(PicConfig("nobody", 1, binding).get_pm(), nullptr);
    EXPECT_EQ(PicConfig("", 1, binding).get_pm(), nullptr);
}

TEST_F(DatabaseConformance, AFileIsOpenedByItsName) {
    host_under_test::install({{"base", {"base", {}}}, {"spi", {"spi", {{"KEY", "a,b"}}}}});
    PicConfig configuration("base", 1, static_cast<PM_PARTNAME_BINDING>(1));
    PM_DEVKEY accessor("spi.acd", configuration, 1, 1, 1);
    EXPECT_STREQ(accessor.getstringbykey("KEY", ",", 1, nullptr, 0), "b");
    PM_DEVKEY missing("nosuch.acd", configuration, 1, 1, 1);
    EXPECT_EQ(missing.getstringbykey("KEY", ",", 0, nullptr, 0), nullptr);
}

TEST(MessageConformance, EachChannelHasItsOwn) {
    host_under_test::install({});
    Port_MsgManData::createObject("Tarvik", "source", 201, "1").issueInfo("%s is %d\n", "one", 1);
    Port_MsgManData::createObject("Tarvik", "source", 1777, "1").issueStatus("%s", "two");
    Port_MsgManData::debugStub("%d.\n", 3);
    const auto messages = host_under_test::takeMessages();
    ASSERT_EQ(messages.size(), 3U);
    EXPECT_EQ(told(messages[0]), "info 201 one is 1\n");
    EXPECT_EQ(told(messages[1]), "status 1777 two");
    EXPECT_EQ(told(messages[2]), "debug 0 3.\n");
}

TEST(MessageConformance, AFinishedTextIsSafeInTheFormatPosition) {
    host_under_test::install({});
    const char* const text = "100%% of %s and %n";
    Port_MsgManData::createObject("Tarvik", "source", 1777, "1").issueStatus(text);
    TarvikSmokeMgr recorder;
    recorder.smokeStatus(text);
    EXPECT_EQ(host_under_test::takeMessages().at(0).text, "100% of %s and %n");
    EXPECT_STREQ(recorder.text().c_str(), "100% of %s and %n");
}

TEST(RecorderConformance, PiecesAreJoined) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("a");
    recorder.smokeStatus("%s%d", "b", 2);
    recorder.smokeStatus("\n");
    EXPECT_STREQ(recorder.text().c_str(), "ab2\n");
}

TEST(ExceptionConformance, EachIsCaughtByItsBases) {
    const auto raise = [](auto exception) { throw exception; };
    EXPECT_THROW(raise(DataMismatchException("Tarvik", "source", "1", 7)), LogicException);
    EXPECT_THROW(raise(OutOfRangeException("Tarvik", "source", "1", 7)), TarvikException);
    EXPECT_THROW(raise(DataNotFoundException("Tarvik", "source", "1", 7)), Port::Exception);
}

TEST(ExceptionConformance, AReportIsAnInfoMessage) {
    host_under_test::install({});
    try {
        throw OutOfRangeException("Tarvik", "source", "1", 1999);
    } catch (const TarvikException& exception) {
        exception.report();
    }
    const auto messages = host_under_test::takeMessages();
    ASSERT_EQ(messages.size(), 1U);
    EXPECT_EQ(messages[0].channel, Channel::INFO);
    EXPECT_NE(messages[0].text.find("1999"), std::string::npos);
}

TEST(ExceptionConformance, AReportCanBeReplaced) {
    class Silent : public LogicException {
    public:
        explicit Silent(int& reports) : LogicException("", "", "", 0), m_reports(reports) {}
        void report() const override { ++m_reports; }

    private:
        int& m_reports;
    };
    host_under_test::install({});
    int reports = 0;
    try {
        throw Silent(reports);
    } catch (const TarvikException& exception) {
        exception.report();
    }
    EXPECT_EQ(reports, 1);
    EXPECT_TRUE(host_under_test::takeMessages().empty());
}
