#pragma once

#include "reference/Call.h"
#include "reference/Outcome.h"

#include <string>

namespace reference {

/// Puts a call to the reference alone.
[[nodiscard]] Outcome ask(Reference& reference, const Call& call);

/// Makes the manager and the reference over the scenario's databases, puts every call to both, and compares
/// results, exceptions, messages, and in the end the dumps and the members.
/// @return where they differ first, and how; empty when they agree
[[nodiscard]] std::string difference(const Scenario& scenario);

/// The same as an expectation of a test.
void expectAgreement(const Scenario& scenario);

} // namespace reference
