// Compares the manager through the C interface with the reference, over random databases and random calls.
#include "CManager.h"

#include "reference/CallRunner.h"
#include "reference/Reference.h"
#include "reference/ScenarioGenerator.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <cstdlib>
#include <sstream>
#include <string>

namespace {

using namespace reference;

constexpr int CALLS_PER_SCENARIO = 100;

/// Half of TARVIK_PROPERTY_CALLS: two tests share them.
int scenarioCount() {
    const char* const calls = std::getenv("TARVIK_PROPERTY_CALLS");
    return (calls == nullptr ? 100'000 : std::atoi(calls)) / 2 / CALLS_PER_SCENARIO + 1;
}

/// Where the two differ first, and how; empty if they agree.
std::string differenceThroughC(const Scenario& scenario) {
    Reference reference(scenario.files);
    CManager manager(scenario.files);
    std::vector<Message> expected = reference.takeMessages();
    if (!reference.databases().has("base.acd")) {
        expected.clear(); // the database layer reports that
    }
    std::string found = compare("the start-up", {"", expected}, {"", manager.takeMessages()});
    for (auto call = scenario.calls.begin(); found.empty() && call != scenario.calls.end(); ++call) {
        const Call plain = withoutHeldTexts(*call);
        std::ostringstream name;
        name << plain;
        found = compare(name.str(), ask(reference, plain), ask(manager, plain));
    }
    return found;
}

void expectAgreementEverywhere(Health health) {
    const std::string parameters = "seed=30 max_success=" + std::to_string(scenarioCount());
    setenv("RC_PARAMS", parameters.c_str(), 0);
    const rc::Gen<Scenario> generator = scenarios(health, CALLS_PER_SCENARIO).as("the scenario");
    EXPECT_TRUE(rc::check([&] {
        const Scenario scenario = *generator;
        const std::string found = differenceThroughC(scenario);
        if (!found.empty()) {
            RC_FAIL(found);
        }
    }));
}

TEST(CAgreement, OverSoundDatabases) { expectAgreementEverywhere(Health::SOUND); }

TEST(CAgreement, OverDamagedDatabases) { expectAgreementEverywhere(Health::DAMAGED); }

} // namespace
