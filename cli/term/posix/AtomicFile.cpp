// Replaces a file as a whole, so that a reader never finds half a file and a run that fails keeps the former one.
#include "term/AtomicFile.h"

#include "term/ExitCode.h"

#include <fmt/format.h>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <sys/stat.h>
#include <unistd.h>

namespace {

class Fault {
public:
    explicit Fault(const std::string& path) : m_path(path) {}

    [[noreturn]] void raise(int error) const {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("can't write \"{}\": {}", m_path, std::strerror(error)));
    }

private:
    const std::string& m_path;
};

/// Writes all, and closes.
/// @return 0, or what went wrong
int writeAndClose(int descriptor, std::string_view text) {
    int error = 0;
    while (error == 0 && !text.empty()) {
        const ssize_t written = ::write(descriptor, text.data(), text.size());
        if (written >= 0) {
            text.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno != EINTR) {
            error = errno;
        }
    }
    if (::close(descriptor) != 0 && error == 0) {
        error = errno;
    }
    return error;
}

/// Writes to what is there, which keeps its owner, its permissions and its other names.
void writeInPlace(const std::string& path, std::string_view text, const Fault& fault) {
    const int descriptor = ::open(path.c_str(), O_WRONLY | O_TRUNC | O_CLOEXEC);
    if (descriptor < 0) {
        fault.raise(errno);
    }
    if (const int error = writeAndClose(descriptor, text); error != 0) {
        fault.raise(error);
    }
}

/// Where a path leads: through all links, also to a file that is not there yet.
std::filesystem::path targetOf(const std::filesystem::path& path) {
    constexpr int MAX_LINKS = 40;
    std::filesystem::path target = path;
    std::error_code none;
    for (int links = 0; links < MAX_LINKS && std::filesystem::is_symlink(target, none); ++links) {
        target = target.parent_path() / std::filesystem::read_symlink(target, none);
    }
    return target;
}

/// Gives a new file the owner and the permissions of the former one.
/// @return whether it has them
bool copyStatus(int descriptor, const struct stat& former) {
    struct stat made {};
    // In this order: a new owner clears some permissions.
    return ::fstat(descriptor, &made) == 0 &&
           ((made.st_uid == former.st_uid && made.st_gid == former.st_gid) ||
            ::fchown(descriptor, former.st_uid, former.st_gid) == 0) &&
           ::fchmod(descriptor, former.st_mode & (S_IRWXU | S_IRWXG | S_IRWXO)) == 0;
}

/// The permissions of a new file of this process.
mode_t usualPermissions() {
    const mode_t mask = ::umask(0);
    ::umask(mask);
    return (S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP | S_IROTH | S_IWOTH) & ~mask;
}

/// Creates a file next to the target. Its name does not depend on the target's, which may be as long as names can be.
/// @return its descriptor; -1 if it cannot be created
int createBeside(const std::filesystem::path& target, std::string& name) {
    name = (target.parent_path() / fmt::format("{}XXXXXX", TEMPORARY_FILE)).string();
    return ::mkostemp(name.data(), O_CLOEXEC);
}

} // namespace

void writeFile(const std::string& path, std::string_view text) {
    const Fault fault(path);
    struct stat former {};
    const bool exists = ::stat(path.c_str(), &former) == 0;
    if (!exists && errno != ENOENT) {
        fault.raise(errno);
    }
    if (exists && (!S_ISREG(former.st_mode) || former.st_nlink != 1)) {
        writeInPlace(path, text, fault);
        return;
    }
    const std::filesystem::path target = targetOf(path);
    std::string beside;
    const int descriptor = createBeside(target, beside);
    if (descriptor < 0 && !exists) {
        fault.raise(errno);
    }
    if (exists && (descriptor < 0 || !copyStatus(descriptor, former))) {
        // No other file can take its place, but the file itself may be writable.
        if (descriptor >= 0) {
            ::close(descriptor);
            ::unlink(beside.c_str());
        }
        writeInPlace(path, text, fault);
        return;
    }
    int error = exists || ::fchmod(descriptor, usualPermissions()) == 0 ? 0 : errno;
    const int written = writeAndClose(descriptor, text);
    error = error == 0 ? written : error;
    if (error == 0 && ::rename(beside.c_str(), target.c_str()) != 0) {
        error = errno;
    }
    if (error != 0) {
        ::unlink(beside.c_str());
        fault.raise(error);
    }
}

std::error_code accessFailure(const std::string& path) {
    return ::access(path.c_str(), W_OK) == 0 ? std::error_code()
                                             : std::error_code(errno, std::generic_category());
}

bool isStandardOutput(const std::string& path) {
    struct stat file {};
    struct stat output {};
    return ::stat(path.c_str(), &file) == 0 && ::fstat(STDOUT_FILENO, &output) == 0 &&
           file.st_dev == output.st_dev && file.st_ino == output.st_ino;
}
