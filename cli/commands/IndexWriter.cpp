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

/// Prefix of the name of the file whose time is the directory's own clock.
constexpr const char* PROBE = ".index.acx.";

/// The status of a new file in the directory: which device it is on, and what time it is there.
acd::FileStatus probe(const std::string& directory) {
    try {
        const struct Removal {
            std::string path;
            ~Removal() {
                std::error_code ignored;
                std::filesystem::remove(acd::toPath(path), ignored);
            }
        } probe{createTemporaryFile(directory, PROBE)};
        return acd::FileSource(probe.path).status();
    } catch (const std::system_error& failure) {
        throw CommandError(ExitCode::FAULT, fmt::format("can't write \"{}\": {}", indexPath(directory),
                                                        failure.code().message()));
    }
}

/// Removes what a run of the tool left that was killed while it wrote. What another run is writing now is younger.
/// @param now by the clock of the directory
void removeLeftovers(const std::string& directory, acd::FileTime now) {
    constexpr std::int64_t SECONDS_AT_LEAST = 600;
    for (const std::string& name : acd::listDirectory(directory)) {
        if (!name.starts_with(PROBE) && !name.starts_with(TEMPORARY_FILE)) {
            continue;
        }
        const std::string path = acd::joinPath(directory, name);
        try {
            if (acd::FileSource(path).status().changed.seconds + SECONDS_AT_LEAST < now.seconds) {
                std::error_code ignored;
                std::filesystem::remove(acd::toPath(path), ignored);
            }
        } catch (const acd::ReadError&) {
            continue; // It is gone, or none of ours: the index can be made all the same.
        }
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
        removeLeftovers(directory, now.changed);
        acd::IndexContents contents = acd::describeDirectory(directory, now.device, now.changed);
        writeFile(indexPath(directory), acd::indexFormat::encode(contents));
        return contents;
    } catch (const acd::ReadError& unreadable) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("can't read \"{}\": {}", directory, unreadable.what()));
    }
}
