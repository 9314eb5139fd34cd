#pragma once

#include "commands/ArgumentList.h"

/// The arguments that several commands share, so that they are named and described alike.
namespace argument {

[[nodiscard]] inline Argument device(Argument::Target target, bool required = true) {
    return {.name = "DEVICE",
            .description = "The device or part family",
            .kind = ValueKind::DEVICE,
            .required = required,
            .target = target};
}

[[nodiscard]] inline Argument mode(Argument::Target target, bool required = true) {
    return {.name = "--mode",
            .letter = 'm',
            .value = "MODE",
            .description = "The configuration mode",
            .kind = ValueKind::MODE,
            .required = required,
            .target = target};
}

[[nodiscard]] inline Argument output(Argument::Target target, bool required = true) {
    return {.name = "--output",
            .letter = 'o',
            .value = "OUTPUT",
            .description = "The cable or output file type",
            .kind = ValueKind::OUTPUT,
            .required = required,
            .target = target};
}

[[nodiscard]] inline Argument package(Argument::Target target) {
    return {.name = "--package",
            .letter = 'p',
            .value = "PACKAGE",
            .description = "The device's package",
            .kind = ValueKind::PACKAGE,
            .target = target};
}

[[nodiscard]] inline Argument operation(Argument::Target target, const char* description) {
    return {.name = "--operation",
            .value = "OPERATION",
            .description = description,
            .kind = ValueKind::OPERATION,
            .target = target};
}

[[nodiscard]] inline Argument dryRun(Argument::Target target) {
    return {.name = "--dry-run",
            .description = "Write nothing; show what would change, as a patch",
            .target = target};
}

} // namespace argument
