#pragma once

#include "term/Terminal.h"
#include "text/Json.h"

#include <string>

/// A yes or a no, with what was asked.
struct Verdict {
    bool allowed;
    std::string question; ///< in words
    Json asked;           ///< the arguments, as the JSON object shows them
};

[[nodiscard]] inline std::string asText(const Verdict& verdict, const Terminal& terminal) {
    return (verdict.allowed ? terminal.good("yes:") : terminal.bad("no:")) + ' ' +
           terminal.sanitised(verdict.question) + '\n';
}

[[nodiscard]] inline Json asJson(const Verdict& verdict) {
    Json object{{"allowed", verdict.allowed}};
    object.update(verdict.asked);
    return object;
}
