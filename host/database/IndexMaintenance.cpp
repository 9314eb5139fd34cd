#include "database/IndexMaintenance.h"

#include "database/DirectoryIndex.h"
#include "database/FileNames.h"
#include "database/SectionScanner.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <string_view>

namespace acd {

namespace {

[[nodiscard]] std::vector<std::string> databaseFilesAmong(std::vector<std::string> names) {
    std::erase_if(names, [](const std::string& name) { return familyName(name).empty(); });
    std::sort(names.begin(), names.end());
    return names;
}

} // namespace

std::vector<std::string> databaseFiles(const std::string& directory) {
    return databaseFilesAmong(listDirectory(directory));
}

IndexContents describeDirectory(const std::string& directory, std::uint64_t device, FileTime created) {
    IndexContents contents{device, created, {}};
    SectionScanner scan;
    for (const std::string& name : databaseFiles(directory)) {
        try {
            IndexedFile& file = contents.files.emplace_back();
            file.name = name;
            file.sections = scan.names([&] {
                auto source = std::make_unique<FileSource>(joinPath(directory, name));
                // From before the first byte is read: what changes the file from here on changes its status, too.
                file.status = source->status();
                return source;
            });
        } catch (const ReadError& unreadable) {
            throw ReadError(name + ": " + unreadable.what());
        }
    }
    return contents;
}

CheckedIndex checkIndex(const std::string& directory) {
    const std::vector<std::string> all = listDirectory(directory);
    if (std::find(all.begin(), all.end(), indexFormat::FILE_NAME) == all.end()) {
        return {IndexState::MISSING, {}};
    }
    const std::optional<DirectoryIndex> index = DirectoryIndex::read(directory);
    if (!index) {
        return {IndexState::INVALID, {}};
    }
    const std::vector<std::string> files = databaseFilesAmong(all);
    const std::vector<std::string_view> names(files.begin(), files.end());
    return {index->isCurrent(directory, names) ? IndexState::CURRENT : IndexState::STALE, index->contents()};
}

} // namespace acd
