// Random scenarios: that they reach what is to be compared, print as tests, and shrink.
#include "CallRunner.h"
#include "Reference.h"
#include "ScenarioGenerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

namespace {

using namespace reference;
using namespace std::string_literals;
using testing::IsSupersetOf;

/// Scenario number `number` of a fixed series.
Scenario scenario(Health health, unsigned number) {
    return scenarios(health, 100)(rc::Random(number)).value();
}

/// What the reference answers in a number of scenarios.
std::map<Method, std::set<std::string>> answers(Health health, unsigned count) {
    std::map<Method, std::set<std::string>> answers;
    for (unsigned number = 0; number < count; ++number) {
        const Scenario asked = scenario(health, number);
        Reference reference(asked.files);
        for (const Call& call : asked.calls) {
            answers[call.method].insert(ask(reference, call).result);
        }
    }
    return answers;
}

std::set<std::string> together(const std::map<Method, std::set<std::string>>& answers) {
    std::set<std::string> all;
    for (const auto& [method, results] : answers) {
        all.insert(results.begin(), results.end());
    }
    return all;
}

std::string printed(const Scenario& scenario) {
    std::ostringstream out;
    out << scenario;
    return out.str();
}

TEST(Scenarios, SignaturesStandInTheOrderOfTheMethods) {
    for (std::size_t number = 0; number < signatures().size(); ++number) {
        EXPECT_EQ(static_cast<std::size_t>(signatures()[number].method), number);
    }
    EXPECT_EQ(signatures().back().method, Method::DUMP_MB_BPI_SPI);
}

TEST(Scenarios, AreTheSameForTheSameSeed) {
    EXPECT_EQ(printed(scenario(Health::DAMAGED, 1)), printed(scenario(Health::DAMAGED, 1)));
    EXPECT_NE(printed(scenario(Health::DAMAGED, 1)), printed(scenario(Health::DAMAGED, 2)));
}

TEST(Scenarios, SoundDatabasesHaveNoMalformedLines) {
    std::size_t faults = 0;
    std::size_t faultsOfDamaged = 0;
    for (unsigned number = 0; number < 100; ++number) {
        faults += Databases(scenario(Health::SOUND, number).files).faults();
        faultsOfDamaged += Databases(scenario(Health::DAMAGED, number).files).faults();
    }
    EXPECT_EQ(faults, 0U);
    EXPECT_GT(faultsOfDamaged, 100U);
}

TEST(Scenarios, EachMethodGivesDifferentAnswers) {
    const std::set<Method> constant{Method::GET_CONSTRAINTS_MANAGER,  Method::SET_EXCEPTIONS,
                                    Method::ADD_CACHED_DEVICE_FAMILY, Method::DUMP_MB_BPI_SPI,
                                    Method::GET_OPERATION_ORDERS,     Method::GET_PROGRAM_OPTION_ORDERS};
    auto given = answers(Health::SOUND, 100);
    for (const Signature& signature : signatures()) {
        EXPECT_GE(given[signature.method].size(), constant.contains(signature.method) ? 1U : 2U)
            << signature.name;
    }
}

TEST(Scenarios, QueriesFindMuchInSoundDatabases) {
    auto given = answers(Health::SOUND, 100);
    for (const Method method : {Method::GET_DEVICE_OPERATIONS, Method::GET_PROGRAM_OPTIONS,
                                Method::GET_BSDL_OPERATIONS, Method::GET_DEVICE_STRING_PROPERTIES}) {
        EXPECT_GT(given[method].size(), 20U) << signatures()[static_cast<std::size_t>(method)].name;
    }
    EXPECT_GT(given[Method::GET_DEVICE_OPERATION_OPTIONS].size(), 3U);
}

TEST(Scenarios, DamagedDatabasesRaiseEverythingThatCanBeRaised) {
    EXPECT_THAT(
        together(answers(Health::DAMAGED, 400)),
        IsSupersetOf({"DataMismatchException 1413", "DataMismatchException 1500", "OutOfRangeException 1631",
                      "DataMismatchException 1638", "DataMismatchException 1649",
                      "DataMismatchException 1659", "OutOfRangeException 1688", "DataMismatchException 1695",
                      "DataMismatchException 1705", "DataMismatchException 1739",
                      "DataMismatchException 1750", "DataMismatchException 1760", "OutOfRangeException 644",
                      "OutOfRangeException 1999", "OutOfRangeException 2024", "DataMismatchException 1011",
                      "DataMismatchException 1051", "DataNotFoundException 437"}));
}

TEST(Scenarios, PrintAsATest) {
    const Scenario small{
        {
            {"base.acd"s, "A = \"\\\n"
                          "\000\3777\t"s},
        },
        {
            {Method::SET_EXCEPTIONS, {false}},
            {Method::CHECK_DEVICE, {-1, "%s"s, nullptr}},
        },
    };
    EXPECT_EQ(printed(small), R"(    expectAgreement({
        {
            {"base.acd"s, "A = \"\\\n"
                          "\000\3777\011"s},
        },
        {
            {Method::SET_EXCEPTIONS, {false}},
            {Method::CHECK_DEVICE, {-1, "%s"s, nullptr}},
        },
    });
)");
}

TEST(Scenarios, ShrinkToWhatAFailureNeeds) {
    const auto fails = [](const Scenario& candidate) {
        const auto family = candidate.files.find("kes.acd");
        return family != candidate.files.end() && family->second.find("VERIFY") != std::string::npos &&
               std::any_of(candidate.calls.begin(), candidate.calls.end(),
                           [](const Call& call) { return call.method == Method::GET_PROGRAM_OPTIONS; });
    };
    const rc::Gen<Scenario> generator = scenarios(Health::SOUND, 100);
    unsigned seed = 0;
    while (!fails(generator(rc::Random(seed)).value())) {
        ++seed;
    }
    const Scenario smallest = rc::shrinkable::findLocalMin(generator(rc::Random(seed)), fails).first;
    ASSERT_EQ(smallest.files.size(), 1U);
    EXPECT_LT(smallest.files.at("kes.acd").size(), 30U) << smallest;
    ASSERT_EQ(smallest.calls.size(), 1U);
    EXPECT_EQ(std::get<int>(smallest.calls[0].arguments[1]), 0);
}

} // namespace
