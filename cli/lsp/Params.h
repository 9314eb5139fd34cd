#pragma once

#include "text/Json.h"

#include <initializer_list>
#include <string>

/// Reads the parameters of messages, which may hold anything.
namespace lsp {

/// @throw RequestError (INVALID_PARAMS) if the value is no text
[[nodiscard]] const std::string& textOf(const Json& json);

/// The path of the document that the parameters name.
/// @throw RequestError (INVALID_PARAMS) if it is no file
[[nodiscard]] std::string pathIn(const Json& params);

/// A member of a member and so on; null if one of them is missing.
[[nodiscard]] Json member(const Json& json, std::initializer_list<const char*> names);

/// Is the value there, and true?
[[nodiscard]] bool isTrue(const Json& json);

} // namespace lsp
