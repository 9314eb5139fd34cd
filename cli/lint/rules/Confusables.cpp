// Rules about texts that look like others: packages whose letters and digits are mixed up, and letters of other scripts.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include <algorithm>
#include <array>
#include <map>
#include <optional>
#include <unordered_map>

namespace lint {

namespace {

constexpr Rule CONFUSABLE_PACKAGE{
    "C104",
    "confusable-package",
    Severity::WARNING,
    "package that looks like a common one",
    R"(The name differs from a more common package only in O and 0, I and 1, S and 5 or B and 8.)",
    "PROPERTIES = PACKAGES,1,TQI00"};
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

/// A spelling is rare up to this number.
constexpr std::size_t MAX_RARE = 2;

bool isDigit(char byte) { return byte >= '0' && byte <= '9'; }

void addPackages(const FamilyData& family, FamilyResult& result) {
    family.forEachSection([&](const Section& section) {
        for (const Item& item : section.items(schema::PROPERTIES)) {
            for (std::size_t i = 2; item.fields.front().text == schema::PACKAGES && i < item.fields.size();
                 ++i) {
                result.packages[item.fields[i].text].push_back(&item.fields[i]);
            }
        }
    });
}

void checkPackages(const FamilyResults& families, Findings& findings) {
    const auto normalised = [](std::string_view package) {
        std::string text(package);
        constexpr std::string_view FROM = "OISB";
        constexpr std::string_view TO = "0158";
        for (char& byte : text) {
            const std::size_t at = FROM.find(byte);
            byte = at == FROM.npos ? byte : TO[at];
        }
        return text;
    };
    std::map<std::string, std::map<std::string_view, std::vector<const Token*>>> all;
    for (const auto& [family, result] : families) {
        for (const auto& [package, uses] : result.packages) {
            std::vector<const Token*>& found = all[normalised(package)][package];
            found.insert(found.end(), uses.begin(), uses.end());
        }
    }
    for (const auto& [text, spellings] : all) {
        // Of two names that are equally common the one that is letters and then digits is right.
        const auto rank = [](const auto& spelling) {
            const std::string_view package = spelling.first;
            const std::size_t digits = std::min(package.find_first_of("0123456789"), package.size());
            const bool isRegular =
                std::all_of(package.begin() + static_cast<std::ptrdiff_t>(digits), package.end(), isDigit);
            return std::pair(spelling.second.size(), isRegular);
        };
        const auto common = std::max_element(
            spellings.begin(), spellings.end(),
            [&rank](const auto& left, const auto& right) { return rank(left) < rank(right); });
        for (const auto& spelling : spellings) {
            for (const Token* use : spelling.second) {
                if (rank(spelling) < rank(*common) && spelling.second.size() <= MAX_RARE) {
                    findings
                        .add(CONFUSABLE_PACKAGE, *use,
                             "{} looks like {}, which is listed {}; did you mean that?",
                             inQuotes(spelling.first), inQuotes(common->first),
                             common->second.size() == 1 ? std::string("once")
                                                        : fmt::format("{} times", common->second.size()))
                        .reports = common->first;
                }
            }
        }
    }
}

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

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    addPackages(family, result);
    for (const AcdLines& file : family.files) {
        for (const AcdLines::Line& line : file.lines()) {
            for (unsigned number = line.firstLine; number <= line.lastLine; ++number) {
                checkLetters(file, number, result.findings);
            }
        }
    }
}

void check(const Model& /*any*/, const FamilyResults& families, Findings& findings) {
    checkPackages(families, findings);
}

} // namespace

RuleSet confusableRules() { return {"", {&CONFUSABLE_PACKAGE, &CONFUSABLE_LETTER}, checkFamily, check}; }

} // namespace lint
