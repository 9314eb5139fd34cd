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

namespace {

/// What the values of a property hold.
Content contentOfProperty(std::string_view name) {
    if (contains(vocabulary::operations(), name)) {
        return Content::MODE_KEY;
    }
    if (name == PACKAGES || name == PACKAGE) {
        return Content::PACKAGE_NAME;
    }
    return name.starts_with(OPTIONS_PREFIX) ? Content::OPTION_NAME : Content::TEXT;
}

Content contentOfTable(const Table& table, std::size_t field) {
    if (field >= table.firstOutput) {
        return Content::TABLE_OUTPUT;
    }
    if (field == 1) {
        return Content::TABLE_MODE;
    }
    return table.hasOptions ? Content::OPTION_NAME : Content::OPERATION_NAME;
}

Content contentOfList(std::string_view key) {
    if (key == DEVICE_SUPPORTED) {
        return Content::OWNER;
    }
    if (key == PROGRAM_OPTION_PACKAGE) {
        return Content::OPTION_OWNER;
    }
    if (key == NOT_SUPPORTED_PART_IN_MODE) {
        return Content::PART;
    }
    if (key == DEVICE_FAMILY) {
        return Content::FLASH_FAMILY;
    }
    return key.ends_with(DEVICES_SUFFIX) ? Content::FLASH : Content::FLASH_OR_DEVICE;
}

} // namespace

Content contentOf(File file, std::string_view key, const Field& field) {
    const Shape shape = shapeOf(file, key);
    if (shape == Shape::NONE) {
        return Content::NONE;
    }
    if (shape == Shape::LIST) {
        return contentOfList(key);
    }
    for (const Table& table : TABLES) {
        if (key == table.key) {
            return contentOfTable(table, field.field);
        }
    }
    if (file == File::BASE && key == IDCODE) {
        return field.field == 0   ? Content::DEVICE
               : field.field == 1 ? Content::IDCODE_PATTERN
                                  : Content::NONE;
    }
    if (!hasNamedRecords(file, key)) { // a mode
        if (field.item == 0) {
            return field.field == 0 ? Content::OUTPUT_LABEL : Content::MODE_OUTPUT;
        }
        return field.item > 1 ? Content::NONE : field.field == 0 ? Content::FAMILY_LABEL : Content::FAMILY;
    }
    if (field.field == 0) {
        return Content::PROPERTY_NAME;
    }
    return key == PROPERTIES && field.field == 1 ? Content::COUNT : contentOfProperty(field.name);
}

std::string_view formOf(File file, std::string_view key) {
    if (shapeOf(file, key) == Shape::NONE) {
        return {};
    }
    switch (contentOf(file, key, {})) {
    case Content::OPERATION_NAME:
        return key == OPERATION ? "operation,mode,output,...:..." : "operation,output,...:...";
    case Content::OPTION_NAME:
        return "option,mode,output,...:...";
    case Content::PROPERTY_NAME:
        return key == PROPERTIES ? "name,count,value,...:..." : "name,value:...";
    case Content::DEVICE:
        return "device,code:...";
    case Content::OUTPUT_LABEL:
        return "label,output,...:label,family,...";
    case Content::PART:
        return "modekey_device_package,...";
    case Content::FLASH_FAMILY:
        return "family,...";
    case Content::FLASH:
    case Content::FLASH_OR_DEVICE:
        return "device,...";
    default:
        return "name,...";
    }
}

const std::vector<std::string>& wordsOf(Content content) {
    static const std::vector<std::string> none;
    static const std::vector<std::string> outputLabel{OUTPUTS_LABEL};
    static const std::vector<std::string> familyLabel{FAMILIES_LABEL};
    switch (content) {
    case Content::OPERATION_NAME:
        return vocabulary::operations();
    case Content::OPTION_NAME:
        return tableOptions();
    case Content::TABLE_MODE:
        return tableModes();
    case Content::TABLE_OUTPUT:
        return tableOutputs();
    case Content::MODE_OUTPUT:
        return modeOutputs();
    case Content::MODE_KEY:
        return vocabulary::modes();
    case Content::OUTPUT_LABEL:
        return outputLabel;
    case Content::FAMILY_LABEL:
        return familyLabel;
    case Content::PROPERTY_NAME:
        return propertyNames();
    default:
        return none;
    }
}

const std::vector<std::string>& propertyNames() {
    static const std::vector<std::string> all = [] {
        std::vector<std::string> names{PACKAGES};
        for (const std::string& operation : vocabulary::operations()) {
            names.push_back(operation);
            names.push_back(std::string(OPTIONS_PREFIX).append(operation));
        }
        return names;
    }();
    return all;
}

NamePlaces namePlaces(File file, std::string_view key) {
    switch (contentOf(file, key, {})) {
    case Content::OWNER:
    case Content::FLASH_FAMILY:
    case Content::FLASH:
        return NamePlaces::ITEMS;
    case Content::FLASH_OR_DEVICE:
        return NamePlaces::ITEMS_IN_ANY_CASE;
    case Content::OPTION_OWNER:
        return NamePlaces::JOINED_ITEMS;
    case Content::PART:
        return NamePlaces::PART_ITEMS;
    case Content::DEVICE:
        return NamePlaces::FIRST_FIELDS;
    default:
        return contentOf(file, key, {1, 1, {}}) == Content::FAMILY ? NamePlaces::SECOND_RECORD
                                                                   : NamePlaces::NONE;
    }
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
    static const std::vector<std::string> all{BOUNDARY_SCAN, "SSerial", "Smap", "BSFILE", "DP770", "SPI"};
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
