// Messages: what the three channels carry, and where it goes by default.
#include <Port_MsgManData.h>

#include "support/Fixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <ostream>
#include <string>

using testing::ElementsAre;

namespace {

// Volatile, so that no compiler knows it for a null that it would warn of.
const char* volatile noText = nullptr;

Port_MsgManData messageObject() { return Port_MsgManData::createObject("Tarvik", "here.cpp", 201, "1.7"); }

/// What a call writes to the standard streams.
struct Written {
    std::string output;
    std::string error;

    friend bool operator==(const Written&, const Written&) = default;
    friend std::ostream& operator<<(std::ostream& out, const Written& written) {
        return out << testing::PrintToString(written.output) << " and "
                   << testing::PrintToString(written.error);
    }
};

template <typename Call>
Written writtenBy(Call call) {
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    call();
    return {testing::internal::GetCapturedStdout(), testing::internal::GetCapturedStderr()};
}

/// The fields of the one message that a call issues, copied.
struct Fields {
    std::string product;
    std::string source;
    int line;
    std::string revision;
    std::string text;
};

template <typename Call>
Fields fieldsIssuedBy(Call call) {
    std::optional<Fields> fields;
    Port_MsgManData::setSink([&fields](const Port_MsgManData::Message& message) {
        fields = {std::string(message.product), std::string(message.source), message.line,
                  std::string(message.revision), std::string(message.text)};
    });
    call();
    Port_MsgManData::setSink({});
    return fields.value();
}

TEST(Messages, GoOutOnTheirChannelsInOrder) {
    MessageRecorder messages;
    messageObject().issueInfo("notice\n");
    messageObject().issueStatus("status\n");
    Port_MsgManData::debugStub("trace\n");
    EXPECT_THAT(messages.take(),
                ElementsAre(info(201, "notice\n"), status(201, "status\n"), debug("trace\n")));
}

TEST(Messages, AreFormatted) {
    MessageRecorder messages;
    messageObject().issueInfo("%s is not supported in %s\n", "KS50", "SPI mode");
    messageObject().issueStatus("%d ", 1);
    Port_MsgManData::debugStub("mode %d out of range\n", 9);
    EXPECT_THAT(messages.take(), ElementsAre(info(201, "KS50 is not supported in SPI mode\n"),
                                             status(201, "1 "), debug("mode 9 out of range\n")));
}

TEST(Messages, WithoutArgumentsAreSafeWhateverTheyHold) {
    MessageRecorder messages;
    messageObject().issueInfo("%s%n%d 100%% 50%");
    messageObject().issueStatus("%s%n%d 100%% 50%");
    Port_MsgManData::debugStub("%s%n%d 100%% 50%");
    const std::string text = "%s%n%d 100% 50%";
    EXPECT_THAT(messages.take(), ElementsAre(info(201, text), status(201, text), debug(text)));
}

TEST(Messages, WithoutArgumentsMayBeVariables) {
    const std::string text = "%s";
    MessageRecorder messages;
    messageObject().issueInfo(text.c_str());
    messageObject().issueStatus(text.c_str());
    Port_MsgManData::debugStub(text.c_str());
    EXPECT_THAT(messages.take(), ElementsAre(info(201, "%s"), status(201, "%s"), debug("%s")));
}

TEST(Messages, ShowANullArgument) {
    MessageRecorder messages;
    messageObject().issueInfo("<%s>", noText);
    messageObject().issueStatus("<%s>", noText);
    Port_MsgManData::debugStub("<%s>", noText);
    EXPECT_THAT(messages.take(),
                ElementsAre(info(201, "<(null)>"), status(201, "<(null)>"), debug("<(null)>")));
}

TEST(Messages, OfANullFormatAreEmpty) {
    MessageRecorder messages;
    messageObject().issueInfo(noText);
    messageObject().issueStatus(noText, 1);
    Port_MsgManData::debugStub(noText);
    EXPECT_THAT(messages.take(), ElementsAre(info(201, ""), status(201, ""), debug("")));
}

TEST(Messages, MayBeLongAndHoldNuls) {
    const std::string name(100'000, 'x');
    MessageRecorder messages;
    messageObject().issueInfo("%s%c!", name.c_str(), '\0');
    EXPECT_THAT(messages.take(), ElementsAre(info(201, name + std::string("\0!", 2))));
}

TEST(Messages, CarryTheirIssuingSite) {
    const Fields notice = fieldsIssuedBy([] { messageObject().issueInfo("notice"); });
    EXPECT_EQ(notice.product, "Tarvik");
    EXPECT_EQ(notice.source, "here.cpp");
    EXPECT_EQ(notice.line, 201);
    EXPECT_EQ(notice.revision, "1.7");
    EXPECT_EQ(notice.text, "notice");

    const Fields line = fieldsIssuedBy([] { messageObject().issueStatus("%d", 5); });
    EXPECT_EQ(line.product, "Tarvik");
    EXPECT_EQ(line.source, "here.cpp");
    EXPECT_EQ(line.line, 201);
    EXPECT_EQ(line.revision, "1.7");
    EXPECT_EQ(line.text, "5");
}

TEST(Messages, ForDevelopersCarryNoSite) {
    const Fields trace = fieldsIssuedBy([] { Port_MsgManData::debugStub("trace %d", 1); });
    EXPECT_EQ(trace.product, "");
    EXPECT_EQ(trace.source, "");
    EXPECT_EQ(trace.line, 0);
    EXPECT_EQ(trace.revision, "");
    EXPECT_EQ(trace.text, "trace 1");
}

TEST(Messages, TakeNullForAnEmptySite) {
    const Fields notice = fieldsIssuedBy(
        [] { Port_MsgManData::createObject(nullptr, nullptr, -5, nullptr).issueInfo("notice"); });
    EXPECT_EQ(notice.product, "");
    EXPECT_EQ(notice.source, "");
    EXPECT_EQ(notice.line, -5);
    EXPECT_EQ(notice.revision, "");
}

TEST(MessageObjects, CanBeKeptAndUsedAgain) {
    MessageRecorder messages;
    const Port_MsgManData original = messageObject();
    const Port_MsgManData copy = original;
    original.issueInfo("one");
    copy.issueInfo("two");
    EXPECT_THAT(messages.take(), ElementsAre(info(201, "one"), info(201, "two")));
}

TEST(DefaultOutput, OfNoticesIsStandardError) {
    EXPECT_EQ(writtenBy([] { messageObject().issueInfo("notice\n"); }), (Written{"", "notice\n"}));
}

TEST(DefaultOutput, OfStatusLinesIsStandardOutput) {
    EXPECT_EQ(writtenBy([] { messageObject().issueStatus("1 "); }), (Written{"1 ", ""}));
}

TEST(DefaultOutput, OfTracesIsNoneUnlessAskedFor) {
    unsetenv("TARVIK_DEBUG");
    EXPECT_EQ(writtenBy([] { Port_MsgManData::debugStub("trace\n"); }), (Written{"", ""}));
}

TEST(DefaultOutput, OfTracesIsStandardErrorWhenAskedFor) {
    setenv("TARVIK_DEBUG", "1", 1);
    EXPECT_EQ(writtenBy([] { Port_MsgManData::debugStub("trace\n"); }), (Written{"", "trace\n"}));
}

TEST(DefaultOutput, OfTracesIsAskedForByAnEmptyVariableToo) {
    setenv("TARVIK_DEBUG", "", 1);
    if (std::getenv("TARVIK_DEBUG") == nullptr) {
        GTEST_SKIP() << "no variable is empty here";
    }
    EXPECT_EQ(writtenBy([] { Port_MsgManData::debugStub("trace\n"); }), (Written{"", "trace\n"}));
}

TEST(DefaultOutput, IsTheBytesOfTheText) {
    EXPECT_EQ(writtenBy([] {
                  messageObject().issueStatus("a%cb\r%s\xFF", '\0', "%d");
                  messageObject().issueStatus("%s", "");
                  messageObject().issueStatus("end");
              }),
              (Written{std::string("a\0b\r%d\xFF"
                                   "end",
                                   10),
                       ""}));
}

} // namespace
