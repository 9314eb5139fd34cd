#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace reference {

/// Values by key.
using Keys = std::map<std::string, std::string>;

/// The case rules of the databases: ASCII alone.
[[nodiscard]] std::string lower(std::string text);
[[nodiscard]] std::string upper(std::string text);

/// The text before its first "_".
[[nodiscard]] std::string baseName(const std::string& text);

/// n separators make n+1 pieces; an empty text is one empty piece.
[[nodiscard]] std::vector<std::string> split(const std::string& text, char separator);

/// A device's section: the name as first written, and its keys.
struct Section {
    std::string name;
    Keys keys;
};

/// What stands in one file.
struct ParsedFile {
    Keys own;                      ///< before the first section
    std::vector<Section> sections; ///< in the order in which they open
    std::size_t faults = 0;        ///< malformed lines
};

[[nodiscard]] ParsedFile parse(const std::string& text);

/// A record's fields. There is always a first one, which may be empty.
using Record = std::vector<std::string>;

/// A field of a record; nothing when the record has none of that number.
[[nodiscard]] std::optional<std::string> fieldOf(const Record& record, long long number);

/// Reads keys: a section's first, then its family's own. Items, records and fields are numbered by a signed
/// 16-bit index, so there are 32768 of each at most.
class Accessor {
public:
    Accessor() = default;
    Accessor(const Keys* family, const Keys* section) : m_family(family), m_section(section) {}

    /// The items of a list, separated by ",".
    [[nodiscard]] std::vector<std::string> items(const std::string& key) const;

    /// Records separated by ":", of fields separated by ",".
    [[nodiscard]] std::vector<Record> records(const std::string& key) const;

private:
    [[nodiscard]] std::vector<std::string> pieces(const std::string& key, char separator) const;

    const Keys* m_family = nullptr;
    const Keys* m_section = nullptr;
};

/// What a name opens. A name that resolves to nothing has no module.
struct Opened {
    std::optional<std::string> module;
    Accessor accessor;
};

/// All databases, by file name, parsed at once. Accessors point into them.
class Databases {
public:
    explicit Databases(const std::map<std::string, std::string>& files);

    /// By the name of a file, in any case.
    [[nodiscard]] bool has(const std::string& file) const { return find(file) != m_files.end(); }
    [[nodiscard]] Accessor file(const std::string& name) const;

    /// By the name of a file, a family or a device.
    [[nodiscard]] Opened open(const std::string& name) const;

    /// Malformed lines in all files.
    [[nodiscard]] std::size_t faults() const;

private:
    using Parsed = std::map<std::string, ParsedFile>;

    [[nodiscard]] Parsed::const_iterator find(const std::string& file) const;
    [[nodiscard]] Opened openWhole(const std::string& name) const;

    Parsed m_files;
};

} // namespace reference
