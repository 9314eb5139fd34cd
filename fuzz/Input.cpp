// How the bytes of a fuzzer turn into what the targets work on, and how a target says that something is wrong.
#include "Input.h"

#include <cstdlib>
#include <iostream>

namespace fuzz {

namespace {

constexpr std::string_view FILE_START = "@@";
constexpr std::string_view ENDING = ".acd";

/// Any text as the name of a database file.
std::string fileName(std::string_view text) {
    std::string name;
    for (const char byte : text) {
        if (byte != '\0' && byte != '\r') {
            name += byte;
        }
    }
    if (name.empty()) {
        name = "base";
    }
    return name.ends_with(ENDING) && name.size() > ENDING.size() ? name : name + std::string(ENDING);
}

} // namespace

std::optional<std::uint8_t> Input::byte() noexcept {
    if (m_rest.empty()) {
        return std::nullopt;
    }
    const auto byte = static_cast<std::uint8_t>(m_rest.front());
    m_rest.remove_prefix(1);
    return byte;
}

std::string_view Input::upTo(std::string_view end) noexcept {
    const std::size_t found = m_rest.find(end);
    const std::string_view text = m_rest.substr(0, found);
    m_rest.remove_prefix(found == std::string_view::npos ? m_rest.size() : found + end.size());
    return text;
}

std::map<std::string, std::string> filesIn(std::string_view text) {
    std::map<std::string, std::string> files;
    std::string* file = &files["base.acd"];
    while (!text.empty()) {
        const std::size_t end = text.find('\n');
        const std::string_view line = text.substr(0, end == std::string_view::npos ? end : end + 1);
        text.remove_prefix(line.size());
        if (line.starts_with(FILE_START)) {
            file = &files[fileName(line.substr(FILE_START.size(), line.find('\n') - FILE_START.size()))];
        } else {
            *file += line;
        }
    }
    return files;
}

void fail(const std::string& what) {
    std::cerr << what << '\n';
    std::abort();
}

void expectSame(const std::string& what, const std::string& expected, const std::string& actual) {
    if (expected != actual) {
        fail(what + "\n  expected: " + expected + "\n  actual:   " + actual);
    }
}

} // namespace fuzz
