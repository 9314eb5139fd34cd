#pragma once

#include "Call.h"
#include "DatabaseGenerator.h"

#include <rapidcheck.h>

#include <cstddef>

namespace reference {

/// Random databases and `calls` random calls about them. A scenario shrinks by its calls, its files, their lines,
/// the records and fields of a line, and the numbers of a call.
[[nodiscard]] rc::Gen<Scenario> scenarios(Health health, std::size_t calls);

} // namespace reference
