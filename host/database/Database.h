#pragma once

#include "database/CaseInsensitiveNameSet.h"
#include "database/FileReading.h"
#include "database/ParseError.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace acd {

/// One layer's file of a family, read but not yet parsed.
struct LayerText {
    std::string path;
    Text text;
};

/// An error and the layer in whose file it is.
struct LayerError {
    std::uint32_t layer;
    ParseError error;
};

/// A text that was not appended, since the value would have grown too long.
struct OversizedAppend {
    std::uint32_t layer;
    SourceLocation location; ///< of the text
    std::string_view key;
    std::string_view text;
};

/// Where a part of a value was written.
struct LayerSpan {
    std::uint32_t offset; ///< of its first byte in the value
    SourceLocation location;
    std::uint32_t layer;
};

/// The value of a key. Small, since there is one for each of very many facts.
class Value {
public:
    [[nodiscard]] std::string_view key() const noexcept { return {m_key, m_keyLength}; }
    [[nodiscard]] std::string_view text() const noexcept { return {m_text, m_textLength}; }

private:
    friend class DatabaseBuilder;
    friend class Database;

    const char* m_key;
    const char* m_text;
    std::uint32_t m_keyLength;
    std::uint32_t m_textLength;
    std::uint32_t m_firstSpan;
    std::uint32_t m_spanCount;
};

/// The keys of one device, or those of the family itself.
class Section {
private:
    friend class DatabaseBuilder;
    friend class Database;

    std::uint32_t m_first = 0; ///< its values are adjacent, in order of their keys
    std::uint32_t m_count = 0;
};

/// What the files of one family say, layer over layer. Never changes once it is made.
class Database {
public:
    /// Without a single key.
    Database() = default;

    /// Parses and merges files.
    /// @param layers the bottom one first
    /// @param errors what is wrong with them is added here
    /// @param maxValueLength what no value may grow over by appending, at most 4 GiB
    explicit Database(std::vector<LayerText> layers, std::vector<LayerError>& errors,
                      std::size_t maxValueLength = MAX_FILE_SIZE);

    Database(const Database&) = delete;
    Database& operator=(const Database&) = delete;

    /// The names of the sections, in the order in which they open first.
    [[nodiscard]] const CaseInsensitiveNameSet& sectionNames() const noexcept { return m_sectionNames; }

    /// The section of a device; null when there is none.
    [[nodiscard]] const Section* section(std::string_view name) const noexcept;

    /// The place of a section among all, the family's own (null) being 0.
    [[nodiscard]] std::size_t ordinal(const Section* section) const noexcept;

    /// The value of a key: the section's, else the family's own. Null for `section` asks the family alone.
    [[nodiscard]] const Value* find(const Section* section, std::string_view key) const noexcept;

    /// Whether a value is the section's, not the family's own.
    [[nodiscard]] bool holds(const Section& section, const Value& value) const noexcept;

    /// The origin of a value, in order; one fragment at least.
    [[nodiscard]] std::span<const LayerSpan> spans(const Value& value) const noexcept;

    /// Where a byte of a value was written.
    /// @param offset of the byte, or the size of the value
    [[nodiscard]] LayerSpan locate(const Value& value, std::size_t offset) const noexcept;

    /// The values of layers below that `KEY = ...` on top replaced, the upper ones first.
    [[nodiscard]] std::span<const Value> replaced(const Value& value) const noexcept;

    /// The name of a section as its first header spells it; empty for the family's own (null).
    [[nodiscard]] std::string_view sectionName(const Section* section) const noexcept;

    /// The family's name as the bottom layer's file spells it; empty without a file.
    [[nodiscard]] std::string_view family() const noexcept;

    [[nodiscard]] std::string_view path(std::uint32_t layer) const noexcept { return m_layers[layer].path; }

private:
    friend class DatabaseBuilder;

    [[nodiscard]] const Value* findIn(const Section& section, std::string_view key) const noexcept;

    std::vector<LayerText> m_layers;
    CaseInsensitiveNameSet m_sectionNames;
    std::vector<Section> m_sections{1}; ///< the family's own first
    std::vector<Value> m_values;
    std::vector<Value> m_replaced;               ///< those of one value are adjacent
    std::vector<std::uint32_t> m_replacedOwners; ///< of each, the index of the value that replaces it
    std::vector<LayerSpan> m_spans;
    std::vector<std::unique_ptr<char[]>> m_joinedTexts; ///< of values that were appended to
};

} // namespace acd
