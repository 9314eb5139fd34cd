#pragma once

#include <StringBase.h>

#include <nlohmann/json.hpp>

#include <string>

/// What the tool reads and writes. Members keep the order in which they are set.
using Json = nlohmann::ordered_json;

/// The value on one line. A database may hold any byte: invalid UTF-8 becomes U+FFFD.
[[nodiscard]] inline std::string oneLine(const Json& value) {
    return value.dump(-1, ' ', false, Json::error_handler_t::replace);
}

[[nodiscard]] inline std::string toStdString(const StringBase& text) {
    return {text.c_str(), text.GetLength()};
}
