#pragma once

#include "database/FileReading.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string_view>
#include <vector>

namespace acd {

/// Names, stored one after the other in one block of memory.
class PackedStrings {
public:
    void clear() noexcept {
        m_bytes.clear();
        m_ends.clear();
    }
    void add(std::string_view name);

    /// Takes names that are packed already.
    /// @param ends as `ends()` gives them
    /// @return whether they fit together, no name being empty; otherwise nothing changes
    [[nodiscard]] bool assign(std::string_view bytes, std::vector<std::uint32_t> ends);

    /// Calls `action` for each name, in order.
    template <typename Action>
    void forEach(Action action) const {
        std::uint32_t begin = 0;
        for (const std::uint32_t end : m_ends) {
            action(std::string_view(m_bytes.data() + begin, end - begin));
            begin = end;
        }
    }

    /// Whether a name is among them, without regard to ASCII case.
    [[nodiscard]] bool containsIgnoreCase(std::string_view name) const noexcept;

    [[nodiscard]] const std::vector<char>& bytes() const noexcept { return m_bytes; }

    /// How many of the bytes belong to the names up to and with each.
    [[nodiscard]] const std::vector<std::uint32_t>& ends() const noexcept { return m_ends; }

private:
    std::vector<char> m_bytes;
    std::vector<std::uint32_t> m_ends;
};

/// Finds the names of the sections of many files, much faster than reading them line by line would.
class SectionScanner {
public:
    static constexpr std::size_t BUFFER_SIZE = std::size_t{256} << 10;

    /// @param bufferSize another size than the usual one, for tests
    explicit SectionScanner(std::size_t bufferSize = BUFFER_SIZE);

    /// The names that the well-formed headers of a file give, in order, repeated ones included.
    /// @param open opens the file; called a second time if the fast scan is not enough
    /// @return valid until the next call
    /// @throw ReadError
    [[nodiscard]] const PackedStrings& names(const std::function<std::unique_ptr<ByteSource>()>& open);

private:
    [[nodiscard]] bool scan(ByteSource& source);
    [[nodiscard]] bool scanLines(std::string_view lines, bool afterContinuation);
    void parse(ByteSource& source);

    std::size_t m_bufferSize;
    std::unique_ptr<char[]> m_buffer; ///< used again for each file: fresh memory is dear
    PackedStrings m_names;
};

} // namespace acd
