// The boundary itself: calls out of order, null pointers, hostile texts, callbacks that throw, results that are kept.
#include "Boundary.h"
#include "support/TarvikTestPeer.h"

#include <TarvikException.h>
#include <tarvik/tarvik.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <functional>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;
using testing::StrEq;

const std::map<std::string, std::string> DATABASES{{"base.acd", "DEVICE_SUPPORTED = finch,spi\n"
                                                                "PROGRAM_OPTION_PACKAGE = finch\n"
                                                                "BS = outputs,PARALLEL,USB2:families,finch\n"
                                                                "IDCODE = FN10,0x0010\n"},
                                                   {"finch.acd",
                                                    "OPERATION = PROGRAM,Bscan,USB2:EXPRESSQSVF,Bscan,USB2\n"
                                                    "PROPERTY = EMPTY,:PINS,44:WIDE,99999999999\n"
                                                    "PROPERTIES = VENDOR,2,Korvel,A\xFF\xC3\xA9\n[FN10]\n"}};

/// A callback's context.
using Listener = std::function<void(const tarvik_message&)>;

void listen(const tarvik_message* message, void* context) {
    (*static_cast<const Listener*>(context))(*message);
}

class Boundary : public testing::Test {
protected:
    Boundary() {
        TarvikTestPeer::reset();
        boundary::session = {};
        std::vector<tarvik_memory_file> files;
        for (const auto& [name, text] : DATABASES) {
            files.push_back({name.c_str(), text.data(), text.size()});
        }
        EXPECT_EQ(tarvik_set_memory_files(files.data(), files.size()), TARVIK_OK);
        listenTo(m_collector);
    }
    ~Boundary() override {
        if (boundary::session.removed) {
            TarvikTestPeer::forgetManager();
        }
        TarvikTestPeer::reset();
        boundary::session = {};
    }

    static void listenTo(Listener& listener) {
        EXPECT_EQ(tarvik_set_message_callback(listen, &listener), TARVIK_OK);
    }

    std::vector<std::string> m_messages;
    Listener m_collector = [this](const tarvik_message& message) { m_messages.emplace_back(message.text); };
};

/// Every function with a result, with null in its place; it must not matter whether there is a manager.
TEST_F(Boundary, ANullPointerForAResultIsRefused) {
    for (const char* const when : {"before", "after"}) {
        SCOPED_TRACE(when);
        for (const tarvik_status status :
             {tarvik_mode_string_to_type("BS", nullptr),
              tarvik_mode_type_to_string(0, nullptr),
              tarvik_cable_string_to_type("USB2", nullptr),
              tarvik_cable_type_to_string(0, nullptr),
              tarvik_operation_string_to_type("ERASE", nullptr),
              tarvik_operation_display_string_to_type("Erase", nullptr),
              tarvik_operation_type_to_string(0, nullptr),
              tarvik_operation_type_to_display_string(0, nullptr),
              tarvik_option_string_to_type("ERASE", nullptr),
              tarvik_option_type_to_string(0, nullptr),
              tarvik_check_output(0, 2, nullptr),
              tarvik_check_device(0, "FN10", nullptr, nullptr),
              tarvik_check_output_and_device(0, 2, "FN10", nullptr, nullptr),
              tarvik_check_operation(0, 2, "FN10", 0, nullptr, nullptr),
              tarvik_check_operation_property("FN10", 0, 0, nullptr, nullptr),
              tarvik_get_device_operations("FN10", 0, 2, nullptr),
              tarvik_get_program_options("FN10", 0, 2, nullptr, nullptr),
              tarvik_get_bsdl_operations("FN10", 2, nullptr),
              tarvik_get_device_operation_options("FN10", "PROGRAM", 0, nullptr),
              tarvik_get_device_string_properties("FN10", "VENDOR", nullptr),
              tarvik_get_device_string_property("FN10", "VENDOR", nullptr),
              tarvik_get_device_bool_property("FN10", "VENDOR", nullptr),
              tarvik_get_device_long_property("FN10", "PINS", nullptr),
              tarvik_get_part_family("FN10", nullptr),
              tarvik_is_korvel_device("FN10", nullptr),
              tarvik_get_all_device_idcodes(nullptr),
              tarvik_is_spi_device("FN10", nullptr),
              tarvik_get_spi_device_string_property("FN10", "SIZE", nullptr),
              tarvik_get_spi_device_bool_property("FN10", "SIZE", nullptr),
              tarvik_get_spi_device_long_property("FN10", "SIZE", nullptr),
              tarvik_is_mb_bpi_spi_support("FN10", "TYPE_BPI", "NONE", 1, nullptr),
              tarvik_get_operation_orders(nullptr, 0, nullptr),
              tarvik_get_program_option_orders(nullptr, 0, nullptr)}) {
            EXPECT_EQ(status, TARVIK_INVALID_ARGUMENT);
        }
        EXPECT_THAT(tarvik_last_error()->text, StrEq("a pointer for a result is null"));
        ASSERT_EQ(tarvik_get_constraints_manager(), TARVIK_OK);
    }
    EXPECT_THAT(m_messages, ElementsAre());
}

