// The host layer through the library that ships: what is used here must be exported by it.
#include <AcdReader.h>
#include <AcdStore.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>
#include <TarvikSmokeMgr.h>
#include <UT_STR.h>

#include "support/Fixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using testing::ElementsAre;

namespace {

TEST(HostLibrary, ExportsTexts) {
    StringBase text;
    text.Format("%d%%", 50);
    EXPECT_STREQ(text.c_str(), "50%");
    text.Format("a%%");
    EXPECT_STREQ(text.c_str(), "a%");
    text.MakeUpper();
    EXPECT_EQ(text.ICompare("a%"), 0);
    text.MakeLower();
    text.Truncate(1);
    EXPECT_EQ(text.CRC32(), 0xE8B7BE43);
    EXPECT_EQ(UT_STR::Compare("a", "a"), 0);
    EXPECT_EQ(UT_STR::ICompare("a", "A"), 0);
    EXPECT_EQ(UT_STR::AToL("7"), 7);
    EXPECT_STREQ(UT_STR::Upper("a").c_str(), "A");
}

TEST(HostLibrary, ExportsMessages) {
    MessageRecorder messages;
    const auto message = Port_MsgManData::createObject("Tarvik", "here.cpp", 1, "");
    message.issueInfo("info");
    message.issueInfo("%s", "info");
    message.issueStatus("status");
    message.issueStatus("%s", "status");
    Port_MsgManData::debugStub("debug");
    Port_MsgManData::debugStub("%s", "debug");
    EXPECT_THAT(messages.take(), ElementsAre(info(1, "info"), info(1, "info"), status(1, "status"),
                                             status(1, "status"), debug("debug"), debug("debug")));
}

TEST(HostLibrary, ExportsTheRecorder) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("piece ");
    recorder.smokeStatus("%d", 1);
    EXPECT_STREQ(recorder.text().c_str(), "piece 1");
}

TEST(HostLibrary, ExportsExceptions) {
    MessageRecorder messages;
    const auto raise = [] { throw OutOfRangeException("Tarvik", "here.cpp", "", 644); };
    EXPECT_THROW(raise(), OutOfRangeException);
    EXPECT_THROW(raise(), TarvikException);
    DataMismatchException("Tarvik", "here.cpp", "", 1).report();
    EXPECT_THAT(messages.take(),
                ElementsAre(info(1, "DataMismatchException raised by Tarvik at here.cpp, line 1\n")));
}

TEST(HostLibrary, RaisesWhatItsUsersCanCatch) {
    MessageRecorder messages;
    AcdStore::setMemoryFiles({});
    EXPECT_THROW(AcdReader(), DataNotFoundException);
}

} // namespace
