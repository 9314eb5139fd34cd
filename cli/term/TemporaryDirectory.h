#pragma once

#include <string>

/// An empty directory that is removed with all that is in it at the end of this object.
class TemporaryDirectory {
public:
    /// @throw CommandError (FAULT) if there can be none
    TemporaryDirectory();
    ~TemporaryDirectory();
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    [[nodiscard]] const std::string& path() const noexcept { return m_path; }

private:
    std::string m_path;
};
