#pragma once

#include <cstddef>

namespace bench {

/// How often this program has asked for memory so far, its libraries included.
[[nodiscard]] std::size_t allocationsSoFar() noexcept;

} // namespace bench
