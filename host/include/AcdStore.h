#pragma once

#include <TarvikAbi.h>
#include <tarvik/Attributes.h>

#include <cstddef>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// Which databases there are, and what they contain where.
///
/// The readers answer from one store a process. Where it looks is settled before the first reader: by
/// `setSearchPath` or `setMemoryFiles`, else by the environment variable TARVIK_DATABASE (directories
/// separated by ":"; ignored in a set-user-id process), else by the installed share/tarvik/database.
/// What has been read lives as long as the process.
class TARVIK_HOST_API AcdStore {
public:
    /// Looks in these directories. To be called before the first reader: once a reader, a configuration or a
    /// method of this class but `searchPath()` has looked for a database, so once a manager exists, the call is
    /// ignored and an info message says so.
    /// @param directories the first one on top: where several hold a file, its keys replace or, with `+=`,
    ///        extend those of the layers below
    static void setSearchPath(std::vector<std::string> directories);

    /// Uses these files instead of any directory. To be called before the first reader, as `setSearchPath`.
    /// @param files name ("kestrel.acd") to text
    static void setMemoryFiles(std::map<std::string, std::string> files);

    /// The directories that are looked in.
    /// @return their paths, top first; empty for memory files
    [[nodiscard]] static std::vector<std::string> searchPath();

    /// The families that have a file, "base" and "spi" among them.
    /// @return their names, as their files spell them, in byte order of the file names
    [[nodiscard]] static std::vector<std::string> families();

    /// The devices of a family.
    /// @param family its name, in any case
    /// @return their names, as its file spells them, in the order in which their sections open
    /// @throw DataNotFoundException when the family's file can't be read
    [[nodiscard]] static std::vector<std::string> devices(const std::string& family);

    /// Where a part of a value was written. A value has one span, or several where lines are continued or
    /// texts appended.
    struct SourceSpan {
        std::size_t offset;     ///< of its first byte in the value
        std::string_view file;  ///< the path, or the name of a memory file
        std::string_view layer; ///< the directory of the search path; empty for a memory file
        unsigned line;          ///< counted from 1
        unsigned column;        ///< counted from 1, in bytes
    };

    /// A value with its origin.
    struct Value {
        std::string_view text;         ///< lives as long as the process
        std::vector<SourceSpan> spans; ///< in order; never empty
        bool fromSection;              ///< false: one of the family's own keys

        /// The values of layers below that `KEY = ...` on top replaced, the upper ones first. They have none
        /// themselves.
        std::vector<Value> replaced;

        /// Where one byte of the text was written.
        /// @param offset of the byte
        /// @return the span that contains it, its column moved to that byte
        [[nodiscard]] SourceSpan at(std::size_t offset) const;
    };

    /// A value and where it comes from.
    /// @param name as an `AcdReader` is opened by
    /// @param key case included
    /// @return what that reader's accessor gives for the key; nothing when there is none
    /// @throw DataNotFoundException when the family's file can't be read
    [[nodiscard]] static std::optional<Value> value(const char* name, const char* key);

    /// A place in a database file.
    struct SourceLocation {
        std::string_view file;  ///< the path, or the name of a memory file; empty: no place
        std::string_view layer; ///< the directory of the search path; empty for a memory file
        unsigned line = 0;      ///< counted from 1
        unsigned column = 0;    ///< counted from 1, in bytes
    };

    /// One call of `PM_DEVKEY::getstringbykey`. The texts `key`, `separator`, `subSeparator` and `text` are valid
    /// during the observer's call; all others live as long as the process.
    struct Read {
        std::string_view family; ///< whose database was read, as its file spells it; empty: an empty database
        std::string_view
            device; ///< whose accessor was asked, as its section spells it; empty: the family's own

        std::string_view key;       ///< that was asked for
        std::string_view separator; ///< between items; empty: the whole value is item 0
        short item;                 ///< the index that was asked for, counted from 0
        const char* subSeparator;   ///< between the fields of an item; null: the whole item was asked for
        short field;                ///< the index that was asked for, counted from 0; without a meaning if
                                    ///< `subSeparator` is null

        const char* text;        ///< the result; null when the key, the item or the field does not exist
        SourceLocation location; ///< of the first byte of `text`; no place when that is null

        std::string_view value;      ///< the whole value of the key; empty when there is no such key
        std::string_view itemText;   ///< the whole item, in `value`; empty when there is no such item
        SourceLocation itemLocation; ///< of the first byte of the item; no place when there is no such item
        bool fromSection; ///< whether the key is in the device's section, not the family's own keys
    };

    /// Receives every read.
    using ReadObserver = std::function<void(const Read&)>;

    /// Calls `observer` after each read of any accessor, before the reader gets the result. Costs one branch a
    /// read while there is no observer. What the observer throws passes through to whoever reads. Reads that
    /// the observer makes itself are not observed, and must not be made on the accessor that is being read.
    /// @param observer an empty one ends the observation
    /// @return the former observer; empty when there was none
    static ReadObserver setReadObserver(ReadObserver observer);

private:
    friend class TarvikTestPeer;

    /// Forgets everything, the search path and the observer included, as if nothing had been asked yet. All readers and
    /// accessors become invalid.
    static void resetForTesting();
};
