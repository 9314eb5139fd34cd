#pragma once

#include "model/Records.h"
#include "text/Json.h"

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

class ConstraintsManager;
class Tool;

/// Asks a question. @return the answer in words
using AnswerInWords = std::function<std::string(ConstraintsManager&)>;

/// "yes" or "no"
[[nodiscard]] std::string inWords(bool answer);

/// `PROGRAM, ERASE`, or "nothing".
[[nodiscard]] std::string inWords(const std::vector<std::string>& answer);

/// What an application gets that leaves exceptions on, as they are by default, where the tool, which turns them off,
/// gets an answer: an exception, and after it an answer without the record that raised and those after it.
struct ApplicationFault {
    std::string exception;                         ///< its type
    int location;                                  ///< its location number
    std::optional<catalogue::SourceText> record{}; ///< what raised; nothing if no record is at fault
    std::string again{};                           ///< the answer to the same question, asked once more
};

/// Asks a fresh manager with exceptions on, twice.
/// @return nothing if it does not raise, or raises only because a property is missing
[[nodiscard]] std::optional<ApplicationFault> findApplicationFault(const AnswerInWords& ask);

/// Does the message report a fault that ended the start-up of a manager?
[[nodiscard]] bool isStartUpFault(std::string_view message);

/// The text at which the start-up of a manager ends early, which leaves all that is read later unread.
/// @return nothing if the start-up reads everything
[[nodiscard]] std::optional<catalogue::SourceText> findStartUpFault();

/// `database/kestrel.acd:26:18: "VERFY" is faulty`, or what else is the reason.
[[nodiscard]] std::string reasonOf(const ApplicationFault& fault);

/// `an application gets OutOfRangeException (location 1631), and "no" when it asks again`.
/// @param answer the tool's own; nothing if it has no short form, so that the two cannot be compared
[[nodiscard]] std::string effectOf(const ApplicationFault& fault, const std::optional<std::string>& answer);

/// Tells the user, in a note and as the member "fault" of the JSON object, if an application gets something else.
/// @param answer as for `effectOf`
void noteApplicationFault(Tool& tool, const AnswerInWords& ask, const std::optional<std::string>& answer);

/// Asks for a device's operations, then for its options. Both load all there is.
void askForTables(ConstraintsManager& manager, const std::string& device);

/// Asks for the tables of all devices and flashes, with exceptions on.
/// @return the faults that an application meets, each once: objects as in the answers, with a "note" in words
[[nodiscard]] Json findApplicationFaults();

/// Prints a note for each of the first faults, and adds all as the member "applicationFaults" to the JSON object. Has no
/// effect if the array is empty.
void noteApplicationFaults(Tool& tool, const Json& faults);
