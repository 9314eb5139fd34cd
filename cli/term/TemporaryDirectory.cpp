// Holds copies of databases while they are compared.
#include "term/TemporaryDirectory.h"

#include "term/ExitCode.h"

#include <fmt/format.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <system_error>

TemporaryDirectory::TemporaryDirectory()
    : m_path((std::filesystem::temp_directory_path() / "tarvik-XXXXXX").string()) {
    if (::mkdtemp(m_path.data()) == nullptr) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("cannot make the directory \"{}\": {}", m_path, std::strerror(errno)));
    }
}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(m_path, ignored);
}
