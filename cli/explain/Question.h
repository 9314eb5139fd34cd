#pragma once

#include "text/Json.h"

#include <tarvik/TARVIKNS.h>

#include <optional>
#include <string>
#include <vector>

class ConstraintsManager;

namespace explanation {

/// A question that is answered by yes or no. Members that its kind does not take are not read.
struct Question {
    enum class Kind {
        OUTPUT,            ///< may the mode use the output?
        DEVICE,            ///< may the device, in its package, be configured in the mode?
        DEVICE_THROUGH,    ///< both at once
        OPERATION,         ///< may the operation be run on the device in the mode through the output?
        OPERATION_IN_MODE, ///< do the device's properties list the mode for the operation?
        OPTION,   ///< does the device, in its package, take the option in the mode through the output?
        BSDL,     ///< does the device offer the boundary-scan operation through the output?
        PROPERTY, ///< has the device the property, or the property this value?
        OPERATION_OPTIONS, ///< has the operation options on the device in the mode, or this option?
        MULTIBOOT,         ///< does the device support the multiboot arrangement?
        DEVICE_IN_MODE,    ///< may the device, in its package, be configured in the mode through some output?
        COMPLETE,          ///< OUTPUT, DEVICE_IN_MODE and OPERATION together
        COMPLETE_IN_MODE,  ///< DEVICE and OPERATION_IN_MODE together
    };

    Kind kind{};
    std::string device;
    TARVIKNS::MODE_TYPE mode{};
    TARVIKNS::OUTPUT_TYPE output{};
    std::optional<std::string> package;
    TARVIKNS::OP_TYPE operation{};
    TARVIKNS::PROGRAM_OPTION option{};
    std::string property;
    std::optional<std::string> value; ///< of the property, or an option of the operation
    std::string multibootType;
    std::string width;
    bool isLead = false; ///< the first device of a multiboot chain

    [[nodiscard]] bool takesPackage() const;
};

enum class Conclusion {
    YES,
    NO,
    FAULT, ///< the database has a fault at which the manager raises
};

/// The manager's answer.
/// @throw TarvikException if the manager raises
[[nodiscard]] bool isAllowed(ConstraintsManager& manager, const Question& question);

/// The same without an exception.
[[nodiscard]] Conclusion ask(ConstraintsManager& manager, const Question& question);

/// The questions that a question is composed of; empty for all but the complete ones.
[[nodiscard]] std::vector<Question> partsOf(const Question& question);

/// A line for each check that the manager leaves out because of the form of the question, so that a "yes" is not taken
/// for more than it is.
[[nodiscard]] std::vector<std::string> skippedChecks(const Question& question);

[[nodiscard]] std::string inWords(const Question& question);
[[nodiscard]] Json inJson(const Question& question);

} // namespace explanation
