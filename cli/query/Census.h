#pragma once

#include "explain/Question.h"

#include <functional>
#include <string>
#include <vector>

class ConstraintsManager;

namespace why {

/// The answer for one of all devices.
struct Entry {
    std::string name;
    std::string family;
    Verdict verdict;
};

using Asking = std::function<Verdict(ConstraintsManager&, const Question&)>;

/// Hears how many of all devices have their answer.
using Counting = std::function<void(std::size_t done, std::size_t total)>;

/// Asks the same question for every device of the database, flashes included.
///
/// Each answer is that of a manager that was asked nothing before: the manager handed over must be such a one.
/// Devices that share a table are asked for once; where one question could change the answer to the next, it is
/// asked in a process of its own.
/// @param question whose device is replaced; an operation or a property
/// @param count is called before each device; may be empty
/// @throw CommandError (FAULT) when a process can't be started
[[nodiscard]] std::vector<Entry> askForAll(ConstraintsManager& manager, Question question, const Asking& ask,
                                           const Counting& count = {});

} // namespace why
