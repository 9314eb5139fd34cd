// Every exported method, asked of a fresh manager and of one that has answered everything before, while its Nth
// allocation fails, for every N: it answers rightly or raises std::bad_alloc, and the manager goes on. (That nothing
// leaks is told by the run under the address sanitizer.)
#include "manager/FailingAllocations.h"
#include "reference/CallRunner.h"
#include "support/TarvikTestPeer.h"

#include <gtest/gtest.h>

#include <new>
#include <optional>
#include <set>

namespace {

using namespace reference;

const Files DATABASES{
    {"base.acd", "DEVICE_SUPPORTED = finch,swift,spi\n"
                 "PROGRAM_OPTION_PACKAGE = FN10_PQ,finch,spi\n"
                 "BS = outputs,PARALLEL,USB2:families,finch\n"
                 "NOT_SUPPORTED_PART_IN_MODE = BS_FN10_PQ\n"
                 "IDCODE = FN10,0x0010\n"},
    {"finch.acd",
     "OPERATION = PROGRAM,Bscan,USB2\nBSDL_OPERATION = HIGHZ,USB2\nPROGRAM_OPTION = ERASE,Bscan,USB2\n"
     "PROPERTY = VENDOR_OF_ALL_FINCHES,A_value_that_is_longer_than_short_texts_are\n"
     "PROPERTIES = PROGRAM,1,BS:OP_PROGRAM,2,VERIFY,ERASE\n"
     "[FN10]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTY = PINS,44\n"},
    {"swift.acd", "OPERATION = VERIFY,Bscan,USB2\nPROPERTY = PINS,100\n[SW10]\n"},
    {"spi.acd",
     "DEVICE_FAMILY = NV\nNV_DEVICES = FLA\nFLA_PROPERTY = SIZE,16:ERASABLE,TRUE\nAT1_DEVICES = FLA\n"
     "OPERATION = ERASE,SPI,USB2\nTYPE_MB_SPI_NONE_LEAD = FLA\n"}};

/// One for each method, about things that have to be loaded first where the method can load.
const std::vector<Call>& calls() {
    using enum Method;
    static const std::vector<Call> CALLS{
        {GET_CONSTRAINTS_MANAGER, {}},
        {SET_EXCEPTIONS, {true}},
        {GET_OPERATION_ORDERS, {}},
        {GET_PROGRAM_OPTION_ORDERS, {}},
        {MODE_STRING_2_TYPE, {"CompactFlash"}},
        {MODE_TYPE_2_STRING, {6}},
        {CABLE_STRING_2_TYPE, {"EXPRESSQSVF"}},
        {CABLE_TYPE_2_STRING, {7}},
        {OPERATION_STRING_2_TYPE, {"verify"}},
        {OPERATION_TYPE_2_STRING, {3}},
        {OPERATION_DISPLAY_STRING_2_TYPE, {"Program Flash and FPGA"}},
        {OPERATION_TYPE_2_DISPLAY_STRING, {1}},
        {OPTION_STRING_2_TYPE, {"SECTOR_LOCKDOWN"}},
        {OPTION_TYPE_2_STRING, {1}},
        {REMOVE_PACKAGE_NAME, {"FN10_a_package_that_is_longer_than_short_texts_are"}},
        {CHECK_OUTPUT, {0, 3}},
        {CHECK_DEVICE, {0, "FN10", "PQ"}},
        {CHECK_OUTPUT_AND_DEVICE, {0, 2, "FN10_PQ", nullptr}},
        {CHECK_OPERATION, {0, 2, "FN10", 0, nullptr}},
        {CHECK_OPERATION_PROPERTY, {"FN10", 0, 0, nullptr}},
        {GET_DEVICE_OPERATIONS, {"FN10", 0, 2}},
        {GET_PROGRAM_OPTIONS, {"FN10", 0, 2, "_PQ"}},
        {GET_BSDL_OPERATIONS, {"FN10", 2}},
        {GET_DEVICE_OPERATION_OPTIONS, {"FN10", "PROGRAM", 0}},
        {GET_DEVICE_STRING_PROPERTIES, {"FN10", "VENDOR_OF_ALL_FINCHES"}},
        {GET_DEVICE_STRING_PROPERTY, {"FN10", "a_key_that_is_longer_than_short_texts_are"}},
        {GET_DEVICE_BOOL_PROPERTY, {"FN10", "PINS"}},
        {GET_DEVICE_LONG_PROPERTY, {"FN10", "PINS"}},
        {GET_PART_FAMILY, {"FN10"}},
        {ADD_CACHED_DEVICE_FAMILY, {"FN10_PQ", "finch"}},
        {IS_KORVEL_DEVICE, {"FN10"}},
        {GET_ALL_DEVICE_IDCODES, {}},
        {IS_SPI_DEVICE, {"fla"}},
        {GET_SPI_DEVICE_STRING_PROPERTY, {"a_flash_that_is_longer_than_short_texts_are", "SIZE"}},
        {GET_SPI_DEVICE_BOOL_PROPERTY, {"FLA", "ERASABLE"}},
        {GET_SPI_DEVICE_LONG_PROPERTY, {"FLA", "SIZE"}},
        {IS_MB_BPI_SPI_SUPPORT, {"FLA", "TYPE_MB_SPI", "NONE", true}},
        {DUMP_OPERATIONS_TABLE, {true}},
        {DUMP_BSDL_OPERATIONS_TABLE, {true}},
        {DUMP_PROGRAM_OPTIONS_TABLE, {true}},
        {DUMP_CACHED_DEVICE_FAMILIES, {true}},
        {DUMP_MB_BPI_SPI, {}},
    };
    return CALLS;
}

/// A manager over the databases, and all that it says.
class Session {
public:
    Session() {
        TarvikTestPeer::reset();
        AcdStore::setMemoryFiles(DATABASES);
        m_messages.listen();
        m_manager = ConstraintsManager::getConstraintsManager();
    }
    ~Session() { TarvikTestPeer::reset(); }
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    void warmUp() {
        for (const Call& call : calls()) {
            static_cast<void>(answer(call));
        }
    }

