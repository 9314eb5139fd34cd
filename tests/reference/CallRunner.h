#pragma once

#include "Call.h"
#include "Outcome.h"

#include <string>

namespace reference {

/// Puts a call to the reference alone.
[[nodiscard]] Outcome ask(Reference& reference, const Call& call);

/// Puts a call to the manager alone, whose messages `messages` listens to.
[[nodiscard]] Outcome ask(ConstraintsManager& manager, ManagerMessages& messages, const Call& call);

/// What is compared behind the last call.
enum class Ending {
    MEMBERS,
    DUMPS_AND_MEMBERS, ///< many times slower
};

/// Makes the manager and the reference over the scenario's databases, puts every call to both, and compares
/// results, exceptions, messages, and the ending.
/// @return where they differ first, and how; empty when they agree
[[nodiscard]] std::string difference(const Scenario& scenario, Ending ending = Ending::DUMPS_AND_MEMBERS);

/// The same as an expectation of a test.
void expectAgreement(const Scenario& scenario);

} // namespace reference
