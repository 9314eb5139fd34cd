// Divides files into parts that are moved or removed as wholes.
#include "edit/Sections.h"

#include <algorithm>

namespace edit {

std::vector<Block> blocksOf(const SourceFile& source) {
    const std::vector<Element>& elements = source.elements();
    std::vector<Block> blocks{{0, elements.size(), {}}};
    for (std::size_t i = 0; i < elements.size(); ++i) {
        const AcdLines::Line* const line = elements[i].line;
        if (line == nullptr || !opensBlock(*line)) {
            continue;
        }
        std::size_t first = i;
        while (first > blocks.back().first && elements[first - 1].kind == Element::Kind::COMMENT) {
            --first;
        }
        // A comment at the start of the file is about the file.
        first = first == 0 ? i : first;
        blocks.back().last = first;
        blocks.push_back({first, elements.size(), line->name});
    }
    return blocks;
}

bool opensBlock(const AcdLines::Line& line) {
    return line.kind == AcdLines::Kind::HEADER || line.closesSection;
}

bool beginsLine(const AcdLines::Line& line, std::size_t offset) {
    return offset > 0 &&
           std::any_of(line.spans.begin(), line.spans.end(),
                       [offset](const AcdLines::SourceSpan& span) { return span.offset == offset; });
}

} // namespace edit
