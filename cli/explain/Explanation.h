#pragma once

#include "explain/Question.h"
#include "model/Records.h"
#include "term/Terminal.h"

#include <optional>
#include <string>
#include <vector>

namespace explanation {

using catalogue::SourceText;

/// One link of the chain that leads to an answer.
struct Step {
    /// "name", "family", "table", "rule", "record" (which decides), "absent" (what decides is missing), "note" (an
    /// oddity on the way), "fault", "part" (of a complete question), "skipped" (a check that the form leaves out), or
    /// after a no "instead" and "differs".
    std::string topic;
    std::string text;
    std::optional<SourceText> place{}; ///< the text of the database, and where it is written
    catalogue::Shadows shadows{};      ///< what lower layers have in its place
};

struct Explanation {
    Conclusion verdict = Conclusion::NO; ///< that the steps come to
    std::vector<Step> steps;

    /// The last record that decides something; null when there is none.
    [[nodiscard]] const SourceText* decidingRecord() const;
};

/// Asks a fresh manager, and finds what decides among the records that it read.
[[nodiscard]] Explanation explain(const Question& question);

/// What comes nearest to a question that was answered by no.
[[nodiscard]] std::vector<Step> alternatives(const Question& question);

/// What is shown: the manager's verdict, and how the records lead there.
struct Answer {
    Question question;
    Conclusion verdict;
    Explanation explanation;
    std::vector<std::string> skipped{}; ///< as `skippedChecks`

    [[nodiscard]] bool agrees() const { return verdict == explanation.verdict; }
};

[[nodiscard]] std::string asText(const Answer& answer, const Terminal& terminal);
[[nodiscard]] Json asJson(const Answer& answer);

} // namespace explanation
