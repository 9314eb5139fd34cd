#include "measure/Results.h"

#include <algorithm>
#include <cstdio>

namespace bench {

void report(std::string_view measure, std::string_view size, std::string_view contender,
            std::string_view unit, double value) {
    const auto length = [](std::string_view text) { return static_cast<int>(text.size()); };
    std::printf("%.*s\t%.*s\t%.*s\t%.*s\t%.6g\n", length(measure), measure.data(), length(size), size.data(),
                length(contender), contender.data(), length(unit), unit.data(), value);
    std::fflush(stdout);
}

double median(std::vector<double> values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return *middle;
}

} // namespace bench
