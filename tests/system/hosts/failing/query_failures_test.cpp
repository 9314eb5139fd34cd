// What the exported queries leave behind when the host fails at any one of the calls that they make.
#include "FailingDatabases.h"
#include "Snapshot.h"

#include <FailingHost.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <new>
#include <optional>

namespace {

using failing_host::Failure;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

/// A question and its answer as text.
struct Query {
    const char* name;
    std::function<std::string(ConstraintsManager&)> ask;
};

std::string answer(long value) { return std::to_string(value); }
std::string answer(const char* text) { return text == nullptr ? "(null)" : text; }
std::string answer(const StringBase& text) { return text.c_str(); }

const std::vector<Query>& queries() {
    using M = ConstraintsManager;
    static const std::vector<Query> all = {
        {"operations", [](M& m) { return answer(m.getDeviceOperations("dev", BS, PARALLEL)); }},
        {"operationsOfSpi",
         [](M& m) { return answer(m.getDeviceOperations("dev", MODE_TYPE::SPI, PARALLEL)); }},
        {"operationsOfNobody", [](M& m) { return answer(m.getDeviceOperations("nobody", BS, PARALLEL)); }},
        {"options", [](M& m) { return answer(m.getProgramOptions("dev_x", BS, PARALLEL, nullptr)); }},
        {"optionsInAPackage", [](M& m) { return answer(m.getProgramOptions("dev", BS, PARALLEL, "pq")); }},
        {"optionsOutOfRange",
         [](M& m) { return answer(m.getProgramOptions("dev", MODE_TYPE{6}, PARALLEL, "")); }},
        {"bsdl", [](M& m) { return answer(m.getBsdlOperations("dev", PARALLEL)); }},
        {"bsdlOutOfRange", [](M& m) { return answer(m.getBsdlOperations("dev", OUTPUT_TYPE{5})); }},
        {"outputCheck", [](M& m) { return answer(m.checkConstraints(BS, OUTPUT_TYPE::STAPL)); }},
        {"deviceCheck", [](M& m) { return answer(m.checkConstraints(MODE_TYPE::SS, "dev_x", "tq")); }},
        {"deviceRefused", [](M& m) { return answer(m.checkConstraints(MODE_TYPE::SS, "dev_x", "pkg")); }},
        {"bothCheck", [](M& m) { return answer(m.checkConstraints(BS, PARALLEL, "dev", nullptr)); }},
        {"bothRefused",
         [](M& m) { return answer(m.checkConstraints(MODE_TYPE::SPI, PARALLEL, "dev", "pq")); }},
        {"operationCheck",
         [](M& m) { return answer(m.checkConstraints(BS, PARALLEL, "dev_x", OP_TYPE::PROGRAM, nullptr)); }},
        {"operationOutOfRange",
         [](M& m) { return answer(m.checkConstraints(BS, PARALLEL, "dev", OP_TYPE{32}, nullptr)); }},
        {"operationProperty",
         [](M& m) { return answer(m.checkConstraints("dev_x", BS, OP_TYPE::ERASE, nullptr)); }},
        {"operationOptions",
         [](M& m) {
             return Snapshot::text(m.getDeviceOperationOptions("dev", "erase", BS)) +
                    Snapshot::text(m.getDeviceOperationOptions("dev", "ERASE", BS));
         }},
        {"properties", [](M& m) { return Snapshot::text(m.getDeviceStringProperties("dev", "PACKAGES")); }},
        {"property", [](M& m) { return answer(m.getDeviceStringProperty("dev", "VENDOR")); }},
        {"propertyOfAFlash", [](M& m) { return answer(m.getDeviceStringProperty("flash", "DENSITY")); }},
        {"propertyMissing",
         [](M& m) {
             try {
                 return answer(m.getDeviceStringProperty("dev", "NOSUCH"));
             } catch (const DataNotFoundException&) {
                 return std::string("raised");
             }
         }},
        {"boolProperty", [](M& m) { return answer(m.getDeviceBoolProperty("dev", "FLAGS")); }},
        {"longProperty", [](M& m) { return answer(m.getDeviceLongProperty("dev", "PINS")); }},
        {"family", [](M& m) { return answer(m.getPartFamily("Dev_x")); }},
        {"seed",
         [](M& m) {
             m.addCachedDeviceFamily("seeded_x", "fam");
             return answer(m.getPartFamily("seeded"));
         }},
        {"korvel", [](M& m) { return answer(m.isKorvelDevice("dev")); }},
        {"spiDevice", [](M& m) { return answer(m.isSpiDevice("flash")); }},
        {"spiProperty", [](M& m) { return answer(m.getSpiDeviceStringProperty("FLASH", "DENSITY")); }},
        {"spiBoolProperty", [](M& m) { return answer(m.getSpiDeviceBoolProperty("FLASH", "FAST")); }},
        {"spiLongProperty", [](M& m) { return answer(m.getSpiDeviceLongProperty("FLASH", "NOSUCH")); }},
        {"multiboot", [](M& m) { return answer(m.isMbBpiSpiSupport("flash", "type_mb_spi", "none", true)); }},
        {"dumpOfFamilies",
         [](M& m) {
             TarvikSmokeMgr recorder;
             static_cast<void>(m.getPartFamily("dev"));
             m.dumpCachedDeviceFamilies(&recorder);
             return std::string(recorder.text());
         }},
        {"dumpOfMultiboot",
         [](M& m) {
             m.dumpMbBpiSpi();
             return std::string();
         }},
        {"converters", [](M& m) {
             StringBase device("dev_x");
             m.removePackageName(device);
             return answer(device) + answer(M::modeType2String(BS)) + answer(M::cableType2String(PARALLEL)) +
                    answer(M::operationType2String(OP_TYPE::ERASE)) +
                    answer(M::operationType2DisplayString(OP_TYPE{32})) +
                    answer(static_cast<long>(M::operationString2Type("nosuch"))) +
                    answer(M::optionType2String(TARVIKNS::PROGRAM_OPTION::OTP));
         }}};
    return all;
}

/// The loaded lists and the flags of a manager.
struct Loaded {
    std::vector<std::string> properties;
    std::vector<std::string> operations;
    std::vector<std::string> options;

