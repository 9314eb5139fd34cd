// The exceptions: their family tree, what they carry, and how they report themselves.
#include <TarvikException.h>

#include "support/Fixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <exception>
#include <string>
#include <type_traits>
#include <vector>

using testing::ElementsAre;

namespace {

constexpr const char* SOURCE = "../s/ConstraintsManager";

/// Whether a thrown `Thrown` is caught by a handler for `Caught`, and still is what it was.
template <typename Thrown, typename Caught>
bool isCaughtAs() {
    try {
        throw Thrown("Tarvik", SOURCE, "1.0", 1500);
    } catch (const Caught& caught) {
        return dynamic_cast<const Thrown*>(&caught) != nullptr;
    } catch (...) {
        return false;
    }
}

template <typename Exception>
bool isCaughtAsEachOfItsBases() {
    return isCaughtAs<Exception, Exception>() && isCaughtAs<Exception, LogicException>() &&
           isCaughtAs<Exception, TarvikException>() && isCaughtAs<Exception, Port::Exception>() &&
           isCaughtAs<Exception, std::exception>();
}

/// The messages of `report`, called through the root of the types that have it.
std::vector<IssuedMessage> reportOf(const TarvikException& exception) {
    MessageRecorder messages;
    exception.report();
    return messages.take();
}

TEST(Exceptions, AreCaughtAsEachOfTheirBases) {
    EXPECT_TRUE(isCaughtAsEachOfItsBases<DataMismatchException>());
    EXPECT_TRUE(isCaughtAsEachOfItsBases<OutOfRangeException>());
    EXPECT_TRUE(isCaughtAsEachOfItsBases<DataNotFoundException>());
    EXPECT_TRUE(isCaughtAsEachOfItsBases<LogicException>());
}

TEST(Exceptions, AreNotCaughtAsTheirSiblings) {
    EXPECT_FALSE((isCaughtAs<DataMismatchException, OutOfRangeException>()));
    EXPECT_FALSE((isCaughtAs<OutOfRangeException, DataNotFoundException>()));
    EXPECT_FALSE((isCaughtAs<DataNotFoundException, DataMismatchException>()));
    EXPECT_FALSE((isCaughtAs<TarvikException, LogicException>()));
}

TEST(Exceptions, NameTheirTypes) {
    EXPECT_STREQ(TarvikException("", "", "", 0).typeName(), "TarvikException");
    EXPECT_STREQ(LogicException("", "", "", 0).typeName(), "LogicException");
    EXPECT_STREQ(DataMismatchException("", "", "", 0).typeName(), "DataMismatchException");
    EXPECT_STREQ(OutOfRangeException("", "", "", 0).typeName(), "OutOfRangeException");
    EXPECT_STREQ(DataNotFoundException("", "", "", 0).typeName(), "DataNotFoundException");
}

TEST(Exceptions, CarryTheirPlaceOfOrigin) {
    const OutOfRangeException exception("Tarvik", SOURCE, "1.7", 1999);
    EXPECT_STREQ(exception.product(), "Tarvik");
    EXPECT_STREQ(exception.source(), SOURCE);
    EXPECT_STREQ(exception.revision(), "1.7");
    EXPECT_EQ(exception.line(), 1999);
}

TEST(Exceptions, TakeNullForTheEmptyText) {
    const DataNotFoundException exception(nullptr, nullptr, nullptr, -1);
    EXPECT_STREQ(exception.product(), "");
    EXPECT_STREQ(exception.source(), "");
    EXPECT_STREQ(exception.revision(), "");
    EXPECT_EQ(exception.line(), -1);
    EXPECT_THAT(reportOf(exception),
                ElementsAre(info(-1, "DataNotFoundException raised by  at , line -1\n")));
}

template <typename Exception>
constexpr bool NEVER_FAILS = std::is_nothrow_copy_constructible_v<Exception>&&
    std::is_nothrow_copy_assignable_v<Exception>&& std::is_nothrow_destructible_v<Exception>&&
        std::is_nothrow_constructible_v<Exception, const char*, const char*, const char*, int>;

TEST(Exceptions, AreMadeAndCopiedWithoutFailing) {
    static_assert(NEVER_FAILS<TarvikException>);
    static_assert(NEVER_FAILS<LogicException>);
    static_assert(NEVER_FAILS<DataMismatchException>);
    static_assert(NEVER_FAILS<OutOfRangeException>);
    static_assert(NEVER_FAILS<DataNotFoundException>);
    static_assert(std::is_nothrow_copy_constructible_v<Port::Exception>);

    const DataMismatchException original("Tarvik", SOURCE, "1.7", 1500);
    const DataMismatchException copy = original;
    EXPECT_STREQ(copy.product(), "Tarvik");
    EXPECT_STREQ(copy.source(), SOURCE);
    EXPECT_STREQ(copy.revision(), "1.7");
    EXPECT_EQ(copy.line(), 1500);
}

TEST(Exceptions, SurviveTheirThrowSiteInAPointer) {
    std::exception_ptr kept;
    try {
        throw DataNotFoundException("Tarvik", SOURCE, "1.7", 437);
    } catch (...) {
        kept = std::current_exception();
    }
    try {
        std::rethrow_exception(kept);
    } catch (const DataNotFoundException& exception) {
        EXPECT_EQ(exception.line(), 437);
    }
}

TEST(ExceptionReport, IsOneInfoMessageWithTypeAndPlace) {
    EXPECT_THAT(reportOf(DataMismatchException("Tarvik", SOURCE, "1.7", 1500)),
                ElementsAre(info(1500, "DataMismatchException raised by Tarvik at ../s/ConstraintsManager, "
                                       "line 1500\n")));
}

TEST(ExceptionReport, NamesTheTypeThatWasThrownThroughEachBase) {
    MessageRecorder messages;
    try {
        throw OutOfRangeException("Tarvik", "here", "", 644);
    } catch (const LogicException& exception) {
        exception.report();
    }
    EXPECT_THAT(messages.take(),
                ElementsAre(info(644, "OutOfRangeException raised by Tarvik at here, line 644\n")));
}

TEST(ExceptionReport, ComesFromThePlaceOfOrigin) {
    std::string product;
    std::string source;
    std::string revision;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        product = message.product;
        source = message.source;
        revision = message.revision;
    });
    DataMismatchException("Tarvik", SOURCE, "1.7", 1500).report();
    Port_MsgManData::setSink({});
    EXPECT_EQ(product, "Tarvik");
    EXPECT_EQ(source, SOURCE);
    EXPECT_EQ(revision, "1.7");
}

TEST(ExceptionReport, LeavesPercentSignsOfThePlaceAlone) {
    EXPECT_THAT(reportOf(LogicException("%n", "100%% %s", "%s", 7)),
                ElementsAre(info(7, "LogicException raised by %n at 100%% %s, line 7\n")));
}

TEST(ExceptionReport, CanBeOverridden) {
    class Quiet : public LogicException {
    public:
        using LogicException::LogicException;
        void report() const override {}
    };
    EXPECT_THAT(reportOf(Quiet("Tarvik", SOURCE, "", 1)), testing::IsEmpty());
}

} // namespace