TEST_F(Boundary, ACountWithoutAnArrayIsRefused) {
    std::size_t count = 7;
    const tarvik_memory_file file{"base.acd", nullptr, 5};
    EXPECT_EQ(tarvik_set_search_path(nullptr, 1), TARVIK_INVALID_ARGUMENT);
    EXPECT_EQ(tarvik_set_memory_files(nullptr, 1), TARVIK_INVALID_ARGUMENT);
    EXPECT_EQ(tarvik_set_memory_files(&file, 1), TARVIK_INVALID_ARGUMENT);
    EXPECT_EQ(tarvik_get_operation_orders(nullptr, 1, &count), TARVIK_INVALID_ARGUMENT);
    EXPECT_EQ(count, 7U);
}

TEST_F(Boundary, DatabasesAreSetBeforeTheManagerIsMade) {
    const char* const directory = "/nowhere";
    EXPECT_EQ(tarvik_set_search_path(nullptr, 0), TARVIK_OK);
    EXPECT_EQ(tarvik_set_search_path(&directory, 1), TARVIK_OK);
    ASSERT_EQ(tarvik_get_constraints_manager(), TARVIK_OK);
    EXPECT_EQ(tarvik_set_search_path(&directory, 1), TARVIK_TOO_LATE);
    EXPECT_EQ(tarvik_set_memory_files(nullptr, 0), TARVIK_TOO_LATE);
    EXPECT_EQ(tarvik_last_error()->status, TARVIK_TOO_LATE);
}

TEST_F(Boundary, AQuestionMakesTheManagerToo) {
    std::uint32_t operations = 0;
    ASSERT_EQ(tarvik_get_device_operations("FN10", TARVIK_MODE_BS, TARVIK_OUTPUT_USB2, &operations),
              TARVIK_OK);
    EXPECT_EQ(operations, 0x80000001U); // the highest bit, too
    EXPECT_EQ(tarvik_set_memory_files(nullptr, 0), TARVIK_TOO_LATE);
}

TEST_F(Boundary, ConversionsNeedNoManager) {
    int value = -1;
    const char* name = nullptr;
    EXPECT_EQ(tarvik_mode_string_to_type("sserial", &value), TARVIK_OK);
    EXPECT_EQ(value, TARVIK_MODE_SS);
    EXPECT_EQ(tarvik_operation_type_to_string(TARVIK_OPERATION_VERIFY, &name), TARVIK_OK);
    EXPECT_THAT(name, StrEq("VERIFY"));
    EXPECT_EQ(tarvik_set_memory_files(nullptr, 0), TARVIK_OK);
}

