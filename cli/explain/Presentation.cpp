// How an explanation reads: one line a step, the place under it, as wide as what shows it.
#include "explain/Explanation.h"

#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace explanation {

namespace {

constexpr std::size_t INDENT = 12;
constexpr std::size_t LEAST_WIDTH = 40;
constexpr std::size_t LEAST_FRAGMENT = 24;

/// "  topic     text", the text broken between its words.
std::string stepText(const Step& step, const Terminal& terminal) {
    const std::size_t room = std::max(terminal.width(), LEAST_WIDTH) - INDENT;
    const std::string separator = '\n' + std::string(INDENT, ' ');
    return "  " + terminal.heading(step.topic) +
           std::string(INDENT - std::min(INDENT, 2 + step.topic.size()), ' ') +
           fmt::format("{}\n", fmt::join(lines(wordsOf(terminal.sanitised(step.text)), room, ""), separator));
}

/// The text, or as much of it as fits; no character is cut in two.
std::string clipped(const std::string& text, std::size_t room) {
    if (text.size() <= room) {
        return text;
    }
    std::size_t end = room - 3;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0U) == 0x80U) {
        --end;
    }
    return text.substr(0, end) + "...";
}

/// "file:line:column: fragment" behind a lead, the fragment on a line of its own where the path leaves no room.
std::string placeText(const char* lead, const SourceText& place, const Terminal& terminal) {
    const std::size_t room = std::max(terminal.width(), LEAST_WIDTH) - INDENT;
    const std::string indent(INDENT, ' ');
    const std::string origin = lead + catalogue::asText(place.origin) + ':';
    const std::size_t needed = std::min(place.text.size(), LEAST_FRAGMENT);
    const bool fits = origin.size() + 1 + needed <= room;
    return indent + terminal.dim(origin) + (fits ? " " : '\n' + indent) +
           terminal.sanitised(clipped(place.text, fits ? room - origin.size() - 1 : room)) + '\n';
}

std::string verdictText(Conclusion verdict, const Terminal& terminal) {
    switch (verdict) {
    case Conclusion::YES:
        return terminal.good("yes:");
    case Conclusion::NO:
        return terminal.bad("no:");
    case Conclusion::FAULT:
        break;
    }
    return terminal.bad("no answer:");
}

} // namespace

std::string asText(const Answer& answer, const Terminal& terminal) {
    std::string text =
        fmt::format("{} {}\n", verdictText(answer.verdict, terminal), inWords(answer.question));
    for (const Step& step : answer.explanation.steps) {
        text += stepText(step, terminal);
        if (step.place) {
            text += placeText("", *step.place, terminal);
            for (const catalogue::Shadow& shadow : step.shadows) {
                text += placeText("shadows ", {shadow.text, shadow.origin}, terminal);
            }
        }
    }
    return text;
}

Json asJson(const Answer& answer) {
    Json steps = Json::array();
    for (const Step& step : answer.explanation.steps) {
        Json object{{"topic", step.topic}, {"text", step.text}};
        if (step.place) {
            object.update(catalogue::asJson(step.place->origin));
            object["fragment"] = step.place->text;
            if (!step.shadows.empty()) {
                object["shadows"] = catalogue::asJson(step.shadows);
            }
        }
        steps.push_back(std::move(object));
    }
    Json object{
        {"allowed", answer.verdict == Conclusion::FAULT ? Json() : Json(answer.verdict == Conclusion::YES)}};
    object.update(inJson(answer.question));
    object["steps"] = std::move(steps);
    object["skipped"] = answer.skipped;
    object["agrees"] = answer.agrees();
    return object;
}

} // namespace explanation
