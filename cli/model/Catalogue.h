#pragma once

#include "term/ExitCode.h"
#include "text/Json.h"

#include <AcdStore.h>

#include <map>
#include <string>
#include <string_view>
#include <vector>

/// What the manager does not offer: the names in the database, and the locations of their values.
namespace catalogue {

/// Where a text of the database begins.
struct Origin {
    std::string file;
    unsigned line;
    unsigned column;
    std::string layer{}; ///< the directory of the search path
};

/// "file:line:column".
[[nodiscard]] std::string asText(const Origin& origin);

/// With its layer, where there are several.
[[nodiscard]] Json asJson(const Origin& origin);

[[nodiscard]] Origin originOf(const AcdStore::SourceSpan& place);

/// A text of a lower layer that a text of an upper layer replaces.
struct Shadow {
    Origin origin;
    std::string text;
};

using Shadows = std::vector<Shadow>;

/// The whole values that a value replaces, the upper ones first.
[[nodiscard]] Shadows shadowsOf(const AcdStore::Value& value);
[[nodiscard]] Json asJson(const Shadows& shadows);

/// One entry of a list "name,...:name,...".
struct Entry {
    Origin origin;
    bool ofDevice; ///< false: it is among the family's own keys
    std::string text;
    Shadows shadows; ///< entries of this name in layers below, the upper ones first
};

/// The entries of a key by their names, the last of each name.
[[nodiscard]] std::map<std::string, Entry> entries(const std::string& database, const std::string& key);

/// The texts of a key that is a flat list.
[[nodiscard]] std::vector<std::string> list(const std::string& database, const std::string& key);

/// The families that have devices: all but "base" and "spi".
[[nodiscard]] std::vector<std::string> families();

/// An SPI flash, or a family of them.
struct Flash {
    std::string name;
    std::string family;
};

/// The SPI flashes in the order of their families, without the families themselves.
[[nodiscard]] std::vector<Flash> flashes();

/// All names that a question about a device can be asked for.
[[nodiscard]] std::vector<std::string> names();

/// The answer to a question about a name that the database does not hold.
[[nodiscard]] CommandError unknownDevice(const std::string& name);

} // namespace catalogue
