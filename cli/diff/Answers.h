#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

namespace diff {

/// What one database answers to one question: names, or values.
using Texts = std::set<std::string>;

/// The names that a database knows.
struct Names {
    std::map<std::string, std::string> devices; ///< and flashes, with their families
    std::map<std::string, Texts> packages;      ///< by device: those that anything in the database speaks of
};

/// The answers to all questions, by question.
using Answers = std::map<std::string, Texts>;

/// All that a database answers.
struct Facts {
    Answers general;                          ///< without a device
    std::map<std::string, Answers> ofDevices; ///< by device
};

/// Reads the names of a database, in a process of its own.
/// @param directories the layers, the first one on top
/// @throw Failure (FAULT) when the database is missing or can't be read
[[nodiscard]] Names namesOf(const std::vector<std::string>& directories);

/// Asks a database everything about these devices, in a process of its own.
/// @param names devices and packages to ask about, whether or not this database knows them
/// @throw Failure (FAULT) as `namesOf`
[[nodiscard]] Facts factsOf(const std::vector<std::string>& directories, const Names& names);

/// The answers about a package begin with this; without a package they are the same question without it.
[[nodiscard]] std::string ofPackage(const std::string& package, const std::string& question);

} // namespace diff
