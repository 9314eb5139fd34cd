#pragma once

#include "explain/Question.h"
#include "explain/StartUp.h"
#include "term/Terminal.h"

#include <optional>
#include <string>
#include <vector>

namespace why {

/// One link of the chain that leads to an answer.
struct Step {
    /// "name", "family", "table", "rule", "record" (which decides), "absent" (what decides is missing), "note" (an
    /// oddity on the way), "fault", or behind a no "instead" and "differs".
    std::string topic;
    std::string text;
    std::optional<Piece> place; ///< where it stands, with the words that stand there
};

struct Explanation {
    Verdict verdict = Verdict::NO; ///< that the steps come to
    std::vector<Step> steps;

    /// The last record that had a say; null when there was none.
    [[nodiscard]] const Piece* decidingRecord() const;
};

/// Follows the records to an answer, apart from the manager.
[[nodiscard]] Explanation explain(const StartUp& facts, const Question& question);

/// What comes nearest to a question that was answered by no.
[[nodiscard]] std::vector<Step> alternatives(const StartUp& facts, const Question& question);

/// What is shown: the manager's verdict, and how the records lead there.
struct Answer {
    Question question;
    Verdict verdict;
    Explanation explanation;

    [[nodiscard]] bool agrees() const { return verdict == explanation.verdict; }
};

[[nodiscard]] std::string asText(const Answer& answer, const Terminal& terminal);
[[nodiscard]] Json asJson(const Answer& answer);

} // namespace why
