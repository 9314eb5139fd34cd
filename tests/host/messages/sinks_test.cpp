// The sink: how it is set and restored, and what it may do while it runs and when it goes.
#include <Port_MsgManData.h>

#include "support/Fixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

using Message = Port_MsgManData::Message;
using Sink = Port_MsgManData::Sink;
using Texts = std::vector<std::string>;

void issue(const char* text) {
    Port_MsgManData::createObject("Tarvik", "here.cpp", 1, "").issueInfo("%s", text);
}

/// A sink that keeps the texts it gets.
Sink keepingIn(Texts& texts) {
    return [&texts](const Message& message) { texts.emplace_back(message.text); };
}

/// What a call writes to standard error.
template <typename Call>
std::string errorOutputOf(Call call) {
    testing::internal::CaptureStderr();
    call();
    return testing::internal::GetCapturedStderr();
}

/// Puts the default back behind each test: its sink looks at what the test owned.
class SinkTest : public testing::Test {
protected:
    void TearDown() override { Port_MsgManData::setSink({}); }
};
using Sinks = SinkTest;
using ThrowingSink = SinkTest;
using ReplacedSink = SinkTest;
using SpeakingSink = SinkTest;
using SinkAtExit = SinkTest;

TEST_F(Sinks, TakeAllMessagesFromThenOn) {
    Texts texts;
    Port_MsgManData::setSink(keepingIn(texts));
    EXPECT_EQ(errorOutputOf([] { issue("one"); }), "");
    issue("two");
    EXPECT_THAT(texts, ElementsAre("one", "two"));
}

TEST_F(Sinks, ReplaceTheFormerOne) {
    Texts first;
    Texts second;
    Port_MsgManData::setSink(keepingIn(first));
    Port_MsgManData::setSink(keepingIn(second));
    issue("text");
    EXPECT_THAT(first, IsEmpty());
    EXPECT_THAT(second, ElementsAre("text"));
}

TEST_F(Sinks, AreHandedBackWhenReplaced) {
    Texts texts;
    Port_MsgManData::setSink(keepingIn(texts));
    const Sink former = Port_MsgManData::setSink([](const Message&) {});
    issue("lost");
    ASSERT_TRUE(former);
    Port_MsgManData::setSink(former);
    issue("kept");
    EXPECT_THAT(texts, ElementsAre("kept"));
}

TEST_F(Sinks, StandInForADefaultThatIsEmpty) {
    EXPECT_FALSE(Port_MsgManData::setSink([](const Message&) {}));
    EXPECT_TRUE(Port_MsgManData::setSink({}));
    EXPECT_FALSE(Port_MsgManData::setSink({}));
}

TEST_F(Sinks, GiveWayToTheDefaultWhenEmpty) {
    Texts texts;
    Port_MsgManData::setSink(keepingIn(texts));
    Port_MsgManData::setSink({});
    EXPECT_EQ(errorOutputOf([] { issue("text"); }), "text");
    EXPECT_THAT(texts, IsEmpty());
}

TEST_F(Sinks, MadeOfANullFunctionAreEmpty) {
    void (*const noFunction)(const Message&) = nullptr;
    Port_MsgManData::setSink(noFunction);
    EXPECT_EQ(errorOutputOf([] { issue("text"); }), "text");
}

TEST_F(Sinks, CanHandOnToTheFormerOne) {
    Texts texts;
    Port_MsgManData::setSink(keepingIn(texts));
    Sink former;
    former = Port_MsgManData::setSink([&](const Message& message) {
        texts.emplace_back("first");
        former(message);
    });
    issue("text");
    EXPECT_THAT(texts, ElementsAre("first", "text"));
}

TEST_F(Sinks, KeepStateOfTheirOwn) {
    Texts texts;
    Port_MsgManData::setSink(
        [&texts, count = 0](const Message&) mutable { texts.push_back(std::to_string(++count)); });
    issue("a");
    issue("b");
    const Sink former = Port_MsgManData::setSink({});
    Port_MsgManData::setSink(former);
    issue("c");
    EXPECT_THAT(texts, ElementsAre("1", "2", "3"));
}

TEST_F(ThrowingSink, ReachesTheCallerThatIssued) {
    Port_MsgManData::setSink([](const Message&) { throw std::runtime_error("full"); });
    const auto message = Port_MsgManData::createObject("Tarvik", "here.cpp", 1, "");
    EXPECT_THROW(message.issueInfo("text"), std::runtime_error);
    EXPECT_THROW(message.issueInfo("%d", 1), std::runtime_error);
    EXPECT_THROW(message.issueStatus("text"), std::runtime_error);
    EXPECT_THROW(message.issueStatus("%d", 1), std::runtime_error);
    EXPECT_THROW(Port_MsgManData::debugStub("text"), std::runtime_error);
    EXPECT_THROW(Port_MsgManData::debugStub("%d", 1), std::runtime_error);
}

