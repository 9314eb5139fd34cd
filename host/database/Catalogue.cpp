#include "database/Catalogue.h"

#include "database/FileNames.h"
#include "database/SectionScanner.h"

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <system_error>
#include <utility>

// Finds the files of the families and reads them when they are needed. Every name is looked up among what the
// listing gave, so that a name never becomes a path.

namespace acd {

namespace {

[[nodiscard]] std::string workingDirectory() {
    std::error_code error;
    return fromPath(std::filesystem::current_path(error));
}

/// Indexes can be ignored, to compare answers with and without them.
[[nodiscard]] bool isIndexEnabled() { return platform::trustedVariable("TARVIK_INDEX") != "off"; }

/// Reads what is in a file, unless that failed before; the first failure is reported.
template <typename Read>
void tryRead(SourceFile& file, DeferredMessages& reports, Read read) {
    if (file.isUnreadable) {
        return;
    }
    try {
        read();
    } catch (const ReadError& unreadable) {
        reports.add(file.path, location::FILE_UNREADABLE, unreadable.what());
        file.isUnreadable = true;
    }
}

} // namespace

Catalogue::Catalogue(const std::vector<std::string>& directories, DeferredMessages& reports,
                     const std::vector<std::string>& unsaved)
    : m_workingDirectory(workingDirectory()), m_directories(directories.rbegin(), directories.rend()) {
    for (std::uint32_t layer = 0; layer != m_directories.size(); ++layer) {
        const std::string& directory = m_directories[layer];
        try {
            std::vector<std::string> names = listDirectory(directory);
            for (const std::string& path : unsaved) {
                if (joinPath(directory, std::string(fileNameOf(path))) == path) {
                    names.emplace_back(fileNameOf(path));
                }
            }
            std::sort(names.begin(), names.end());
            names.erase(std::unique(names.begin(), names.end()), names.end());
            for (const std::string& name : names) {
                addFile(name, {joinPath(directory, name), layer, nullptr});
            }
        } catch (const ReadError& unreadable) {
            reports.add(directory, location::DIRECTORY_UNREADABLE, unreadable.what());
        }
    }
    sort();
}

Catalogue::Catalogue(std::shared_ptr<const MemoryFiles> files) : m_memoryFiles(std::move(files)) {
    for (const auto& [name, text] : *m_memoryFiles) {
        addFile(name, {name, 0, &text});
    }
    sort();
}

/// Adds a file to its family. Of two in one layer whose names differ in case only the first one counts.
void Catalogue::addFile(std::string_view fileName, SourceFile file) {
    const std::string_view name = familyName(fileName);
    if (name.empty()) {
        return;
    }
    Family* known = family(name);
    if (known == nullptr) {
        known = m_families.emplace_back(std::make_unique<Family>()).get();
        known->fileName = fileName;
        known->name = name;
        m_names.add(known->name);
    } else if (known->files.back().layer == file.layer) {
        known->files.back().caseCollisions.push_back(std::move(file.path));
        return;
    }
    known->files.push_back(std::move(file));
}

/// Files are added in order; only files that exist in an upper layer alone are appended out of order.
void Catalogue::sort() {
    const auto precedes = [](const auto& left, const auto& right) {
        return left->fileName < right->fileName;
    };
    if (std::is_sorted(m_families.begin(), m_families.end(), precedes)) {
        return;
    }
    std::sort(m_families.begin(), m_families.end(), precedes);
    m_names = {};
    for (const auto& family : m_families) {
        m_names.add(family->name);
    }
}

Family* Catalogue::family(std::string_view name) const noexcept {
    const std::uint32_t ordinal = m_names.find(name);
    return ordinal == CaseInsensitiveNameSet::NONE ? nullptr : m_families[ordinal].get();
}

Family* Catalogue::familyOfFile(std::string_view fileName) const noexcept {
    return family(familyName(fileName));
}

Family* Catalogue::familyOfDevice(std::string_view device, DeferredMessages& reports) {
    if (!m_devices) {
        m_devices = makeIndex(reports);
    }
    const std::uint32_t ordinal = m_devices->family(device);
    return ordinal == DeviceIndex::NONE ? nullptr : m_families[ordinal].get();
}

/// The index of a layer's directory; nothing unless it describes the files that were found there as they are now.
std::optional<DirectoryIndex> Catalogue::currentIndex(std::uint32_t layer) const {
    const std::string directory = absolute(m_directories[layer]);
    std::optional<DirectoryIndex> index = DirectoryIndex::read(directory);
    if (!index) {
        return std::nullopt;
    }
    std::vector<std::string_view> names;
    for (const auto& family : m_families) {
        for (const SourceFile& file : family->files) {
            if (file.layer == layer) {
                names.push_back(fileNameOf(file.path));
                std::transform(file.caseCollisions.begin(), file.caseCollisions.end(),
                               std::back_inserter(names), fileNameOf);
            }
        }
    }
    std::sort(names.begin(), names.end());
    return index->isCurrent(directory, names) ? std::move(index) : std::nullopt;
}

DeviceIndex Catalogue::makeIndex(DeferredMessages& reports) const {
    std::vector<std::optional<DirectoryIndex>> indexes(m_directories.size());
    if (isIndexEnabled()) {
        for (std::uint32_t layer = 0; layer != indexes.size(); ++layer) {
            indexes[layer] = currentIndex(layer);
        }
    }
    const auto indexedSections = [&indexes](const SourceFile& file) -> const PackedStrings* {
        return file.text == nullptr && indexes[file.layer]
                   ? indexes[file.layer]->sections(fileNameOf(file.path))
                   : nullptr;
    };
    DeviceIndex devices;
    SectionScanner scan;
    for (std::uint32_t ordinal = 0; ordinal != m_families.size(); ++ordinal) {
        for (SourceFile& file : m_families[ordinal]->files) {
            tryRead(file, reports, [&] {
                const PackedStrings* const sections = indexedSections(file);
                devices.add(sections != nullptr ? *sections : scan.names([&] { return open(file); }),
                            ordinal);
            });
        }
    }
    return devices;
}

const Database* Catalogue::database(Family& family, DeferredMessages& reports) const {
    if (family.database != nullptr) {
        return family.database.get();
    }
    std::vector<LayerText> layers;
    for (SourceFile& file : family.files) {
        tryRead(file, reports, [&] { layers.push_back({file.path, readAll(*open(file))}); });
    }
    if (layers.size() != family.files.size()) {
        return nullptr;
    }
    std::vector<LayerError> errors;
    auto database = std::make_unique<const Database>(std::move(layers), errors);
    DeferredMessages found;
    for (const LayerError& error : errors) {
        found.add(database->path(error.layer), error.error);
    }
    family.database = std::move(database);
    reports.add(std::move(found));
    return family.database.get();
}

std::unique_ptr<ByteSource> Catalogue::open(const SourceFile& file) const {
    if (file.text != nullptr) {
        return std::make_unique<MemorySource>(*file.text);
    }
    return std::make_unique<FileSource>(absolute(file.path));
}

std::string Catalogue::absolute(const std::string& path) const {
    return platform::isAbsolute(path) ? path : joinPath(m_workingDirectory, path);
}

} // namespace acd
