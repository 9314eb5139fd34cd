#pragma once

#include <string>
#include <string_view>

namespace report {

/// The text as a page can show it. A database may hold any byte: what is no UTF-8, and what is a control
/// character, shows as U+FFFD.
[[nodiscard]] std::string displayable(std::string_view text);

/// A displayable text as HTML, between tags or in a quoted attribute.
[[nodiscard]] std::string escaped(std::string_view text);

/// A displayable text as a JSON string that may stand in an HTML script element.
[[nodiscard]] std::string jsonString(std::string_view text);

/// A displayable text as the fragment of a link.
[[nodiscard]] std::string urlFragment(std::string_view text);

} // namespace report
