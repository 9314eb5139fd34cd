// Sorts what has no order of its own.
#include "edit/Sort.h"

#include "diff/NaturalLess.h"
#include "edit/Draft.h"
#include "edit/Names.h"
#include "edit/Sections.h"
#include "lint/Check.h"
#include "model/RecordSplitter.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <optional>

namespace edit {

namespace {

using schema::NamePlaces;
using vocabulary::Kind;
using Parts = std::vector<std::string>;

Parts split(std::string_view text, char separator) {
    Parts parts;
    splitter::forEachField(text, separator,
                           [&parts](std::string_view part, std::size_t) { parts.emplace_back(part); });
    return parts;
}

std::string join(const Parts& parts, char separator) {
    return fmt::format("{}", fmt::join(parts, std::string(1, separator)));
}

/// Sorts the parts from one on, as people order names.
/// @return whether it was possible: an empty part keeps all in their order
bool sortNames(Parts& parts, std::size_t first) {
    const auto begin = parts.begin() + static_cast<std::ptrdiff_t>(std::min(first, parts.size()));
    if (std::any_of(begin, parts.end(), [](const std::string& part) { return part.empty(); })) {
        return false;
    }
    std::stable_sort(begin, parts.end(), diff::NaturalLess());
    return true;
}

/// Sorts the words from one on in the order of the vocabulary.
/// @return whether it was possible: an unknown word keeps all in their order
bool sortWords(Parts& words, std::size_t first, Kind kind) {
    const auto begin = words.begin() + static_cast<std::ptrdiff_t>(std::min(first, words.size()));
    if (!std::all_of(begin, words.end(),
                     [kind](const std::string& word) { return vocabulary::find(kind, word).has_value(); })) {
        return false;
    }
    std::stable_sort(begin, words.end(), [kind](const std::string& left, const std::string& right) {
        return vocabulary::find(kind, left) < vocabulary::find(kind, right);
    });
    return true;
}

/// The records of a permission table in the order of operations or options, then of modes.
std::optional<Parts> sortedTable(Parts records, std::size_t first, const schema::Table& table) {
    std::vector<std::pair<std::vector<std::optional<int>>, std::string>> ranked;
    for (std::size_t i = first; i < records.size(); ++i) {
        Parts fields = split(records[i], splitter::FIELDS);
        if (fields.size() <= table.firstOutput || !sortWords(fields, table.firstOutput, Kind::OUTPUT)) {
            return std::nullopt;
        }
        std::vector<std::optional<int>> rank{
            vocabulary::find(table.hasOptions ? Kind::OPTION : Kind::OPERATION, fields[0])};
        if (table.firstOutput == 2) {
            rank.push_back(vocabulary::find(Kind::MODE, fields[1]));
        }
        if (std::find(rank.begin(), rank.end(), std::nullopt) != rank.end()) {
            return std::nullopt;
        }
        ranked.emplace_back(std::move(rank), join(fields, splitter::FIELDS));
    }
    std::stable_sort(ranked.begin(), ranked.end(),
                     [](const auto& left, const auto& right) { return left.first < right.first; });
    records.resize(std::min(first, records.size()));
    for (auto& [rank, text] : ranked) {
        records.push_back(std::move(text));
    }
    return records;
}

/// The families and outputs of a mode, each after the label of its record.
std::string sortedMode(std::string_view value) {
    Parts records = split(value, splitter::RECORDS);
    for (std::string& record : records) {
        Parts fields = split(record, splitter::FIELDS);
        if (sortWords(fields, 1, Kind::OUTPUT) || sortNames(fields, 1)) {
            record = join(fields, splitter::FIELDS);
        }
    }
    return join(records, splitter::RECORDS);
}

/// The value of a statement in its order.
std::string sortedValue(const AcdLines::Line& line, schema::File file, bool isInSection) {
    std::string value(line.value);
    const bool isAppend = line.kind == AcdLines::Kind::APPEND;
    const auto table = std::find_if(schema::TABLES.begin(), schema::TABLES.end(),
                                    [&line](const schema::Table& one) { return line.name == one.key; });
    const NamePlaces places = isInSection ? NamePlaces::NONE : schema::namePlaces(file, line.name);
    const bool isTable = table != schema::TABLES.end();
    if (!isTable && places == NamePlaces::NONE) {
        return value;
    }
    const bool isMode = places == NamePlaces::SECOND_RECORD;
    const char separator =
        isTable || isMode || places == NamePlaces::FIRST_FIELDS ? splitter::RECORDS : splitter::FIELDS;
    Parts parts = split(value, separator);
    if (parts.size() >= AcdText::MAX_PARTS) {
        return value; // not all of them are read
    }
    if (isMode) {
        return sortedMode(value);
    }
    // What is before the first separator of an appended text belongs to the value before.
    const std::size_t first = isAppend ? 1 : 0;
    if (isTable) {
        const std::optional<Parts> records = sortedTable(std::move(parts), first, *table);
        return records ? join(*records, separator) : value;
    }
    return sortNames(parts, first) ? join(parts, separator) : value;
}

/// The sections in the order of their names.
std::string withSortedSections(const SourceFile& file) {
    std::vector<Block> blocks = blocksOf(file);
    std::stable_sort(std::next(blocks.begin()), blocks.end(), [](const Block& left, const Block& right) {
        return diff::NaturalLess()(lowerCase(left.device), lowerCase(right.device));
    });
    std::string text(file.byteOrderMark());
    for (const Block& block : blocks) {
        std::string part;
        std::size_t end = block.last;
        while (end > block.first && file.elements()[end - 1].kind == Element::Kind::BLANK) {
            --end;
        }
        for (std::size_t i = block.first; i < end; ++i) {
            part += file.elements()[i].source;
        }
        if (part.empty()) {
            continue;
        }
        text += text.size() > file.byteOrderMark().size() ? file.lineEnd() : std::string_view();
        text += part;
        text += part.ends_with('\n') ? std::string_view() : file.lineEnd();
    }
    return text;
}

} // namespace

KeysOfFamilies keysWithFindings(const lint::Model& model) {
    KeysOfFamilies keys;
    for (const lint::Finding& finding : check(model, {.withConsequences = true})) {
        for (const AcdLines::Line& line : finding.location.file->lines()) {
            if (line.firstLine <= finding.location.line && finding.location.line <= line.lastLine) {
                keys[finding.location.file->family()].emplace(line.name);
            }
        }
    }
    return keys;
}

std::string sorted(const SourceFile& file, const std::set<std::string>& skipped) {
    const schema::File kind = schema::fileOf(file.lines().family());
    std::vector<TextChange> changes;
    bool isInSection = false;
    bool isValid = true;
    for (const AcdLines::Line& line : file.lines().lines()) {
        isInSection = isInSection || opensBlock(line);
        if (line.kind == AcdLines::Kind::INVALID) {
            isValid = false;
        } else if (line.kind != AcdLines::Kind::HEADER && !skipped.contains(std::string(line.name))) {
            if (std::string value = sortedValue(line, kind, isInSection); value != line.value) {
                changes.push_back(changeOfValue(file, line, 0, line.value.size(), std::move(value)));
            }
        }
    }
    std::string text = changed(file.text(), std::move(changes));
    return isValid ? withSortedSections(SourceFile(text, file.lines().path(), file.lines().family())) : text;
}

} // namespace edit
