#pragma once

#include "term/TemporaryDirectory.h"

#include <string>
#include <vector>

namespace diff {

/// The directories of a database as they were in a revision of their git repositories. Repositories, their indexes and
/// work trees stay as they are.
class Revision {
public:
    /// @param name of the revision: a commit, tag or branch, as git takes it
    /// @param directories the layers of the database; those outside of a repository are taken as they are, but one at
    ///                    least must be in one
    /// @throw CommandError (FAULT) if the revision is not known or does not have a directory
    Revision(const std::string& name, const std::vector<std::string>& directories);

    /// The directories with the files of the revision; they exist as long as this object.
    [[nodiscard]] const std::vector<std::string>& directories() const noexcept { return m_directories; }

private:
    TemporaryDirectory m_scratch;
    std::vector<std::string> m_directories;
};

} // namespace diff
