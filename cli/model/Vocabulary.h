#pragma once

#include <tarvik/TARVIKNS.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// The texts by which people name modes, outputs, operations and options.
///
/// The manager's converters take every text, and read an unknown one as something else; the tool takes the texts that
/// name something, in any case, and refuses the others.
namespace vocabulary {

enum class Kind { MODE, OUTPUT, OPERATION, OPTION };

/// One value of an enumeration.
struct Word {
    std::string key;
    std::vector<std::string> others; ///< texts other than the key that databases use
    std::string name;                ///< the display name; empty for options, which have none
};

/// The words of a kind, in value order.
[[nodiscard]] const std::vector<Word>& words(Kind kind);

/// The key names, in value order.
[[nodiscard]] const std::vector<std::string>& keys(Kind kind);
[[nodiscard]] inline const std::vector<std::string>& modes() { return keys(Kind::MODE); }
[[nodiscard]] inline const std::vector<std::string>& outputs() { return keys(Kind::OUTPUT); }
[[nodiscard]] inline const std::vector<std::string>& operations() { return keys(Kind::OPERATION); }
[[nodiscard]] inline const std::vector<std::string>& options() { return keys(Kind::OPTION); }

/// The texts other than its key that databases use for a mode.
[[nodiscard]] inline const std::vector<std::string>& otherModeTexts(TARVIKNS::MODE_TYPE mode) {
    return words(Kind::MODE).at(static_cast<std::size_t>(mode)).others;
}

/// The value that a text names: by its key, another text or its display name, without regard to case, to repeated
/// blanks and to "mode" or "cable" at the end of a display name. Nothing for an unknown text.
[[nodiscard]] std::optional<int> find(Kind kind, std::string_view text);

/// `unknown mode "SR"; did you mean "SS"?`
[[nodiscard]] std::string unknownWord(Kind kind, std::string_view text);

/// The value that a text names, as `find` reads it.
/// @throw CommandError (FAULT) that lists what is accepted
[[nodiscard]] TARVIKNS::MODE_TYPE readMode(const std::string& text);
[[nodiscard]] TARVIKNS::OUTPUT_TYPE readOutput(const std::string& text);
[[nodiscard]] TARVIKNS::OP_TYPE readOperation(const std::string& text);
[[nodiscard]] TARVIKNS::PROGRAM_OPTION readOption(const std::string& text);

[[nodiscard]] const std::string& key(TARVIKNS::MODE_TYPE mode);
[[nodiscard]] const std::string& key(TARVIKNS::OUTPUT_TYPE output);
[[nodiscard]] const std::string& key(TARVIKNS::OP_TYPE operation);
[[nodiscard]] const std::string& key(TARVIKNS::PROGRAM_OPTION option);

/// The display name of an operation.
[[nodiscard]] const std::string& displayName(TARVIKNS::OP_TYPE operation);

} // namespace vocabulary
