#pragma once

#include "generate/Facts.h"

#include <cstdint>
#include <string>
#include <vector>

namespace bench {

/// What one question is about; every contender is asked the same ones.
struct Question {
    std::string device;
    std::size_t mode;
    std::size_t output;
    std::size_t operation;
    std::string key; ///< of a property that the device has
};

/// Questions about all devices alike, in random order.
[[nodiscard]] std::vector<Question> makeQuestions(const Facts& facts, std::size_t count, std::uint64_t seed);

} // namespace bench
