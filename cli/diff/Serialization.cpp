// The form in which a snapshot goes from one process to another. Answers are lines of fields: databases consist of
// lines without NUL bytes, so neither end can be part of a field.
#include "diff/Snapshot.h"

#include <charconv>
#include <utility>

namespace diff {

namespace {

constexpr char FIELD_END = '\0';
constexpr char LINE_END = '\n';

/// Cuts the text up to the next end off.
std::string_view take(std::string_view& rest, char end) {
    const std::size_t length = rest.find(end);
    const std::string_view piece = rest.substr(0, length);
    rest.remove_prefix(std::min(rest.size(), piece.size() + 1));
    return piece;
}

void put(std::string& text, std::string_view field) { (text += field) += FIELD_END; }

/// An enumerator, or nothing.
template <typename Value>
void put(std::string& text, const std::optional<Value>& value) {
    put(text, value ? std::to_string(static_cast<int>(*value)) : std::string());
}

template <typename Value>
std::optional<Value> takeValue(std::string_view& line) {
    const std::string_view field = take(line, FIELD_END);
    int value = 0;
    std::from_chars(field.data(), field.data() + field.size(), value);
    return field.empty() ? std::nullopt : std::optional(static_cast<Value>(value));
}

} // namespace

std::string serialized(const Answers& answers) {
    std::string text;
    for (const auto& [question, answer] : answers) {
        put(text, question.package);
        put(text, question.topic);
        put(text, std::optional(question.kind));
        put(text, question.mode);
        put(text, question.output);
        for (const std::string& one : answer) {
            put(text, one);
        }
        text += LINE_END;
    }
    return text;
}

Answers deserialized(std::string_view text) {
    Answers answers;
    while (!text.empty()) {
        std::string_view line = take(text, LINE_END);
        Question question;
        question.package = take(line, FIELD_END);
        question.topic = take(line, FIELD_END);
        question.kind = takeValue<Question::Kind>(line).value_or(Question::Kind::NAMES);
        question.mode = takeValue<TARVIKNS::MODE_TYPE>(line);
        question.output = takeValue<TARVIKNS::OUTPUT_TYPE>(line);
        StringSet& answer = answers.try_emplace(answers.end(), std::move(question))->second;
        while (!line.empty()) {
            answer.emplace_hint(answer.end(), take(line, FIELD_END));
        }
    }
    return answers;
}

} // namespace diff
