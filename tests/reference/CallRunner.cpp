// Puts the same calls to the manager and to the reference, and compares what comes of them.
#include "CallRunner.h"

#include "HeldResults.h"
#include "Invocation.h"
#include "Reference.h"
#include "support/TarvikTestPeer.h"

#include <TarvikException.h>
#include <TarvikSmokeMgr.h>
#include <tarvik/ConstraintsManager.h>

#include <gtest/gtest.h>

#include <sstream>
#include <utility>

namespace reference {

// What differs in how the two take and give texts.

template <>
struct Terms<ConstraintsManager> {
    using Recorder = TarvikSmokeMgr;
    static StringBase text(const std::string& text) { return {text.data(), text.size()}; }
    static std::string recorded(const TarvikSmokeMgr& recorder) { return show(recorder.text()); }
    static bool isTheOne(const ConstraintsManager& manager) {
        return ConstraintsManager::getConstraintsManager() == &manager;
    }
};

template <>
struct Terms<Reference> {
    using Recorder = std::string;
    static std::string text(const std::string& text) { return text; }
    static std::string recorded(const std::string& recorder) { return show(recorder); }
    static bool isTheOne(const Reference&) { return true; }
};

namespace {

Outcome outcomeOf(ConstraintsManager& manager, ManagerMessages& messages, const Call& call,
                  const std::vector<const char*>& heldArguments, HeldResults& held) {
    Outcome outcome;
    try {
        outcome.result = invoke(manager, call, heldArguments, held);
    } catch (const TarvikException& exception) {
        outcome.result = showRaised(exception);
    }
    outcome.messages = messages.take();
    return outcome;
}

/// Both, alive over the same databases.
class Pair {
public:
    explicit Pair(const Files& files) : m_reference(files) {
        TarvikTestPeer::reset();
        AcdStore::setMemoryFiles(files);
        m_messages.listen();
        m_manager = ConstraintsManager::getConstraintsManager();
    }
    ~Pair() { TarvikTestPeer::reset(); }
    Pair(const Pair&) = delete;
    Pair& operator=(const Pair&) = delete;

    [[nodiscard]] std::string startUpDifference() {
        std::vector<Message> expected = m_reference.takeMessages();
        if (isBaseMissing()) {
            expected.clear(); // The database layer reports that, which is looked at in the end.
        }
        return compare("the start-up", {"", expected}, {"", m_messages.take()});
    }

    [[nodiscard]] std::string callDifference(const Call& call) {
        std::ostringstream name;
        name << call;
        Call plain = call;
        std::vector<const char*> held(call.arguments.size(), nullptr);
        for (std::size_t number = 0; number < held.size(); ++number) {
            if (const auto* wanted = std::get_if<HeldText>(&call.arguments[number])) {
                held[number] = m_held.text(wanted->number);
                plain.arguments[number] = std::string(held[number]);
            }
        }
        return compare(name.str(), ask(m_reference, plain), askHolding(plain, held));
    }

    /// All that the manager returned is still what it was.
    [[nodiscard]] std::string heldDifference() const { return m_held.difference(); }

    [[nodiscard]] std::string memberDifference() {
        const std::vector<Member> expected = members(m_reference);
        const std::vector<Member> actual = members(*m_manager);
        std::string differences;
        for (std::size_t number = 0; number < expected.size(); ++number) {
            differences += compare("member " + expected[number].name, {expected[number].value, {}},
                                   {actual[number].value, {}});
        }
        return differences;
    }

    /// The database layer speaks up about malformed lines, at most once each, and about nothing else.
    [[nodiscard]] std::string databaseMessageDifference() const {
        const std::size_t missingBase = isBaseMissing() ? 2 : 0;
        const std::size_t limit = m_reference.databases().faults() + missingBase;
        if (m_messages.ofDatabase() > limit || m_messages.ofDatabase() < missingBase) {
            return "the database layer issued " + std::to_string(m_messages.ofDatabase()) +
                   " messages, expected " + std::to_string(missingBase) + " to " + std::to_string(limit) +
                   "\n";
        }
        return "";
    }

private:
    [[nodiscard]] Outcome askHolding(const Call& call, const std::vector<const char*>& heldArguments) {
        return outcomeOf(*m_manager, m_messages, call, heldArguments, m_held);
    }

    [[nodiscard]] bool isBaseMissing() const { return !m_reference.databases().has("base.acd"); }

    Reference m_reference;
    ManagerMessages m_messages;
    HeldResults m_held;
    ConstraintsManager* m_manager = nullptr;
};

} // namespace

Outcome ask(ConstraintsManager& manager, ManagerMessages& messages, const Call& call) {
    HeldResults held;
    return outcomeOf(manager, messages, call, {}, held);
}

Outcome ask(Reference& reference, const Call& call) {
    Outcome outcome;
    try {
        outcome.result = invoke(reference, call);
    } catch (const Raised& raised) {
        outcome.result = showRaised(raised.type, raised.line);
    }
    outcome.messages = reference.takeMessages();
    return outcome;
}

std::string difference(const Scenario& scenario, Ending ending) {
    Pair pair(scenario.files);
    std::string found = pair.startUpDifference();
    for (auto call = scenario.calls.begin(); found.empty() && call != scenario.calls.end(); ++call) {
        found = pair.callDifference(*call);
    }
    for (const Method dump : {Method::DUMP_OPERATIONS_TABLE, Method::DUMP_BSDL_OPERATIONS_TABLE,
                              Method::DUMP_PROGRAM_OPTIONS_TABLE, Method::DUMP_CACHED_DEVICE_FAMILIES}) {
        if (found.empty() && ending == Ending::DUMPS_AND_MEMBERS) {
            found = pair.callDifference({dump, {true}});
        }
    }
    if (found.empty()) {
        found = pair.heldDifference() + pair.memberDifference() + pair.databaseMessageDifference();
    }
    return found;
}

void expectAgreement(const Scenario& scenario) { EXPECT_EQ(difference(scenario), ""); }

} // namespace reference
