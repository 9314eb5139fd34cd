#pragma once

#include <cstddef>
#include <functional>

/// How often the action asks for memory.
[[nodiscard]] std::size_t countAllocations(const std::function<void()>& action);

/// Runs the action while the request for memory with this number, counted from 1, fails.
/// @return whether the action came to its end
[[nodiscard]] bool runFailing(std::size_t failing, const std::function<void()>& action);
