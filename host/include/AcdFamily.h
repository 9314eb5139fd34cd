#pragma once

#include <AcdLines.h>

#include <cstddef>
#include <memory>
#include <string_view>
#include <vector>

namespace acd {
class Database;
class Section;
class Value;
} // namespace acd

/// What the files of one family say together: the layers merged as the readers merge them, and where every byte
/// was written.
///
/// For tools that have the lines of the files. Whoever wants single values asks `AcdStore::value`.
class __attribute__((visibility("default"))) AcdFamily {
public:
    /// A place in one of the files.
    struct Location {
        const AcdLines* file; ///< never null
        unsigned line;        ///< counted from 1
        unsigned column;      ///< counted from 1, in bytes
    };

    /// A key of a section and its value.
    class __attribute__((visibility("default"))) Entry {
    public:
        /// @return the key; its bytes are those of `keyLocation()`
        [[nodiscard]] std::string_view key() const noexcept;

        /// @return where the key was written last among the lines that make up the value
        [[nodiscard]] Location keyLocation() const noexcept;

        /// @return the value, appended texts included
        [[nodiscard]] std::string_view value() const noexcept;

        /// Where a byte of the value was written.
        /// @param offset of the byte; the size of the value gives the place after its last byte
        /// @return the place
        [[nodiscard]] Location locationOf(std::size_t offset) const noexcept;

    private:
        friend class AcdFamily;
        Entry(const AcdFamily& family, const acd::Value& value) noexcept
            : m_family(&family), m_value(&value) {}

        const AcdFamily* m_family;
        const acd::Value* m_value;
    };

    /// The keys of one device, or those of the family itself.
    struct Section {
        std::string_view name;      ///< as its first header spells it; empty for the family's own keys
        Location location;          ///< of that name; the start of the first file for the family's own keys
        std::vector<Entry> entries; ///< in byte order of their keys, each key once

        /// @param key case included
        /// @return its entry; null when the section has no such key
        [[nodiscard]] const Entry* find(std::string_view key) const noexcept;
    };

    /// An appended text that was dropped, since the value would have grown too long.
    struct DroppedAppend {
        std::string_view key;  ///< that the text was to be appended to
        std::string_view text; ///< of the line
        Location location;     ///< of its first byte
    };

    /// Merges the files of one family.
    /// @param layers the bottom one first, one at least; they must outlive this object and must not be moved
    /// @param maxValueLength what no value may grow over by appending
    explicit AcdFamily(std::vector<const AcdLines*> layers,
                       std::size_t maxValueLength = std::size_t{1} << 30);

    AcdFamily(const AcdFamily&) = delete;
    AcdFamily& operator=(const AcdFamily&) = delete;
    ~AcdFamily();

    /// @return the family's own keys; lives as long as this object, as all other results do
    [[nodiscard]] const Section& own() const noexcept { return m_sections.front(); }

    /// @return the family's own keys, then the devices in the order in which their sections open first
    [[nodiscard]] const std::vector<Section>& sections() const noexcept { return m_sections; }

    /// @return the appended texts that were dropped
    [[nodiscard]] const std::vector<DroppedAppend>& droppedAppends() const noexcept {
        return m_droppedAppends;
    }

private:
    [[nodiscard]] std::vector<Entry> entriesOf(const acd::Section* section) const;
    [[nodiscard]] Location locationOfName(const char* name) const noexcept;

    std::vector<const AcdLines*> m_layers;
    std::unique_ptr<const acd::Database> m_database;
    std::vector<Section> m_sections;
    std::vector<DroppedAppend> m_droppedAppends;
};
