#include "database/Database.h"

#include "database/FileNames.h"
#include "database/LineReader.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <tuple>
#include <utility>

// How the files of a family become one set of values: gathered in order, layer over layer, then sorted by
// section and key, so that all lines about a key are adjacent and are merged together.

namespace acd {

/// Fills a database; what it needs for that only goes with it.
class DatabaseBuilder {
public:
    DatabaseBuilder(Database& database, std::vector<OversizedAppend>& oversized, std::size_t maxValueLength)
        : m_database(database), m_oversized(oversized), m_maxValueLength(maxValueLength) {}

    /// Starts the next layer.
    void openLayer(std::uint32_t layer);

    /// Takes the next line of that layer.
    void add(const Line& line);

    /// Merges what was added.
    void merge();

private:
    static constexpr std::uint32_t OWN = 0;
    static constexpr std::uint32_t NOWHERE = 0xFFFFFFFF;

    struct Assignment {
        Value value;
        std::uint32_t section;
        bool appends;

        [[nodiscard]] auto sortKey() const noexcept { return std::tuple(section, value.key()); }
    };
    using Assignments = std::vector<Assignment>;

    /// Each assignment replaces all that came before it; an append without one is the first text itself.
    [[nodiscard]] static Assignments::iterator lastAssignment(Assignments::iterator first,
                                                              Assignments::iterator last) {
        const auto behind = std::find_if(std::reverse_iterator(last), std::reverse_iterator(first),
                                         [](const Assignment& candidate) { return !candidate.appends; })
                                .base();
        return behind == first ? first : std::prev(behind);
    }

    [[nodiscard]] std::uint32_t openSection(std::string_view name);
    void assign(const Line& line);
    void recordShadowed(Assignments::iterator first, Assignments::iterator last);
    [[nodiscard]] Value join(Assignments::iterator first, Assignments::iterator last);
    void dropOversizedAppends(Assignments::iterator first, Assignments::iterator last, bool isReported);

