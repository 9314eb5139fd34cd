#pragma once

#include "SmallDatabase.h"

/// The answers of one batch on a small database, line by line.
inline std::vector<nlohmann::json> batch(const std::string& input,
                                         const SmallDatabase& database = SmallDatabase()) {
    ProcessOptions start = database.start({"batch"});
    start.input = input;
    const ProcessResult outcome = runTool(start);
    if (outcome.status != 0 || !outcome.error.empty()) {
        throw std::runtime_error("status " + std::to_string(outcome.status) + ": " + outcome.error);
    }
    std::vector<nlohmann::json> answers;
    for (std::size_t position = 0; position < outcome.output.size();) {
        const std::size_t end = outcome.output.find('\n', position);
        answers.push_back(nlohmann::json::parse(outcome.output.substr(position, end - position)));
        position = end + 1;
    }
    return answers;
}

/// The one answer to the last of these requests.
inline nlohmann::json answerTo(const std::string& requests, const SmallDatabase& database = SmallDatabase()) {
    return batch(requests, database).back();
}