TEST_F(Boundary, ARemovedManagerAnswersNothing) {
    std::uint32_t operations = 5;
    ASSERT_EQ(tarvik_get_constraints_manager(), TARVIK_OK);
    ASSERT_EQ(tarvik_remove_constraints_manager(), TARVIK_OK);
    EXPECT_EQ(tarvik_remove_constraints_manager(), TARVIK_REMOVED);
    EXPECT_EQ(tarvik_get_constraints_manager(), TARVIK_REMOVED);
    EXPECT_EQ(tarvik_get_device_operations("FN10", 0, 2, &operations), TARVIK_REMOVED);
    EXPECT_EQ(tarvik_dump_operations_table(nullptr), TARVIK_REMOVED);
    EXPECT_EQ(tarvik_set_exceptions(0), TARVIK_REMOVED);
    EXPECT_EQ(tarvik_set_search_path(nullptr, 0), TARVIK_TOO_LATE);
    EXPECT_EQ(operations, 5U);
    EXPECT_THAT(tarvik_last_error()->type, StrEq(""));
    int value = 0;
    EXPECT_EQ(tarvik_cable_string_to_type("SVF", &value), TARVIK_OK);
}

TEST_F(Boundary, RemovingBeforeThereIsOneEndsItToo) {
    EXPECT_EQ(tarvik_remove_constraints_manager(), TARVIK_OK);
    EXPECT_EQ(tarvik_get_constraints_manager(), TARVIK_REMOVED);
}

TEST_F(Boundary, AFailureShowsItsException) {
    const char* value = "unchanged";
    ASSERT_EQ(tarvik_get_device_string_property("FN10", "NONE", &value), TARVIK_DATA_NOT_FOUND);
    EXPECT_THAT(value, StrEq("unchanged"));
    const tarvik_error& error = *tarvik_last_error();
    EXPECT_EQ(error.status, TARVIK_DATA_NOT_FOUND);
    EXPECT_EQ(error.line, 437);
    EXPECT_THAT(error.type, StrEq("DataNotFoundException"));
    EXPECT_THAT(error.product, StrEq("Tarvik"));
    EXPECT_THAT(error.source, StrEq("../s/ConstraintsManager"));
    EXPECT_THAT(error.text, StartsWith("DataNotFoundException"));
    // A success leaves it.
    ASSERT_EQ(tarvik_get_device_string_property("FN10", "PINS", &value), TARVIK_OK);
    EXPECT_EQ(tarvik_last_error()->line, 437);
}

TEST_F(Boundary, AFailureNamesTheRecordThatItIsAbout) {
    const tarvik_memory_file files[] = {{"base.acd", "DEVICE_SUPPORTED = swift\n", 25},
                                        {"swift.acd", "OPERATION = PROGRAM\n[SW10]\n", 27}};
    ASSERT_EQ(tarvik_set_memory_files(files, 2), TARVIK_OK);
    std::uint32_t operations = 5;
    EXPECT_EQ(tarvik_get_device_operations("SW10", 0, 2, &operations), TARVIK_DATA_MISMATCH);
    EXPECT_EQ(operations, 5U);
    EXPECT_THAT(tarvik_last_error()->text, HasSubstr("swift.acd:1:"));
}

TEST_F(Boundary, WithExceptionsOffAFaultGivesANeutralValue) {
    const char* value = "";
    std::int32_t number = 0;
    ASSERT_EQ(tarvik_set_exceptions(0), TARVIK_OK);
    ASSERT_EQ(tarvik_get_device_string_property("FN10", "NONE", &value), TARVIK_OK);
    EXPECT_EQ(value, nullptr);
    ASSERT_EQ(tarvik_get_device_long_property("FN10", "NONE", &number), TARVIK_OK);
    EXPECT_EQ(number, -1);
    ASSERT_EQ(tarvik_set_exceptions(-1), TARVIK_OK);
    EXPECT_EQ(tarvik_get_device_string_property("FN10", "NONE", &value), TARVIK_DATA_NOT_FOUND);
}

