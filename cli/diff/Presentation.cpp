// Shows a comparison: what several cells of the tables have in common is one line.
#include "diff/Presentation.h"

#include "model/Vocabulary.h"
#include "term/Table.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace diff {

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// A cell of a table, or several that change alike.
using Cell = std::pair<std::optional<MODE_TYPE>, std::optional<OUTPUT_TYPE>>;
using Cells = std::vector<Cell>;

/// One line of what changed.
struct Line {
    std::string question;
    bool isValue;
    StringSet lost;
    StringSet gained;
};

template <typename Keys>
std::string listed(const Keys& keys) {
    std::string text;
    for (const auto& key : keys) {
        text += (text.empty() ? "" : ", ") + vocabulary::key(key);
    }
    return text;
}

/// " in BS, SM through USB2; in SS through PARALLEL", or nothing.
std::string inWords(const Cells& cells) {
    std::map<std::optional<MODE_TYPE>, std::vector<OUTPUT_TYPE>> outputsByMode;
    for (const auto& [mode, output] : cells) {
        if (output) {
            outputsByMode[mode].push_back(*output);
        }
    }
    std::vector<std::pair<std::vector<MODE_TYPE>, std::vector<OUTPUT_TYPE>>> places;
    for (const auto& [mode, outputs] : outputsByMode) {
        auto place = std::find_if(places.begin(), places.end(),
                                  [&wanted = outputs](const auto& known) { return known.second == wanted; });
        if (place == places.end()) {
            place = places.insert(places.end(), {{}, outputs});
        }
        if (mode) {
            place->first.push_back(*mode);
        }
    }
    std::string text;
    for (const auto& [modes, outputs] : places) {
        text += text.empty() ? "" : ";";
        text += modes.empty() ? "" : " in " + listed(modes);
        text += " through " + listed(outputs);
    }
    return text;
}

std::string topicOf(const Question& question) {
    return question.package.empty() ? question.topic
                                    : fmt::format("package {}: {}", question.package, question.topic);
}

std::string inWords(const Question& question) {
    return topicOf(question) + inWords(Cells{{question.mode, question.output}});
}

/// The changes of one topic, which are next to each other: names that come and go in the same cells are one line.
void addLines(std::vector<Line>& lines, const std::vector<Change>& changes) {
    std::map<std::pair<std::string, bool>, Cells> cellsByName; ///< lost or gained
    for (const Change& change : changes) {
        const Cell cell(change.question.mode, change.question.output);
        for (const std::string& name : change.lost) {
            cellsByName[{name, false}].push_back(cell);
        }
        for (const std::string& name : change.gained) {
            cellsByName[{name, true}].push_back(cell);
        }
    }
    const Question& first = changes.front().question;
    std::map<Cells, Line> byCells;
    for (const auto& [name, cells] : cellsByName) {
        Line& line = byCells[cells];
        (name.second ? line.gained : line.lost).insert(name.first);
    }
    for (auto& [cells, line] : byCells) {
        line.question = topicOf(first) + inWords(cells);
        line.isValue = first.kind == Question::Kind::VALUE;
        lines.push_back(std::move(line));
    }
}

std::vector<Line> linesOf(const std::vector<Change>& changes) {
    std::vector<Line> lines;
    for (auto first = changes.begin(); first != changes.end();) {
        const auto last = std::find_if(first, changes.end(), [first](const Change& change) {
            return change.question.topic != first->question.topic ||
                   change.question.package != first->question.package;
        });
        addLines(lines, {first, last});
        first = last;
    }
    return lines;
}

std::string asText(const Line& line, const Terminal& terminal) {
    std::vector<std::string> words = wordsOf(terminal.sanitised(line.question));
    words.back() += ':';
    for (const std::string& lost : line.lost) {
        words.push_back(terminal.bad('-' + terminal.sanitised(lost)));
    }
    for (const std::string& gained : line.gained) {
        words.push_back(terminal.good('+' + terminal.sanitised(gained)));
    }
    constexpr std::size_t INDENT = 4;
    std::string text;
    for (const std::string& part : lines(words, terminal.width() - std::min(terminal.width(), INDENT), "")) {
        text.append(text.empty() ? INDENT / 2 : INDENT, ' ').append(part).append(1, '\n');
    }
    return text;
}

/// Families that change alike as a whole, or a group of some other kind.
using Section = std::vector<const Group*>;

std::vector<Section> sectionsOf(const std::vector<Group>& groups) {
    std::vector<Section> sections;
    std::map<std::vector<Change>, std::size_t> wholeFamilies;
    for (const Group& group : groups) {
        const auto position = group.others.empty()
                                  ? wholeFamilies.try_emplace(group.changes, sections.size()).first->second
                                  : sections.size();
        sections.resize(std::max(sections.size(), position + 1));
        sections[position].push_back(&group);
    }
    return sections;
}

/// Few enough to be named as exceptions.
bool areExceptions(const Group& group) {
    constexpr std::size_t FEW = 3;
    return group.others.size() <= FEW && group.others.size() < group.devices.size();
}

std::string count(const Group& group) {
    return fmt::format("{} of {} devices", group.devices.size(), group.devices.size() + group.others.size());
}

std::string heading(const Group& group) {
    if (group.devices.size() == 1) {
        const std::string& device = group.devices.front();
        return device == group.family ? device : fmt::format("{} ({})", device, group.family);
    }
    if (group.isWhole()) {
        return fmt::format("{} (all {} devices)", group.family, group.devices.size());
    }
    if (areExceptions(group)) {
        return fmt::format("{} (all but {})", group.family, lines(group.others, std::string::npos).front());
    }
    return fmt::format("{} ({})", group.family, count(group));
}

