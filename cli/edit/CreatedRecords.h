#pragma once

#include "edit/Create.h"
#include "model/Records.h"

#include <string>
#include <string_view>
#include <vector>

namespace edit {

/// The record of a device's packages; empty if none are given.
[[nodiscard]] std::string packagesRecord(const Creation& creation);

/// The records of a new family's operations: each in all modes that have cells.
[[nodiscard]] std::vector<std::string> operationRecords(const Creation& creation);

/// The properties of a new family that answer in which modes an operation is offered.
[[nodiscard]] std::vector<std::string> modeRecords(const Creation& creation);

/// The records with another one in place of that of a name, or after the last one; as they are if it is empty.
[[nodiscard]] std::vector<std::string> textsWith(const catalogue::Records& records, std::string_view name,
                                                 std::string record);

} // namespace edit
