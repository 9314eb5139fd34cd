#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace bench {

inline constexpr std::size_t MODES = 6;
inline constexpr std::size_t OUTPUTS = 5;
inline constexpr std::size_t OPERATIONS = 32;

/// The place of a mode and an output in a family's masks.
[[nodiscard]] constexpr std::size_t cellOf(std::size_t mode, std::size_t output) noexcept {
    return mode * OUTPUTS + output;
}

/// Bit i stands for operation, or option, i; one mask for each mode and output.
using Masks = std::array<std::uint32_t, MODES * OUTPUTS>;

/// How much there is of everything.
struct Size {
    std::string_view name;
    std::size_t families;
    std::size_t devicesOfFamily = 30;
};

/// One family alone, and the three sizes that are compared.
inline constexpr std::array<Size, 4> SIZES{{{"XS", 1}, {"S", 10}, {"M", 100}, {"L", 1000}}};

/// The size of that name; null when there is none.
[[nodiscard]] const Size* sizeNamed(std::string_view name) noexcept;

struct Property {
    std::string key;
    std::string value;
};

struct Device {
    std::string name;
    std::vector<Property> properties;
};

struct Family {
    std::string name;
    Masks operations{};
    Masks options{};
    std::array<std::uint32_t, OUTPUTS> bsdlOperations{};
    std::vector<Device> devices;
};

/// What a database is made to say: the one source from which every contender is filled.
struct Facts {
    std::vector<Family> families;
    std::vector<Device> flashes;
};

/// Of the databases that the published figures are about.
inline constexpr std::uint64_t USUAL_SEED = 1;

/// The same facts for the same size and seed, on every machine.
[[nodiscard]] Facts makeFacts(const Size& size, std::uint64_t seed);

} // namespace bench
