// Temporary files on POSIX systems.
#include "term/TemporaryFiles.h"

#include <fmt/format.h>

#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <system_error>
#include <unistd.h>

std::string createTemporaryFile(const std::string& directory, const std::string& beginning) {
    std::string path = fmt::format("{}/{}XXXXXX", directory, beginning);
    const int descriptor = ::mkostemp(path.data(), O_CLOEXEC);
    if (descriptor == -1) {
        throw std::system_error(errno, std::generic_category(), path);
    }
    ::close(descriptor);
    return path;
}

std::string createTemporaryDirectory() {
    std::string path = (std::filesystem::temp_directory_path() / "tarvik-XXXXXX").string();
    if (::mkdtemp(path.data()) == nullptr) {
        throw std::system_error(errno, std::generic_category(),
                                fmt::format("cannot make the directory \"{}\"", path));
    }
    return path;
}
