// Names and origins from the host layer's database, for lists, suggestions, and the locations of values.
#include "model/Catalogue.h"

#include "model/RecordSplitter.h"
#include "model/Schema.h"
#include "text/Suggest.h"

#include <TarvikException.h>

#include <fmt/format.h>

#include <iterator>
#include <utility>

namespace catalogue {

namespace {

/// The last entry of each name.
std::map<std::string, Entry> lastEntries(const AcdStore::Value& value) {
    std::map<std::string, Entry> found;
    splitter::forEachItem(value.text, splitter::RECORDS, [&](std::string_view text, std::size_t offset) {
        Entry entry{originOf(value.at(offset)), value.fromSection, std::string(text), {}};
        const auto [known, isNew] = found.try_emplace(std::string(text.substr(0, text.find(','))));
        if (!isNew) {
            Entry& former = known->second;
            entry.shadows = std::move(former.shadows);
            // An entry that was appended on top.
            if (former.origin.layer != entry.origin.layer) {
                entry.shadows.insert(entry.shadows.begin(), {former.origin, former.text});
            }
        }
        known->second = std::move(entry);
    });
    return found;
}

} // namespace

std::string asText(const Origin& origin) {
    return fmt::format("{}:{}:{}", origin.file, origin.line, origin.column);
}

Json asJson(const Origin& origin) {
    Json object{{"file", origin.file}, {"line", origin.line}, {"column", origin.column}};
    if (AcdStore::searchPath().size() > 1) {
        object["layer"] = origin.layer;
    }
    return object;
}

Origin originOf(const AcdStore::SourceSpan& place) {
    return {std::string(place.file), place.line, place.column, std::string(place.layer)};
}

Shadows shadowsOf(const AcdStore::Value& value) {
    Shadows shadows;
    for (const AcdStore::Value& replaced : value.replaced) {
        shadows.push_back({originOf(replaced.spans.front()), std::string(replaced.text)});
    }
    return shadows;
}

Json asJson(const Shadows& shadows) {
    Json list = Json::array();
    for (const Shadow& shadow : shadows) {
        Json object = asJson(shadow.origin);
        object["text"] = shadow.text;
        list.push_back(std::move(object));
    }
    return list;
}

std::map<std::string, Entry> entries(const std::string& database, const std::string& key) {
    const std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str());
    if (!value) {
        return {};
    }
    std::map<std::string, Entry> found = lastEntries(*value);
    for (const AcdStore::Value& replaced : value->replaced) {
        for (auto& [name, below] : lastEntries(replaced)) {
            if (const auto entry = found.find(name); entry != found.end()) {
                Shadows& shadows = entry->second.shadows;
                shadows.push_back({below.origin, std::move(below.text)});
                std::move(below.shadows.begin(), below.shadows.end(), std::back_inserter(shadows));
            }
        }
    }
    return found;
}

std::vector<std::string> list(const std::string& database, const std::string& key) {
    std::vector<std::string> texts;
    if (const std::optional<AcdStore::Value> value = AcdStore::value(database.c_str(), key.c_str())) {
        splitter::forEachItem(value->text, splitter::FIELDS,
                              [&](std::string_view text, std::size_t) { texts.emplace_back(text); });
    }
    return texts;
}

std::vector<std::string> families() {
    std::vector<std::string> own;
    for (std::string& family : AcdStore::families()) {
        if (schema::fileOf(family) == schema::File::FAMILY) {
            own.push_back(std::move(family));
        }
    }
    return own;
}

std::vector<Flash> flashes() {
    std::vector<Flash> all;
    for (const std::string& family : list(schema::SPI, schema::DEVICE_FAMILY)) {
        for (std::string& name : list(schema::SPI, schema::devicesKey(family))) {
            all.push_back({std::move(name), family});
        }
    }
    return all;
}

std::vector<std::string> names() {
    std::vector<std::string> all;
    for (const std::string& family : families()) {
        all.push_back(family);
        try {
            for (std::string& device : AcdStore::devices(family)) {
                all.push_back(std::move(device));
            }
        } catch (const DataNotFoundException&) {
            // A family that can't be read has no names to offer; the question itself was about another name.
        }
    }
    try {
        for (Flash& flash : flashes()) {
            all.push_back(std::move(flash.name));
        }
    } catch (const DataNotFoundException&) {
        // Likewise.
    }
    return all;
}

CommandError unknownDevice(const std::string& name) {
    const std::vector<std::string> known = names();
    const std::string base = name.substr(0, name.find('_'));
    if (std::ranges::find(known, name) != known.end()) {
        const std::string reason =
            base == name
                ? "the manager looks for flashes in upper case"
                : fmt::format("\"_\" begins a package, so the manager looks for the device \"{}\"", base);
        return {ExitCode::NO, fmt::format("the database has \"{}\", but {}", name, reason)};
    }
    const std::string suggestion = didYouMean(name, known);
    return {ExitCode::NO, fmt::format("the database has no device \"{}\"{}", name,
                                      suggestion.empty() ? didYouMean(base, known) : suggestion)};
}

} // namespace catalogue
