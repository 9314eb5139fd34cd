#pragma once

#include <string>
#include <string_view>

/// A path as a URI: with the scheme "file" if it is absolute.
[[nodiscard]] std::string asUri(std::string_view path);

/// The path that a URI of the scheme "file" names, in normal form; empty for any other URI.
[[nodiscard]] std::string pathOf(std::string_view uri);
