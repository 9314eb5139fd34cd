#pragma once

#include <tarvik/TARVIKNS.h>

#include <string>
#include <vector>

class ConstraintsManager;
class Tool;

/// Questions that several commands ask the manager.
namespace questions {

/// Why an answer in SPI mode is not about the device alone.
inline constexpr const char* SPI_MODE_RULE = "SPI mode treats every device as \"spi\"";

/// The keys of the modes in which the device, or family, may be configured through some output.
/// @param package may be null
[[nodiscard]] std::vector<std::string> modes(ConstraintsManager& manager, const std::string& device,
                                             const char* package);

/// The keys of other modes, in which it may be configured as long as no output is given. SPI and PFF, which accept
/// every device then, are not among them.
[[nodiscard]] std::vector<std::string> modesWithoutOutput(ConstraintsManager& manager,
                                                          const std::string& device, const char* package);

/// The modes through some output, asked of the tool's manager. The manager's messages about the other modes are dropped.
[[nodiscard]] std::vector<std::string> modes(Tool& tool, const std::string& device);

/// The operations, or options, that a mask contains, in the order in which they are presented.
[[nodiscard]] std::vector<TARVIKNS::OP_TYPE> operations(const ConstraintsManager& manager, int mask);
[[nodiscard]] std::vector<TARVIKNS::PROGRAM_OPTION> options(const ConstraintsManager& manager, int mask);

/// Call it after the question proper: the manager remembers what a name resolved to, so whether it knows a device
/// must not be asked first.
/// @throw CommandError (NO) for a device that the manager does not know, unless names are taken literally
void requireKnown(Tool& tool, const std::string& device);

} // namespace questions
