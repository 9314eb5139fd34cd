#pragma once

#include "reference/Call.h"
#include "reference/RandomSource.h"

#include <vector>

/// Writes a database in another way that says the same: other layers, lines, orders and line ends.
/// @param files a database without malformed lines
/// @return the files of each layer, the top one first
[[nodiscard]] std::vector<reference::Files> rewritten(reference::RandomSource& pick,
                                                      const reference::Files& files);
