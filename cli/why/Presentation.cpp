// How an explanation reads: one line a step, the place under it, in 80 columns.
#include "why/Explanation.h"

#include <fmt/format.h>

#include <algorithm>

namespace why {

namespace {

constexpr std::size_t LINE_WIDTH = 80;
constexpr std::size_t INDENT = 12;
constexpr std::size_t LEAST_FRAGMENT = 24;

/// The text broken at blanks, its lines behind the first one indented.
std::string wrappedText(const std::string& first, const std::string& text) {
    std::string result;
    std::string line = first;
    for (std::size_t start = 0; start <= text.size();) {
        const std::size_t end = std::min(text.find(' ', start), text.size());
        const std::string word = text.substr(start, end - start);
        if (line.size() > INDENT && line.size() + 1 + word.size() > LINE_WIDTH) {
            result += line + '\n';
            line.assign(INDENT, ' ');
        } else if (line.size() > INDENT) {
            line += ' ';
        }
        line += word;
        start = end + 1;
    }
    return result + line + '\n';
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
std::string placeText(const char* lead, const Piece& place) {
    const std::string indent(INDENT, ' ');
    const std::string origin = indent + lead + catalogue::asText(place.origin) + ':';
    const std::size_t needed = std::min(place.text.size(), LEAST_FRAGMENT);
    if (origin.size() + 1 + needed > LINE_WIDTH) {
        return origin + '\n' + indent + clipped(place.text, LINE_WIDTH - INDENT) + '\n';
    }
    return origin + ' ' + clipped(place.text, LINE_WIDTH - origin.size() - 1) + '\n';
}

const char* verdictText(Verdict verdict) {
    switch (verdict) {
    case Verdict::YES:
        return "yes";
    case Verdict::NO:
        return "no";
    case Verdict::FAULT:
        break;
    }
    return "no answer";
}

} // namespace

std::string asText(const Answer& answer) {
    std::string text = fmt::format("{}: {}\n", verdictText(answer.verdict), inWords(answer.question));
    for (const Step& step : answer.explanation.steps) {
        text += wrappedText(fmt::format("  {:<10}", step.topic), step.text);
        if (step.place) {
            text += placeText("", *step.place);
            for (const catalogue::Shadow& shadow : step.place->shadows) {
                text += placeText("shadows ", {shadow.text, shadow.origin});
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
            if (!step.place->shadows.empty()) {
                object["shadows"] = catalogue::asJson(step.place->shadows);
            }
        }
        steps.push_back(std::move(object));
    }
    Json object{
        {"allowed", answer.verdict == Verdict::FAULT ? Json() : Json(answer.verdict == Verdict::YES)}};
    object.update(inJson(answer.question));
    object["steps"] = std::move(steps);
    object["agrees"] = answer.agrees();
    return object;
}

} // namespace why