/// The families of a section, and for those with one device that device.
std::vector<std::string> familiesOf(const Section& section) {
    std::vector<std::string> names;
    for (const Group* const group : section) {
        names.push_back(group->devices.size() == 1 ? heading(*group) : group->family);
    }
    return names;
}

Json asJson(const std::vector<Change>& changes) {
    Json list = Json::array();
    for (const Change& change : changes) {
        list.push_back(
            {{"question", inWords(change.question)}, {"lost", change.lost}, {"gained", change.gained}});
    }
    return list;
}

Json names(const Devices& devices) {
    StringSet all;
    for (const auto& [family, members] : devices) {
        all.insert(members.begin(), members.end());
    }
    return all;
}

Json byFamily(const Devices& devices) {
    Json list = Json::array();
    for (const auto& [family, members] : devices) {
        list.push_back({{"family", family}, {"devices", members}});
    }
    return list;
}

/// As code, whatever the text holds.
std::string code(const std::string& text) {
    return text.find('`') == text.npos ? fmt::format("`{}`", text) : fmt::format("`` {} ``", text);
}

template <typename Names>
std::string codes(const Names& names) {
    std::string text;
    for (const std::string& name : names) {
        text += (text.empty() ? "" : ", ") + code(name);
    }
    return text;
}

std::string asMarkdown(const Line& line) {
    std::string text = fmt::format("- {}: ", line.question);
    if (line.isValue && !line.lost.empty() && !line.gained.empty()) {
        return text + fmt::format("{} becomes {}\n", codes(line.lost), codes(line.gained));
    }
    text += line.lost.empty() ? "" : "lost " + codes(line.lost);
    text += line.lost.empty() || line.gained.empty() ? "" : "; ";
    text += line.gained.empty() ? "" : "gained " + codes(line.gained);
    return text + '\n';
}

std::string markdownHeading(const Group& group) {
    if (group.isWhole()) {
        return fmt::format("All {} devices:\n\n", group.devices.size());
    }
    if (group.devices.size() > 1 && areExceptions(group)) {
        return fmt::format("All but {}:\n\n", codes(group.others));
    }
    return fmt::format("{}:\n\n", codes(group.devices));
}

} // namespace

std::string asText(const Comparison& comparison, const Terminal& terminal) {
    std::string text;
    const auto addHeading = [&](const std::string& heading) {
        text += terminal.heading(terminal.sanitised(heading)) + '\n';
    };
    const auto addDevices = [&](const char* title, const Devices& devices) {
        if (!devices.empty()) {
            addHeading(title);
        }
        for (const auto& [family, members] : devices) {
            text += fmt::format("  {}\n{}", family == "spi" ? "spi (flashes)" : family,
                                wrapped(members, 4, terminal.width()));
        }
    };
    addDevices("only in the old database", comparison.onlyInOld);
    addDevices("only in the new database", comparison.onlyInNew);
    if (!comparison.general.empty()) {
        addHeading("for all devices");
    }
    for (const Line& line : linesOf(comparison.general)) {
        text += asText(line, terminal);
    }
    for (const Section& section : sectionsOf(comparison.groups)) {
        const Group& group = *section.front();
        if (section.size() > 1) {
            addHeading(fmt::format("{} families", section.size()));
            text += wrapped(familiesOf(section), 4, terminal.width());
        } else {
            addHeading(heading(group));
        }
        if (section.size() == 1 && group.devices.size() > 1 && !group.isWhole() && !areExceptions(group)) {
            text += wrapped(group.devices, 4, terminal.width());
        }
        for (const Line& line : linesOf(group.changes)) {
            text += asText(line, terminal);
        }
    }
    return text;
}

Json asJson(const Comparison& comparison) {
    Json groups = Json::array();
    for (const Group& group : comparison.groups) {
        groups.push_back({{"family", group.family},
                          {"devices", group.devices},
                          {"whole", group.isWhole()},
                          {"changes", asJson(group.changes)}});
    }
    return {{"same", comparison.isEmpty()},
            {"onlyInOld", names(comparison.onlyInOld)},
            {"onlyInNew", names(comparison.onlyInNew)},
            {"lost", byFamily(comparison.onlyInOld)},
            {"gained", byFamily(comparison.onlyInNew)},
            {"general", asJson(comparison.general)},
            {"groups", groups},
            {"unanswered", comparison.unanswered}};
}

std::string asMarkdown(const Comparison& comparison) {
    std::string text;
    const auto addSection = [&text](const std::string& title) {
        text += fmt::format("{}### {}\n\n", text.empty() ? "" : "\n", title);
    };
    const auto addDevices = [&](const char* title, const Devices& devices) {
        if (!devices.empty()) {
            addSection(title);
        }
        for (const auto& [family, members] : devices) {
            text += fmt::format("- {}: {}\n", family == "spi" ? "flashes" : family, codes(members));
        }
    };
    addDevices("New devices", comparison.onlyInNew);
    addDevices("Devices no longer supported", comparison.onlyInOld);
    if (!comparison.general.empty()) {
        addSection("For all devices");
    }
    for (const Line& line : linesOf(comparison.general)) {
        text += asMarkdown(line);
    }
    std::string family;
    for (const Section& section : sectionsOf(comparison.groups)) {
        const Group& group = *section.front();
        if (section.size() > 1) {
            addSection(fmt::format("{} families", section.size()));
            text += codes(familiesOf(section)) + ":\n\n";
            family.clear();
        } else if (group.family != family) {
            family = group.family;
            addSection(family == "spi" ? "spi (flashes)" : family);
        } else {
            text += '\n';
        }
        text += section.size() > 1 ? "" : markdownHeading(group);
        for (const Line& line : linesOf(group.changes)) {
            text += asMarkdown(line);
        }
    }
    return text;
}

} // namespace diff
