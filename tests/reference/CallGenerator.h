#pragma once

#include "reference/Call.h"
#include "reference/Picker.h"

namespace reference {

[[nodiscard]] Call makeCall(Picker& pick);

} // namespace reference
