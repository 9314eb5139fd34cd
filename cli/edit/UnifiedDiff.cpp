// Shows a change as a patch that other programs can read and apply.
#include "edit/UnifiedDiff.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <unordered_map>
#include <vector>

namespace edit {

namespace {

using Lines = std::vector<std::string_view>;

constexpr std::size_t CONTEXT = 3;

Lines linesOf(std::string_view text) {
    Lines lines;
    while (!text.empty()) {
        const std::size_t size = std::min(text.find('\n'), text.size() - 1) + 1;
        lines.push_back(text.substr(0, size));
        text.remove_prefix(size);
    }
    return lines;
}

/// A line of a change: both numbers if it stays, one if it is removed or added.
struct Step {
    char mark; ///< ' ', '-' or '+'
    std::string_view line;
};

/// The lines of a range that both texts have in common, found by lines that occur once in each (the patience method):
/// linear for texts that are nearly the same.
class Matcher {
public:
    Matcher(const Lines& before, const Lines& after) : m_before(before), m_after(after) {
        match(0, before.size(), 0, after.size());
    }

    [[nodiscard]] std::vector<Step> take() { return std::move(m_steps); }

private:
    void match(std::size_t first, std::size_t last, std::size_t otherFirst, std::size_t otherLast) {
        while (first < last && otherFirst < otherLast && m_before[first] == m_after[otherFirst]) {
            m_steps.push_back({' ', m_before[first]});
            ++first;
            ++otherFirst;
        }
        std::size_t same = 0;
        while (first < last - same && otherFirst < otherLast - same &&
               m_before[last - same - 1] == m_after[otherLast - same - 1]) {
            ++same;
        }
        matchMiddle(first, last - same, otherFirst, otherLast - same);
        for (std::size_t i = last - same; i < last; ++i) {
            m_steps.push_back({' ', m_before[i]});
        }
    }

    void matchMiddle(std::size_t first, std::size_t last, std::size_t otherFirst, std::size_t otherLast) {
        struct Use {
            std::size_t count = 0;
            std::size_t otherCount = 0;
            std::size_t otherPlace = 0;
        };
        std::unordered_map<std::string_view, Use> uses;
        for (std::size_t i = first; i < last; ++i) {
            ++uses[m_before[i]].count;
        }
        for (std::size_t i = otherFirst; i < otherLast; ++i) {
            Use& use = uses[m_after[i]];
            ++use.otherCount;
            use.otherPlace = i;
        }
        // The lines that occur once in each, as far as they come in one order in both.
        std::vector<std::pair<std::size_t, std::size_t>> anchors;
        for (std::size_t i = first; i < last; ++i) {
            const Use& use = uses[m_before[i]];
            if (use.count == 1 && use.otherCount == 1 &&
                (anchors.empty() || anchors.back().second < use.otherPlace)) {
                anchors.emplace_back(i, use.otherPlace);
            }
        }
        if (anchors.empty()) {
            for (std::size_t i = first; i < last; ++i) {
                m_steps.push_back({'-', m_before[i]});
            }
            for (std::size_t i = otherFirst; i < otherLast; ++i) {
                m_steps.push_back({'+', m_after[i]});
            }
            return;
        }
        for (const auto& [place, otherPlace] : anchors) {
            match(first, place, otherFirst, otherPlace);
            m_steps.push_back({' ', m_before[place]});
            first = place + 1;
            otherFirst = otherPlace + 1;
        }
        match(first, last, otherFirst, otherLast);
    }

    const Lines& m_before;
    const Lines& m_after;
    std::vector<Step> m_steps;
};

/// "12,3" as the heading of a hunk has it: the line before an empty range is its place.
std::string range(std::size_t line, std::size_t count) {
    return count == 1 ? fmt::format("{}", line) : fmt::format("{},{}", count == 0 ? line - 1 : line, count);
}

} // namespace

std::string unifiedDiff(const std::string& path, std::string_view before, std::string_view after) {
    return unifiedDiff(path, path, before, after);
}

std::string unifiedDiff(const std::string& path, const std::string& newPath, std::string_view before,
                        std::string_view after) {
    if (before == after) {
        return {};
    }
    const Lines oldLines = linesOf(before);
    const Lines newLines = linesOf(after);
    const std::vector<Step> steps = Matcher(oldLines, newLines).take();
    std::string text = fmt::format("--- {}\n+++ {}\n", path, newPath);
    std::size_t line = 1;
    std::size_t otherLine = 1;
    const auto isChange = [](const Step& step) { return step.mark != ' '; };
    for (auto next = steps.begin(); next != steps.end();) {
        const auto change = std::find_if(next, steps.end(), isChange);
        const auto skip = change == steps.end()
                              ? std::distance(next, change)
                              : std::max<std::ptrdiff_t>(
                                    std::distance(next, change) - static_cast<std::ptrdiff_t>(CONTEXT), 0);
        line += static_cast<std::size_t>(skip);
        otherLine += static_cast<std::size_t>(skip);
        next += skip;
        if (next == steps.end()) {
            break;
        }
        // The hunk ends where no change follows within twice the context.
        auto end = change;
        for (auto last = change;
             last != steps.end() && std::distance(end, last) <= static_cast<std::ptrdiff_t>(2 * CONTEXT);
             ++last) {
            end = isChange(*last) ? std::next(last) : end;
        }
        const auto tail =
            std::min<std::ptrdiff_t>(std::distance(end, steps.end()), static_cast<std::ptrdiff_t>(CONTEXT));
        end += tail;
        const auto count = [&](char other) {
            return static_cast<std::size_t>(
                std::count_if(next, end, [other](const Step& step) { return step.mark != other; }));
        };
        const std::size_t removed = count('+');
        const std::size_t added = count('-');
        text += fmt::format("@@ -{} +{} @@\n", range(line, removed), range(otherLine, added));
        for (; next != end; ++next) {
            text += next->mark;
            text += next->line;
            text += next->line.ends_with('\n') ? "" : "\n\\ No newline at end of file\n";
        }
        line += removed;
        otherLine += added;
    }
    return text;
}

} // namespace edit
