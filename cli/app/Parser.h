#pragma once

#include "app/CommandLine.h"

/// Reads the words of a command line and stores the values of its arguments.
/// @param words without the name of the program
/// @return the command; null if there is none, which is valid together with `help` and `version` only
/// @throw CommandError (FAULT) that describes the mistake and names the help to read
const DeclaredCommand* parse(CommandLine& line, const std::vector<std::string>& words);
