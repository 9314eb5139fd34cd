#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace acd {

/// Where databases are looked for.
struct SearchPath {
    std::vector<std::string> directories; ///< the top one first

    /// Where an installed database was looked for in vain; empty when there was no need to.
    std::vector<std::string> tried;
};

/// The search path of a process that does not set one: the environment's, else the installed database.
[[nodiscard]] SearchPath defaultSearchPath();

/// The parts of a list of directories separated by `:`, on Windows by `;`, without the empty ones.
[[nodiscard]] std::vector<std::string> splitDirectories(std::string_view list);

/// The search path of a library that is loaded from `library`: the first database directory that is
/// installed beside it.
[[nodiscard]] SearchPath installedSearchPath(const std::string& library);

} // namespace acd
