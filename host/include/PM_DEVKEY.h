#pragma once

#include <AcdText.h>
#include <TarvikAbi.h>
#include <tarvik/Attributes.h>

#include <cstddef>
#include <string>
#include <string_view>

class PM_PIC;

namespace acd {
class Database;
class ReadLog;
class Section;
} // namespace acd

/// Reads keyed values of one database: a device's accessor falls back to its family's keys.
class TARVIK_HOST_API PM_DEVKEY {
public:
    /// Opens a file on a configuration. No such file gives an empty database.
    /// @param file its name, for example "spi.acd"
    /// @param configuration which one does not matter to this library
    /// @param flag1 has no meaning to this library, as the others
    /// @param flag2 likewise
    /// @param flag3 likewise
    /// @throw DataNotFoundException when the file is there but can't be read
    PM_DEVKEY(const char* file, const PM_PIC& configuration, unsigned char flag1, unsigned char flag2,
              unsigned char flag3);

    /// The accessor of one section of a database.
    /// @param database must outlive the accessor
    /// @param section must outlive it, too; null: the family's own keys
    PM_DEVKEY(const acd::Database& database, const acd::Section* section) noexcept;

    ~PM_DEVKEY();

    PM_DEVKEY(const PM_DEVKEY&) = delete;
    PM_DEVKEY& operator=(const PM_DEVKEY&) = delete;

    /// Reads one item, or one field of an item.
    ///
    /// The key's value is split at `separator`; with a `subSeparator`, item `index` is split again and its
    /// part `subIndex` is the result. n separators make n+1 pieces and nothing is trimmed; an empty value has
    /// no items, an empty item has one empty field.
    /// @param key matched exactly, case included
    /// @param separator where items end; null or empty: the whole value is item 0
    /// @param index counted from 0 to 32767; reading 0, 1, 2, ... in order costs time linear in the list
    /// @param subSeparator where fields end; null: the whole item is the result
    /// @param subIndex counted from 0 to 32767; not read without `subSeparator`
    /// @return the text, valid until the next call on this accessor; null when the key, the item or the field
    ///         does not exist
    [[nodiscard]] const char* getstringbykey(const char* key, const char* separator, short index,
                                             const char* subSeparator, short subIndex);

private:
    friend class acd::ReadLog;

    /// What the latest call asked for, and whether it exists.
    struct Request {
        short index = 0;
        short subIndex = 0;
        bool hasSubSeparator = false;
        bool isFound = false;
    };

    [[nodiscard]] bool find(const char* key, const char* separator, const char* subSeparator);
    void select(std::string_view key, std::string_view separator);
    bool moveToItem(std::size_t index) noexcept;

    const acd::Database& m_database;
    const acd::Section* m_section;

    std::string m_key;
    std::string m_separator;
    std::string_view m_value;
    AcdText::PartCursor m_item;

    std::string m_subSeparator;
    AcdText::PartCursor m_field;

    Request m_request;
    std::string m_result; ///< the text and a NUL, then what is left of longer ones
};