TEST_F(ThrowingSink, StaysTheSink) {
    Texts texts;
    Port_MsgManData::setSink([&texts](const Message& message) {
        texts.emplace_back(message.text);
        throw 7;
    });
    EXPECT_THROW(issue("one"), int);
    EXPECT_THROW(issue("two"), int);
    EXPECT_THAT(texts, ElementsAre("one", "two"));
}

TEST_F(ReplacedSink, LivesUntilItsOwnCallIsOver) {
    const auto token = std::make_shared<std::string>("state");
    const std::weak_ptr<std::string> watch = token;
    Texts texts;
    Port_MsgManData::setSink([&texts, watch, state = std::make_shared<std::shared_ptr<std::string>>(token)](
                                 const Message& message) {
        Port_MsgManData::setSink(keepingIn(texts));
        texts.push_back(**state + " " + std::string(message.text));
    });
    issue("one");
    issue("two");
    EXPECT_THAT(texts, ElementsAre("state one", "two"));
    EXPECT_EQ(watch.use_count(), 1) << "the former sink still holds its state";
}

TEST_F(ReplacedSink, MayRestoreTheDefault) {
    Texts texts;
    Port_MsgManData::setSink([&texts, tail = std::string(100, '!')](const Message& message) {
        Port_MsgManData::setSink({});
        texts.push_back(std::string(message.text) + tail);
    });
    EXPECT_EQ(errorOutputOf([] {
                  issue("one");
                  issue("two");
              }),
              "two");
    EXPECT_THAT(texts, ElementsAre("one" + std::string(100, '!')));
}

TEST_F(ReplacedSink, MaySpeakAsItGoes) {
    struct Farewell {
        ~Farewell() { issue("farewell"); }
    };
    Texts texts;
    Port_MsgManData::setSink([farewell = std::make_shared<Farewell>()](const Message&) {});
    Port_MsgManData::setSink(keepingIn(texts));
    EXPECT_THAT(texts, ElementsAre("farewell"));
}

TEST_F(ReplacedSink, StaysWhenItCannotBeHandedBack) {
    struct Uncopyable {
        bool* isStuck;
        Texts* texts;

        Uncopyable(bool& stuck, Texts& kept) : isStuck(&stuck), texts(&kept) {}
        Uncopyable(const Uncopyable& other) : isStuck(other.isStuck), texts(other.texts) {
            if (*isStuck) {
                throw std::runtime_error("stuck");
            }
        }
        Uncopyable& operator=(const Uncopyable&) = delete;
        ~Uncopyable() = default;

        void operator()(const Message& message) const { texts->emplace_back(message.text); }
    };
    bool isStuck = false;
    Texts texts;
    Port_MsgManData::setSink(Uncopyable(isStuck, texts));
    isStuck = true;
    EXPECT_THROW(Port_MsgManData::setSink({}), std::runtime_error);
    issue("text");
    EXPECT_THAT(texts, ElementsAre("text"));

    isStuck = false;
    Port_MsgManData::setSink({});
}

TEST_F(SpeakingSink, IsCalledForItsOwnMessages) {
    Texts texts;
    Port_MsgManData::setSink([&texts](const Message& message) {
        const std::string text(message.text);
        if (text.size() < 4) {
            issue((text + "+").c_str());
        }
        texts.emplace_back(message.text);
    });
    issue("a");
    EXPECT_THAT(texts, ElementsAre("a+++", "a++", "a+", "a"));
}

TEST_F(SpeakingSink, MayBeReplacedByTheSinkThatItCalls) {
    Texts texts;
    Port_MsgManData::setSink([&texts, tail = std::string(100, '!')](const Message& message) {
        if (message.text == "outer") {
            issue("inner");
        } else {
            Port_MsgManData::setSink(keepingIn(texts));
        }
        texts.push_back(std::string(message.text) + tail);
    });
    issue("outer");
    issue("last");
    EXPECT_THAT(texts, ElementsAre("inner" + std::string(100, '!'), "outer" + std::string(100, '!'), "last"));
}

TEST_F(SinkAtExit, StillTakesWhatDestructorsSay) {
    struct Speaker {
        ~Speaker() { issue("from a destructor at exit"); }
    };
    const auto exitWithASpeaker = [] {
        // Made before the sink is first asked for, and so destroyed after whatever that leaves to be destroyed.
        static const Speaker speaker;
        Port_MsgManData::setSink([head = std::string(100, '>')](const Message& message) {
            std::fprintf(stderr, "%s%.*s", head.c_str(), static_cast<int>(message.text.size()),
                         message.text.data());
        });
        std::exit(0);
    };
    EXPECT_EXIT(exitWithASpeaker(), testing::ExitedWithCode(0), ">>> *from a destructor at exit");
}

} // namespace
