// Inserts items, statements and sections into the text of a file, next to what they belong to.
#include "edit/Additions.h"

#include "edit/Names.h"
#include "edit/Sections.h"
#include "model/RecordSplitter.h"
#include "text/Suggest.h"

#include <algorithm>
#include <iterator>
#include <optional>

namespace edit {

namespace {

struct Part {
    std::string_view text;
    std::size_t end; ///< in the value
};

std::vector<Part> partsOf(std::string_view value, char separator) {
    std::vector<Part> parts;
    splitter::forEachItem(value, separator, [&parts](std::string_view item, std::size_t offset) {
        parts.push_back({item, offset + item.size()});
    });
    return parts;
}

/// How many parts of a value are to be before the item; nothing if only another statement has its place.
std::optional<std::size_t> placeIn(const std::vector<Part>& parts, const Addition& addition) {
    if (!addition.after.empty()) {
        const auto found = std::find_if(parts.begin(), parts.end(), [&addition](const Part& part) {
            return part.text == addition.after;
        });
        return found == parts.end() ? std::nullopt
                                    : std::optional<std::size_t>(std::distance(parts.begin(), found) + 1);
    }
    // The list begins after the label of a record, and after the start of an appended text, which is empty.
    auto first = std::find_if(parts.rbegin(), parts.rend(), [](const Part& part) {
                     return part.text.find(splitter::RECORDS) != part.text.npos;
                 }).base();
    first += first != parts.end() && first->text.empty() ? 1 : 0;
    const auto isLess = [](const Part& left, const Part& right) { return left.text < right.text; };
    if (first == parts.end() || !std::is_sorted(first, parts.end(), isLess)) {
        return parts.size();
    }
    const auto next =
        std::upper_bound(first, parts.end(), addition.item,
                         [](std::string_view item, const Part& part) { return item < part.text; });
    return static_cast<std::size_t>(std::distance(parts.begin(), next));
}

std::string ofLine(const SourceFile& source, const std::string& text) {
    std::string result;
    for (const char byte : text) {
        result += byte == '\n' ? std::string(source.lineEnd()) : std::string(1, byte);
    }
    return result;
}

/// Inserts lines before an element, or at the end.
void insertLines(Draft::File& file, const SourceFile& source, std::size_t element, const std::string& lines) {
    const bool isAtEnd = element == source.elements().size();
    const std::size_t offset =
        isAtEnd ? file.text.size()
                : static_cast<std::size_t>(source.elements()[element].source.data() - source.text().data());
    const bool isLineOpen = isAtEnd && !file.text.empty() && file.text.back() != '\n';
    setText(file, changed(file.text, {{offset, 0, ofLine(source, (isLineOpen ? "\n" : "") + lines)}}));
}

/// The element after the last one that is not blank.
std::size_t endOf(const SourceFile& source, const Block& block) {
    std::size_t end = block.last;
    while (end > block.first && source.elements()[end - 1].kind == Element::Kind::BLANK) {
        --end;
    }
    return end;
}

} // namespace

void addItem(Draft::File& file, const Addition& addition, char separator, bool hasValue) {
    const SourceFile source(file.text, file.path, file.family);
    const AcdLines::Line* last = nullptr;
    const AcdLines::Line* found = nullptr;
    for (const AcdLines::Line& line : source.lines().lines()) {
        if (opensBlock(line)) {
            break;
        }
        if (line.name == addition.key) {
            last = &line;
            found = placeIn(partsOf(line.value, separator), addition) ? &line : found;
        }
    }
    if (last == nullptr) {
        addStatement(file,
                     addition.key + (hasValue ? std::string(" += ") + separator : " = ") + addition.item);
        return;
    }
    // The item that is to be before it may be in another file.
    const Addition anywhere{addition.key, addition.item, {}};
    const AcdLines::Line& line = found == nullptr ? *last : *found;
    const std::vector<Part> parts = partsOf(line.value, separator);
    const std::size_t place = placeIn(parts, found == nullptr ? anywhere : addition).value_or(0);
    const std::size_t at = place == 0 ? 0 : parts[place - 1].end;
    const std::string text = parts.empty() ? ' ' + addition.item
                             : place == 0  ? addition.item + separator
                                           : separator + addition.item;
    setText(file, changed(file.text, {changeOfValue(source, line, at, at, text)}));
}

void addStatement(Draft::File& file, const std::string& statement) {
    const SourceFile source(file.text, file.path, file.family);
    insertLines(file, source, endOf(source, blocksOf(source).front()), statement + '\n');
}

void addSection(Draft::File& file, const std::string& section, const std::string& after) {
    const SourceFile source(file.text, file.path, file.family);
    const std::vector<Block> blocks = blocksOf(source);
    const auto sibling = std::find_if(blocks.rbegin(), blocks.rend(), [&after](const Block& block) {
        return !after.empty() && sameWithoutCase(block.device, after);
    });
    const Block& block = sibling == blocks.rend() ? blocks.back() : *sibling;
    insertLines(file, source, endOf(source, block), (file.text.empty() ? "" : "\n") + section);
}

} // namespace edit
