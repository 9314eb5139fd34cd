#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace fuzz {

/// What a fuzzer made up, read from its start.
class Input {
public:
    Input(const std::uint8_t* data, std::size_t size) : m_rest(reinterpret_cast<const char*>(data), size) {}

    /// The next byte; nothing at the end.
    [[nodiscard]] std::optional<std::uint8_t> byte() noexcept;

    /// The text up to the next `end`, which is skipped, or up to the end of all.
    [[nodiscard]] std::string_view upTo(std::string_view end) noexcept;

    [[nodiscard]] std::string_view rest() const noexcept { return m_rest; }

private:
    std::string_view m_rest;
};

/// Database files in one text, so that inputs can be read and written by hand: a line "@@NAME" starts another
/// file; what stands before the first is base.acd.
[[nodiscard]] std::map<std::string, std::string> filesIn(std::string_view text);

/// Tells what went wrong, and ends the process as a sanitizer would.
[[noreturn]] void fail(const std::string& what);

/// Ends the process unless both are the same.
void expectSame(const std::string& what, const std::string& expected, const std::string& actual);

} // namespace fuzz
