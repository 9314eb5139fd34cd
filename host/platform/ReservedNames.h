#pragma once

#include <AcdText.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <string_view>

namespace acd::platform {

/// Whether Windows takes a file name for a device, in whatever directory and with whatever ending: opening `COM1.acd`
/// would reset what is connected to the serial port.
[[nodiscard]] inline bool isReservedName(std::string_view fileName) noexcept {
    constexpr std::array<std::string_view, 6> DEVICES{"CON", "PRN", "AUX", "NUL", "CONIN$", "CONOUT$"};
    constexpr std::array<std::string_view, 2> NUMBERED{"COM", "LPT"};
    constexpr std::array<std::string_view, 13> NUMBERS{
        "0", "1", "2", "3",        "4",        "5",       "6",
        "7", "8", "9", "\xC2\xB9", "\xC2\xB2", "\xC2\xB3"}; // also superscripts
    std::string_view name = fileName.substr(0, fileName.find_first_of(".:"));
    name = name.substr(0, name.find_last_not_of(' ') + 1);
    const std::string_view device = name.substr(0, std::min<std::size_t>(name.size(), 3));
    return std::any_of(DEVICES.begin(), DEVICES.end(),
                       [&](std::string_view each) { return AcdText::equalsIgnoreCase(name, each); }) ||
           (std::any_of(NUMBERED.begin(), NUMBERED.end(),
                        [&](std::string_view each) { return AcdText::equalsIgnoreCase(device, each); }) &&
            std::find(NUMBERS.begin(), NUMBERS.end(), name.substr(device.size())) != NUMBERS.end());
}

} // namespace acd::platform
