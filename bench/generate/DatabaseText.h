#pragma once

#include "generate/Facts.h"

#include <map>
#include <string>

namespace bench {

/// The database files that say the facts: file name to text.
[[nodiscard]] std::map<std::string, std::string> databaseText(const Facts& facts);

/// Writes the files of `databaseText` into a directory, which is made.
void writeDatabase(const Facts& facts, const std::string& directory);

} // namespace bench
