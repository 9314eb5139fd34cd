#pragma once

#include <map>
#include <string>
#include <string_view>

/// The files of the demonstration database, name to text, as they were when the tool was built.
[[nodiscard]] std::map<std::string, std::string> demonstrationFiles();
