#pragma once

#include <string>
#include <vector>

/// The words of multiboot arrangements.
namespace multiboot {

inline constexpr const char* TYPE_PREFIX = "TYPE_";
inline const std::vector<std::string> TYPES{"TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI", "TYPE_MB_QPRM"};
inline const std::vector<std::string> WIDTHS{"SERIAL", "PARALLEL", "NONE"};

} // namespace multiboot
