#include "database/Database.h"

#include "database/FileNames.h"
#include "database/LineReader.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <tuple>
#include <utility>

// How the files of a family become one set of values: gathered in order, layer over layer, then sorted by
// section and key, so that all that is said of a key stands together and is merged in one go.

namespace acd {

/// Fills a database; what it needs for that only goes with it.
class DatabaseBuilder {
public:
    DatabaseBuilder(Database& database, std::vector<LayerFault>& faults, std::size_t longestValue)
        : m_database(database), m_faults(faults), m_longestValue(longestValue) {}

    void read(std::uint32_t layer);
    void merge();

private:
    struct Assignment {
        Value value;
        std::uint32_t section;
        bool appends;

        [[nodiscard]] auto place() const noexcept { return std::tuple(section, value.key()); }
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
    void add(const Line& line, std::uint32_t section, std::uint32_t layer);
    void keepReplaced(Assignments::iterator first, Assignments::iterator last);
    [[nodiscard]] Value join(Assignments::iterator first, Assignments::iterator last);
    void dropWhatIsTooLong(Assignments::iterator first, Assignments::iterator last, bool isTold);

    Database& m_database;
    std::vector<LayerFault>& m_faults;
    std::size_t m_longestValue;
    Assignments m_assignments;
};

void DatabaseBuilder::read(std::uint32_t layer) {
    constexpr std::uint32_t OWN = 0;
    constexpr std::uint32_t NOWHERE = 0xFFFFFFFF;

    const Text& text = m_database.m_layers[layer].text;
    LineReader reader(text.bytes.get(), text.size);
    std::uint32_t section = OWN;
    Line line;
    while (reader.next(line)) {
        switch (line.kind) {
        case Line::Kind::HEADER:
            section = openSection(line.name);
            break;
        case Line::Kind::ASSIGNMENT:
        case Line::Kind::APPEND:
            if (section != NOWHERE) {
                add(line, section, layer);
            }
            break;
        case Line::Kind::FAULT:
            m_faults.push_back({layer, line.fault});
            if (line.fault.closesSection) {
                section = NOWHERE;
            }
            break;
        }
    }
}

std::uint32_t DatabaseBuilder::openSection(std::string_view name) {
    const std::uint32_t section = m_database.m_sectionNames.add(name) + 1;
    if (section == m_database.m_sections.size()) {
        m_database.m_sections.emplace_back();
    }
    return section;
}

void DatabaseBuilder::add(const Line& line, std::uint32_t section, std::uint32_t layer) {
    Value value;
    value.m_key = line.name.data();
    value.m_keyLength = static_cast<std::uint32_t>(line.name.size());
    value.m_text = line.value.data();
    value.m_textLength = static_cast<std::uint32_t>(line.value.size());
    value.m_firstFragment = static_cast<std::uint32_t>(m_database.m_fragments.size());
    value.m_fragmentCount = static_cast<std::uint32_t>(line.pieces.size());
    for (const Piece& piece : line.pieces) {
        m_database.m_fragments.push_back({piece.offset, piece.place, layer});
    }
    m_assignments.push_back({value, section, line.kind == Line::Kind::APPEND});
}

void DatabaseBuilder::merge() {
    // Stable: what is said of one key stays in the order in which it is said.
    std::stable_sort(
        m_assignments.begin(), m_assignments.end(),
        [](const Assignment& left, const Assignment& right) { return left.place() < right.place(); });
    m_database.m_values.reserve(m_assignments.size());
    for (auto first = m_assignments.begin(); first != m_assignments.end();) {
        const auto last = std::find_if(first, m_assignments.end(), [first](const Assignment& assignment) {
            return assignment.place() != first->place();
        });
        Section& section = m_database.m_sections[first->section];
        if (section.m_count++ == 0) {
            section.m_first = static_cast<std::uint32_t>(m_database.m_values.size());
        }
        const auto standing = lastAssignment(first, last);
        dropWhatIsTooLong(standing, last, true);
        keepReplaced(first, standing);
        m_database.m_values.push_back(join(standing, last));
        first = last;
    }
    m_database.m_fragments.shrink_to_fit();
}

/// Keeps what a layer hides of the layers below it.
/// @param last the assignment that stands
void DatabaseBuilder::keepReplaced(Assignments::iterator first, Assignments::iterator last) {
    const auto owner = static_cast<std::uint32_t>(m_database.m_values.size());
    const auto layerOf = [this](const Assignment& assignment) {
        return m_database.m_fragments[assignment.value.m_firstFragment].layer;
    };
    for (std::uint32_t layer = layerOf(*last); first != last;) {
        const auto standing = lastAssignment(first, last);
        if (layerOf(*standing) != layer) {
            layer = layerOf(*standing);
            dropWhatIsTooLong(standing, last, false);
            m_database.m_replaced.push_back(join(standing, last));
            m_database.m_replacedOwners.push_back(owner);
        }
        last = standing;
    }
}

/// Joins what stands for one key in a text and fragments of its own.
Value DatabaseBuilder::join(Assignments::iterator first, Assignments::iterator last) {
    if (std::distance(first, last) == 1) {
        return first->value;
    }
    std::size_t length = 0;
    for (auto part = first; part != last; ++part) {
        length += part->value.m_textLength;
    }
    auto& text = m_database.m_joinedTexts.emplace_back(std::make_unique_for_overwrite<char[]>(length));
    auto& fragments = m_database.m_fragments;

    Value joined = first->value;
    joined.m_text = text.get();
    joined.m_textLength = 0;
    joined.m_firstFragment = static_cast<std::uint32_t>(fragments.size());
    for (auto part = first; part != last; ++part) {
        for (std::uint32_t index = 0; index != part->value.m_fragmentCount; ++index) {
            Fragment fragment = fragments[part->value.m_firstFragment + index];
            fragment.offset += joined.m_textLength;
            fragments.push_back(fragment);
        }
        std::memcpy(text.get() + joined.m_textLength, part->value.m_text, part->value.m_textLength);
        joined.m_textLength += part->value.m_textLength;
    }
    joined.m_fragmentCount = static_cast<std::uint32_t>(fragments.size()) - joined.m_firstFragment;
    return joined;
}

/// Empties the appended texts that would make the value too long.
void DatabaseBuilder::dropWhatIsTooLong(Assignments::iterator first, Assignments::iterator last,
                                        bool isTold) {
    std::size_t length = first->value.m_textLength;
    for (auto part = std::next(first); part != last; ++part) {
        if (length + part->value.m_textLength <= m_longestValue) {
            length += part->value.m_textLength;
            continue;
        }
        if (isTold) {
            const Fragment& origin = m_database.m_fragments[part->value.m_firstFragment];
            m_faults.push_back(
                {origin.layer,
                 {FaultKind::VALUE_TOO_LONG, false, origin.place, excerpt(part->value.text())}});
        }
        part->value.m_textLength = 0;
        part->value.m_fragmentCount = 0;
    }
}

Database::Database(std::vector<LayerText> layers, std::vector<LayerFault>& faults, std::size_t longestValue)
    : m_layers(std::move(layers)) {
    DatabaseBuilder builder(*this, faults, longestValue);
    for (std::uint32_t layer = 0; layer != m_layers.size(); ++layer) {
        builder.read(layer);
    }
    builder.merge();
}

const Section* Database::section(std::string_view name) const noexcept {
    const std::uint32_t ordinal = m_sectionNames.find(name);
    return ordinal == NameTable::NONE ? nullptr : &m_sections[ordinal + 1];
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

std::span<const Fragment> Database::fragments(const Value& value) const noexcept {
    return {m_fragments.data() + value.m_firstFragment, value.m_fragmentCount};
}

std::span<const Value> Database::replaced(const Value& value) const noexcept {
    const auto owner = static_cast<std::uint32_t>(&value - m_values.data());
    const auto [first, last] = std::equal_range(m_replacedOwners.begin(), m_replacedOwners.end(), owner);
    return {m_replaced.data() + (first - m_replacedOwners.begin()), static_cast<std::size_t>(last - first)};
}

} // namespace acd
