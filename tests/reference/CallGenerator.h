#pragma once

#include "Call.h"
#include "RandomSource.h"

namespace reference {

[[nodiscard]] Call makeCall(RandomSource& pick);

} // namespace reference
