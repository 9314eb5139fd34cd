#pragma once

#include <StringBase.h>

#include <nlohmann/json.hpp>

#include <string>

/// What the tool reads and writes; names keep the order in which they are set.
using Json = nlohmann::ordered_json;

/// On one line. A database may hold any byte: those that are no UTF-8 show as U+FFFD.
[[nodiscard]] inline std::string oneLine(const Json& value) {
    return value.dump(-1, ' ', false, Json::error_handler_t::replace);
}

[[nodiscard]] inline std::string plain(const StringBase& text) { return {text.c_str(), text.GetLength()}; }
