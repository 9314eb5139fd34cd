// Holds the manager against the reference, over random databases and random sequences of calls.
#include "CallRunner.h"
#include "ScenarioGenerator.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <cstdlib>
#include <string>

namespace {

using namespace reference;

constexpr int CALLS_PER_SCENARIO = 100;

/// Half of TARVIK_PROPERTY_CALLS: two tests share them.
int scenarioCount() {
    const char* calls = std::getenv("TARVIK_PROPERTY_CALLS");
    return (calls == nullptr ? 100'000 : std::atoi(calls)) / 2 / CALLS_PER_SCENARIO + 1;
}

/// The same scenarios each time, unless RC_PARAMS asks for others.
void configure() {
    const char* wanted = std::getenv("RC_PARAMS");
    const std::string parameters =
        "seed=20 max_success=" + std::to_string(scenarioCount()) + " " + (wanted == nullptr ? "" : wanted);
    setenv("RC_PARAMS", parameters.c_str(), 1);
}

void expectAgreementEverywhere(Health health) {
    configure();
    const rc::Gen<Scenario> generator = scenarios(health, CALLS_PER_SCENARIO).as("the scenario");
    EXPECT_TRUE(rc::check([&] {
        const Scenario scenario = *generator;
        const std::string found = difference(scenario);
        if (!found.empty()) {
            RC_FAIL(found);
        }
    }));
}

TEST(ManagerAgreement, OverSoundDatabases) { expectAgreementEverywhere(Health::SOUND); }

TEST(ManagerAgreement, OverDamagedDatabases) { expectAgreementEverywhere(Health::DAMAGED); }

} // namespace
