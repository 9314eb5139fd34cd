// Finds names in the texts of a database, at the places that the schema describes.
#include "edit/Names.h"

#include "edit/Sections.h"
#include "model/RecordSplitter.h"
#include "term/ExitCode.h"
#include "term/Terminal.h"
#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>

namespace edit {

namespace {

using schema::NamePlaces;

bool isLetterOrDigit(char byte) {
    return (byte >= '0' && byte <= '9') || (AcdText::toUpper(byte) >= 'A' && AcdText::toUpper(byte) <= 'Z');
}

NamedItem withName(NamePlaces places, std::string_view value, std::size_t begin, std::size_t end) {
    const std::string_view item = value.substr(begin, end - begin);
    if (places == NamePlaces::FIRST_FIELDS) {
        return {begin, end, begin, begin + std::min(item.find(splitter::FIELDS), item.size())};
    }
    if (places == NamePlaces::PART_ITEMS) {
        const std::string_view name = schema::nameOfPart(item);
        const std::size_t at =
            name.empty() ? begin : begin + static_cast<std::size_t>(name.data() - item.data());
        return {begin, end, at, at + name.size()};
    }
    return {begin, end, begin, end};
}

} // namespace

std::optional<KnownName> findName(const lint::Model& model, const std::string& name) {
    KnownName known;
    const auto take = [&known](std::string_view spelling) {
        known.name = known.name.empty() ? spelling : std::string_view(known.name);
        return true;
    };
    for (const lint::FlashList& family : model.flashFamilies()) {
        if (sameWithoutCase(family.family.text, name)) {
            known.isFlashFamily = take(family.family.text);
        }
        for (const lint::Token& flash : family.devices) {
            if (sameWithoutCase(flash.text, name)) {
                known.isFlash = take(flash.text);
            }
        }
    }
    for (const auto& family : model.families()) {
        if (family->kind == schema::File::FAMILY && sameWithoutCase(family->name, name)) {
            known.isFamily = take(family->name);
        }
    }
    if (const lint::Device* const device = model.deviceInAnyCase(name)) {
        known.isDevice = take(device->section->name.text);
    }
    return known.name.empty() ? std::nullopt : std::optional(known);
}

bool isUsableName(std::string_view name) {
    constexpr std::size_t MAX_NAME = 15; // what dumps show
    return !name.empty() && name.size() <= MAX_NAME && isLetterOrDigit(name.front()) &&
           std::all_of(name.begin(), name.end(), [](char byte) {
               return isLetterOrDigit(byte) || byte == '-' || byte == '.' || byte == '+';
           });
}

NameIndex::NameIndex(const lint::Model& model) : m_model(model) {
    for (const auto* const names : {&model.familyNames(), &model.deviceNames(), &model.flashNames()}) {
        m_names.insert(names->begin(), names->end());
    }
}

std::string_view NameIndex::nameOf(const NamedStatement& statement, const NamedItem& item) const {
    const std::string_view name = statement.line.value.substr(item.nameBegin, item.nameEnd - item.nameBegin);
    return statement.places == NamePlaces::JOINED_ITEMS ? ownerOf(name) : name;
}

std::string_view NameIndex::ownerOf(std::string_view joined) const {
    if (m_names.contains(joined)) {
        return joined;
    }
    std::string_view owner;
    for (std::size_t length = 1; length < joined.size(); ++length) {
        const std::string_view name = joined.substr(0, length);
        if (!m_names.contains(name)) {
            continue;
        }
        owner = name;
        const lint::Device* const device = m_model.device(name);
        const std::vector<lint::Token> packages =
            device == nullptr ? std::vector<lint::Token>() : m_model.packages(*device);
        if (std::any_of(packages.begin(), packages.end(),
                        [&](const lint::Token& package) { return package.text == joined.substr(length); })) {
            break;
        }
    }
    return owner.empty() ? joined : owner;
}

bool NameIndex::isSame(NamePlaces places, std::string_view left, std::string_view right) {
    return places == NamePlaces::ITEMS_IN_ANY_CASE ? sameWithoutCase(left, right) : left == right;
}

std::vector<NamedStatement> StatementReader::read(const AcdLines& file) {
    const schema::File kind = schema::fileOf(file.family());
    std::vector<NamedStatement> all;
    for (const AcdLines::Line& line : file.lines()) {
        if (opensBlock(line)) {
            break;
        }
        const NamePlaces places = schema::namePlaces(kind, line.name);
        if (places != NamePlaces::NONE) {
            all.push_back({line, places, items(line, places)});
        }
    }
    return all;
}

std::vector<NamedItem> StatementReader::items(const AcdLines::Line& line, NamePlaces places) {
    std::vector<NamedItem> all;
    const std::string_view value = line.value;
    const auto add = [&](std::size_t begin, char separator, std::string_view text) {
        splitter::forEachItem(text, separator, [&](std::string_view item, std::size_t offset) {
            all.push_back(withName(places, value, begin + offset, begin + offset + item.size()));
        });
    };
    if (places == NamePlaces::FIRST_FIELDS) {
        add(0, splitter::RECORDS, value);
    } else if (places != NamePlaces::SECOND_RECORD) {
        add(0, splitter::FIELDS, value);
    } else {
        std::size_t& records = m_records[std::string(line.name)];
        records = line.kind == AcdLines::Kind::APPEND ? records : 0;
        for (std::size_t begin = 0; begin <= value.size(); ++begin) {
            const std::size_t end = std::min(value.find(splitter::RECORDS, begin), value.size());
            if (records == 1) {
                const bool beginsHere = begin != 0;
                add(begin, splitter::FIELDS, value.substr(begin, end - begin));
                if (beginsHere && !all.empty()) {
                    all.front().nameEnd = all.front().nameBegin; // the label
                }
            }
            records += end < value.size() ? 1U : 0U;
            begin = end;
        }
    }
    return all;
}

std::string placeOf(const lint::Model& model, const std::string& name) {
    StatementReader reader;
    for (const AcdLines* const file : model.files()) {
        const auto asText = [file](const AcdLines::Line& line) {
            return fmt::format("{}:{}:{}", file->path(), line.line, line.column);
        };
        const bool isOfSpi = schema::fileOf(file->family()) == schema::File::SPI;
        for (const AcdLines::Line& line : file->lines()) {
            const bool isHeader = line.kind == AcdLines::Kind::HEADER;
            if (sameWithoutCase(isHeader  ? line.name
                                : isOfSpi ? nameInKey(line)
                                          : std::string_view(),
                                name)) {
                return asText(line);
            }
        }
        for (const NamedStatement& statement : reader.read(*file)) {
            for (const NamedItem& item : statement.items) {
                const std::string_view text =
                    statement.line.value.substr(item.nameBegin, item.nameEnd - item.nameBegin);
                if (sameWithoutCase(text, name)) {
                    return asText(statement.line);
                }
            }
        }
    }
    return {};
}

void requireNewName(const lint::Model& model, const std::string& name, bool isFamily,
                    const std::string& former) {
    const auto refuse = [](const std::string& reason) { throw CommandError(ExitCode::FAULT, reason); };
    if (!isUsableName(name) || schema::fileOf(name) != schema::File::FAMILY) {
        refuse(fmt::format(
            "\"{}\" cannot be a name: names have 1 to 15 letters, digits, \"-\", \".\" and \"+\", "
            "begin with a letter or a digit, and are not \"base\" or \"spi\"",
            printable(name)));
    }
    if (const std::string spelling = isFamily ? lowerCase(name) : upperCase(name); name != spelling) {
        refuse(fmt::format("\"{}\" is in the wrong case, since lists are case-sensitive: families are in "
                           "lower case, all others in upper case: \"{}\"",
                           name, spelling));
    }
    if (sameWithoutCase(name, former)) {
        return;
    }
    if (const std::optional<KnownName> known = findName(model, name)) {
        refuse(fmt::format("the database has \"{}\" already", known->name));
    }
    if (const std::string place = placeOf(model, name); !place.empty()) {
        refuse(fmt::format("\"{}\" is named already: {}", name, place));
    }
}

void requireChangeable(const std::string& name) {
    if (schema::fileOf(name) != schema::File::FAMILY || schema::isFlashClass(name)) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("\"{}\" is a fixed name, which cannot be changed", printable(name)));
    }
}

std::string_view nameInKey(const AcdLines::Line& line) {
    for (const std::string_view suffix : {schema::DEVICES_SUFFIX, schema::PROPERTY_SUFFIX}) {
        if (line.name.ends_with(suffix)) {
            return line.name.substr(0, line.name.size() - suffix.size());
        }
    }
    return {};
}

TextChange changeOfValue(const SourceFile& source, const AcdLines::Line& line, std::size_t begin,
                         std::size_t end, std::string text) {
    const auto offsetOf = [&](std::size_t at) {
        const auto next = std::upper_bound(
            line.spans.begin(), line.spans.end(), at,
            [](std::size_t wanted, const AcdLines::SourceSpan& span) { return wanted < span.offset; });
        const AcdLines::SourceSpan& span = *std::prev(next);
        return source.offsetOf(span.line, span.column) + (at - span.offset);
    };
    // The end is that of the byte before: the next one may be in another line.
    const std::size_t from = begin == end && begin > 0 ? offsetOf(begin - 1) + 1 : offsetOf(begin);
    const std::size_t to = begin == end ? from : offsetOf(end - 1) + 1;
    return {from, to - from, std::move(text)};
}

} // namespace edit
