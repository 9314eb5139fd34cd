// Builds the model that all rules check: files merged as the readers merge them, each text with its location.
#include "lint/Model.h"

#include "database/FileNames.h"
#include "database/FileReading.h"
#include "database/IndexMaintenance.h"
#include "model/RecordSplitter.h"
#include "text/Suggest.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <utility>

namespace lint {

namespace {

std::set<std::string_view> texts(const std::vector<Token>& list) {
    std::set<std::string_view> names;
    for (const Token& item : list) {
        names.insert(item.text);
    }
    return names;
}

/// The values of property PACKAGES among the keys of a section.
std::optional<std::vector<Token>> packagesOf(const Section& section) {
    // PROPERTIES is read last, so it counts.
    for (const schema::PropertyKey key : {schema::PROPERTY_KEYS[1], schema::PROPERTY_KEYS[0]}) {
        const std::vector<Item>& items = section.items(key.key);
        for (auto item = items.rbegin(); item != items.rend(); ++item) {
            if (item->fields.front().text == schema::PACKAGES) {
                const auto first = static_cast<std::ptrdiff_t>(std::min(key.firstValue, item->fields.size()));
                return std::vector<Token>(item->fields.begin() + first, item->fields.end());
            }
        }
    }
    return std::nullopt;
}

constexpr std::string_view SEPARATORS = ",:";

std::string_view itemAt(std::string_view text, std::size_t offset, char separator) {
    return text.substr(offset, text.find(separator, offset) - offset);
}

} // namespace

const std::vector<Token>& Value::list() const {
    static const std::vector<Token> none;
    return items.empty() ? none : items.front().fields;
}

std::vector<Token> Value::replaced() const {
    std::vector<Token> all;
    for (auto source = m_replaced.rbegin(); source != m_replaced.rend(); ++source) {
        all.push_back({source->text, source->key.location});
    }
    return all;
}

void Value::assign(const AcdLines& file, const AcdLines::Line& line, char separator) {
    const AcdLines::SourceSpan& first = line.spans.front();
    const Token value{line.value, {&file, first.line, first.column}};
    if (line.kind == AcdLines::Kind::ASSIGNMENT) {
        if (!m_source.text.empty() && m_source.key.location.file != &file) {
            m_replaced.push_back(std::move(m_source));
            isReplaced = true;
        }
        m_source = {};
        isAssigned = true;
        oversizedAppends.clear();
        joinedAppends.clear();
    }
    if (line.value.size() > MAX_LENGTH - m_source.text.size()) {
        oversizedAppends.push_back(value);
        return;
    }
    key = m_source.key = {line.name, {&file, line.line, line.column}};
    if (!m_source.text.empty() && !line.value.empty() &&
        SEPARATORS.find(m_source.text.back()) == SEPARATORS.npos &&
        SEPARATORS.find(line.value.front()) == SEPARATORS.npos) {
        joinedAppends.push_back(value);
        m_source.text += separator;
    }
    for (const AcdLines::SourceSpan& span : line.spans) {
        m_source.spans.push_back({m_source.text.size() + span.offset, {&file, span.line, span.column}});
    }
    m_source.text += line.value;
}

void Value::split(schema::File file, std::string_view name, schema::Shape wanted) {
    shape = wanted;
    if (shape == schema::Shape::NONE) {
        return;
    }
    items = itemsOf(m_source, truncatedItems);
    if (!items.empty()) {
        restoreHidden(file, name);
    }
}

std::vector<Item> Value::itemsOf(const SourceText& source, std::vector<Token>& truncated) const {
    std::vector<Item> found;
    const std::string_view text = source.text;
    const auto addItem = [&](std::string_view item, std::size_t offset) {
        std::vector<Token> fields;
        // Databases are mostly fields: growing step by step would take twice the memory.
        fields.reserve(
            std::min(AcdText::MAX_PARTS,
                     static_cast<std::size_t>(std::count(item.begin(), item.end(), splitter::FIELDS)) + 1));
        const std::size_t end =
            splitter::forEachField(item, splitter::FIELDS, [&](std::string_view field, std::size_t at) {
                fields.push_back(source.token(field, offset + at));
            });
        if (end != text.npos) {
            truncated.push_back(source.token(itemAt(item, end, splitter::FIELDS), offset + end));
        }
        found.push_back({source.token(item, offset), std::move(fields)});
    };
    if (shape == schema::Shape::LIST) {
        if (!text.empty()) {
            addItem(text, 0);
        }
        return found;
    }
    const std::size_t end = splitter::forEachItem(text, splitter::RECORDS, addItem);
    if (end != text.npos) {
        truncated.push_back(source.token(itemAt(text, end, splitter::RECORDS), end));
    }
    return found;
}

void Value::restoreHidden(schema::File file, std::string_view name) {
    const bool isNamed = schema::hasNamedRecords(file, name);
    const std::size_t first = schema::firstListed(file, name);
    if (m_replaced.empty() || (!isNamed && first > 1)) {
        return; // tables may be replaced as a whole
    }
    std::vector<Token> ignored;
    for (auto source = m_replaced.rbegin(); source != m_replaced.rend(); ++source) {
        std::set<std::string_view> known;
        const auto addKnown = [&known](const Token& token) { known.insert(token.text); };
        for (const Item& item : items) {
            std::for_each(item.fields.begin(), isNamed ? item.fields.begin() + 1 : item.fields.end(),
                          addKnown);
        }
        std::vector<Item> below = itemsOf(*source, ignored);
        Hiding hiding{key, source->key, {}};
        std::size_t kept = 0;
        for (const Item& item : below) {
            const std::vector<Token>& fields = item.fields;
            for (std::size_t j = isNamed ? 0 : first; j < (isNamed ? 1 : fields.size()); ++j) {
                if (known.contains(fields[j].text)) {
                    ++kept;
                } else {
                    hiding.names.push_back(fields[j]);
                }
            }
        }
        // Whoever writes a list again and keeps most of it removes names on purpose. Properties are never removed.
        const bool isProperty = isNamed && name != schema::IDCODE;
        if (hiding.names.empty() || (!isProperty && hiding.names.size() <= kept)) {
            continue;
        }
        for (std::size_t i = 0; i < below.size(); ++i) {
            if (isNamed && !known.contains(below[i].fields.front().text)) {
                items.push_back(std::move(below[i]));
            } else if (!isNamed && i < items.size()) {
                std::copy_if(below[i].fields.begin() + static_cast<std::ptrdiff_t>(first),
                             below[i].fields.end(), std::back_inserter(items[i].fields),
                             [&known](const Token& token) { return !known.contains(token.text); });
            }
        }
        hidings.push_back(std::move(hiding));
    }
}

Token Value::SourceText::token(std::string_view part, std::size_t offset) const {
    const auto next =
        std::upper_bound(spans.begin(), spans.end(), offset,
                         [](std::size_t wanted, const Span& span) { return wanted < span.offset; });
    // An inserted separator belongs to the end of the span before it.
    const Span& span = *std::prev(next);
    SourceLocation location = span.location;
    location.column += static_cast<unsigned>(offset - span.offset);
    return {part, location};
}

const Value* Section::find(std::string_view key) const {
    const auto found = values.find(key);
    return found == values.end() ? nullptr : &found->second;
}

const std::vector<Item>& Section::items(std::string_view key) const {
    static const std::vector<Item> none;
    const Value* const value = find(key);
    return value == nullptr ? none : value->items;
}

const std::vector<Token>& Section::list(std::string_view key) const {
    static const std::vector<Token> none;
    const Value* const value = find(key);
    return value == nullptr ? none : value->list();
}

Token FamilyData::start() const { return startOf(files.front()); }

std::vector<std::string> layersOf(const std::vector<AcdLines>& files) {
    std::set<std::string> directories;
    for (const AcdLines& file : files) {
        directories.emplace(acd::directoryOf(file.path()));
    }
    directories.erase(std::string());
    return {directories.begin(), directories.end()};
}

std::vector<std::string> unusedIndexes(std::vector<std::string> directories) {
    std::erase_if(directories, [](const std::string& directory) {
        try {
            const acd::IndexState state = acd::checkIndex(directory).state;
            return state == acd::IndexState::MISSING || state == acd::IndexState::CURRENT;
        } catch (const acd::ReadError&) {
            return true; // that it cannot be listed is reported otherwise
        }
    });
    return directories;
}

Token startOf(const AcdLines& file) {
    if (file.lines().empty()) {
        return {{}, {&file, 1, 1}};
    }
    const AcdLines::Line& line = file.lines().front();
    return {line.name, {&file, line.line, line.column}};
}

FamilyData::FamilyData(std::vector<AcdLines> family)
    : files(std::move(family)), name(files.front().family()), kind(schema::fileOf(name)) {
    for (const AcdLines& file : files) {
        addFile(file);
    }
    splitValues();
}

void FamilyData::addFile(const AcdLines& file) {
    std::map<std::string, Section*> sections;
    for (Section& device : devices) {
        sections.emplace(lowerCase(device.name.text), &device);
    }
    Section* open = &own;
    for (const AcdLines::Line& line : file.lines()) {
        if (line.kind == AcdLines::Kind::INVALID) {
            open = line.closesSection ? nullptr : open;
        } else if (line.kind == AcdLines::Kind::HEADER) {
            Section*& section = sections[lowerCase(line.name)];
            if (section == nullptr) {
                section = &devices.emplace_back();
                section->name = {line.name, {&file, line.line, line.column}};
            }
            open = section;
        } else if (open != nullptr) {
            const bool isList = schema::firstListed(kind, line.name) <= 1;
            open->values[line.name].assign(file, line, isList ? splitter::FIELDS : splitter::RECORDS);
        }
    }
}

void FamilyData::splitValues() {
    for (auto& [key, value] : own.values) {
        value.split(kind, key, schema::shapeOf(kind, key));
    }
    for (Section& device : devices) {
        for (auto& [key, value] : device.values) {
            value.split(schema::File::FAMILY, key, schema::shapeInSection(key));
        }
    }
}

Families familiesOf(std::vector<AcdLines> files) {
    Families families;
    for (auto first = files.begin(); first != files.end();) {
        const auto last = std::find_if(
            first, files.end(), [&first](const AcdLines& file) { return file.family() != first->family(); });
        families.push_back(std::make_shared<const FamilyData>(
            std::vector<AcdLines>(std::make_move_iterator(first), std::make_move_iterator(last))));
        first = last;
    }
    return families;
}

std::vector<FlashList> flashLists(const Section& spiKeys) {
    std::vector<FlashList> all;
    for (const Token& family : spiKeys.list(schema::DEVICE_FAMILY)) {
        all.push_back({family, spiKeys.list(schema::devicesKey(family.text))});
    }
    return all;
}

std::vector<std::string> namesOf(const std::vector<FlashList>& flashes) {
    std::vector<std::string> names;
    for (const FlashList& list : flashes) {
        names.emplace_back(list.family.text);
        for (const Token& flash : list.devices) {
            names.emplace_back(flash.text);
        }
    }
    return names;
}

Model::Model(Families families, std::vector<std::string> unusedIndexes)
    : m_families(std::move(families)), m_unusedIndexes(std::move(unusedIndexes)) {
    for (const auto& family : m_families) {
        m_base = family->kind == schema::File::BASE ? family.get() : m_base;
        m_spi = family->kind == schema::File::SPI ? family.get() : m_spi;
        m_familyNames.push_back(family->name);
    }
    // spi is a family even without a file.
    if (m_spi == nullptr) {
        m_familyNames.emplace_back(schema::SPI_FAMILY);
    }
    m_sortedFamilyNames.insert(m_familyNames.begin(), m_familyNames.end());
    for (const std::string& name : m_familyNames) {
        m_lowerFamilies.insert(lowerCase(name));
    }
    m_supported = texts(baseKeys().list(schema::DEVICE_SUPPORTED));
    m_optionPackages = texts(baseKeys().list(schema::PROGRAM_OPTION_PACKAGE));
    m_flashFamilies = flashLists(spiKeys());
    m_flashNames = namesOf(m_flashFamilies);
    for (const std::string& name : m_flashNames) {
        m_lowerFlashes.insert(lowerCase(name));
    }
    findDevices();
}

std::vector<const AcdLines*> Model::files() const {
    std::vector<const AcdLines*> all;
    for (const auto& family : m_families) {
        for (const AcdLines& file : family->files) {
            all.push_back(&file);
        }
    }
    return all;
}

void Model::findDevices() {
    std::size_t count = 0;
    for (const auto& family : m_families) {
        count += family->devices.size();
    }
    m_devices.reserve(count); // so that they stay where they are
    m_lowerDevices.reserve(count);
    for (const auto& family : m_families) {
        if (family->kind != schema::File::FAMILY) {
            continue;
        }
        for (const Section& section : family->devices) {
            // Of several families the first one has the device.
            const auto [known, isNew] = m_lowerDevices.try_emplace(lowerCase(section.name.text));
            if (isNew) {
                known->second = &m_devices.emplace_back(Device{family.get(), &section});
                m_deviceNames.emplace_back(section.name.text);
            }
        }
    }
}

bool Model::isComplete() const {
    const std::vector<const AcdLines*> all = files();
    return std::all_of(all.begin(), all.end(),
                       [](const AcdLines* file) { return file->readError().empty(); });
}

const Section& Model::baseKeys() const {
    static const Section none{};
    return m_base == nullptr ? none : m_base->own;
}

const Section& Model::spiKeys() const {
    static const Section none{};
    return m_spi == nullptr ? none : m_spi->own;
}

const Device* Model::device(std::string_view name) const {
    const Device* const found = deviceInAnyCase(std::string(name));
    return found == nullptr || found->section->name.text != name ? nullptr : found;
}

bool Model::isFamily(std::string_view name) const { return m_sortedFamilyNames.contains(name); }

const Device* Model::deviceInAnyCase(const std::string& name) const {
    const auto found = m_lowerDevices.find(lowerCase(name));
    return found == m_lowerDevices.end() ? nullptr : found->second;
}

bool Model::isFamilyInAnyCase(const std::string& name) const {
    return m_lowerFamilies.count(lowerCase(name)) != 0;
}

bool Model::isFlashInAnyCase(const std::string& name) const {
    return m_lowerFlashes.count(lowerCase(name)) != 0;
}

std::vector<Token> Model::packages(const Device& device) const {
    if (std::optional<std::vector<Token>> own = packagesOf(*device.section)) {
        return *std::move(own);
    }
    return packagesOf(device.family->own).value_or(std::vector<Token>());
}

} // namespace lint
