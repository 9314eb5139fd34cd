// A rule about characters that look like others: nobody sees them on a screen.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include <algorithm>
#include <array>
#include <optional>
#include <unordered_map>
#include <utility>

namespace lint {

namespace {

constexpr Rule CONFUSABLE_LETTER{
    "C105",
    "confusable-letter",
    Severity::WARNING,
    "letter that looks like an ASCII letter or a blank",
    R"(A word mixes ASCII characters with letters of another script that look like ASCII, or it contains a no-break or
zero-width space. It equals no name that is typed on a keyboard. Words of another script alone are not reported.)",
    "PROPERTY = VENDOR,K<U+043E>rvel",
    false,
    true};

/// A character of a word that looks like another.
struct Confusable {
    std::string what;  ///< the character in words
    std::string meant; ///< the word with the characters that were most likely meant
};

std::optional<Confusable> confusableIn(std::string_view word) {
    static const std::unordered_map<std::string_view, char> LETTERS{
        {"\u0410", 'A'}, {"\u0412", 'B'}, {"\u0415", 'E'}, {"\u041a", 'K'}, {"\u041c", 'M'}, {"\u041d", 'H'},
        {"\u041e", 'O'}, {"\u0420", 'P'}, {"\u0421", 'C'}, {"\u0422", 'T'}, {"\u0423", 'Y'}, {"\u0425", 'X'},
        {"\u0405", 'S'}, {"\u0406", 'I'}, {"\u0408", 'J'}, {"\u0430", 'a'}, {"\u0435", 'e'}, {"\u043e", 'o'},
        {"\u0440", 'p'}, {"\u0441", 'c'}, {"\u0443", 'y'}, {"\u0445", 'x'}, {"\u0455", 's'}, {"\u0456", 'i'},
        {"\u0458", 'j'}, {"\u0391", 'A'}, {"\u0392", 'B'}, {"\u0395", 'E'}, {"\u0396", 'Z'}, {"\u0397", 'H'},
        {"\u0399", 'I'}, {"\u039a", 'K'}, {"\u039c", 'M'}, {"\u039d", 'N'}, {"\u039f", 'O'}, {"\u03a1", 'P'},
        {"\u03a4", 'T'}, {"\u03a5", 'Y'}, {"\u03a7", 'X'}, {"\u03bf", 'o'}, {"\u03bd", 'v'}};
    static const std::array<std::string_view, 6> SPACES{"\u00a0", "\u200b", "\u200c",
                                                        "\u200d", "\u202f", "\ufeff"};
    bool hasSpace = false;
    bool hasAscii = false;
    char looksLike = 0;
    std::string meant;
    for (std::size_t i = 0; i < word.size();) {
        const std::string_view rest = word.substr(i);
        const auto space = std::find_if(SPACES.begin(), SPACES.end(),
                                        [rest](std::string_view one) { return rest.starts_with(one); });
        const auto letter = LETTERS.find(rest.substr(0, 2));
        if (space != SPACES.end()) {
            hasSpace = true;
            i += space->size();
        } else if (letter != LETTERS.end()) {
            looksLike = letter->second;
            meant += looksLike;
            i += letter->first.size();
        } else {
            hasAscii = hasAscii || static_cast<unsigned char>(word[i]) < 0x80U;
            meant += word[i++];
        }
    }
    if (hasSpace) {
        return Confusable{"a no-break or zero-width space", std::move(meant)};
    }
    if (!hasAscii || looksLike == 0) {
        return std::nullopt;
    }
    return Confusable{fmt::format("a letter of another script that looks like \"{}\"", looksLike),
                      std::move(meant)};
}

void checkLetters(const AcdLines& file, unsigned line, Findings& findings) {
    const std::string_view text = file.source(line);
    if (std::all_of(text.begin(), text.end(),
                    [](char byte) { return static_cast<unsigned char>(byte) < 0x80U; })) {
        return;
    }
    constexpr std::string_view SEPARATORS = " \t,:=+[]\\";
    for (std::size_t begin = 0; begin < text.size();) {
        const std::size_t end = std::min(text.find_first_of(SEPARATORS, begin), text.size());
        const std::string_view word = text.substr(begin, end - begin);
        // A byte-order mark at the start of the file is skipped by the readers.
        const bool isMark = line == 1 && begin == 0 && word.starts_with("\ufeff");
        if (const auto confusable = confusableIn(isMark ? word.substr(3) : word)) {
            findings
                .add(CONFUSABLE_LETTER, {word, {&file, line, static_cast<unsigned>(begin + 1)}},
                     "{} contains {}", inQuotes(word), confusable->what)
                .reports = confusable->meant;
        }
        begin = end + 1;
    }
}

void check(const Model& model, Findings& findings) {
    for (const AcdLines& file : model.files()) {
        for (const AcdLines::Line& line : file.lines()) {
            for (unsigned number = line.firstLine; number <= line.lastLine; ++number) {
                checkLetters(file, number, findings);
            }
        }
    }
}

} // namespace

RuleSet letterRules() { return {"", {&CONFUSABLE_LETTER}, check}; }

} // namespace lint
