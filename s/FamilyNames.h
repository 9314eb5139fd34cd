#pragma once

// The two families that the manager itself knows by name.

namespace familyNames {

/// The family of every unknown device.
inline constexpr const char* BASE = "base";

/// The family of every SPI flash, and the name that answers in SPI mode.
inline constexpr const char* SPI = "spi";

} // namespace familyNames