TEST_F(Boundary, EachExceptionHasItsStatus) {
    const auto statusOf = [](auto exception) { return boundary::guard([&] { throw exception; }); };
    EXPECT_EQ(statusOf(DataMismatchException("p", "s", "r", 1)), TARVIK_DATA_MISMATCH);
    EXPECT_EQ(statusOf(OutOfRangeException("p", "s", "r", 2)), TARVIK_OUT_OF_RANGE);
    EXPECT_EQ(statusOf(DataNotFoundException("p", "s", "r", 3)), TARVIK_DATA_NOT_FOUND);
    EXPECT_EQ(statusOf(LogicException("p", "s", "r", 4)), TARVIK_OTHER_EXCEPTION);
    EXPECT_THAT(tarvik_last_error()->type, StrEq("LogicException"));
    EXPECT_EQ(statusOf(TarvikException("p", "s", "r", 5)), TARVIK_OTHER_EXCEPTION);
    EXPECT_THAT(tarvik_last_error()->type, StrEq("TarvikException"));
    EXPECT_EQ(tarvik_last_error()->line, 5);
    EXPECT_THAT(tarvik_last_error()->revision, StrEq("r"));
    EXPECT_EQ(statusOf(std::bad_alloc()), TARVIK_NO_MEMORY);
    EXPECT_EQ(statusOf(std::runtime_error("why")), TARVIK_OTHER_EXCEPTION);
    EXPECT_THAT(tarvik_last_error()->text, StrEq("why"));
    EXPECT_EQ(statusOf(5), TARVIK_OTHER_EXCEPTION);
}

TEST_F(Boundary, ALongErrorTextIsCut) {
    EXPECT_EQ(boundary::guard([] { throw std::runtime_error(std::string(100'000, 'x')); }),
              TARVIK_OTHER_EXCEPTION);
    EXPECT_THAT(tarvik_last_error()->text, StrEq(std::string(1023, 'x')));
}

TEST_F(Boundary, MessagesReachTheCallback) {
    tarvik_message seen{};
    std::string texts;
    Listener listener = [&](const tarvik_message& message) {
        seen = message;
        texts += std::string(message.product) + "|" + message.source + "|" + message.text;
    };
    listenTo(listener);
    int allowed = 1;
    ASSERT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_SVF, &allowed), TARVIK_OK);
    EXPECT_EQ(allowed, 0);
    EXPECT_EQ(seen.channel, TARVIK_CHANNEL_INFO);
    EXPECT_GT(seen.line, 0);
    EXPECT_EQ(texts, "Tarvik|../s/ConstraintsManager|SVF is not supported in Boundary Scan mode\n");
}

TEST_F(Boundary, WithoutACallbackMessagesGoWhereTheyWent) {
    ASSERT_EQ(tarvik_set_message_callback(nullptr, nullptr), TARVIK_OK);
    testing::internal::CaptureStderr();
    int allowed = 1;
    ASSERT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_SVF, &allowed), TARVIK_OK);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "SVF is not supported in Boundary Scan mode\n");
}

TEST_F(Boundary, ACallbackThatThrowsEndsNothing) {
    for (int round = 0; round < 2; ++round) {
        Listener listener = [&](const tarvik_message&) {
            if (round == 0) {
                throw std::runtime_error("the log is full");
            }
            throw 5;
        };
        listenTo(listener);
        int allowed = 1;
        EXPECT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_SVF, &allowed), TARVIK_CALLBACK_FAILED);
        EXPECT_EQ(allowed, 0); // the answer is there
        EXPECT_EQ(tarvik_last_error()->status, TARVIK_CALLBACK_FAILED);
        if (round == 0) {
            EXPECT_THAT(tarvik_last_error()->text, StrEq("the log is full"));
        }
        // It is about that call only.
        EXPECT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_USB2, &allowed), TARVIK_OK);
        EXPECT_EQ(allowed, 1);
    }
}

TEST_F(Boundary, AFailureOutweighsThatOfTheCallback) {
    Listener listener = [](const tarvik_message&) { throw 5; };
    listenTo(listener);
    const char* value = nullptr;
    EXPECT_EQ(tarvik_get_device_string_property("FN10", "NONE", &value), TARVIK_DATA_NOT_FOUND);
    EXPECT_EQ(tarvik_last_error()->line, 437);
}

