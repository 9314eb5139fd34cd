#pragma once

#include "lsp/View.h"

namespace lsp {

/// What is known of the text at a position, as a hover; null if nothing is.
[[nodiscard]] Json hoverOf(const View& view, const Position& position);

/// The sections of the view's file, with their keys.
[[nodiscard]] Json symbolsOf(const View& view);

/// The devices and families whose names contain a text, in any case.
[[nodiscard]] Json symbolsOf(const View& anyFile, const std::string& query);

} // namespace lsp
