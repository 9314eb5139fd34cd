// The reference's own reader of database files: as plain as can be, and apart from the host layer, so that a
// fault of one can't hide in the other.
#include "ReferenceReader.h"

#include <algorithm>
#include <set>

namespace reference {

namespace {

const std::string BLANKS = " \t";
const std::string EXTENSION = ".acd";

std::string trimLeft(const std::string& text) {
    const auto first = text.find_first_not_of(BLANKS);
    return first == std::string::npos ? "" : text.substr(first);
}

std::string trimRight(const std::string& text) { return text.substr(0, text.find_last_not_of(BLANKS) + 1); }

std::string trim(const std::string& text) { return trimRight(trimLeft(text)); }

std::vector<std::string> physicalLines(std::string text) {
    if (text.starts_with("\xEF\xBB\xBF")) {
        text = text.substr(3);
    }
    std::vector<std::string> lines = split(text, '\n');
    // What stands behind the last line end has none of its own: a CR there is text.
    const std::string rest = lines.back();
    lines.pop_back();
    for (std::string& line : lines) {
        if (line.ends_with('\r')) {
            line.pop_back();
        }
    }
    if (!rest.empty()) {
        lines.push_back(rest);
    }
    return lines;
}

bool isNothing(const std::string& line) { return trim(line).empty() || trim(line).front() == '#'; }

/// A line with those that it goes on in; nothing when the file ends before the line does.
std::optional<std::string> joinedLine(const std::vector<std::string>& lines, std::size_t& next) {
    std::string joined = lines[next++];
    bool goesOn = joined.ends_with('\\');
    while (goesOn) {
        joined = trimRight(joined.substr(0, joined.size() - 1));
        if (next == lines.size()) {
            return std::nullopt;
        }
        const std::string& more = lines[next++];
        joined += trimLeft(more);
        goesOn = more.ends_with('\\');
    }
    return joined;
}

/// The name in a header; nothing when the header is malformed.
std::optional<std::string> headerName(const std::string& line) {
    const std::string header = trim(line);
    if (header.size() < 3 || header.back() != ']' || header.find('\0') != std::string::npos) {
        return std::nullopt;
    }
    const std::string name = header.substr(1, header.size() - 2);
    if (name.find_first_of("] \t") != std::string::npos) {
        return std::nullopt;
    }
    return name;
}

/// The section of that name: the one that is there already, or a new one.
std::size_t sectionNumber(std::vector<Section>& sections, const std::string& name) {
    for (std::size_t number = 0; number < sections.size(); ++number) {
        if (lower(sections[number].name) == lower(name)) {
            return number;
        }
    }
    sections.push_back({name, {}});
    return sections.size() - 1;
}

struct Assignment {
    std::string key;
    std::string value;
    bool append;
};

std::optional<Assignment> assignment(const std::string& line) {
    const auto equals = line.find('=');
    if (equals == std::string::npos || line.find('\0') != std::string::npos) {
        return std::nullopt;
    }
    const bool append = equals > 0 && line[equals - 1] == '+';
    const std::string key = trim(line.substr(0, append ? equals - 1 : equals));
    if (key.empty() || key.find_first_of(BLANKS) != std::string::npos) {
        return std::nullopt;
    }
    return Assignment{key, trim(line.substr(equals + 1)), append};
}

} // namespace

std::string lower(std::string text) {
    for (char& byte : text) {
        if (byte >= 'A' && byte <= 'Z') {
            byte = static_cast<char>(byte + 32);
        }
    }
    return text;
}

std::string upper(std::string text) {
    for (char& byte : text) {
        if (byte >= 'a' && byte <= 'z') {
            byte = static_cast<char>(byte - 32);
        }
    }
    return text;
}

std::string baseName(const std::string& text) { return text.substr(0, text.find('_')); }

std::vector<std::string> split(const std::string& text, char separator) {
    std::vector<std::string> pieces{""};
    for (const char byte : text) {
        if (byte == separator) {
            pieces.emplace_back();
        } else {
            pieces.back() += byte;
        }
    }
    return pieces;
}

ParsedFile parse(const std::string& text) {
    ParsedFile file;
    const std::vector<std::string> lines = physicalLines(text);
    bool inSection = false;
    bool dropping = false;
    std::size_t section = 0;
    for (std::size_t next = 0; next < lines.size();) {
        if (isNothing(lines[next])) {
            ++next;
            continue;
        }
        const bool header = trim(lines[next]).front() == '[';
        const std::optional<std::string> line = joinedLine(lines, next);
        if (header) {
            const auto name = line ? headerName(*line) : std::nullopt;
            inSection = true;
            dropping = !name;
            if (name) {
                section = sectionNumber(file.sections, *name);
            } else {
                ++file.faults;
            }
            continue;
        }
        const auto assigned = line ? assignment(*line) : std::nullopt;
        if (!assigned) {
            ++file.faults;
        } else if (!dropping) {
            Keys& keys = inSection ? file.sections[section].keys : file.own;
            std::string& value = keys[assigned->key];
            value = assigned->append ? value + assigned->value : assigned->value;
        }
    }
    return file;
}

namespace {

constexpr std::size_t MOST_PIECES = 32768;

/// The pieces that an index reaches.
std::vector<std::string> reachable(std::vector<std::string> pieces) {
    pieces.resize(std::min(pieces.size(), MOST_PIECES));
    return pieces;
}

} // namespace

std::optional<std::string> fieldOf(const Record& record, long long number) {
    if (number >= static_cast<long long>(record.size())) {
        return std::nullopt;
    }
    return record[static_cast<std::size_t>(number)];
}

std::vector<std::string> Accessor::pieces(const std::string& key, char separator) const {
    for (const Keys* keys : {m_section, m_family}) {
        if (keys != nullptr && keys->contains(key)) {
            const std::string& value = keys->at(key);
            return value.empty() ? std::vector<std::string>{} : reachable(split(value, separator));
        }
    }
    return {};
}

std::vector<std::string> Accessor::items(const std::string& key) const { return pieces(key, ','); }

std::vector<Record> Accessor::records(const std::string& key) const {
    std::vector<Record> records;
    for (const std::string& piece : pieces(key, ':')) {
        records.push_back(reachable(split(piece, ',')));
    }
    return records;
}

Databases::Databases(const std::map<std::string, std::string>& files) {
    std::set<std::string> taken;
    for (const auto& [name, text] : files) {
        // Of two files whose names differ in case alone only the first one counts.
        if (taken.insert(lower(name)).second) {
            m_files[name] = parse(text);
        }
    }
}

Databases::Parsed::const_iterator Databases::find(const std::string& file) const {
    return std::find_if(m_files.begin(), m_files.end(),
                        [&](const auto& entry) { return lower(entry.first) == lower(file); });
}

Accessor Databases::file(const std::string& name) const {
    const auto found = find(name);
    return found == m_files.end() ? Accessor() : Accessor(&found->second.own, nullptr);
}

Opened Databases::openWhole(const std::string& name) const {
    for (const std::string& fileName : {name, name + EXTENSION}) {
        if (const auto found = find(fileName); found != m_files.end()) {
            return {found->first.substr(0, found->first.size() - EXTENSION.size()),
                    Accessor(&found->second.own, nullptr)};
        }
    }
    for (const auto& [file, content] : m_files) {
        for (const Section& section : content.sections) {
            if (lower(section.name) == lower(name)) {
                return {file.substr(0, file.size() - EXTENSION.size()),
                        Accessor(&content.own, &section.keys)};
            }
        }
    }
    return {};
}

Opened Databases::open(const std::string& name) const {
    const Opened whole = openWhole(name);
    return whole.module ? whole : openWhole(baseName(name));
}

std::size_t Databases::faults() const {
    std::size_t count = 0;
    for (const auto& [name, content] : m_files) {
        count += content.faults;
    }
    return count;
}

} // namespace reference
