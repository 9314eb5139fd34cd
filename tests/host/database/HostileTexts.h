#pragma once

#include <random>
#include <string>
#include <string_view>

/// Texts that are all edge: the tokens of the grammar and what can go wrong with them, in random order.
class HostileTexts {
public:
    explicit HostileTexts(unsigned seed) : m_random(seed) {}

    [[nodiscard]] std::string next(unsigned longest = 40) {
        using namespace std::string_view_literals;
        static constexpr std::string_view TOKENS[] = {
            "\n"sv,        "\n"sv,     "\n"sv,      "\\\n"sv,      "\\\n"sv,  "\r\n"sv,
            "\\\r\n"sv,    "\r"sv,     "\\"sv,      " "sv,         "\t"sv,    "["sv,
            "]"sv,         "[A]"sv,    "\n[B]\n"sv, "\n [a]"sv,    "[C c]"sv, "[]"sv,
            "#"sv,         "\n#"sv,    "="sv,       "+="sv,        "+"sv,     "\nA=1\n"sv,
            "\nB += 2"sv,  "A = "sv,   "b"sv,       "A"sv,         "\0"sv,    "\xEF\xBB\xBF"sv,
            "# [D]\\\n"sv, "\n\\\n"sv, "[E]\\\n"sv, "x = [F]\n"sv, "\xFF"sv,
        };
        std::string text = pick(8) == 0 ? "\xEF\xBB\xBF" : "";
        for (unsigned count = pick(longest); count != 0; --count) {
            text += TOKENS[pick(std::size(TOKENS))];
        }
        return text;
    }

    /// Bytes without any sense.
    [[nodiscard]] std::string noise(std::size_t size) {
        std::string text(size, '\0');
        for (char& byte : text) {
            byte = static_cast<char>(pick(256));
        }
        return text;
    }

    /// A number from 0 to `bound` - 1, the same on every machine.
    [[nodiscard]] unsigned pick(std::size_t bound) { return static_cast<unsigned>(m_random() % bound); }

private:
    std::mt19937 m_random;
};
