#pragma once

#include "lint/Model.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

/// A part of one line of a file, and what is to be written in its place.
struct TextEdit {
    SourceLocation location;
    std::size_t length; ///< in bytes, up to the end of the line; 0 inserts
    std::string text;
};

/// How a finding can be removed.
struct Fix {
    std::vector<TextEdit> edits; ///< that do not overlap
    bool isSafe = true;          ///< false: it is a guess, such as the nearest name
};

/// A name that is near to an unknown one.
struct Suggestion {
    std::optional<std::string> name;
    bool isOtherCase = false; ///< the same name in another case

    /// `; did you mean "..."?`, or nothing.
    [[nodiscard]] std::string question() const;
};

// Each returns nothing if the token is not on one line of its file, as a continued one is not.

/// Writes another text in place of a token.
[[nodiscard]] std::optional<Fix> replacing(const Token& token, std::string text, bool isSafe = true);

/// Writes a name in place of an unknown one; safe if they differ in case only.
[[nodiscard]] std::optional<Fix> replacing(const Token& token, const Suggestion& suggestion);

/// Writes a text in front of a token.
[[nodiscard]] std::optional<Fix> insertingBefore(const Token& token, std::string text);

/// Adds a name to lists of base.acd, which are created if they do not exist, and to the families of modes. That is a
/// guess: what has the name may be what is wrong.
[[nodiscard]] std::optional<Fix> listing(const Model& model, std::string_view name,
                                         const std::vector<const char*>& lists,
                                         const std::vector<std::string>& modes = {});

/// Removes an item with one of the separators around it.
[[nodiscard]] std::optional<Fix> removing(const Token& item);

/// The part of a token, with its location.
[[nodiscard]] Token partOf(const Token& token, std::size_t offset, std::size_t length);

} // namespace lint
