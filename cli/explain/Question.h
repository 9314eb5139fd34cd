#pragma once

#include "text/Json.h"

#include <tarvik/TARVIKNS.h>

#include <optional>
#include <string>

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
    };

    Kind kind{};
    std::string device;
    TARVIKNS::MODE_TYPE mode{};
    TARVIKNS::OUTPUT_TYPE output{};
    std::optional<std::string> package;
    TARVIKNS::OP_TYPE operation{};
    TARVIKNS::PROGRAM_OPTION option{};
    std::string property;
    std::optional<std::string> value;
};

enum class Conclusion {
    YES,
    NO,
    FAULT, ///< the database has a fault at which the manager raises
};

/// The manager's answer.
[[nodiscard]] Conclusion ask(ConstraintsManager& manager, const Question& question);

[[nodiscard]] std::string inWords(const Question& question);
[[nodiscard]] Json inJson(const Question& question);

} // namespace explanation
