#pragma once

#include <map>
#include <string>

/// The files that a page is made of, name to text, as they were when the tool was built.
[[nodiscard]] std::map<std::string, std::string> pageFiles();
