// A reader never meets half a page, and a run that fails keeps the former one.
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

void writeInPlace(const std::string& path, std::string_view text, const Fault& fault) {
    const int descriptor = ::open(path.c_str(), O_WRONLY | O_CLOEXEC);
    if (descriptor < 0) {
        fault.raise(errno);
    }
    if (const int error = writeAndClose(descriptor, text); error != 0) {
        fault.raise(error);
    }
}

/// What a new file of this process may be, or what the former one was.
mode_t permissions(const std::filesystem::path& path) {
    struct stat former {};
    if (::stat(path.c_str(), &former) == 0) {
        return former.st_mode & (S_IRWXU | S_IRWXG | S_IRWXO);
    }
    const mode_t mask = ::umask(0);
    ::umask(mask);
    return (S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP | S_IROTH | S_IWOTH) & ~mask;
}

} // namespace

void writeFile(const std::string& path, std::string_view text) {
    const Fault fault(path);
    std::error_code none;
    // Behind a link, the file that it leads to is the one to replace.
    const std::filesystem::path target = std::filesystem::is_symlink(path, none)
                                             ? std::filesystem::weakly_canonical(path, none)
                                             : std::filesystem::path(path);
    const std::filesystem::file_status status = std::filesystem::status(target, none);
    if (std::filesystem::exists(status) && !std::filesystem::is_regular_file(status)) {
        writeInPlace(path, text, fault);
        return;
    }
    std::string beside = target.string() + ".XXXXXX";
    const int descriptor = ::mkostemp(beside.data(), O_CLOEXEC);
    if (descriptor < 0) {
        fault.raise(errno);
    }
    struct stat former {};
    if (::stat(target.c_str(), &former) == 0 && ::fchown(descriptor, former.st_uid, former.st_gid) != 0) {
        // Only a privileged user can give files away; the text is the user's own.
        [[maybe_unused]] const int ignored = ::fchown(descriptor, static_cast<uid_t>(-1), former.st_gid);
    }
    int error = ::fchmod(descriptor, permissions(target)) == 0 ? 0 : errno;
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
