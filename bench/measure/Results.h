#pragma once

#include <string_view>
#include <vector>

namespace bench {

/// Writes one result to standard output, as a line of fields that the table is made from.
void report(std::string_view measure, std::string_view size, std::string_view contender,
            std::string_view unit, double value);

/// The middle one; of an even number the upper of the two in the middle.
[[nodiscard]] double median(std::vector<double> values);

/// Rounds of all contenders in turn: the machine drifts, so that only neighbours in time can be compared.
inline constexpr int ROUNDS = 11;

} // namespace bench
