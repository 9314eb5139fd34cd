#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <stdexcept>
#include <string>
#include <system_error>

/// A database directory that lives as long as this object.
class DatabaseDirectory {
public:
    using Files = std::map<std::string, std::string>; ///< name to text

    explicit DatabaseDirectory(const Files& files = {}) {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "tarvik-tool-XXXXXX").generic_string();
        if (::mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("can't make a directory for a test database");
        }
        m_path = pattern;
        for (const auto& [name, text] : files) {
            std::ofstream(m_path / name, std::ios::binary) << text;
        }
    }
    ~DatabaseDirectory() {
        std::error_code error; // as on Windows, if a process works in it
        std::filesystem::remove_all(m_path, error);
    }
    DatabaseDirectory(const DatabaseDirectory&) = delete;
    DatabaseDirectory& operator=(const DatabaseDirectory&) = delete;

    [[nodiscard]] std::string path() const { return m_path.generic_string(); }
    [[nodiscard]] std::string path(const std::string& name) const { return (m_path / name).generic_string(); }

private:
    std::filesystem::path m_path;
};
