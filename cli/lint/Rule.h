#pragma once

#include <string_view>
#include <vector>

namespace lint {

class Findings;
class Model;

enum class Level {
    WARNING, ///< without effect, or not for long right
    ERROR,   ///< the database does not say what it seems to say
};

/// What can be found.
struct Rule {
    std::string_view code; ///< a letter and three digits; never given to another rule
    Level level;
    std::string_view title;       ///< in one line
    std::string_view explanation; ///< why it matters, and what to write in its place
    std::string_view example;     ///< lines that are found
};

/// Rules about one thing, and the function that looks for them.
struct Group {
    std::vector<const Rule*> rules;
    void (*check)(const Model& model, Findings& findings);
};

/// All groups, in the order of the codes' letters.
[[nodiscard]] const std::vector<Group>& groups();

/// All rules, in the order of their codes.
[[nodiscard]] const std::vector<const Rule*>& rules();

/// The rule of that code; null when there is none.
[[nodiscard]] const Rule* ruleOf(std::string_view code);

[[nodiscard]] constexpr std::string_view nameOf(Level level) {
    return level == Level::ERROR ? "error" : "warning";
}

} // namespace lint
