// Holds the texts of a database while an edit is made and proven.
#include "edit/Draft.h"

#include "edit/Format.h"
#include "edit/UnifiedDiff.h"

#include "database/FileNames.h"
#include "platform/Platform.h"

#include <AcdStore.h>

#include <algorithm>
#include <filesystem>
#include <tuple>
#include <utility>

namespace edit {

namespace {

namespace fs = std::filesystem;

std::string canonicalForm(const Draft::File& file) {
    return joined(formatted(SourceFile(file.text, file.path, file.family)));
}

std::size_t layerOf(const std::string& path, const std::vector<std::string>& layers) {
    const fs::path file = acd::toPath(path);
    const auto found = std::find_if(layers.begin(), layers.end(), [&file](const std::string& layer) {
        return acd::toPath(layer) / file.filename() == file;
    });
    return static_cast<std::size_t>(std::distance(layers.begin(), found));
}

} // namespace

std::string changed(std::string text, std::vector<TextChange> changes) {
    std::stable_sort(changes.begin(), changes.end(), [](const TextChange& left, const TextChange& right) {
        return left.offset < right.offset;
    });
    std::for_each(changes.rbegin(), changes.rend(), [&text](const TextChange& change) {
        text.replace(change.offset, change.length, change.text);
    });
    return text;
}

Draft::Draft(std::vector<File> files) : m_files(std::move(files)) { sort(); }

Draft Draft::ofDatabase() {
    const std::vector<std::string> layers = AcdStore::searchPath();
    std::vector<File> files;
    for (const AcdLines& lines : AcdLines::ofDatabase()) {
        const std::string text = readFile(lines.path());
        files.push_back(
            {lines.path(), lines.family(), layerOf(lines.path(), layers), text, lines.path(), text});
    }
    return Draft(std::move(files));
}

Draft::File& Draft::fileOf(const std::string& family, std::size_t layer, const std::string& directory) {
    const auto isMeant = [&](const File& file) { return file.family == family && file.layer == layer; };
    if (std::none_of(m_files.begin(), m_files.end(), isMeant)) {
        m_files.push_back({acd::joinPath(directory, family + ".acd"), family, layer, {}, {}, {}});
        sort();
    }
    return *std::find_if(m_files.begin(), m_files.end(), isMeant);
}

void Draft::sort() {
    std::stable_sort(m_files.begin(), m_files.end(), [](const File& left, const File& right) {
        return std::tie(left.family, right.layer) < std::tie(right.family, left.layer);
    });
}

lint::Model Draft::model() const {
    std::vector<AcdLines> lines;
    for (const File& file : m_files) {
        if (!file.isRemoved) {
            lines.emplace_back(file.text, file.path, file.family);
        }
    }
    return lint::Model(std::move(lines));
}

std::vector<Rewrite> Draft::rewrites() const {
    std::vector<Rewrite> all;
    for (const File& file : m_files) {
        if (file.isRemoved) {
            all.push_back({file.formerPath, std::nullopt, {}});
        } else if (file.path != file.formerPath || file.text != file.formerText) {
            all.push_back({file.path, file.text, file.path == file.formerPath ? "" : file.formerPath});
        }
    }
    return all;
}

std::string Draft::diff() const {
    std::string all;
    for (const File& file : m_files) {
        if (!file.isRemoved && file.path == file.formerPath) {
            all += unifiedDiff(file.path, file.formerText, file.text);
            continue;
        }
        if (!file.formerPath.empty()) {
            all += unifiedDiff(file.formerPath, NO_FILE, file.formerText, {});
        }
        if (!file.isRemoved) {
            all += unifiedDiff(NO_FILE, file.path, {}, file.text);
        }
    }
    return all;
}

void setText(Draft::File& file, std::string text) {
    const bool wasCanonical = canonicalForm(file) == file.text;
    file.text = std::move(text);
    if (wasCanonical) {
        file.text = canonicalForm(file);
    }
}

} // namespace edit
