// Makes the model that all rules look at: files merged as the readers merge them, every piece with its place.
#include "lint/Model.h"

#include "lint/Keys.h"
#include "text/Suggest.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <utility>

namespace lint {

namespace {

void addList(std::set<std::string_view>& names, const Entry* entry) {
    if (entry != nullptr) {
        for (const Token& item : entry->list()) {
            names.insert(item.text);
        }
    }
}

/// The values of property PACKAGES among the keys of a section.
std::optional<std::vector<Token>> packagesOf(const Section& section) {
    for (const auto& [key, firstValue] : {std::pair("PROPERTIES", 2), std::pair("PROPERTY", 1)}) {
        const Entry* const entry = section.find(key);
        if (entry == nullptr) {
            continue;
        }
        for (auto record = entry->records.rbegin(); record != entry->records.rend(); ++record) {
            if (record->fields.front().text == "PACKAGES") {
                const auto first = std::min<std::ptrdiff_t>(firstValue, std::ssize(record->fields));
                return std::vector<Token>(record->fields.begin() + first, record->fields.end());
            }
        }
    }
    return std::nullopt;
}

} // namespace

const std::vector<Token>& Entry::list() const {
    static const std::vector<Token> none;
    return records.empty() ? none : records.front().fields;
}

void Entry::assign(const AcdLines& file, const AcdLines::Line& line) {
    if (line.kind == AcdLines::Kind::ASSIGNMENT) {
        m_text.clear();
        m_fragments.clear();
        tooLong.clear();
    }
    if (line.value.size() > LONGEST - m_text.size()) {
        const AcdLines::SourceSpan& first = line.spans.front();
        tooLong.push_back({line.value, {&file, first.line, first.column}});
        return;
    }
    key = {line.name, {&file, line.line, line.column}};
    for (const AcdLines::SourceSpan& fragment : line.spans) {
        m_fragments.push_back({m_text.size() + fragment.offset, {&file, fragment.line, fragment.column}});
    }
    m_text += line.value;
}

void Entry::split(Shape wanted) {
    shape = wanted;
    if (m_text.empty() || shape == Shape::NONE) {
        return;
    }
    if (shape == Shape::LIST) {
        records.push_back({token(0, m_text.size()), pieces(0, m_text.size(), ',')});
        return;
    }
    const std::vector<Token> items = pieces(0, m_text.size(), ':');
    records.reserve(items.size());
    for (const Token& item : items) {
        const auto begin = static_cast<std::size_t>(item.text.data() - m_text.data());
        records.push_back({item, pieces(begin, begin + item.text.size(), ',')});
    }
}

Token Entry::token(std::size_t offset, std::size_t length) const {
    const auto behind = std::upper_bound(
        m_fragments.begin(), m_fragments.end(), offset,
        [](std::size_t wanted, const Fragment& fragment) { return wanted < fragment.offset; });
    const Fragment& fragment = *std::prev(behind);
    Place place = fragment.place;
    place.column += static_cast<unsigned>(offset - fragment.offset);
    return {std::string_view(m_text).substr(offset, length), place};
}

std::vector<Token> Entry::pieces(std::size_t begin, std::size_t end, char separator) {
    const std::string_view text = std::string_view(m_text).substr(begin, end - begin);
    std::vector<Token> all;
    // Databases are mostly pieces: growing step by step would take twice the memory.
    all.reserve(
        std::min(MOST, static_cast<std::size_t>(std::count(text.begin(), text.end(), separator)) + 1));
    for (std::size_t start = begin; start <= end;) {
        const std::size_t next = std::min(m_text.find(separator, start), end);
        if (all.size() == MOST) {
            unseen.push_back(token(start, next - start));
            break;
        }
        all.push_back(token(start, next - start));
        start = next + 1;
    }
    return all;
}

const Entry* Section::find(std::string_view key) const {
    const auto found = entries.find(key);
    return found == entries.end() ? nullptr : &found->second;
}

Token Family::place() const { return startOf(*files.front()); }

Token startOf(const AcdLines& file) {
    if (file.lines().empty()) {
        return {{}, {&file, 1, 1}};
    }
    const AcdLines::Line& line = file.lines().front();
    return {line.name, {&file, line.line, line.column}};
}

Model::Model(std::vector<AcdLines> files) : m_files(std::move(files)) {
    for (const AcdLines& file : m_files) {
        addFile(file);
    }
    for (const Family& family : m_families) {
        m_base = family.kind == Family::Kind::BASE ? &family : m_base;
        m_spi = family.kind == Family::Kind::SPI ? &family : m_spi;
        m_familyNames.push_back(family.name);
        m_lowerFamilies.insert(lowerCase(family.name));
    }
    splitEntries();
    addList(m_supported, baseEntry("DEVICE_SUPPORTED"));
    addList(m_optionPackages, baseEntry("PROGRAM_OPTION_PACKAGE"));
    findDevices();
    findFlashes();
}

void Model::addFile(const AcdLines& file) {
    // The files of a family come one behind the other.
    if (m_families.empty() || m_families.back().name != file.family()) {
        Family& added = m_families.emplace_back();
        added.name = file.family();
        added.kind = sameWithoutCase(added.name, "base")  ? Family::Kind::BASE
                     : sameWithoutCase(added.name, "spi") ? Family::Kind::SPI
                                                          : Family::Kind::PARTS;
    }
    Family& family = m_families.back();
    family.files.push_back(&file);

    std::map<std::string, Section*> sections;
    for (Section& device : family.devices) {
        sections.emplace(lowerCase(device.name.text), &device);
    }
    Section* open = &family.own;
    for (const AcdLines::Line& line : file.lines()) {
        if (line.kind == AcdLines::Kind::INVALID) {
            open = line.closesSection ? nullptr : open;
        } else if (line.kind == AcdLines::Kind::HEADER) {
            Section*& section = sections[lowerCase(line.name)];
            if (section == nullptr) {
                section = &family.devices.emplace_back();
                section->name = {line.name, {&file, line.line, line.column}};
            }
            open = section;
        } else if (open != nullptr) {
            open->entries[line.name].assign(file, line);
        }
    }
}

void Model::splitEntries() {
    for (Family& family : m_families) {
        for (auto& [key, entry] : family.own.entries) {
            entry.split(shapeOf(family.kind, key));
        }
        for (Section& device : family.devices) {
            for (auto& [key, entry] : device.entries) {
                entry.split(shapeInSection(key));
            }
        }
    }
}

void Model::findDevices() {
    for (const Family& family : m_families) {
        if (family.kind != Family::Kind::PARTS) {
            continue;
        }
        for (const Section& section : family.devices) {
            // Of several families the first one has the device.
            const auto [known, isNew] = m_lowerDevices.try_emplace(lowerCase(section.name.text));
            if (isNew) {
                known->second =
                    &m_devices.emplace(section.name.text, Device{&family, &section}).first->second;
                m_deviceNames.emplace_back(section.name.text);
            }
        }
    }
}

void Model::findFlashes() {
    const Entry* const families = spiEntry("DEVICE_FAMILY");
    if (families == nullptr) {
        return;
    }
    for (const Token& family : families->list()) {
        const Entry* const devices = spiEntry(std::string(family.text) + "_DEVICES");
        m_flashFamilies.push_back({family, devices == nullptr ? nullptr : &devices->list()});
        m_flashNames.emplace_back(family.text);
        for (std::size_t i = 0; devices != nullptr && i < devices->list().size(); ++i) {
            m_flashNames.emplace_back(devices->list()[i].text);
        }
    }
    for (const std::string& name : m_flashNames) {
        m_lowerFlashes.insert(lowerCase(name));
    }
}

const Entry* Model::baseEntry(std::string_view key) const {
    return m_base == nullptr ? nullptr : m_base->own.find(key);
}

const Entry* Model::spiEntry(std::string_view key) const {
    return m_spi == nullptr ? nullptr : m_spi->own.find(key);
}

const Device* Model::device(std::string_view name) const {
    const auto found = m_devices.find(name);
    return found == m_devices.end() ? nullptr : &found->second;
}

bool Model::isFamily(std::string_view name) const {
    return std::find(m_familyNames.begin(), m_familyNames.end(), name) != m_familyNames.end();
}

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
