// Reads the words of multiboot arrangements strictly: the manager answers "no" for a mistyped one.
#include "model/Multiboot.h"

#include "term/ExitCode.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>

namespace multiboot {

namespace {

/// The word that a text names, without regard to case.
/// @param others what else to suggest
const std::string& readWord(const char* kind, const std::vector<std::string>& words, const std::string& text,
                            std::vector<std::string> others = {}) {
    const auto found = std::find_if(words.begin(), words.end(),
                                    [&](const std::string& word) { return sameWithoutCase(word, text); });
    if (found == words.end()) {
        others.insert(others.end(), words.begin(), words.end());
        throw CommandError(ExitCode::FAULT,
                           fmt::format("unknown multiboot {} \"{}\"{}\n{}s, in any case:\n{}", kind, text,
                                       didYouMean(text, others), kind, wrapped(words, 2)));
    }
    return *found;
}

} // namespace

const std::string& readType(const std::string& text) {
    const std::string prefix = TYPE_PREFIX;
    std::vector<std::string> shortTypes;
    for (const std::string& type : TYPES) {
        shortTypes.push_back(type.substr(prefix.size()));
        if (sameWithoutCase(shortTypes.back(), text)) {
            return type;
        }
    }
    return readWord("type", TYPES, text, shortTypes);
}

const std::string& readWidth(const std::string& text) { return readWord("width", WIDTHS, text); }

} // namespace multiboot
