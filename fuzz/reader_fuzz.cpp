// Holds the reader of database files against the plain reader of the tests: the same names must open the same
// databases and give the same items and records, and each byte must stand in the file where its origin says.
#include "Input.h"

#include "reference/Outcome.h"
#include "reference/ReferenceReader.h"
#include "support/TarvikTestPeer.h"

#include <AcdLines.h>
#include <AcdReader.h>
#include <AcdStore.h>
#include <PM_DEVKEY.h>

#include <algorithm>
#include <limits>
#include <set>

namespace {

using Files = std::map<std::string, std::string>;

/// More of either would only be slow.
constexpr std::size_t MOST_NAMES = 24;
constexpr std::size_t MOST_KEYS = 12;

void keep(std::set<std::string>& set, const std::string& text, std::size_t most) {
    if (set.size() < most) {
        set.insert(text);
    }
}

std::string stem(const std::string& file) { return file.substr(0, file.size() - 4); }

struct Asked {
    std::set<std::string> names;
    std::set<std::string> keys;
};

/// The names and keys that these files hold, and some that they don't.
Asked askedOf(const Files& files) {
    Asked asked{{"nobody", "spi", "base"}, {"NONE"}};
    const auto addName = [&](const std::string& name) {
        keep(asked.names, name, MOST_NAMES);
        keep(asked.names, reference::upper(name) + "_X", MOST_NAMES);
        keep(asked.names, reference::baseName(name), MOST_NAMES);
    };
    const auto addKeys = [&](const reference::Keys& keys) {
        for (const auto& [key, value] : keys) {
            keep(asked.keys, key, MOST_KEYS);
        }
    };
    for (const auto& [file, text] : files) {
        addName(file);
        addName(stem(file));
        const reference::ParsedFile parsed = reference::parse(text);
        addKeys(parsed.own);
        for (const reference::Section& section : parsed.sections) {
            addName(section.name);
            addKeys(section.keys);
        }
    }
    return asked;
}

std::vector<std::string> itemsOf(PM_DEVKEY& accessor, const std::string& key) {
    std::vector<std::string> items;
    while (items.size() <= static_cast<std::size_t>(std::numeric_limits<short>::max())) {
        const char* const item =
            accessor.getstringbykey(key.c_str(), ",", static_cast<short>(items.size()), nullptr, 0);
        if (item == nullptr) {
            break;
        }
        items.emplace_back(item);
    }
    return items;
}

std::vector<reference::Record> recordsOf(PM_DEVKEY& accessor, const std::string& key) {
    std::vector<reference::Record> records;
    for (short number = 0; number >= 0; ++number) {
        reference::Record record;
        for (short field = 0; field >= 0; ++field) {
            const char* const text = accessor.getstringbykey(key.c_str(), ":", number, ",", field);
            if (text == nullptr) {
                break;
            }
            record.emplace_back(text);
        }
        if (record.empty()) {
            break;
        }
        records.push_back(record);
    }
    return records;
}

/// The files taken apart once more, line by line.
using Lines = std::map<std::string, AcdLines, std::less<>>;

void expectOriginsHold(const Lines& lines, const std::string& name, const std::string& key) {
    const std::optional<AcdStore::Value> value = AcdStore::value(name.c_str(), key.c_str());
    for (std::size_t offset = 0; value && offset < value->text.size(); ++offset) {
        const AcdStore::SourceSpan place = value->at(offset);
        const std::string_view line = lines.find(place.file)->second.source(place.line);
        if (place.column == 0 || place.column > line.size() ||
            line[place.column - 1] != value->text[offset]) {
            fuzz::fail("byte " + std::to_string(offset) + " of " + name + " " + key +
                       " is not where it is said to be");
        }
    }
}

void expectSameAnswers(const Files& files, const Lines& lines) {
    const reference::Databases databases(files);
    const Asked asked = askedOf(files);
    for (const std::string& name : asked.names) {
        const reference::Opened expected = databases.open(name);
        const AcdReader actual(name.c_str());
        fuzz::expectSame("the module of " + name, expected.module.value_or("base"), actual.getPM());
        for (const std::string& key : asked.keys) {
            const std::string what = name + " " + key;
            fuzz::expectSame("the items of " + what, reference::show(expected.accessor.items(key)),
                             reference::show(itemsOf(*actual.getDevkey(), key)));
            fuzz::expectSame("the records of " + what, reference::show(expected.accessor.records(key)),
                             reference::show(recordsOf(*actual.getDevkey(), key)));
            expectOriginsHold(lines, name, key);
        }
    }
}

void expectSameFaults(const Files& files, const Lines& lines) {
    for (const auto& [file, text] : files) {
        const std::vector<AcdLines::Line>& all = lines.find(file)->second.lines();
        const auto faults = std::count_if(all.begin(), all.end(), [](const AcdLines::Line& line) {
            return line.kind == AcdLines::Kind::INVALID;
        });
        fuzz::expectSame("the faults of " + file, std::to_string(reference::parse(text).faults),
                         std::to_string(faults));
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Files files = fuzz::filesIn(fuzz::Input(data, size).rest());
    TarvikTestPeer::reset();
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) {});
    AcdStore::setMemoryFiles(files);
    Lines lines;
    for (const auto& [file, text] : files) {
        lines.try_emplace(file, text);
    }
    expectSameAnswers(files, lines);
    expectSameFaults(files, lines);
    return 0;
}
