#pragma once

#include "diff/Snapshot.h"

#include <string>
#include <string_view>

namespace diff {

/// Facts as bytes, to hand them from one process to another: names and values may hold any byte.
[[nodiscard]] std::string packed(const Facts& facts);
[[nodiscard]] Facts unpackedFacts(std::string_view bytes);

[[nodiscard]] std::string packed(const Answers& answers);
[[nodiscard]] Answers unpackedAnswers(std::string_view bytes);

} // namespace diff
