// Makes the index of a directory.
#include "commands/IndexWriter.h"

#include "database/FileNames.h"
#include "database/IndexMaintenance.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"
#include "term/TemporaryFiles.h"

#include <fmt/format.h>

#include <filesystem>
#include <system_error>

namespace {

/// The status of a new file in the directory: which device it is on, and what time it is there.
acd::FileStatus probe(const std::string& directory) {
    try {
        const struct Removal {
            std::string path;
            ~Removal() {
                std::error_code ignored;
                std::filesystem::remove(acd::toPath(path), ignored);
            }
        } probe{createTemporaryFile(directory, fmt::format(".{}.", acd::indexFormat::FILE_NAME))};
        return acd::FileSource(probe.path).status();
    } catch (const std::system_error& failure) {
        throw CommandError(ExitCode::FAULT, fmt::format("can't write \"{}\": {}", indexPath(directory),
                                                        failure.code().message()));
    }
}

} // namespace

std::string indexPath(const std::string& directory) {
    return acd::joinPath(directory, acd::indexFormat::FILE_NAME);
}

acd::IndexContents writeIndex(const std::string& directory) {
    try {
        // A directory without files is more likely a wrong one than one that needs an index.
        if (acd::databaseFiles(directory).empty()) {
            throw CommandError(ExitCode::FAULT, fmt::format("no .acd file in \"{}\"", directory));
        }
        // Before any file is read: what changes from here on is as young as the index.
        const acd::FileStatus now = probe(directory);
        acd::IndexContents contents = acd::describeDirectory(directory, now.device, now.changed);
        writeFile(indexPath(directory), acd::indexFormat::encode(contents));
        return contents;
    } catch (const acd::ReadError& unreadable) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("can't read \"{}\": {}", directory, unreadable.what()));
    }
}
