// Takes names out of lists and records, with one of the separators around each, and removes what is empty then.
#include "edit/Remove.h"

#include "edit/Sections.h"
#include "model/RecordSplitter.h"
#include "text/Suggest.h"

#include <algorithm>
#include <map>
#include <utility>

namespace edit {

namespace {

class Remover {
public:
    Remover(Draft& draft, const std::set<std::string>& names)
        : m_draft(draft), m_names(names), m_model(draft.model()), m_index(m_model) {
        for (const Draft::File& file : draft.files()) {
            const AcdLines lines(file.text);
            for (const AcdLines::Line& line : lines.lines()) {
                ++m_statements[{file.family, std::string(line.name)}];
            }
        }
    }

    void run() {
        for (Draft::File& file : m_draft.files()) {
            if (schema::fileOf(file.family) == schema::File::FAMILY && hasAnyCase(file.family)) {
                file.isRemoved = true;
                continue;
            }
            const SourceFile source(file.text, file.path, file.family);
            m_changes.clear();
            removeSections(source);
            removeKeys(source);
            for (const NamedStatement& statement : m_reader.read(source.lines())) {
                removeItems(source, statement);
            }
            setText(file, changed(file.text, m_changes));
        }
    }

private:
    [[nodiscard]] bool hasAnyCase(std::string_view name) const {
        return std::any_of(m_names.begin(), m_names.end(),
                           [name](const std::string& other) { return sameWithoutCase(name, other); });
    }

    void removeSections(const SourceFile& source) {
        for (const Block& block : blocksOf(source)) {
            for (std::size_t i = block.first; hasAnyCase(block.device) && i < block.last; ++i) {
                removeElement(source, source.elements()[i]);
            }
        }
    }

    void removeElement(const SourceFile& source, const Element& element) {
        m_changes.push_back({static_cast<std::size_t>(element.source.data() - source.text().data()),
                             element.source.size(),
                             {}});
    }

    void removeStatement(const SourceFile& source, const AcdLines::Line& line) {
        const auto element = std::find_if(source.elements().begin(), source.elements().end(),
                                          [&line](const Element& one) { return one.line == &line; });
        removeElement(source, *element);
    }

    /// Removes the keys of spi.acd that contain a name.
    void removeKeys(const SourceFile& source) {
        if (schema::fileOf(source.lines().family()) != schema::File::SPI) {
            return;
        }
        for (const AcdLines::Line& line : source.lines().lines()) {
            if (opensBlock(line)) {
                return;
            }
            if (isKeyOfName(line.name)) {
                removeStatement(source, line);
            }
        }
    }

    [[nodiscard]] bool isKeyOfName(std::string_view key) const {
        return std::any_of(m_names.begin(), m_names.end(), [key](const std::string& name) {
            return key == schema::devicesKey(name) || key == schema::propertyKey(name);
        });
    }

    void removeItems(const SourceFile& source, const NamedStatement& statement) {
        const AcdLines::Line& line = statement.line;
        if (isKeyOfName(line.name)) {
            return;
        }
        const std::vector<NamedItem>& items = statement.items;
        std::vector<bool> isRemoved;
        std::transform(items.begin(), items.end(), std::back_inserter(isRemoved),
                       [&](const NamedItem& item) { return isMeant(statement, item); });
        // An appended text begins with the end of the item before it.
        const bool isAppend = line.kind == AcdLines::Kind::APPEND;
        const std::size_t first =
            isAppend && !items.empty() && items.front().begin == items.front().end ? 1 : 0;
        const bool isWhole =
            statement.places != schema::NamePlaces::SECOND_RECORD ||
            (isAppend && !items.empty() && items.front().begin == 0 && items.back().end == line.value.size());
        const bool isEmptied = isWhole && first < items.size() &&
                               std::all_of(isRemoved.begin() + static_cast<std::ptrdiff_t>(first),
                                           isRemoved.end(), [](bool one) { return one; });
        const auto [state, isNew] = m_lacksStart.try_emplace(std::string(line.name));
        const bool isFirst = isNew || !isAppend;
        if (isEmptied) {
            state->second = isFirst || state->second;
            if (isAppend || m_statements[{source.lines().family(), std::string(line.name)}] == 1) {
                removeStatement(source, line);
            } else {
                m_changes.push_back(changeOfValue(source, line, 0, line.value.size(), {}));
            }
            return;
        }
        // A separator at the start has nothing before it any more.
        if (!isFirst && state->second && first == 1) {
            isRemoved.front() = true;
        }
        state->second = false;
        removeRuns(source, statement, isRemoved);
    }

    [[nodiscard]] bool isMeant(const NamedStatement& statement, const NamedItem& item) const {
        const std::string_view name = m_index.nameOf(statement, item);
        return !name.empty() && std::any_of(m_names.begin(), m_names.end(), [&](const std::string& other) {
            return NameIndex::isSame(statement.places, name, other);
        });
    }

    /// Removes items that follow each other at once, so that no separator is removed twice.
    void removeRuns(const SourceFile& source, const NamedStatement& statement,
                    const std::vector<bool>& isRemoved) {
        const std::vector<NamedItem>& items = statement.items;
        const AcdLines::Line& line = statement.line;
        for (std::size_t i = 0; i < items.size(); ++i) {
            if (!isRemoved[i]) {
                continue;
            }
            std::size_t next = i;
            while (next < items.size() && isRemoved[next]) {
                ++next;
            }
            const std::size_t begin = items[i].begin;
            if (next < items.size() && (i == 0 || beginsLine(line, begin))) {
                // Up to the next item, which may be in the next line.
                const std::size_t end = items[next].begin;
                TextChange change = changeOfValue(source, line, begin, end, {});
                if (beginsLine(line, end) && end < line.value.size()) {
                    change.length = changeOfValue(source, line, end, end + 1, {}).offset - change.offset;
                }
                m_changes.push_back(std::move(change));
            } else {
                m_changes.push_back(
                    changeOfValue(source, line, begin - (i == 0 ? 0 : 1), items[next - 1].end, {}));
            }
            i = next;
        }
    }

    Draft& m_draft;
    const std::set<std::string>& m_names;
    const lint::Model m_model;
    const NameIndex m_index;
    StatementReader m_reader;
    std::map<std::pair<std::string, std::string>, std::size_t> m_statements; ///< by family and key
    std::map<std::string, bool> m_lacksStart; ///< by key: was all removed that its value had so far?
    std::vector<TextChange> m_changes;
};

} // namespace

std::set<std::string> namesRemovedWith(const lint::Model& model, const KnownName& known) {
    std::set<std::string> names{known.name};
    for (const lint::Device& device : model.devices()) {
        if (known.isFamily && device.family->name == known.name) {
            names.emplace(device.section->name.text);
        }
    }
    for (const lint::FlashList& family : model.flashFamilies()) {
        if (family.family.text != known.name) {
            continue;
        }
        for (const lint::Token& flash : family.devices) {
            const bool isElsewhere = std::any_of(
                model.flashFamilies().begin(), model.flashFamilies().end(),
                [&](const lint::FlashList& other) {
                    return other.family.text != known.name &&
                           std::any_of(other.devices.begin(), other.devices.end(),
                                       [&](const lint::Token& one) { return one.text == flash.text; });
                });
            if (!isElsewhere) {
                names.emplace(flash.text);
            }
        }
    }
    return names;
}

void removeFrom(Draft& draft, const std::set<std::string>& names) { Remover(draft, names).run(); }

} // namespace edit