    [[nodiscard]] std::string answer(const Call& call) { return ask(*m_manager, m_messages, call).result; }

    /// The answer while allocation number `number` fails; nothing when std::bad_alloc came of it.
    [[nodiscard]] std::optional<std::string> answerFailing(const Call& call, long number) {
        const auto failing = FailingAllocations::atNumber(number);
        std::optional<std::string> answered;
        try {
            answered = answer(call);
        } catch (const std::bad_alloc&) {
        }
        m_happened = failing.happened();
        static_cast<void>(m_messages.take());
        return answered;
    }

    /// Did the latest call get as far as the failing allocation?
    [[nodiscard]] bool happened() const { return m_happened; }

private:
    ManagerMessages m_messages;
    ConstraintsManager* m_manager = nullptr;
    bool m_happened = false;
};

/// About another family, which no call above touches.
const Call UNTOUCHED{Method::GET_DEVICE_OPERATIONS, {"SW10", 0, 2}};

class Allocations : public testing::TestWithParam<std::size_t> {
protected:
    const Call& call = calls()[GetParam()];
};

TEST_P(Allocations, FailOneByOneInAFreshManager) {
    const std::string right = Session().answer(call);
    const std::string rightUntouched = Session().answer(UNTOUCHED);
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        Session session;
        const std::optional<std::string> answered = session.answerFailing(call, number);
        happened = session.happened();
        EXPECT_EQ(answered.value_or(right), right);
        EXPECT_EQ(session.answer(UNTOUCHED), rightUntouched);
        // A load that failed may leave something undone, but the question has an answer again.
        static_cast<void>(session.answer(call));
        ASSERT_FALSE(HasFailure());
    }
}

TEST_P(Allocations, FailOneByOneInAWarmManager) {
    Session session;
    session.warmUp();
    const std::string right = session.answer(call);
    bool happened = true;
    for (long number = 1; happened; ++number) {
        SCOPED_TRACE(number);
        EXPECT_EQ(session.answerFailing(call, number).value_or(right), right);
        happened = session.happened();
        EXPECT_EQ(session.answer(call), right);
        ASSERT_FALSE(HasFailure());
    }
}

std::string nameOf(const testing::TestParamInfo<std::size_t>& info) {
    return std::string(signatures()[info.param].name);
}

INSTANTIATE_TEST_SUITE_P(OfEachMethod, Allocations, testing::Range(std::size_t{0}, calls().size()), nameOf);

TEST(AllocationCalls, AreOneForEachMethodInTheirOrder) {
    ASSERT_EQ(calls().size(), signatures().size());
    for (std::size_t number = 0; number < calls().size(); ++number) {
        EXPECT_EQ(calls()[number].method, signatures()[number].method);
        EXPECT_EQ(calls()[number].arguments.size(), signatures()[number].arguments.size());
    }
}

} // namespace
