// The one description of the database's keys: what is read where, how it is split, which words it takes.
#include "model/Schema.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <algorithm>

using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace schema {

namespace {

constexpr std::array<const char*, 3> BASE_LISTS{DEVICE_SUPPORTED, PROGRAM_OPTION_PACKAGE,
                                                NOT_SUPPORTED_PART_IN_MODE};

template <typename Names>
bool contains(const Names& names, std::string_view name) {
    return std::find(names.begin(), names.end(), name) != names.end();
}

/// The words from the first to that of `last`.
template <typename Type>
std::vector<std::string> upTo(Type last, const std::vector<std::string>& all) {
    return {all.begin(), all.begin() + static_cast<int>(last) + 1};
}

} // namespace

File fileOf(std::string_view family) {
    if (sameWithoutCase(family, "base")) {
        return File::BASE;
    }
    return sameWithoutCase(family, SPI_FAMILY) ? File::SPI : File::FAMILY;
}

bool isFlashClass(std::string_view name) { return contains(FLASH_CLASSES, name); }

std::string devicesKey(std::string_view family) { return std::string(family).append(DEVICES_SUFFIX); }

std::string propertyKey(std::string_view name) { return upperCase(name).append(PROPERTY_SUFFIX); }

Shape shapeInSection(std::string_view key) {
    return contains(FAMILY_KEYS, key) ? Shape::RECORDS : Shape::NONE;
}

Shape shapeOf(File file, std::string_view key) {
    if (contains(FAMILY_KEYS, key)) {
        return Shape::RECORDS;
    }
    if (file == File::BASE) {
        if (contains(BASE_LISTS, key)) {
            return Shape::LIST;
        }
        return key == IDCODE || contains(vocabulary::modes(), key) ? Shape::RECORDS : Shape::NONE;
    }
    if (file == File::SPI) {
        if (key == DEVICE_FAMILY || key.ends_with(DEVICES_SUFFIX) || contains(multiboot::keys(), key)) {
            return Shape::LIST;
        }
        return key.ends_with(PROPERTY_SUFFIX) ? Shape::RECORDS : Shape::NONE;
    }
    return Shape::NONE;
}

std::size_t firstListed(File file, std::string_view key) {
    if (shapeOf(file, key) == Shape::LIST) {
        return 0;
    }
    if (key == PROPERTIES) {
        return 2;
    }
    return file == File::BASE && contains(vocabulary::modes(), key) ? 1 : std::string_view::npos;
}

bool hasNamedRecords(File file, std::string_view key) {
    return key == PROPERTY || key == PROPERTIES || (file == File::BASE && key == IDCODE) ||
           (file == File::SPI && key.ends_with(PROPERTY_SUFFIX));
}

NamePlaces namePlaces(File file, std::string_view key) {
    if (file == File::BASE) {
        if (key == DEVICE_SUPPORTED) {
            return NamePlaces::ITEMS;
        }
        if (key == PROGRAM_OPTION_PACKAGE) {
            return NamePlaces::JOINED_ITEMS;
        }
        if (key == NOT_SUPPORTED_PART_IN_MODE) {
            return NamePlaces::PART_ITEMS;
        }
        return key == IDCODE                        ? NamePlaces::FIRST_FIELDS
               : contains(vocabulary::modes(), key) ? NamePlaces::SECOND_RECORD
                                                    : NamePlaces::NONE;
    }
    if (shapeOf(file, key) != Shape::LIST) {
        return NamePlaces::NONE;
    }
    return contains(multiboot::keys(), key) ? NamePlaces::ITEMS_IN_ANY_CASE : NamePlaces::ITEMS;
}

std::string_view nameOfPart(std::string_view item) {
    const std::size_t name = item.find('_') + 1;
    const std::size_t end = item.find('_', name);
    return name == 0 || end == item.npos ? std::string_view() : item.substr(name, end - name);
}

std::vector<std::string> fixedKeys(File file) {
    std::vector<std::string> all(FAMILY_KEYS.begin(), FAMILY_KEYS.end());
    const auto add = [&all](const auto& names) { all.insert(all.end(), names.begin(), names.end()); };
    if (file == File::BASE) {
        add(BASE_LISTS);
        add(vocabulary::modes());
        all.emplace_back(IDCODE);
    } else if (file == File::SPI) {
        all.emplace_back(DEVICE_FAMILY);
        add(multiboot::keys());
        for (const char* const name : FLASH_CLASSES) {
            all.push_back(devicesKey(name));
            all.push_back(propertyKey(name));
        }
    }
    return all;
}

const std::vector<std::string>& tableModes() {
    static const std::vector<std::string> all{"Bscan", "SSerial", "Smap", "BSFILE", "DP770", "SPI"};
    return all;
}

const std::vector<std::string>& tableOutputs() {
    static const std::vector<std::string> all = upTo(OUTPUT_TYPE::STAPL, vocabulary::outputs());
    return all;
}

const std::vector<std::string>& tableOptions() {
    static const std::vector<std::string> all = upTo(PROGRAM_OPTION::SECTOR_LOCKDOWN, vocabulary::options());
    return all;
}

const std::vector<std::string>& modeOutputs() {
    static const std::vector<std::string> all = [] {
        std::vector<std::string> readable = tableOutputs();
        readable.insert(readable.end(), {"EXPRESSSVF", "EXPRESSQSVF"});
        return readable;
    }();
    return all;
}

} // namespace schema
