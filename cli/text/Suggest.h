#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// The candidate that a mistyped text most likely means, in any case; nothing if none is near.
[[nodiscard]] std::optional<std::string> suggest(std::string_view text,
                                                 const std::vector<std::string>& candidates);

/// `; did you mean "KS50"?`, or an empty text.
[[nodiscard]] std::string didYouMean(std::string_view text, const std::vector<std::string>& candidates);

/// Whether the texts are the same but for ASCII case.
[[nodiscard]] bool sameWithoutCase(std::string_view left, std::string_view right);

/// The text in ASCII lower case.
[[nodiscard]] std::string lowerCase(std::string_view text);

/// The text in ASCII upper case.
[[nodiscard]] std::string upperCase(std::string_view text);
