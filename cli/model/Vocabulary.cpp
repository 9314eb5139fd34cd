// Reads the words of the vocabulary strictly: a mistyped mode must not be answered for another one.
#include "model/Vocabulary.h"

#include "term/ExitCode.h"
#include "term/Table.h"
#include "text/Suggest.h"

// The manager's own table: the class itself does not give the display names of modes and outputs.
#include <WordTables.h>

#include <fmt/format.h>

#include <algorithm>
#include <array>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace vocabulary {

namespace {

constexpr std::array<const char*, 4> KIND_NAMES{"mode", "output", "operation", "option"};

const char* nameOf(Kind kind) { return KIND_NAMES.at(static_cast<std::size_t>(kind)); }

std::vector<Word> modeWords() {
    std::vector<Word> words;
    for (const wordTables::Mode& mode : wordTables::MODES) {
        words.push_back({mode.key, {}, mode.display});
        for (const char* const name : mode.names) {
            if (name != nullptr && words.back().key != name) {
                words.back().others.emplace_back(name);
            }
        }
    }
    return words;
}

template <typename Rows>
std::vector<Word> wordsOf(const Rows& rows) {
    std::vector<Word> words;
    words.reserve(rows.size());
    for (const auto& row : rows) {
        words.push_back({row.key, {}, row.display});
    }
    return words;
}

std::vector<Word> optionWords() {
    std::vector<Word> words;
    words.reserve(wordTables::OPTIONS.size());
    for (const wordTables::Option& option : wordTables::OPTIONS) {
        words.push_back({option.key, {}, ""});
    }
    return words;
}

/// A display name with single blanks, and without what all names of its kind end in.
std::string shortName(Kind kind, std::string_view name) {
    std::vector<std::string> words = ::wordsOf(std::string(name));
    const char* const ending = kind == Kind::MODE ? "mode" : "cable";
    if (words.size() > 1 && kind <= Kind::OUTPUT && sameWithoutCase(words.back(), ending)) {
        words.pop_back();
    }
    std::string text;
    for (const std::string& word : words) {
        text += (text.empty() ? "" : " ") + word;
    }
    return text;
}

/// All texts that suggestions come from.
std::vector<std::string> acceptedTexts(Kind kind) {
    std::vector<std::string> texts = keys(kind);
    for (const Word& word : words(kind)) {
        texts.insert(texts.end(), word.others.begin(), word.others.end());
        if (!word.name.empty()) {
            texts.push_back(shortName(kind, word.name));
        }
    }
    return texts;
}

template <typename Type>
Type read(Kind kind, const std::string& text) {
    if (const std::optional<int> value = find(kind, text)) {
        return static_cast<Type>(*value);
    }
    // The long lists would hide the suggestion.
    const std::string list = kind == Kind::MODE || kind == Kind::OUTPUT
                                 ? fmt::format("{}s, in any case:\n{}", nameOf(kind), wrapped(keys(kind), 2))
                                 : std::string();
    throw CommandError(ExitCode::FAULT,
                       fmt::format("{}\n{}see: tarvik vocabulary", unknownWord(kind, text), list));
}

} // namespace

const std::vector<Word>& words(Kind kind) {
    static const std::array<std::vector<Word>, 4> all{modeWords(), wordsOf(wordTables::OUTPUTS),
                                                      wordsOf(wordTables::OPERATIONS), optionWords()};
    return all.at(static_cast<std::size_t>(kind));
}

const std::vector<std::string>& keys(Kind kind) {
    static const std::array<std::vector<std::string>, 4> all = [] {
        std::array<std::vector<std::string>, 4> keys;
        for (std::size_t one = 0; one < keys.size(); ++one) {
            for (const Word& word : words(static_cast<Kind>(one))) {
                keys.at(one).push_back(word.key);
            }
        }
        return keys;
    }();
    return all.at(static_cast<std::size_t>(kind));
}

std::optional<int> find(Kind kind, std::string_view text) {
    const std::vector<Word>& all = words(kind);
    const std::string name = shortName(kind, text);
    const auto hasKey = [&](const Word& word) {
        return sameWithoutCase(word.key, text) ||
               std::any_of(word.others.begin(), word.others.end(),
                           [&](const std::string& other) { return sameWithoutCase(other, text); });
    };
    const auto hasName = [&](const Word& word) {
        return !word.name.empty() && sameWithoutCase(shortName(kind, word.name), name);
    };
    auto found = std::find_if(all.begin(), all.end(), hasKey);
    found = found == all.end() ? std::find_if(all.begin(), all.end(), hasName) : found;
    return found == all.end() ? std::nullopt : std::optional(static_cast<int>(found - all.begin()));
}

std::string unknownWord(Kind kind, std::string_view text) {
    return fmt::format("unknown {} \"{}\"{}", nameOf(kind), text, didYouMean(text, acceptedTexts(kind)));
}

MODE_TYPE readMode(const std::string& text) { return read<MODE_TYPE>(Kind::MODE, text); }
OUTPUT_TYPE readOutput(const std::string& text) { return read<OUTPUT_TYPE>(Kind::OUTPUT, text); }
OP_TYPE readOperation(const std::string& text) { return read<OP_TYPE>(Kind::OPERATION, text); }
PROGRAM_OPTION readOption(const std::string& text) { return read<PROGRAM_OPTION>(Kind::OPTION, text); }

const std::string& key(MODE_TYPE mode) { return modes().at(static_cast<std::size_t>(mode)); }
const std::string& key(OUTPUT_TYPE output) { return outputs().at(static_cast<std::size_t>(output)); }
const std::string& key(OP_TYPE operation) { return operations().at(static_cast<std::size_t>(operation)); }
const std::string& key(PROGRAM_OPTION option) { return options().at(static_cast<std::size_t>(option)); }

const std::string& displayName(OP_TYPE operation) {
    return words(Kind::OPERATION).at(static_cast<std::size_t>(operation)).name;
}

} // namespace vocabulary
