#pragma once

#include "lsp/View.h"

namespace lsp {

/// What lint finds in the view's file, as diagnostics.
[[nodiscard]] Json diagnosticsOf(const View& view);

/// The fixes of the findings that touch a range of the view's file, as code actions.
[[nodiscard]] Json codeActionsOf(const View& view, const Range& range);

/// The edits that bring the view's file into its canonical form.
/// @throw RequestError (REQUEST_FAILED) if it has none
[[nodiscard]] Json formattingOf(const View& view, const std::string& text);

} // namespace lsp
