// Suggestions for mistyped names: the edit distance, cut off where a suggestion would be a guess.
#include "text/Suggest.h"

#include <AcdText.h>

#include <algorithm>
#include <numeric>
#include <utility>

namespace {

/// The least number of insertions, deletions, replacements and exchanges of neighbours that turn one text into the
/// other.
std::size_t distance(std::string_view left, std::string_view right) {
    std::vector<std::size_t> beforeLast;
    std::vector<std::size_t> last(right.size() + 1);
    std::vector<std::size_t> row(right.size() + 1);
    std::iota(row.begin(), row.end(), std::size_t{0});
    for (std::size_t i = 0; i < left.size(); ++i) {
        beforeLast = std::exchange(last, row);
        row[0] = i + 1;
        for (std::size_t j = 0; j < right.size(); ++j) {
            const std::size_t replaced = last[j] + (left[i] == right[j] ? 0 : 1);
            row[j + 1] = std::min({replaced, last[j + 1] + 1, row[j] + 1});
            if (i > 0 && j > 0 && left[i] == right[j - 1] && left[i - 1] == right[j]) {
                row[j + 1] = std::min(row[j + 1], beforeLast[j - 1] + 1);
            }
        }
    }
    return row.back();
}

std::size_t difference(std::size_t left, std::size_t right) {
    return std::max(left, right) - std::min(left, right);
}

} // namespace

bool sameWithoutCase(std::string_view left, std::string_view right) {
    return AcdText::equalsIgnoreCase(left, right);
}

std::string lowerCase(std::string_view text) { return AcdText::lowerCase(text); }

std::string upperCase(std::string_view text) {
    std::string upper(text);
    std::transform(upper.begin(), upper.end(), upper.begin(), AcdText::toUpper);
    return upper;
}

std::optional<std::string> suggest(std::string_view text, const std::vector<std::string>& candidates) {
    // A name of this length is not mistyped, and the distance costs the product of both lengths.
    constexpr std::size_t LONGEST = 100;
    if (text.empty() || text.size() > LONGEST) {
        return std::nullopt;
    }
    const std::string wanted = lowerCase(text);
    std::size_t limit = std::max<std::size_t>(1, wanted.size() / 3) + 1;
    const std::string* best = nullptr;
    const std::string* continued = nullptr;
    for (const std::string& candidate : candidates) {
        const std::string name = lowerCase(candidate);
        if (continued == nullptr && wanted.size() > 1 && name.starts_with(wanted)) {
            continued = &candidate;
        }
        if (difference(name.size(), wanted.size()) >= limit) {
            continue;
        }
        const std::size_t found = distance(wanted, name);
        if (found < limit && found < std::max(wanted.size(), name.size())) {
            limit = found;
            best = &candidate;
        }
    }
    best = best == nullptr ? continued : best;
    return best == nullptr ? std::nullopt : std::optional(*best);
}

std::string didYouMean(std::string_view text, const std::vector<std::string>& candidates) {
    const std::optional<std::string> candidate = suggest(text, candidates);
    return candidate ? "; did you mean \"" + *candidate + "\"?" : std::string();
}
