#pragma once

#include <string>
#include <unordered_set>

namespace why {

/// The names that a question can't be asked about in one go with others: what the manager learns from one question
/// could change its answer to the next.
class Oddities {
public:
    Oddities();

    /// A name that others resolve to, or that resolves like others.
    [[nodiscard]] bool isEntangled(const std::string& name) const;

private:
    /// Names of files, and of devices that stand in files without a family, in lower case.
    std::unordered_set<std::string> m_names;
};

/// Does a record of PROGRAM_OPTION name an option that the manager can't read? It raises then, but only when it
/// reads the record first.
/// @param name a family or a device
/// @param sectionOnly whether only the device's own section counts
[[nodiscard]] bool hasUnknownOption(const std::string& name, bool sectionOnly);

} // namespace why
