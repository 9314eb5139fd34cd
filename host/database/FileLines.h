#pragma once

#include "database/Catalogue.h"

#include <AcdLines.h>

#include <string>
#include <string_view>

/// Makes the lines of a file of a database, with what listing and reading it found.
class AcdFileLines {
public:
    /// @param readError why there is no text; empty when there is
    [[nodiscard]] static AcdLines make(const acd::Family& family, const acd::SourceFile& file,
                                       std::string_view text, std::string readError);
};
