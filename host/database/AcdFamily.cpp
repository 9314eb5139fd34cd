#include <AcdFamily.h>

#include "database/Database.h"

#include <algorithm>
#include <utility>

// The public view on the merge of layers: the same one that the readers answer from, over lines that a tool has.

std::string_view AcdFamily::Entry::key() const noexcept { return m_value->key(); }

std::string_view AcdFamily::Entry::value() const noexcept { return m_value->text(); }

AcdFamily::Location AcdFamily::Entry::keyLocation() const noexcept {
    return m_family->locationOfName(m_value->key().data());
}

AcdFamily::Location AcdFamily::Entry::locationOf(std::size_t offset) const noexcept {
    const acd::LayerSpan span = m_family->m_database->locate(*m_value, offset);
    return {m_family->m_layers[span.layer], span.location.line, span.location.column};
}

const AcdFamily::Entry* AcdFamily::Section::find(std::string_view key) const noexcept {
    const auto found =
        std::lower_bound(entries.begin(), entries.end(), key,
                         [](const Entry& entry, std::string_view wanted) { return entry.key() < wanted; });
    return found != entries.end() && found->key() == key ? &*found : nullptr;
}

AcdFamily::AcdFamily(std::vector<const AcdLines*> layers, std::size_t maxValueLength)
    : m_layers(std::move(layers)) {
    std::vector<acd::OversizedAppend> oversized;
    m_database = std::make_unique<const acd::Database>(m_layers, oversized, maxValueLength);

    const acd::CaseInsensitiveNameSet& names = m_database->sectionNames();
    m_sections.reserve(names.size() + 1);
    m_sections.push_back({{}, {m_layers.front(), 1, 1}, entriesOf(nullptr)});
    for (std::uint32_t ordinal = 0; ordinal != names.size(); ++ordinal) {
        const std::string_view name = names[ordinal];
        m_sections.push_back({name, locationOfName(name.data()), entriesOf(m_database->section(name))});
    }
    for (const acd::OversizedAppend& append : oversized) {
        m_droppedAppends.push_back({append.key,
                                    append.text,
                                    {m_layers[append.layer], append.location.line, append.location.column}});
    }
}

AcdFamily::~AcdFamily() = default;

std::vector<AcdFamily::Entry> AcdFamily::entriesOf(const acd::Section* section) const {
    const auto values = m_database->values(section);
    std::vector<Entry> entries;
    entries.reserve(values.size());
    for (const acd::Value& value : values) {
        entries.push_back(Entry(*this, value));
    }
    return entries;
}

AcdFamily::Location AcdFamily::locationOfName(const char* name) const noexcept {
    for (const AcdLines* const file : m_layers) {
        if (const AcdLines::Line* const line = file->lineOfName(name)) {
            return {file, line->line, line->column};
        }
    }
    return {m_layers.front(), 1, 1};
}
