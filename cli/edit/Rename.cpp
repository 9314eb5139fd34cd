// Changes a name at all its places.
#include "edit/Rename.h"

#include "edit/Names.h"
#include "text/Suggest.h"

#include "database/FileNames.h"

#include <fmt/format.h>

#include <cctype>

namespace edit {

namespace {

/// The key of spi.acd with the new name; the same key if it does not contain the former one.
std::string renamedKey(std::string_view key, const std::string& from, const std::string& to) {
    if (key == schema::devicesKey(from)) {
        return schema::devicesKey(to);
    }
    return key == schema::propertyKey(from) ? schema::propertyKey(to) : std::string(key);
}

std::vector<TextChange> changesOfNames(const SourceFile& source, const std::string& from,
                                       const std::string& to) {
    const bool isSpi = schema::fileOf(source.lines().family()) == schema::File::SPI;
    std::vector<TextChange> changes;
    for (const AcdLines::Line& line : source.lines().lines()) {
        const std::size_t offset = source.offsetOf(line.line, line.column);
        if (line.kind == AcdLines::Kind::HEADER) {
            if (sameWithoutCase(line.name, from)) {
                changes.push_back({offset, line.name.size(), to});
            }
        } else if (isSpi && line.kind != AcdLines::Kind::INVALID) {
            if (std::string key = renamedKey(line.name, from, to); key != line.name) {
                changes.push_back({offset, line.name.size(), std::move(key)});
            }
        }
    }
    return changes;
}

bool isPartOfWord(char byte) { return std::isalnum(static_cast<unsigned char>(byte)) != 0; }

bool containsWord(std::string_view text, std::string_view word) {
    for (std::size_t at = text.find(word); at != text.npos; at = text.find(word, at + 1)) {
        const std::size_t end = at + word.size();
        if ((at == 0 || !isPartOfWord(text[at - 1])) && (end == text.size() || !isPartOfWord(text[end]))) {
            return true;
        }
    }
    return false;
}

} // namespace

void renameIn(Draft& draft, const std::string& from, const std::string& to) {
    const lint::Model model = draft.model();
    const NameIndex index(model);
    StatementReader reader;
    for (Draft::File& file : draft.files()) {
        const SourceFile source(file.text, file.path, file.family);
        std::vector<TextChange> changes = changesOfNames(source, from, to);
        for (const NamedStatement& statement : reader.read(source.lines())) {
            for (const NamedItem& item : statement.items) {
                const std::string_view name = index.nameOf(statement, item);
                if (NameIndex::isSame(statement.places, name, from)) {
                    changes.push_back(changeOfValue(source, statement.line, item.nameBegin,
                                                    item.nameBegin + name.size(), to));
                }
            }
        }
        setText(file, changed(file.text, std::move(changes)));
        if (schema::fileOf(file.family) == schema::File::FAMILY && sameWithoutCase(file.family, from)) {
            const std::string extension(acd::fileNameOf(file.path).substr(file.family.size()));
            file.path = acd::joinPath(std::string(acd::directoryOf(file.path)), to + extension);
            file.family = to;
        }
    }
    draft.sort();
}

std::vector<std::string> commentsAbout(const Draft& draft, const std::string& name) {
    std::vector<std::string> places;
    for (const Draft::File& file : draft.files()) {
        if (file.isRemoved) {
            continue;
        }
        const AcdLines lines(file.text);
        for (const AcdLines::Comment& comment : lines.comments()) {
            if (containsWord(comment.text, name)) {
                places.push_back(fmt::format("{}:{}", file.path, comment.line));
            }
        }
    }
    return places;
}

} // namespace edit