TEST_F(Boundary, TheManagerCannotBeUsedInACallback) {
    std::vector<tarvik_status> statuses;
    Listener listener = [&](const tarvik_message&) {
        int value = 0;
        statuses = {tarvik_check_output(0, 2, &value),
                    tarvik_get_constraints_manager(),
                    tarvik_remove_constraints_manager(),
                    tarvik_set_exceptions(0),
                    tarvik_set_search_path(nullptr, 0),
                    tarvik_set_message_callback(nullptr, nullptr),
                    tarvik_dump_mb_bpi_spi(),
                    tarvik_mode_string_to_type("SS", &value)};
    };
    listenTo(listener);
    int allowed = 1;
    EXPECT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_SVF, &allowed), TARVIK_OK);
    EXPECT_EQ(allowed, 0);
    EXPECT_THAT(statuses, ElementsAre(TARVIK_BUSY, TARVIK_BUSY, TARVIK_BUSY, TARVIK_BUSY, TARVIK_BUSY,
                                      TARVIK_BUSY, TARVIK_BUSY, TARVIK_OK));
    EXPECT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_USB2, &allowed), TARVIK_OK);
}

TEST_F(Boundary, AConversionInACallbackDoesNotHideThatItThrew) {
    int depth = 0;
    Listener listener = [&](const tarvik_message&) {
        int operation = 0;
        if (depth++ == 0) {
            // Issues a message itself: the callback is called in the callback.
            EXPECT_EQ(tarvik_operation_string_to_type("none", &operation), TARVIK_OK);
            throw 5;
        }
        EXPECT_EQ(tarvik_get_constraints_manager(), TARVIK_BUSY);
    };
    listenTo(listener);
    int allowed = 1;
    EXPECT_EQ(tarvik_check_output(TARVIK_MODE_BS, TARVIK_OUTPUT_SVF, &allowed), TARVIK_CALLBACK_FAILED);
    EXPECT_EQ(depth, 2);
}

TEST_F(Boundary, HugeAndStrangeTextsAreNames) {
    const std::string huge(1 << 20, 'x');
    const std::string bytes = "\xFF\xFE\x80%n%s";
    for (const char* const text : {huge.c_str(), bytes.c_str(), "", static_cast<const char*>(nullptr)}) {
        const char* family = nullptr;
        int flag = -1;
        EXPECT_EQ(tarvik_get_part_family(text, &family), TARVIK_OK);
        EXPECT_THAT(family, StrEq("base"));
        EXPECT_EQ(tarvik_is_spi_device(text, &flag), TARVIK_OK);
        EXPECT_EQ(flag, 0);
        EXPECT_EQ(tarvik_check_device(TARVIK_MODE_BS, text, text, &flag), TARVIK_OK);
        EXPECT_EQ(flag, 0);
    }
}

TEST_F(Boundary, NumbersSaturate) {
    std::int32_t number = 0;
    EXPECT_EQ(tarvik_get_device_long_property("FN10", "WIDE", &number), TARVIK_OK);
    EXPECT_EQ(number, 2147483647);
}

TEST_F(Boundary, PackageNamesAreCutInPlace) {
    std::array<char, 12> device{"FN10_PQ_208"};
    EXPECT_EQ(tarvik_remove_package_name(device.data()), TARVIK_OK);
    EXPECT_THAT(device.data(), StrEq("FN10"));
    EXPECT_EQ(tarvik_remove_package_name(device.data()), TARVIK_OK);
    EXPECT_THAT(device.data(), StrEq("FN10"));
    EXPECT_EQ(tarvik_remove_package_name(nullptr), TARVIK_OK);
}

