// Makes the index of a directory.
#include "commands/IndexWriter.h"

#include "database/IndexMaintenance.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"

#include <fmt/format.h>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>

namespace {

/// The status of a new file in the directory: which device it is on, and what time it is there.
acd::FileStatus probe(const std::string& directory) {
    std::string path = fmt::format("{}/.{}.XXXXXX", directory, acd::indexFormat::FILE_NAME);
    const int descriptor = ::mkostemp(path.data(), O_CLOEXEC);
    if (descriptor == -1) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("can't write \"{}\": {}", indexPath(directory), std::strerror(errno)));
    }
    ::close(descriptor);
    const struct Removal {
        const std::string& path;
        ~Removal() { ::unlink(path.c_str()); }
    } removal{path};
    return acd::FileSource(path).status();
}

} // namespace

std::string indexPath(const std::string& directory) {
    return fmt::format("{}{}{}", directory, directory.ends_with('/') ? "" : "/", acd::indexFormat::FILE_NAME);
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
