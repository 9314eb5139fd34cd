#pragma once

#include "Call.h"
#include "Picker.h"

namespace reference {

[[nodiscard]] Call makeCall(Picker& pick);

} // namespace reference
