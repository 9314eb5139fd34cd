#pragma once

#include <tarvik/TARVIKNS.h>

#include <string>
#include <string_view>
#include <vector>

/// The texts by which people name modes, outputs, operations and options.
///
/// The manager's converters take every text, and read an unknown one as something else; the tool takes those
/// that name something, and refuses the others.
namespace vocabulary {

/// The key names, in value order.
[[nodiscard]] const std::vector<std::string>& modes();
[[nodiscard]] const std::vector<std::string>& outputs();
[[nodiscard]] const std::vector<std::string>& operations();
[[nodiscard]] const std::vector<std::string>& options();

/// The display names of the operations, in value order.
[[nodiscard]] const std::vector<std::string>& operationNames();

/// The texts other than its key name that name a mode.
[[nodiscard]] std::vector<std::string> otherModeTexts(TARVIKNS::MODE_TYPE mode);

/// The value that a text names: a mode by any of its texts, an operation by its key name or display name, both
/// without regard to case; an output by its key name, case included.
/// @throw CommandError (FAULT) that says what is accepted
[[nodiscard]] TARVIKNS::MODE_TYPE readMode(const std::string& text);
[[nodiscard]] TARVIKNS::OUTPUT_TYPE readOutput(const std::string& text);
[[nodiscard]] TARVIKNS::OP_TYPE readOperation(const std::string& text);

[[nodiscard]] const std::string& key(TARVIKNS::MODE_TYPE mode);
[[nodiscard]] const std::string& key(TARVIKNS::OUTPUT_TYPE output);
[[nodiscard]] const std::string& key(TARVIKNS::OP_TYPE operation);

} // namespace vocabulary
