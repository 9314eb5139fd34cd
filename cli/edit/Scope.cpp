// Says which names a finding concerns, so that a fix can be held to them.
#include "edit/Scope.h"

#include "edit/Names.h"
#include "edit/Sections.h"
#include "text/Suggest.h"

#include <algorithm>
#include <cctype>

namespace edit {

namespace {

/// The line that contains a location, and the header before it; null if no line does, or no header precedes it.
struct Place {
    const AcdLines::Line* line = nullptr;
    const AcdLines::Line* header = nullptr;
};

Place placeOf(const lint::Finding& finding) {
    Place place;
    for (const AcdLines::Line& line : finding.location.file->lines()) {
        if (line.firstLine > finding.location.line) {
            break;
        }
        place.line = line.lastLine >= finding.location.line ? &line : nullptr;
        place.header = opensBlock(line) ? &line : place.header;
    }
    return place;
}

/// The words of a line, of which a malformed header may name a device.
void addWords(std::string_view text, Scope& scope) {
    const auto isPart = [](char byte) { return std::isalnum(static_cast<unsigned char>(byte)) != 0; };
    for (auto begin = std::find_if(text.begin(), text.end(), isPart); begin != text.end();) {
        const auto end = std::find_if_not(begin, text.end(), isPart);
        scope.names.insert(lowerCase(std::string(begin, end)));
        begin = std::find_if(end, text.end(), isPart);
    }
}

class ScopeFinder {
public:
    explicit ScopeFinder(const lint::Model& model) : m_model(model), m_index(model) {}

    [[nodiscard]] Scope find(const lint::Finding& finding) {
        const Place place = placeOf(finding);
        const AcdLines& file = *finding.location.file;
        if (place.header != nullptr) {
            addName(place.header->name);
            if (place.header->kind == AcdLines::Kind::INVALID) {
                addWords(file.source(place.header->line), m_scope);
            }
        } else if (schema::fileOf(file.family()) == schema::File::FAMILY || place.line == nullptr ||
                   schema::shapeInSection(place.line->name) != schema::Shape::NONE) {
            addName(file.family());
        } else {
            addNamesOf(*place.line, finding);
        }
        return std::move(m_scope);
    }

private:
    void addName(std::string_view name) {
        m_scope.names.insert(lowerCase(name));
        for (const lint::FlashList& family : m_model.flashFamilies()) {
            if (sameWithoutCase(family.family.text, name)) {
                for (const lint::Token& flash : family.devices) {
                    m_scope.names.insert(lowerCase(flash.text));
                }
            }
        }
    }

    /// The names of a statement of base.acd or spi.acd: that of the item with the finding, otherwise all.
    void addNamesOf(const AcdLines::Line& line, const lint::Finding& finding) {
        if (const std::string_view name = nameInKey(line); !name.empty()) {
            addName(name);
            return;
        }
        std::set<std::string_view> all;
        StatementReader reader;
        for (const AcdLines* file : m_model.files()) {
            if (file->family() != finding.location.file->family()) {
                continue;
            }
            for (const NamedStatement& statement : reader.read(*file)) {
                if (statement.line.name != line.name) {
                    continue;
                }
                for (const NamedItem& item : statement.items) {
                    const std::string_view name = m_index.nameOf(statement, item);
                    const std::optional<KnownName> known = findName(m_model, std::string(name));
                    if (&statement.line == &line && known && contains(line, item, finding)) {
                        addName(name);
                        return;
                    }
                    all.insert(name);
                }
            }
        }
        m_scope.isWhole = all.empty() || isOfMode(line);
        for (const std::string_view name : all) {
            addName(name);
        }
    }

    /// The part of a mode key that has no names concerns all families.
    [[nodiscard]] static bool isOfMode(const AcdLines::Line& line) {
        return schema::namePlaces(schema::File::BASE, line.name) == schema::NamePlaces::SECOND_RECORD;
    }

    [[nodiscard]] static bool contains(const AcdLines::Line& line, const NamedItem& item,
                                       const lint::Finding& finding) {
        const auto span =
            std::find_if(line.spans.rbegin(), line.spans.rend(), [&finding](const AcdLines::SourceSpan& one) {
                return one.line == finding.location.line && one.column <= finding.location.column;
            });
        if (span == line.spans.rend()) {
            return false;
        }
        const std::size_t offset = span->offset + (finding.location.column - span->column);
        // The start of an appended text continues the item before it.
        const bool isContinuation = line.kind == AcdLines::Kind::APPEND && item.begin == 0;
        return item.begin <= offset && offset < item.end && !isContinuation;
    }

    const lint::Model& m_model;
    const NameIndex m_index;
    Scope m_scope;
};

} // namespace

void Scope::add(const Scope& other) {
    isWhole = isWhole || other.isWhole;
    names.insert(other.names.begin(), other.names.end());
}

Scope scopeOf(const lint::Finding& finding, const lint::Model& model) {
    return ScopeFinder(model).find(finding);
}

std::set<std::string> namesOutside(const Scope& scope, const diff::Comparison& comparison) {
    std::set<std::string> names;
    if (scope.isWhole) {
        return names;
    }
    const auto isIn = [&scope](const std::string& name) { return scope.names.contains(lowerCase(name)); };
    const auto add = [&](const std::string& family, const std::vector<std::string>& devices) {
        for (const std::string& device : devices) {
            if (!isIn(device) && !isIn(family)) {
                names.insert(device);
            }
        }
    };
    for (const diff::Devices* const devices : {&comparison.onlyInOld, &comparison.onlyInNew}) {
        for (const auto& [family, list] : *devices) {
            add(family, list);
        }
    }
    for (const diff::Group& group : comparison.groups) {
        add(group.family, group.devices);
    }
    for (const diff::Change& change : comparison.general) {
        const std::string& topic = change.question.topic;
        if (topic != diff::FAMILIES && topic != diff::FLASH_FAMILIES) {
            // Tables and modes that all devices have in common are those of spi.
            if (!isIn(std::string(schema::SPI_FAMILY))) {
                names.emplace(schema::SPI_FAMILY);
            }
            continue;
        }
        for (const diff::StringSet* const texts : {&change.lost, &change.gained}) {
            std::copy_if(texts->begin(), texts->end(), std::inserter(names, names.end()),
                         [&isIn](const std::string& name) { return !isIn(name); });
        }
    }
    return names;
}

} // namespace edit
