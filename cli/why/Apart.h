#pragma once

#include <functional>
#include <string>

namespace why {

/// Runs `work` in a copy of this process, so that nothing of what it does to the manager stays.
/// @return what it returned
/// @throw Failure (FAULT) when there can't be such a copy
[[nodiscard]] std::string apart(const std::function<std::string()>& work);

} // namespace why