TEST_F(Boundary, SetsAreReadTextByText) {
    const tarvik_text_set* values = nullptr;
    ASSERT_EQ(tarvik_get_device_string_properties("FN10", "VENDOR", &values), TARVIK_OK);
    EXPECT_EQ(tarvik_text_set_size(values), 2U);
    EXPECT_EQ(tarvik_text_set_contains(values, "Korvel"), 1);
    EXPECT_EQ(tarvik_text_set_contains(values, "korvel"), 0);
    EXPECT_EQ(tarvik_text_set_contains(values, nullptr), 0);
    tarvik_iterator at = {nullptr};
    EXPECT_THAT(tarvik_text_set_next(values, &at), StrEq("A\xFF\xC3\xA9"));
    const tarvik_iterator kept = at;
    EXPECT_THAT(tarvik_text_set_next(values, &at), StrEq("Korvel"));
    EXPECT_EQ(tarvik_text_set_next(values, &at), nullptr);
    EXPECT_EQ(tarvik_text_set_next(values, &at), nullptr); // stays at the end
    at = kept;
    EXPECT_THAT(tarvik_text_set_next(values, &at), StrEq("Korvel"));

    ASSERT_EQ(tarvik_get_device_string_properties("FN10", "NONE", &values), TARVIK_OK);
    at = {nullptr};
    EXPECT_EQ(tarvik_text_set_size(values), 0U);
    EXPECT_EQ(tarvik_text_set_next(values, &at), nullptr);
    EXPECT_EQ(tarvik_text_set_next(values, &at), nullptr);

    ASSERT_EQ(tarvik_get_device_string_properties("FN10", "EMPTY", &values), TARVIK_OK);
    EXPECT_EQ(tarvik_text_set_contains(values, nullptr), 1); // null is the empty text
    EXPECT_EQ(tarvik_text_set_size(nullptr), 0U);
    EXPECT_EQ(tarvik_text_set_contains(nullptr, "x"), 0);
    EXPECT_EQ(tarvik_text_set_next(nullptr, &at), nullptr);
    EXPECT_EQ(tarvik_text_set_next(values, nullptr), nullptr);
}

TEST_F(Boundary, MapsAreReadEntryByEntry) {
    const tarvik_text_map* idcodes = nullptr;
    ASSERT_EQ(tarvik_get_all_device_idcodes(&idcodes), TARVIK_OK);
    EXPECT_EQ(tarvik_text_map_size(idcodes), 1U);
    EXPECT_THAT(tarvik_text_map_find(idcodes, "FN10"), StrEq("0x0010"));
    EXPECT_EQ(tarvik_text_map_find(idcodes, "fn10"), nullptr);
    EXPECT_EQ(tarvik_text_map_find(idcodes, nullptr), nullptr);
    tarvik_iterator at = {nullptr};
    const char* value = nullptr;
    EXPECT_THAT(tarvik_text_map_next(idcodes, &at, &value), StrEq("FN10"));
    EXPECT_THAT(value, StrEq("0x0010"));
    EXPECT_EQ(tarvik_text_map_next(idcodes, &at, nullptr), nullptr);
    EXPECT_EQ(tarvik_text_map_size(nullptr), 0U);
    EXPECT_EQ(tarvik_text_map_find(nullptr, "FN10"), nullptr);
    EXPECT_EQ(tarvik_text_map_next(nullptr, &at, nullptr), nullptr);
    EXPECT_EQ(tarvik_text_map_next(idcodes, nullptr, nullptr), nullptr);
}

TEST_F(Boundary, ResultsLiveUntilTheManagerIsRemoved) {
    const char* vendor = nullptr;
    const char* family = nullptr;
    const char* name = nullptr;
    const tarvik_text_set* values = nullptr;
    ASSERT_EQ(tarvik_get_device_string_property("FN10", "VENDOR", &vendor), TARVIK_OK);
    ASSERT_EQ(tarvik_get_part_family("FN10", &family), TARVIK_OK);
    ASSERT_EQ(tarvik_operation_type_to_display_string(TARVIK_OPERATION_PROGRAMFPGAONLY, &name), TARVIK_OK);
    ASSERT_EQ(tarvik_get_device_string_properties("FN10", "VENDOR", &values), TARVIK_OK);
    for (int round = 0; round < 1000; ++round) {
        const std::string other = "device" + std::to_string(round);
        const char* ignored = nullptr;
        ASSERT_EQ(tarvik_add_cached_device_family(other.c_str(), other.c_str()), TARVIK_OK);
        ASSERT_EQ(tarvik_get_part_family(other.c_str(), &ignored), TARVIK_OK);
        ASSERT_EQ(tarvik_operation_type_to_display_string(round % 32, &ignored), TARVIK_OK);
    }
    EXPECT_THAT(vendor, StrEq("A\xFF\xC3\xA9"));
    EXPECT_THAT(family, StrEq("finch"));
    EXPECT_THAT(name, StrEq("Program FPGA Only "));
    EXPECT_EQ(tarvik_text_set_size(values), 2U);
    ASSERT_EQ(tarvik_remove_constraints_manager(), TARVIK_OK);
    EXPECT_THAT(name, StrEq("Program FPGA Only "));
}

