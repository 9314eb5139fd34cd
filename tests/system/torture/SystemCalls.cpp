// The wrappers that the linker puts in front of the system calls; each makes the real one unless told otherwise.
#include "SystemCalls.h"

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <map>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

namespace {

struct Watch {
    bool active = false;
    long troubled = 0;
    SystemCalls::Trouble trouble;
    std::size_t readLimit = 0; ///< 0: none
    std::vector<SystemCalls::Call> calls;
    std::map<int, std::string> files;
    std::map<DIR*, std::string> directories;
};

/// Never destroyed: files are read and written behind the end of main, too.
Watch& watched() {
    static Watch& watch = *new Watch;
    return watch;
}

/// @return whether the call is to fail, with errno set
bool fails(SystemCalls::Kind kind, const std::string& path) {
    Watch& watch = watched();
    if (!watch.active) {
        return false;
    }
    watch.calls.push_back({kind, path});
    if (static_cast<long>(watch.calls.size()) != watch.troubled) {
        return false;
    }
    const int error = watch.trouble(watch.calls.back());
    if (error != 0) {
        errno = error;
    }
    return error != 0;
}

} // namespace

void SystemCalls::watch(long number, Trouble trouble) {
    watched() = {true, number, std::move(trouble), 0, {}, {}, {}};
}

void SystemCalls::limitRead(std::size_t size) { watched().readLimit = size; }

std::vector<SystemCalls::Call> SystemCalls::stop() {
    watched().active = false;
    return std::move(watched().calls);
}

extern "C" {

// The names that the linker gives.
// NOLINTBEGIN(bugprone-reserved-identifier)

int __real_open64(const char* path, int flags, ...);
int __real_fstat64(int descriptor, struct stat64* status);
ssize_t __real_read(int descriptor, void* buffer, std::size_t size);
DIR* __real_opendir(const char* path);
dirent64* __real_readdir64(DIR* directory);

int __wrap_open64(const char* path, int flags, ...) {
    if (fails(SystemCalls::Kind::OPEN, path)) {
        return -1;
    }
    mode_t mode = 0;
    if ((flags & O_CREAT) != 0) {
        va_list arguments;
        va_start(arguments, flags);
        mode = va_arg(arguments, mode_t);
        va_end(arguments);
    }
    const int descriptor = __real_open64(path, flags, mode);
    watched().files[descriptor] = path;
    return descriptor;
}

int __wrap_fstat64(int descriptor, struct stat64* status) {
    return fails(SystemCalls::Kind::STAT, watched().files[descriptor]) ? -1
                                                                       : __real_fstat64(descriptor, status);
}

ssize_t __wrap_read(int descriptor, void* buffer, std::size_t size) {
    if (fails(SystemCalls::Kind::READ, watched().files[descriptor])) {
        return -1;
    }
    const std::size_t limit = std::exchange(watched().readLimit, 0);
    return __real_read(descriptor, buffer, limit == 0 ? size : std::min(size, limit));
}

DIR* __wrap_opendir(const char* path) {
    if (fails(SystemCalls::Kind::LIST, path)) {
        return nullptr;
    }
    DIR* const directory = __real_opendir(path);
    watched().directories[directory] = path;
    return directory;
}

dirent64* __wrap_readdir64(DIR* directory) {
    return fails(SystemCalls::Kind::ENTRY, watched().directories[directory]) ? nullptr
                                                                             : __real_readdir64(directory);
}

// NOLINTEND(bugprone-reserved-identifier)

} // extern "C"
