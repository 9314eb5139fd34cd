#pragma once

#include "edit/SourceFile.h"
#include "lint/Model.h"

#include <map>
#include <set>
#include <string>

namespace edit {

/// Keys by family.
using KeysOfFamilies = std::map<std::string, std::set<std::string>>;

/// The keys whose values have findings. The order of what is wrong may be seen.
[[nodiscard]] KeysOfFamilies keysWithFindings(const lint::Model& model);

/// The file with everything sorted whose order cannot be seen: sections, the names of lists, the records and outputs of
/// tables, IDCODEs. Comments stay with their sections; keys, properties, and what is not valid keep their order.
/// @param skipped keys whose values keep their order
[[nodiscard]] std::string sorted(const SourceFile& file, const std::set<std::string>& skipped);

} // namespace edit
