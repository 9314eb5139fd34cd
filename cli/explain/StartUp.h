#pragma once

#include "explain/Records.h"

#include <tarvik/TARVIKNS.h>

#include <array>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace why {

/// Names, and where each is listed first.
using Names = std::map<std::string, Piece>;

/// What the manager reads when it starts, each fact with its place. It never changes afterwards.
struct StartUp {
    struct Mode {
        std::map<TARVIKNS::OUTPUT_TYPE, Piece> outputs;
        std::optional<Piece> outputRecord;
        Names families;
        std::optional<Piece> familyRecord;
    };

    /// A property of an SPI flash or of a class of them.
    struct FlashProperty {
        std::string value;
        Piece record;
    };

    static constexpr std::size_t MODES = 9;

    Names supported;     ///< DEVICE_SUPPORTED: the names that have operation tables
    Names packages;      ///< PROGRAM_OPTION_PACKAGE: the names that have option tables
    Names excludedParts; ///< NOT_SUPPORTED_PART_IN_MODE
    std::array<Mode, MODES> modes;
    bool complete = false; ///< false: there is no base database, so nothing else was read either

    Names flashes;                                        ///< flashes and their families
    std::map<std::string, FlashProperty> flashProperties; ///< by name and property written together
    std::vector<std::pair<std::string, Names>>
        flashClasses; ///< members in lower case; of several the last counts

    [[nodiscard]] const Mode& mode(TARVIKNS::MODE_TYPE mode) const {
        return modes.at(static_cast<std::size_t>(mode));
    }
    [[nodiscard]] bool isFlash(const std::string& name) const;
};

[[nodiscard]] StartUp readStartUp();

/// What stands before the first "_": a device without its package.
[[nodiscard]] std::string withoutPackage(const std::string& device);

[[nodiscard]] std::string upperCase(const std::string& text);

} // namespace why
