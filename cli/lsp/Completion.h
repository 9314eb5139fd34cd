#pragma once

#include "lsp/View.h"

namespace lsp {

/// What may be written at a position: keys, words or names, as the schema says.
[[nodiscard]] Json completionOf(const View& view, const Position& position);

} // namespace lsp
