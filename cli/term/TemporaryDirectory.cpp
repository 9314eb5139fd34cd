// Holds copies of databases while they are compared.
#include "term/TemporaryDirectory.h"

#include "term/ExitCode.h"
#include "term/TemporaryFiles.h"

#include "platform/Platform.h"

#include <filesystem>
#include <system_error>

TemporaryDirectory::TemporaryDirectory() {
    try {
        m_path = createTemporaryDirectory();
    } catch (const std::system_error& failure) {
        throw CommandError(ExitCode::FAULT, failure.what());
    }
}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(acd::toPath(m_path), ignored);
}
