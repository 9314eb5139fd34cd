#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// The keys that the manager reads, each with its file, its shape and its words.
namespace schema {

/// The classes of database files.
enum class File {
    BASE,   ///< base.acd
    SPI,    ///< spi.acd
    FAMILY, ///< one part family and its devices
};

/// The class of the file that holds a family, in any case of its name.
[[nodiscard]] File fileOf(std::string_view family);

/// How the value of a key is split.
enum class Shape {
    NONE,    ///< the key is not read
    LIST,    ///< item,item,...
    RECORDS, ///< field,...:field,...
};

inline constexpr const char* BASE = "base.acd";
inline constexpr const char* SPI = "spi.acd";

/// The family of all flashes, and of every device in SPI mode.
inline constexpr std::string_view SPI_FAMILY = "spi";

/// The key of SPI mode.
inline constexpr std::string_view SPI_MODE = "SPI";

inline constexpr const char* DEVICE_SUPPORTED = "DEVICE_SUPPORTED";
inline constexpr const char* PROGRAM_OPTION_PACKAGE = "PROGRAM_OPTION_PACKAGE";
inline constexpr const char* NOT_SUPPORTED_PART_IN_MODE = "NOT_SUPPORTED_PART_IN_MODE";
inline constexpr const char* IDCODE = "IDCODE";
inline constexpr const char* OPERATION = "OPERATION";
inline constexpr const char* BSDL_OPERATION = "BSDL_OPERATION";
inline constexpr const char* PROGRAM_OPTION = "PROGRAM_OPTION";
inline constexpr const char* PROPERTY = "PROPERTY";
inline constexpr const char* PROPERTIES = "PROPERTIES";
inline constexpr const char* DEVICE_FAMILY = "DEVICE_FAMILY";

/// The labels of the two lists of a mode key. The manager ignores their text.
inline constexpr const char* OUTPUTS_LABEL = "outputs";
inline constexpr const char* FAMILIES_LABEL = "families";

/// The values of a flag, in upper case.
inline constexpr std::array<const char*, 2> FLAGS{"TRUE", "FALSE"};

/// The word of Boundary Scan mode in records.
inline constexpr const char* BOUNDARY_SCAN = "Bscan";

/// The property that lists a device's packages. The manager gives it no meaning of its own.
inline constexpr const char* PACKAGES = "PACKAGES";

/// The property that gives a flash's package, likewise.
inline constexpr const char* PACKAGE = "PACKAGE";

/// Begins the properties that list the options of an operation.
inline constexpr std::string_view OPTIONS_PREFIX = "OP_";

/// The classes of flashes, in the order in which they are searched: the last one that lists a flash counts.
inline constexpr std::array<const char*, 6> FLASH_CLASSES{"AT1", "ST1", "ST2", "BPI1", "BPI2", "BPI3"};
[[nodiscard]] bool isFlashClass(std::string_view name);

inline constexpr std::string_view DEVICES_SUFFIX = "_DEVICES";
inline constexpr std::string_view PROPERTY_SUFFIX = "_PROPERTY";

/// The key of the flashes of a family or class.
[[nodiscard]] std::string devicesKey(std::string_view family);

/// The key of the properties of a flash, a family or a class: looked up in upper case.
[[nodiscard]] std::string propertyKey(std::string_view name);

/// A permission table of a family: which words come before the outputs of a record.
struct Table {
    const char* key;
    bool hasOptions;         ///< the first field is an option, not an operation
    std::size_t firstOutput; ///< 2: the second field is a mode
};

inline constexpr std::array<Table, 3> TABLES{
    {{OPERATION, false, 2}, {BSDL_OPERATION, false, 1}, {PROGRAM_OPTION, true, 2}}};

/// A key of properties: which field of a record is the first value.
struct PropertyKey {
    const char* key;
    std::size_t firstValue;
};

/// Both share one set of names; of one name in both, the later key counts.
inline constexpr std::array<PropertyKey, 2> PROPERTY_KEYS{{{PROPERTY, 1}, {PROPERTIES, 2}}};

/// The keys of a family, all of which its sections may have, too.
inline constexpr std::array<const char*, 5> FAMILY_KEYS{OPERATION, BSDL_OPERATION, PROGRAM_OPTION, PROPERTY,
                                                        PROPERTIES};

/// The shape of a key before the first section of a file.
[[nodiscard]] Shape shapeOf(File file, std::string_view key);

/// The shape of a key of a device's section.
[[nodiscard]] Shape shapeInSection(std::string_view key);

/// The field from which on the records of a key hold a list of alike words; `npos` where no fields are alike.
[[nodiscard]] std::size_t firstListed(File file, std::string_view key);

/// Do the records of a key begin with a name of their own, so that a record replaces one of the same name?
[[nodiscard]] bool hasNamedRecords(File file, std::string_view key);

/// What a field of a value holds.
enum class Content {
    NONE, ///< nothing that is read
    TEXT, ///< any text
    OPERATION_NAME,
    OPTION_NAME,
    TABLE_MODE,   ///< the word of a mode in records
    TABLE_OUTPUT, ///< the word of an output in records
    MODE_OUTPUT,  ///< the word of an output in a mode key
    MODE_KEY,
    OUTPUT_LABEL, ///< of a mode's outputs
    FAMILY_LABEL, ///< of a mode's families
    PROPERTY_NAME,
    COUNT,
    PACKAGE_NAME,
    IDCODE_PATTERN,
    FAMILY,
    OWNER,        ///< a family or a device
    OPTION_OWNER, ///< a family, a device, or a device and a package, joined
    DEVICE,
    PART, ///< a mode key, a device and a package, joined by "_"
    FLASH_FAMILY,
    FLASH,
    FLASH_OR_DEVICE,
};

/// Which field of a value.
struct Field {
    std::size_t item = 0;  ///< counted from 0
    std::size_t field = 0; ///< of the item, likewise
    std::string_view name; ///< the first field of the item
};

/// What a field holds.
[[nodiscard]] Content contentOf(File file, std::string_view key, const Field& field);

/// How the value of a key is written: "operation,mode,output,...:..."; empty if the key is not read.
[[nodiscard]] std::string_view formOf(File file, std::string_view key);

/// The words that a field can hold, if they are fixed; none otherwise.
[[nodiscard]] const std::vector<std::string>& wordsOf(Content content);

/// The properties that have a meaning for the manager.
[[nodiscard]] const std::vector<std::string>& propertyNames();

/// Which texts of a value are names of families, devices or flashes.
enum class NamePlaces {
    NONE,
    ITEMS,             ///< the items of a list
    ITEMS_IN_ANY_CASE, ///< likewise, compared without case
    JOINED_ITEMS,      ///< likewise, each alone or with a package after it
    PART_ITEMS,        ///< the second part of each item MODEKEY_NAME_PACKAGE
    FIRST_FIELDS,      ///< the first field of each record
    SECOND_RECORD,     ///< the fields of the second record, without the first one
};

/// The places of names in the value of a key before the first section of a file. In sections there are none.
[[nodiscard]] NamePlaces namePlaces(File file, std::string_view key);

/// The name in an item "MODEKEY_NAME_PACKAGE" of `NOT_SUPPORTED_PART_IN_MODE`.
/// @return NAME; empty if the item has fewer parts
[[nodiscard]] std::string_view nameOfPart(std::string_view item);

/// The keys of a file whose names are fixed. Those of spi.acd that contain a name are not among them.
[[nodiscard]] std::vector<std::string> fixedKeys(File file);

/// The words of the modes in records, in value order: those that have cells in the tables.
[[nodiscard]] const std::vector<std::string>& tableModes();

/// The words of the outputs in records: those that have cells in the tables.
[[nodiscard]] const std::vector<std::string>& tableOutputs();

/// The words of the options in records: those that a database can give.
[[nodiscard]] const std::vector<std::string>& tableOptions();

/// The words of the outputs that a mode key can list.
[[nodiscard]] const std::vector<std::string>& modeOutputs();

} // namespace schema