    static Loaded of(ConstraintsManager& manager) {
        auto& members = TarvikTestPeer::members(manager);
        return {list(members.m_loadedFamilies), list(members.m_operationsLoaded),
                list(members.m_programOptionsLoaded)};
    }
    template <typename Container>
    static std::vector<std::string> list(const Container& container) {
        std::vector<std::string> texts;
        for (const StringBase& text : container) {
            texts.emplace_back(text.c_str());
        }
        return texts;
    }
};

bool isPrefix(const std::vector<std::string>& part, const std::vector<std::string>& whole) {
    return part.size() <= whole.size() && std::equal(part.begin(), part.end(), whole.begin());
}

bool isRead(const std::string& read) {
    const auto& reads = failing_host::reads();
    return std::find(reads.begin(), reads.end(), read) != reads.end();
}

class QueryFailures : public testing::TestWithParam<std::size_t> {
protected:
    QueryFailures() {
        memory_host::setDatabases(failingDatabases());
        failing_host::serve();
    }
    ~QueryFailures() override {
        failing_host::serve();
        TarvikTestPeer::removeManager();
    }

    [[nodiscard]] const Query& query() const { return queries()[GetParam()]; }

    static ConstraintsManager& freshManager(bool exceptions) {
        failing_host::serve();
        TarvikTestPeer::removeManager();
        ConstraintsManager& manager = *ConstraintsManager::getConstraintsManager();
        manager.setExceptions(exceptions);
        return manager;
    }

    // Asks while the host fails at its call number `call`; the answer, or nothing when the failure came out.
    std::optional<std::string> askFailing(ConstraintsManager& manager, std::size_t call,
                                          Failure failure) const {
        failing_host::failAt(call, failure);
        try {
            return query().ask(manager);
        } catch (const failing_host::InjectedException&) {
            EXPECT_EQ(failure, Failure::TARVIK_EXCEPTION);
        } catch (const std::bad_alloc&) {
            EXPECT_EQ(failure, Failure::BAD_ALLOC);
        }
        EXPECT_TRUE(failing_host::hasFailed());
        EXPECT_EQ(failing_host::reports(), 0) << "only the start-up reports";
        return std::nullopt;
    }

    // What is noted as loaded stays so, and is not read again.
    void expectNothingIsReadAgain(ConstraintsManager& manager) const {
        const Loaded before = Loaded::of(manager);
        failing_host::serve();
        try {
            static_cast<void>(query().ask(manager));
        } catch (const DataNotFoundException& exception) {
            // A property whose load failed is missing for good.
            EXPECT_EQ(exception.line(), 437);
        } catch (const LogicException& exception) {
            ADD_FAILURE() << "the manager raised at " << exception.line();
        }
        for (const std::string& owner : before.properties) {
            EXPECT_FALSE(isRead(owner + " PROPERTY")) << owner;
            EXPECT_FALSE(isRead(owner + " PROPERTIES")) << owner;
        }
        for (const std::string& family : before.operations) {
            EXPECT_FALSE(isRead(family + " OPERATION")) << family;
            EXPECT_FALSE(isRead(family + " BSDL_OPERATION")) << family;
        }
        for (const std::string& owner : before.options) {
            EXPECT_FALSE(isRead(owner + " PROGRAM_OPTION")) << owner;
        }
        EXPECT_TRUE(isPrefix(before.operations, Loaded::of(manager).operations));
        EXPECT_TRUE(isPrefix(before.options, Loaded::of(manager).options));
    }
};

std::string nameOf(const testing::TestParamInfo<std::size_t>& info) { return queries()[info.param].name; }

} // namespace

TEST_P(QueryFailures, EachPassesOutAndLeavesWhatWasNoted) {
    for (const bool exceptions : {true, false}) {
        ConstraintsManager& whole = freshManager(exceptions);
        const Loaded atStart = Loaded::of(whole);
        const std::string expected = query().ask(whole);
        const Loaded atEnd = Loaded::of(whole);

        for (const Failure failure : {Failure::TARVIK_EXCEPTION, Failure::BAD_ALLOC}) {
            for (std::size_t call = 1;; ++call) {
                SCOPED_TRACE("call " + std::to_string(call));
                ConstraintsManager& manager = freshManager(exceptions);
                if (const auto result = askFailing(manager, call, failure)) {
                    EXPECT_FALSE(failing_host::hasFailed()) << "a failure was lost";
                    EXPECT_EQ(*result, expected);
                    break;
                }
                failing_host::serve();
                const Loaded loaded = Loaded::of(manager);
                EXPECT_TRUE(std::includes(atEnd.properties.begin(), atEnd.properties.end(),
                                          loaded.properties.begin(), loaded.properties.end()));
                EXPECT_TRUE(isPrefix(atStart.operations, loaded.operations));
                EXPECT_TRUE(isPrefix(loaded.operations, atEnd.operations));
                EXPECT_TRUE(isPrefix(atStart.options, loaded.options));
                EXPECT_TRUE(isPrefix(loaded.options, atEnd.options));
                expectNothingIsReadAgain(manager);
                if (HasFailure()) {
                    return;
                }
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Exported, QueryFailures, testing::Range(std::size_t{0}, queries().size()), nameOf);