    Database& m_database;
    std::vector<OversizedAppend>& m_oversized;
    std::size_t m_maxValueLength;
    std::uint32_t m_layer = 0;
    std::uint32_t m_section = OWN;
    Assignments m_assignments;
};

void DatabaseBuilder::openLayer(std::uint32_t layer) {
    m_layer = layer;
    m_section = OWN;
}

void DatabaseBuilder::add(const Line& line) {
    switch (line.kind) {
    case Line::Kind::HEADER:
        m_section = openSection(line.name);
        break;
    case Line::Kind::ASSIGNMENT:
    case Line::Kind::APPEND:
        if (m_section != NOWHERE) {
            assign(line);
        }
        break;
    case Line::Kind::INVALID:
        if (line.error.closesSection) {
            m_section = NOWHERE;
        }
        break;
    }
}

std::uint32_t DatabaseBuilder::openSection(std::string_view name) {
    const std::uint32_t section = m_database.m_sectionNames.add(name) + 1;
    if (section == m_database.m_sections.size()) {
        m_database.m_sections.emplace_back();
    }
    return section;
}

void DatabaseBuilder::assign(const Line& line) {
    Value value;
    value.m_key = line.name.data();
    value.m_keyLength = static_cast<std::uint32_t>(line.name.size());
    value.m_text = line.value.data();
    value.m_textLength = static_cast<std::uint32_t>(line.value.size());
    value.m_firstSpan = static_cast<std::uint32_t>(m_database.m_spans.size());
    value.m_spanCount = static_cast<std::uint32_t>(line.spans.size());
    for (const SourceSpan& span : line.spans) {
        m_database.m_spans.push_back({span.offset, span.location, m_layer});
    }
    m_assignments.push_back({value, m_section, line.kind == Line::Kind::APPEND});
}

void DatabaseBuilder::merge() {
    // Stable: the lines about one key stay in their order.
    std::stable_sort(
        m_assignments.begin(), m_assignments.end(),
        [](const Assignment& left, const Assignment& right) { return left.sortKey() < right.sortKey(); });
    m_database.m_values.reserve(m_assignments.size());
    for (auto first = m_assignments.begin(); first != m_assignments.end();) {
        const auto last = std::find_if(first, m_assignments.end(), [first](const Assignment& assignment) {
            return assignment.sortKey() != first->sortKey();
        });
        Section& section = m_database.m_sections[first->section];
        if (section.m_count++ == 0) {
            section.m_first = static_cast<std::uint32_t>(m_database.m_values.size());
        }
        const auto standing = lastAssignment(first, last);
        dropOversizedAppends(standing, last, true);
        recordShadowed(first, standing);
        m_database.m_values.push_back(join(standing, last));
        first = last;
    }
    // A copy is not worth it for less.
    if (m_database.m_spans.capacity() > 2 * m_database.m_spans.size()) {
        m_database.m_spans.shrink_to_fit();
    }
}

/// Records the values of lower layers that an upper layer replaces.
/// @param last the assignment that takes effect
void DatabaseBuilder::recordShadowed(Assignments::iterator first, Assignments::iterator last) {
    const auto owner = static_cast<std::uint32_t>(m_database.m_values.size());
    const auto layerOf = [this](const Assignment& assignment) {
        return m_database.m_spans[assignment.value.m_firstSpan].layer;
    };
    for (std::uint32_t layer = layerOf(*last); first != last;) {
        const auto standing = lastAssignment(first, last);
        if (layerOf(*standing) != layer) {
            layer = layerOf(*standing);
            dropOversizedAppends(standing, last, false);
            m_database.m_replaced.push_back(join(standing, last));
            m_database.m_replacedOwners.push_back(owner);
        }
        last = standing;
    }
}

/// Joins the texts that make up one value, and their spans.
Value DatabaseBuilder::join(Assignments::iterator first, Assignments::iterator last) {
    if (std::distance(first, last) == 1) {
        return first->value;
    }
    std::size_t length = 0;
    for (auto part = first; part != last; ++part) {
        length += part->value.m_textLength;
    }
    auto& text = m_database.m_joinedTexts.emplace_back(makeBuffer(length));
    auto& spans = m_database.m_spans;

    Value joined = first->value;
    joined.m_text = text.get();
    joined.m_textLength = 0;
    joined.m_firstSpan = static_cast<std::uint32_t>(spans.size());
    for (auto part = first; part != last; ++part) {
        if (part->value.m_spanCount != 0) {
            joined.m_key = part->value.m_key;
        }
        for (std::uint32_t index = 0; index != part->value.m_spanCount; ++index) {
            LayerSpan span = spans[part->value.m_firstSpan + index];
            span.offset += joined.m_textLength;
            spans.push_back(span);
        }
        std::memcpy(text.get() + joined.m_textLength, part->value.m_text, part->value.m_textLength);
        joined.m_textLength += part->value.m_textLength;
    }
    joined.m_spanCount = static_cast<std::uint32_t>(spans.size()) - joined.m_firstSpan;
    return joined;
}

/// Empties the appended texts that would make the value too long.
void DatabaseBuilder::dropOversizedAppends(Assignments::iterator first, Assignments::iterator last,
                                           bool isReported) {
    std::size_t length = first->value.m_textLength;
    for (auto part = std::next(first); part != last; ++part) {
        if (length + part->value.m_textLength <= m_maxValueLength) {
            length += part->value.m_textLength;
            continue;
        }
        if (isReported) {
            const LayerSpan& origin = m_database.m_spans[part->value.m_firstSpan];
            m_oversized.push_back({origin.layer, origin.location, part->value.key(), part->value.text()});
        }
        part->value.m_textLength = 0;
        part->value.m_spanCount = 0;
    }
}

Database::Database(std::vector<LayerText> layers, std::vector<LayerError>& errors, std::size_t maxValueLength)
    : m_layers(std::move(layers)) {
    std::vector<OversizedAppend> oversized;
    DatabaseBuilder builder(*this, oversized, maxValueLength);
    Line line;
    for (std::uint32_t layer = 0; layer != m_layers.size(); ++layer) {
        const Text& text = m_layers[layer].text;
        m_spans.reserve(m_spans.size() + expectedLines(text.size));
        LineReader reader(text.bytes.get(), text.size);
        builder.openLayer(layer);
        while (reader.next(line)) {
            builder.add(line);
            if (line.kind == Line::Kind::INVALID) {
                errors.push_back({layer, line.error});
            }
        }
    }
    builder.merge();
    for (const OversizedAppend& append : oversized) {
        errors.push_back(
            {append.layer, {ParseErrorKind::VALUE_TOO_LONG, false, append.location, excerpt(append.text)}});
    }
}

const Section* Database::section(std::string_view name) const noexcept {
    const std::uint32_t ordinal = m_sectionNames.find(name);
    return ordinal == CaseInsensitiveNameSet::NONE ? nullptr : &m_sections[ordinal + 1];
}

std::size_t Database::ordinal(const Section* section) const noexcept {
    return section == nullptr ? 0 : static_cast<std::size_t>(section - m_sections.data());
}

std::string_view Database::sectionName(const Section* section) const noexcept {
    return section == nullptr ? std::string_view()
                              : m_sectionNames[static_cast<std::uint32_t>(ordinal(section) - 1)];
}

std::string_view Database::family() const noexcept {
    return m_layers.empty() ? std::string_view() : familyName(fileNameOf(m_layers.front().path));
}

const Value* Database::find(const Section* section, std::string_view key) const noexcept {
    const Value* const value = section == nullptr ? nullptr : findIn(*section, key);
    return value != nullptr ? value : findIn(m_sections.front(), key);
}

const Value* Database::findIn(const Section& section, std::string_view key) const noexcept {
    const Value* const first = m_values.data() + section.m_first;
    const Value* const last = first + section.m_count;
    const Value* const value =
        std::lower_bound(first, last, key, [](const Value& candidate, std::string_view wanted) {
            return candidate.key() < wanted;
        });
    return value != last && value->key() == key ? value : nullptr;
}

bool Database::holds(const Section& section, const Value& value) const noexcept {
    const auto index = static_cast<std::size_t>(&value - m_values.data());
    return index >= section.m_first && index - section.m_first < section.m_count;
}

std::span<const LayerSpan> Database::spans(const Value& value) const noexcept {
    return {m_spans.data() + value.m_firstSpan, value.m_spanCount};
}

LayerSpan Database::locate(const Value& value, std::size_t offset) const noexcept {
    const std::span<const LayerSpan> spans = this->spans(value);
    const auto next =
        std::upper_bound(spans.begin(), spans.end(), offset,
                         [](std::size_t wanted, const LayerSpan& span) { return wanted < span.offset; });
    // Of spans at the same offset all but the last are empty: the byte is in the last.
    LayerSpan span = *std::prev(next);
    span.location.column += static_cast<std::uint32_t>(offset - span.offset);
    return span;
}

std::span<const Value> Database::replaced(const Value& value) const noexcept {
    const auto owner = static_cast<std::uint32_t>(&value - m_values.data());
    const auto [first, last] = std::equal_range(m_replacedOwners.begin(), m_replacedOwners.end(), owner);
    return {m_replaced.data() + (first - m_replacedOwners.begin()), static_cast<std::size_t>(last - first)};
}

} // namespace acd
