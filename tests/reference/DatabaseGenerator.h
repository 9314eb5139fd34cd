#pragma once

#include "Call.h"
#include "RandomSource.h"

namespace reference {

/// How random databases look.
enum class Health {
    SOUND,   ///< as a careful author writes them
    DAMAGED, ///< unknown words, missing fields, malformed lines, missing files
};

[[nodiscard]] Files makeDatabases(RandomSource& pick, Health health);

} // namespace reference
