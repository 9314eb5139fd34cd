#pragma once

#include <tarvik/TARVIKNS.h>

#include <string>
#include <vector>

class ConstraintsManager;
class Tool;

/// Questions that several commands ask the manager.
namespace questions {

/// The keys of the modes in which the device, or family, may be configured. What the manager says about the
/// others is no news to who asked for all, and is dropped.
[[nodiscard]] std::vector<std::string> modes(Tool& tool, const std::string& device);

/// The operations, or options, that a mask stands for, in the order in which they are presented.
[[nodiscard]] std::vector<TARVIKNS::OP_TYPE> operations(const ConstraintsManager& manager, int mask);
[[nodiscard]] std::vector<TARVIKNS::PROGRAM_OPTION> options(const ConstraintsManager& manager, int mask);

/// Call it behind the question proper: the manager remembers what a name resolved to, so asking it whether it
/// knows a device must not come first.
/// @throw CommandError (NO) for a device that the manager does not know
void requireKnown(ConstraintsManager& manager, const std::string& device);

} // namespace questions
