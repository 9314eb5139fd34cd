#pragma once

#include "database/FileReading.h"
#include "database/PackedStrings.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string_view>

namespace acd {

/// Finds the names of the sections of many files, much faster than reading them line by line would.
class SectionScanner {
public:
    static constexpr std::size_t BUFFER_SIZE = std::size_t{256} << 10;

    /// @param bufferSize another size than the usual one, for tests
    explicit SectionScanner(std::size_t bufferSize = BUFFER_SIZE);

    /// The names that the well-formed headers of a file give, in order, repeated ones included.
    /// @param open opens the file; called a second time if the fast scan is not enough
    /// @throw ReadError
    [[nodiscard]] PackedStrings names(const std::function<std::unique_ptr<ByteSource>()>& open);

private:
    [[nodiscard]] bool scan(ByteSource& source);
    [[nodiscard]] bool scanLines(std::string_view lines, bool afterContinuation);
    void parse(ByteSource& source);

    std::size_t m_bufferSize;
    std::unique_ptr<char[]> m_buffer; ///< used again for each file: fresh memory is dear
    StringPacker m_names;             ///< used again, too
};

} // namespace acd
