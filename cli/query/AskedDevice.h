#pragma once

#include "text/Json.h"

#include <optional>
#include <string>
#include <vector>

class Tool;

/// A device as the manager is asked about it: spelled as in the database, its package separate.
struct AskedDevice {
    std::string name;
    std::optional<std::string> package;

    /// How the name and package that were typed were read: `"ks50_tq144" is device KS50 in package TQ144`. Empty if the
    /// manager is asked about them as they are.
    std::string reading;
};

/// Whether a command asks about the package.
enum class PackageUse { TAKEN, IGNORED };

/// The device, family or flash that a text means: its name in any case, maybe with "_" and a package.
/// @return its name as the database spells it; nothing if there is none
/// @throw DataNotFoundException if its family cannot be read
[[nodiscard]] std::optional<std::string> deviceNamed(const std::string& text);

/// The packages that the database gives a device; none if it does not say, or the device cannot be loaded.
[[nodiscard]] std::vector<std::string> packagesOf(const std::string& device);

/// Opens the database, and finds the device that a text means: its name in any case, maybe with "_" and a package. If
/// that is not the text itself, the user is told in a note, and the JSON object has a member "asked".
///
/// With `--literal` the texts are left as they are, whatever they are.
/// @param package the package that was given separately; nothing if none was
/// @throw CommandError (NO) if there is no such device; (FAULT) if the device's packages are known and this is none of
///        them, or if a family cannot be read that may have the device
[[nodiscard]] AskedDevice askedDevice(Tool& tool, const std::string& device,
                                      const std::optional<std::string>& package = {},
                                      PackageUse use = PackageUse::IGNORED);
