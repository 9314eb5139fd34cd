#pragma once

#include <string>
#include <unordered_set>

/// The names for which a manager's answers depend on what it was asked before.
class OrderDependentNames {
public:
    OrderDependentNames();

    /// Is it a name that others resolve to, or that resolves as another one does?
    [[nodiscard]] bool contains(const std::string& name) const;

private:
    /// In lower case: the names of files, and of devices with a section in base.acd or spi.acd.
    std::unordered_set<std::string> m_names;
};

/// Does a record of PROGRAM_OPTION name an unknown option? The manager raises when it reads that record, which it
/// does only once.
/// @param name a family or a device
[[nodiscard]] bool hasUnknownOption(const std::string& name);

/// Does the device's section have a PROGRAM_OPTION, in place of its family's?
[[nodiscard]] bool hasOwnOptions(const std::string& device);
