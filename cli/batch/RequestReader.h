#pragma once

#include "text/Json.h"

#include <string>
#include <string_view>

/// One line of the input, read.
struct Request {
    Json id;            ///< null when there is none, or when it could not be read
    std::string idText; ///< the id as it is written; empty together with a null id
    std::string fault;  ///< what is wrong with the line; empty when it was understood
    std::string call;
    Json arguments; ///< an array, or an object of named ones
};

[[nodiscard]] Request readRequest(std::string_view line);
