#pragma once

#include "explain/Question.h"
#include "query/ReadLog.h"

#include <ManagerFactory.h>

namespace explanation {

/// The answer of a manager that was asked nothing before.
[[nodiscard]] Conclusion askFreshManager(const Question& question);

/// A question to a manager that was asked nothing before, its answer, and what the manager read on the way.
struct Inquiry {
    explicit Inquiry(const Question& question);

    /// The family of a name, as the question resolved it.
    [[nodiscard]] std::string familyOf(const std::string& name) const;

    ReadLog startUp;                 ///< what the manager read before the question
    ReadLog reads;                   ///< what it read for the question
    ManagerFactory::Manager manager; ///< its exceptions are off
    Conclusion verdict = Conclusion::NO;
};

} // namespace explanation
