#pragma once

#include <string>
#include <vector>

/// The words of multiboot arrangements.
namespace multiboot {

inline constexpr const char* TYPE_PREFIX = "TYPE_";
inline const std::vector<std::string> TYPES{"TYPE_BPI", "TYPE_MB_SPI", "TYPE_MB_BPI", "TYPE_MB_QPRM"};
inline const std::vector<std::string> WIDTHS{"SERIAL", "PARALLEL", "NONE"};

/// The type that a text names, in any case, with or without `TYPE_`; likewise the width.
/// @throw CommandError (FAULT) that lists what is accepted
[[nodiscard]] const std::string& readType(const std::string& text);
[[nodiscard]] const std::string& readWidth(const std::string& text);

/// The keys of the lists that a database can have.
[[nodiscard]] inline const std::vector<std::string>& keys() {
    static const std::vector<std::string> all = [] {
        std::vector<std::string> joined;
        for (const std::string& type : TYPES) {
            // A serial flash has no width to choose, a parallel one always has.
            const bool isParallelBus = type.ends_with("BPI");
            for (const std::string& width : WIDTHS) {
                if ((width != "NONE") == isParallelBus) {
                    joined.push_back(type + '_' + width + "_LEAD");
                    joined.push_back(type + '_' + width + "_CHAIN");
                }
            }
        }
        return joined;
    }();
    return all;
}

/// Calls `use(type, width, lead)` for each arrangement that may be asked for, in the order in which they are shown.
template <typename Use>
void forEachArrangement(Use use) {
    for (const std::string& type : TYPES) {
        for (const std::string& width : WIDTHS) {
            for (const bool lead : {true, false}) {
                use(type, width, lead);
            }
        }
    }
}

} // namespace multiboot
