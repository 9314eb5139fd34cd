#include "ReferenceParser.h"

#include <algorithm>

// The plain reader of database files.

namespace {

using Bytes = ReferenceParser::Bytes;

bool isBlank(const ReferenceParser::Byte& byte) { return byte.value == ' ' || byte.value == '\t'; }

Bytes trimmedLeft(Bytes bytes) {
    while (!bytes.empty() && isBlank(bytes.front())) {
        bytes.erase(bytes.begin());
    }
    return bytes;
}

Bytes trimmedRight(Bytes bytes) {
    while (!bytes.empty() && isBlank(bytes.back())) {
        bytes.pop_back();
    }
    return bytes;
}

std::string textOf(const Bytes& bytes) {
    std::string text;
    for (const auto& byte : bytes) {
        text += byte.value;
    }
    return text;
}

std::string folded(std::string text) {
    for (char& byte : text) {
        if (byte >= 'A' && byte <= 'Z') {
            byte = static_cast<char>(byte + 32);
        }
    }
    return text;
}

bool holdsBlank(const std::string& text) { return text.find_first_of(" \t") != text.npos; }

} // namespace

std::vector<Bytes> ReferenceParser::physicalLines(std::string_view text) {
    if (text.substr(0, 3) == "\xEF\xBB\xBF") {
        text.remove_prefix(3);
    }
    std::vector<Bytes> lines;
    Bytes line;
    unsigned number = 1;
    for (const char byte : text) {
        if (byte != '\n') {
            line.push_back({byte, number, static_cast<unsigned>(line.size() + 1)});
            continue;
        }
        if (!line.empty() && line.back().value == '\r') {
            line.pop_back();
        }
        lines.push_back(line);
        line.clear();
        ++number;
    }
    if (!text.empty() && text.back() != '\n') {
        lines.push_back(line);
    }
    return lines;
}

void ReferenceParser::add(std::string_view text) {
    m_open = 0;
    const std::vector<Bytes> lines = physicalLines(text);
    for (std::size_t index = 0; index < lines.size(); ++index) {
        Bytes line = trimmedLeft(lines[index]);
        if (line.empty() || line[0].value == '#') {
            continue;
        }
        const unsigned start = line[0].line;
        const bool isHeader = line[0].value == '[';
        bool isWhole = true;
        while (isWhole && !lines[index].empty() && lines[index].back().value == '\\') {
            isWhole = index + 1 < lines.size();
            if (isWhole) {
                line.pop_back();
                line = trimmedRight(line);
                const Bytes more = trimmedLeft(lines[++index]);
                line.insert(line.end(), more.begin(), more.end());
            }
        }
        line = trimmedRight(line);
        const bool isGood = isWhole && textOf(line).find('\0') == std::string::npos &&
                            (isHeader ? addHeader(textOf(line)) : addAssignment(line));
        if (!isGood) {
            faultLines.push_back(start);
            m_open = isHeader ? -1 : m_open;
        }
    }
}

bool ReferenceParser::addHeader(const std::string& text) {
    const std::string name = text.substr(1, text.find(']') - 1);
    if (name.empty() || holdsBlank(name) || text != '[' + name + ']') {
        return false;
    }
    for (m_open = 1; m_open < static_cast<int>(sections.size()); ++m_open) {
        if (folded(sections[static_cast<std::size_t>(m_open)].name) == folded(name)) {
            return true;
        }
    }
    sections.push_back({name, {}});
    return true;
}

bool ReferenceParser::addAssignment(const Bytes& line) {
    const std::string text = textOf(line);
    const std::size_t equals = text.find('=');
    if (equals == text.npos) {
        return false;
    }
    const bool appends = equals > 0 && text[equals - 1] == '+';
    const auto keyEnd = static_cast<std::ptrdiff_t>(appends ? equals - 1 : equals);
    const std::string key = textOf(trimmedRight(Bytes(line.begin(), line.begin() + keyEnd)));
    if (key.empty() || holdsBlank(key)) {
        return false;
    }
    if (m_open == -1) {
        return true;
    }
    const Bytes value =
        trimmedLeft(Bytes(line.begin() + static_cast<std::ptrdiff_t>(equals) + 1, line.end()));
    auto& entries = sections[static_cast<std::size_t>(m_open)].entries;
    auto entry = std::find_if(entries.begin(), entries.end(), [&](const Entry& e) { return e.key == key; });
    if (entry == entries.end()) {
        entry = entries.insert(entries.end(), {key, {}});
    }
    if (!appends) {
        entry->value.clear();
    }
    entry->value.insert(entry->value.end(), value.begin(), value.end());
    return true;
}
