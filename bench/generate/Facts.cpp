#include "generate/Facts.h"

#include <algorithm>
#include <random>

// Invents families, devices and flashes. Nothing but the seed goes in, and no distribution of the standard library
// is used: those differ from one library to the next.

namespace bench {

namespace {

constexpr std::size_t PROPERTIES = 20;
constexpr std::size_t FLASH_SHARE = 20; ///< one flash for so many devices
constexpr std::uint32_t SHARE_OF_CELLS = 3;
constexpr std::size_t READABLE_OPTIONS = 17; ///< a database can only name the first ones

constexpr std::array<const char*, PROPERTIES> KEYS{
    "CELLS",  "PINS",    "BITS",   "SPEED",  "CORE",    "GRADE", "REVISION", "SILICON", "FLASH", "CLOCKS",
    "MEMORY", "STARTUP", "WAKEUP", "SUPPLY", "PACKAGE", "LEAD",  "HANDLING", "NOTE",    "LOT",   "ORIGIN"};

constexpr std::array<const char*, 16> WORDS{"amber",  "basalt", "cedar",  "dusk",    "ember", "fjord",
                                            "garnet", "heron",  "indigo", "juniper", "kelp",  "lagoon",
                                            "meadow", "nickel", "opal",   "pewter"};

class Chance {
public:
    explicit Chance(std::uint64_t seed) : m_engine(seed) {}

    [[nodiscard]] std::size_t below(std::size_t bound) {
        return static_cast<std::size_t>(m_engine() % bound);
    }

    template <typename Table>
    [[nodiscard]] const auto& of(const Table& table) {
        return table[below(table.size())];
    }

    /// Each of the first `bits` with the share of cells that is set.
    [[nodiscard]] std::uint32_t mask(std::size_t bits) {
        std::uint32_t mask = 0;
        for (std::size_t bit = 0; bit < bits; ++bit) {
            mask |= below(SHARE_OF_CELLS) == 0 ? std::uint32_t{1} << bit : 0;
        }
        return mask;
    }

private:
    std::mt19937_64 m_engine;
};

/// A name of three syllables that no other number below their count has.
std::string nameOf(std::size_t number, std::string_view consonants, std::string_view vowels) {
    std::string name;
    for (int syllable = 0; syllable < 3; ++syllable) {
        name += consonants[number % consonants.size()];
        number /= consonants.size();
        name += vowels[number % vowels.size()];
        number /= vowels.size();
    }
    return name;
}

std::string familyName(std::size_t number) { return nameOf(number, "bdfgklmnprstv", "aeiou"); }

/// As data sheets have them: mostly short numbers and flags, a few sentences among them.
std::string propertyValue(Chance& chance, std::size_t property) {
    if (property < 8) {
        return std::to_string(1 + chance.below(1'000'000));
    }
    if (property < 11) {
        return chance.below(2) == 0 ? "TRUE" : "FALSE";
    }
    std::string value;
    const std::size_t words = 1 + (property - 11) * 5 / 4;
    for (std::size_t word = 0; word < words; ++word) {
        value += value.empty() ? "" : " ";
        value += chance.of(WORDS);
    }
    return value;
}

Device makeDevice(Chance& chance, std::string name) {
    Device device{std::move(name), {}};
    for (std::size_t property = 0; property < PROPERTIES; ++property) {
        device.properties.push_back({KEYS[property], propertyValue(chance, property)});
    }
    return device;
}

Family makeFamily(Chance& chance, std::size_t number, std::size_t devices) {
    Family family;
    family.name = familyName(number);
    for (std::size_t cell = 0; cell < family.operations.size(); ++cell) {
        family.operations[cell] = chance.mask(OPERATIONS);
        family.options[cell] = chance.mask(READABLE_OPTIONS);
    }
    for (std::uint32_t& mask : family.bsdlOperations) {
        mask = chance.mask(OPERATIONS);
    }
    const std::string prefix = nameOf(number, "BDFGKLMNPRSTV", "AEIOU");
    for (std::size_t device = 1; device <= devices; ++device) {
        family.devices.push_back(makeDevice(chance, prefix + std::to_string(device * 50)));
    }
    return family;
}

} // namespace

const Size* sizeNamed(std::string_view name) noexcept {
    const auto* const found =
        std::find_if(SIZES.begin(), SIZES.end(), [name](const Size& size) { return size.name == name; });
    return found == SIZES.end() ? nullptr : found;
}

Facts makeFacts(const Size& size, std::uint64_t seed) {
    Chance chance(seed);
    Facts facts;
    for (std::size_t number = 0; number < size.families; ++number) {
        facts.families.push_back(makeFamily(chance, number, size.devicesOfFamily));
    }
    const std::size_t flashes = std::max<std::size_t>(1, size.families * size.devicesOfFamily / FLASH_SHARE);
    for (std::size_t number = 0; number < flashes; ++number) {
        facts.flashes.push_back(
            {nameOf(number, "WXZHJQC", "AEIOUY") + "F",
             {{"DENSITY", std::to_string(1024U << chance.below(10))}, {"VENDOR", chance.of(WORDS)}}});
    }
    return facts;
}

} // namespace bench
