#pragma once

#include <string>
#include <vector>

/// Settles which database is answered from: the given directories, else the one of the environment or of the
/// installation, else the demonstration, with a note on standard error.
/// @throw CommandError (FAULT) that names the paths tried, when a database is missing or can't be read
void openDatabase(const std::vector<std::string>& directories);