TEST_F(Boundary, ADumpIsATextOrMessages) {
    const char* table = nullptr;
    const char* again = nullptr;
    ASSERT_EQ(tarvik_dump_operations_table(&table), TARVIK_OK);
    const std::string kept = table;
    EXPECT_GT(kept.size(), 100U);
    EXPECT_THAT(m_messages, ElementsAre());
    ASSERT_EQ(tarvik_dump_operations_table(&again), TARVIK_OK);
    EXPECT_EQ(again, kept);
    ASSERT_EQ(tarvik_dump_operations_table(nullptr), TARVIK_OK);
    std::string issued;
    for (const std::string& message : m_messages) {
        issued += message;
    }
    EXPECT_EQ(issued, kept);
}

TEST_F(Boundary, OrdersAreWrittenAsFarAsThereIsRoom) {
    std::array<int, 3> few{-1, -1, -1};
    std::size_t count = 0;
    EXPECT_EQ(tarvik_get_operation_orders(few.data(), 2, &count), TARVIK_OK);
    EXPECT_EQ(count, 32U);
    EXPECT_THAT(few, ElementsAre(0, 1, -1));
    EXPECT_EQ(tarvik_get_program_option_orders(few.data(), 3, &count), TARVIK_OK);
    EXPECT_EQ(count, 24U);
    EXPECT_THAT(few, ElementsAre(0, 1, 2));
}

TEST_F(Boundary, EnumeratorsHaveTheNamesOfTheVocabulary) {
    const auto expectNames = [](int enumeration, int count, tarvik_status (*toString)(int, const char**)) {
        for (int value = 0; value < count; ++value) {
            const char* name = nullptr;
            ASSERT_EQ(toString(value, &name), TARVIK_OK);
            EXPECT_THAT(tarvik_enumerator_name(enumeration, value), StrEq(name));
        }
        EXPECT_EQ(tarvik_enumerator_name(enumeration, count), nullptr);
        EXPECT_EQ(tarvik_enumerator_name(enumeration, -1), nullptr);
    };
    expectNames(TARVIK_ENUMERATION_MODE, 9, tarvik_mode_type_to_string);
    expectNames(TARVIK_ENUMERATION_OUTPUT, 10, tarvik_cable_type_to_string);
    expectNames(TARVIK_ENUMERATION_OPERATION, 32, tarvik_operation_type_to_string);
    expectNames(TARVIK_ENUMERATION_OPTION, 24, tarvik_option_type_to_string);
    EXPECT_THAT(tarvik_enumerator_name(TARVIK_ENUMERATION_STATUS, TARVIK_CALLBACK_FAILED),
                StrEq("CALLBACK_FAILED"));
    EXPECT_EQ(tarvik_enumerator_name(TARVIK_ENUMERATION_STATUS, TARVIK_CALLBACK_FAILED + 1), nullptr);
    EXPECT_THAT(tarvik_enumerator_name(TARVIK_ENUMERATION_CHANNEL, TARVIK_CHANNEL_DEBUG), StrEq("DEBUG"));
    EXPECT_EQ(tarvik_enumerator_name(TARVIK_ENUMERATION_CHANNEL + 1, 0), nullptr);
    EXPECT_EQ(tarvik_enumerator_name(-1, 0), nullptr);
}

TEST(Version, IsThatOfTheProject) { EXPECT_THAT(tarvik_version(), StrEq(TARVIK_PROJECT_VERSION)); }

} // namespace
