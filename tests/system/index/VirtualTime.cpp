#include "VirtualTime.h"

#include <cerrno>
#include <cstdarg>
#include <map>
#include <set>
#include <stdexcept>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

struct File {
    ino_t number;
    dev_t device;
    std::int64_t modified;
    std::int64_t changed;
};

constexpr std::int64_t START = 1'000'000 * virtualTime::TICK;
constexpr std::int64_t SLOWER = 7 * virtualTime::TICK; ///< how far the clock of the other device is behind
constexpr dev_t DEVICE = 1;
constexpr dev_t OTHER_DEVICE = 2;

struct World {
    std::int64_t time = START;
    std::int64_t setBack = 0; ///< how often the clocks were
    std::map<ino_t, File> files;
    std::set<ino_t> numbers; ///< in use
    int call = 0;
    virtualTime::Event event;
};

/// Never destroyed: files are written after main, too.
World& world() {
    static World& world = *new World;
    return world;
}

std::int64_t now(dev_t device) {
    const std::int64_t time = world().time - (device == OTHER_DEVICE ? SLOWER : 0);
    return time / virtualTime::TICK * virtualTime::TICK + world().setBack;
}

/// The lowest number that is free: a new file often has the number of one that is gone.
ino_t newNumber() {
    ino_t number = 1;
    while (!world().numbers.insert(number).second) {
        ++number;
    }
    return number;
}

File& fileOf(ino_t inode, dev_t device = DEVICE) {
    const auto found = world().files.find(inode);
    return found != world().files.end()
               ? found->second
               : world()
                     .files.emplace(inode, File{newNumber(), device, now(device), now(device)})
                     .first->second;
}

/// A file that is gone gives its number back.
void forget(ino_t inode) {
    if (const auto file = world().files.find(inode); file != world().files.end()) {
        world().numbers.erase(file->second.number);
        world().files.erase(file);
    }
}

bool fails() {
    World& here = world();
    if (here.call == 0 || --here.call != 0) {
        return false;
    }
    const int error = std::exchange(here.event, {})();
    if (error != 0) {
        errno = error;
    }
    return error != 0;
}

timespec toTimespec(std::int64_t nanoseconds) {
    return {nanoseconds / 1'000'000'000, nanoseconds % 1'000'000'000};
}

void disguise(struct stat64& status) {
    if (!S_ISREG(status.st_mode)) {
        return;
    }
    const File& file = fileOf(status.st_ino);
    status.st_ino = file.number;
    status.st_dev = file.device;
    status.st_mtim = toTimespec(file.modified);
    status.st_ctim = toTimespec(file.changed);
}

} // namespace

extern "C" {

// The names that the linker gives.
// NOLINTBEGIN(bugprone-reserved-identifier)

int __real_open64(const char* path, int flags, ...);
int __real_fstat64(int descriptor, struct stat64* status);
int __real_fstatat64(int directory, const char* path, struct stat64* status, int flags);
int __real_mkostemp(char* pattern, int flags);
ssize_t __real_write(int descriptor, const void* buffer, std::size_t size);
int __real_rename(const char* from, const char* to);
int __real_unlink(const char* path);

int __wrap_open64(const char* path, int flags, ...) {
    if (fails()) {
        return -1;
    }
    mode_t mode = 0;
    if ((flags & O_CREAT) != 0) {
        va_list arguments;
        va_start(arguments, flags);
        mode = va_arg(arguments, mode_t);
        va_end(arguments);
    }
    return __real_open64(path, flags, mode);
}

int __wrap_fstat64(int descriptor, struct stat64* status) {
    if (fails()) {
        return -1;
    }
    const int result = __real_fstat64(descriptor, status);
    disguise(*status);
    return result;
}

int __wrap_fstatat64(int directory, const char* path, struct stat64* status, int flags) {
    const int result = __real_fstatat64(directory, path, status, flags);
    if (result == 0) {
        disguise(*status);
    }
    return result;
}

int __wrap_mkostemp(char* pattern, int flags) {
    if (fails()) {
        return -1;
    }
    const int descriptor = __real_mkostemp(pattern, flags);
    struct stat64 status {};
    if (descriptor != -1 && __real_fstat64(descriptor, &status) == 0) {
        forget(status.st_ino);
        fileOf(status.st_ino);
    }
    return descriptor;
}

ssize_t __wrap_write(int descriptor, const void* buffer, std::size_t size) {
    return fails() ? -1 : __real_write(descriptor, buffer, size);
}

int __wrap_unlink(const char* path) {
    struct stat64 status {};
    if (__real_fstatat64(AT_FDCWD, path, &status, AT_SYMLINK_NOFOLLOW) == 0 && status.st_nlink == 1) {
        forget(status.st_ino);
    }
    return __real_unlink(path);
}

int __wrap_rename(const char* from, const char* to) {
    if (fails()) {
        return -1;
    }
    struct stat64 target {};
    const bool isReplaced = __real_fstatat64(AT_FDCWD, to, &target, AT_SYMLINK_NOFOLLOW) == 0 &&
                            S_ISREG(target.st_mode) && target.st_nlink == 1;
    const int result = __real_rename(from, to);
    if (result == 0) {
        if (isReplaced) {
            forget(target.st_ino);
        }
        virtualTime::touch(to);
    }
    return result;
}

// NOLINTEND(bugprone-reserved-identifier)

} // extern "C"

namespace virtualTime {

void reset() { world() = {}; }

void advance(std::int64_t nanoseconds) {
    world().time += nanoseconds;
    world().setBack += nanoseconds < 0 ? 1 : 0;
}

void write(const std::string& path, std::string_view text, bool onOtherDevice) {
    const bool isNew = ::access(path.c_str(), F_OK) != 0;
    const int descriptor = __real_open64(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    struct stat64 status {};
    if (descriptor == -1 || __real_fstat64(descriptor, &status) != 0 ||
        __real_write(descriptor, text.data(), text.size()) != static_cast<ssize_t>(text.size())) {
        throw std::runtime_error("can't write " + path);
    }
    ::close(descriptor);
    if (isNew) {
        forget(status.st_ino);
    }
    File& file = fileOf(status.st_ino, onOtherDevice ? OTHER_DEVICE : DEVICE);
    file.modified = file.changed = now(file.device);
}

void touch(const std::string& path) {
    struct stat64 status {};
    if (__real_fstatat64(AT_FDCWD, path.c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0 &&
        S_ISREG(status.st_mode)) {
        File& file = fileOf(status.st_ino);
        file.changed = now(file.device);
    }
}

void setModified(const std::string& path, std::int64_t nanoseconds) {
    struct stat64 status {};
    if (__real_fstatat64(AT_FDCWD, path.c_str(), &status, 0) == 0 && S_ISREG(status.st_mode)) {
        File& file = fileOf(status.st_ino);
        file.modified = nanoseconds;
        file.changed = now(file.device);
    }
}

std::int64_t modified(const std::string& path) {
    struct stat64 status {};
    return __real_fstatat64(AT_FDCWD, path.c_str(), &status, 0) == 0 && S_ISREG(status.st_mode)
               ? fileOf(status.st_ino).modified
               : 0;
}

void interrupt(int call, Event event) {
    world().call = call;
    world().event = std::move(event);
}

bool stopInterrupting() {
    world().call = 0;
    return std::exchange(world().event, {}) != nullptr;
}

} // namespace virtualTime
