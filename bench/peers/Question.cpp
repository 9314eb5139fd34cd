#include "peers/Question.h"

#include <random>

namespace bench {

std::vector<Question> makeQuestions(const Facts& facts, std::size_t count, std::uint64_t seed) {
    std::mt19937_64 engine(seed);
    const auto below = [&engine](std::size_t bound) { return static_cast<std::size_t>(engine() % bound); };
    std::vector<Question> questions;
    questions.reserve(count);
    for (std::size_t number = 0; number < count; ++number) {
        const Family& family = facts.families[below(facts.families.size())];
        const Device& device = family.devices[below(family.devices.size())];
        const std::string& key = device.properties[below(device.properties.size())].key;
        // SPI, the last mode, is answered for all devices alike: no look-up to measure.
        questions.push_back({device.name, below(MODES - 1), below(OUTPUTS), below(OPERATIONS), key});
    }
    return questions;
}

} // namespace bench
