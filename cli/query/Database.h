#pragma once

#include <string>
#include <vector>

/// The directories of databases. Layers may be separated as in a search path: "site:company".
/// @throw CommandError (FAULT) if a database has no directory
[[nodiscard]] std::vector<std::string> directoriesOf(const std::vector<std::string>& databases);

/// Settles which database is answered from: the given directories, else the one of the environment or of the
/// installation, else the demonstration, with a note on standard error.
/// @throw CommandError (FAULT) that names the paths tried, when a database is missing or can't be read
void openDatabase(const std::vector<std::string>& directories);

/// Settles which database is to be changed, likewise, but without the demonstration. There may be no base.acd yet.
/// @return its directories, the uppermost layer first
/// @throw CommandError (FAULT) if no database is given, or a directory can't be read
[[nodiscard]] std::vector<std::string> openDirectories(const std::vector<std::string>& directories);
