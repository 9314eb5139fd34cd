// Lists properties: the names come from the database, the values from the manager.
#include "query/Properties.h"

#include "model/Schema.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <map>

namespace {

using Entries = std::map<std::string, catalogue::Entry>;

/// What names and places leave of a line for the values.
std::size_t valueWidth(const Properties& properties, std::size_t lineWidth, std::size_t indent) {
    // Two blanks behind each column but the last, and the comma at the end of a broken line.
    constexpr std::size_t GAPS = 3 * 2 + 1;
    constexpr std::size_t LEAST = 12;
    std::size_t key = 0;
    std::size_t from = 0;
    std::size_t where = 0;
    for (const Property& property : properties) {
        key = std::max(key, property.key.size());
        from = std::max(from, property.from.size());
        where = std::max(where, catalogue::asText(property.origin).size());
    }
    const std::size_t taken = indent + key + from + where + GAPS;
    return std::max(LEAST, lineWidth - std::min(lineWidth, taken));
}

/// The property entries of an owner, as the manager loads them: PROPERTIES behind PROPERTY, so it wins.
Entries propertyEntries(const std::string& owner) {
    Entries all = catalogue::entries(owner, "PROPERTIES");
    all.merge(catalogue::entries(owner, "PROPERTY"));
    return all;
}

/// The entries of an owner that the manager also finds under another name, because it joins owner and property with "_":
/// "x_PINS" of "kes" is "PINS" of "kes_x".
Entries entriesUnder(const std::string& name, const std::string& owner, const Entries& entries) {
    Entries found;
    const std::string prefix = name + '_';
    if (owner.starts_with(prefix) || name.starts_with(owner + '_')) {
        for (const auto& [key, entry] : entries) {
            const std::string joined = owner + '_' + key;
            if (joined.starts_with(prefix)) {
                found.emplace(joined.substr(prefix.size()), entry);
            }
        }
    }
    return found;
}

Entries flashEntries(const std::string& name) {
    return catalogue::entries(schema::SPI, schema::propertyKey(name));
}

} // namespace

std::string flashClass(const std::string& device) {
    std::string found;
    for (const char* const name : schema::FLASH_CLASSES) {
        const std::vector<std::string> members = catalogue::list(schema::SPI, schema::devicesKey(name));
        if (std::any_of(members.begin(), members.end(),
                        [&](const std::string& member) { return sameWithoutCase(member, device); })) {
            found = name;
        }
    }
    return found;
}

const PropertyReader::Entries& PropertyReader::entriesOfFamily(const std::string& family) {
    const auto [known, isNew] = m_families.try_emplace(family);
    if (isNew) {
        known->second = propertyEntries(family);
    }
    return known->second;
}

Properties PropertyReader::read(const std::string& device, const std::string& family, const Query& ask) {
    Entries own = propertyEntries(device);
    const Entries& inherited = entriesOfFamily(family);
    // The manager stores the family's properties last, and looks under the device's name first.
    for (auto& [key, entry] : entriesUnder(family, device, own)) {
        if (inherited.count(key) == 0) {
            own.try_emplace(key, std::move(entry));
        }
    }
    own.merge(entriesUnder(device, family, inherited));
    Properties properties;
    properties.reserve(own.size() + inherited.size());
    const auto add = [&](const std::string& key, catalogue::Entry entry) {
        if (std::optional<std::vector<std::string>> values = ask(key)) {
            properties.push_back({key, std::move(*values), entry.ofDevice ? "device" : "family",
                                  std::move(entry.origin), std::move(entry.shadows)});
        }
    };
    auto below = inherited.begin();
    for (auto& [key, entry] : own) {
        for (; below != inherited.end() && below->first < key; ++below) {
            add(below->first, below->second);
        }
        if (below != inherited.end() && below->first == key) {
            ++below;
        }
        add(key, std::move(entry));
    }
    for (; below != inherited.end(); ++below) {
        add(below->first, below->second);
    }
    return properties;
}

std::vector<std::string> propertyValues(ConstraintsManager& manager, const std::string& device,
                                        const std::string& key) {
    std::vector<std::string> values;
    for (const StringBase& value : manager.getDeviceStringProperties(device.c_str(), key.c_str())) {
        values.push_back(toStdString(value));
    }
    return values;
}

Properties deviceProperties(ConstraintsManager& manager, const std::string& device) {
    return PropertyReader().read(
        device, toStdString(manager.getPartFamily(device.c_str())),
        [&](const std::string& key) { return propertyValues(manager, device, key); });
}

Properties flashProperties(const ConstraintsManager& manager, const std::string& device) {
    Properties properties;
    const auto add = [&](const std::string& key, const std::string& from, const catalogue::Entry& entry) {
        const std::string value = manager.getSpiDeviceStringProperty(device.c_str(), key.c_str());
        if (!value.empty()) {
            properties.push_back({key, {value}, from, entry.origin, entry.shadows});
        }
    };
    const Entries own = flashEntries(device);
    for (const auto& [key, entry] : own) {
        add(key, "device", entry);
    }
    if (const std::string name = flashClass(device); !name.empty()) {
        for (const auto& [key, entry] : flashEntries(name)) {
            if (own.count(key) == 0) {
                add(key, name, entry);
            }
        }
    }
    return properties;
}

std::string asText(const Properties& properties, const Terminal& terminal, std::size_t indent) {
    Table table({"PROPERTY", "VALUE", "FROM", "WHERE"});
    const std::size_t width = valueWidth(properties, terminal.width(), indent);
    for (const Property& property : properties) {
        const std::vector<std::string> values = lines(property.values, width);
        table.add({property.key, values.empty() ? "(none)" : values.front(), property.from,
                   catalogue::asText(property.origin)});
        for (std::size_t i = 1; i < values.size(); ++i) {
            table.add({"", values[i]});
        }
        for (const catalogue::Shadow& shadow : property.shadows) {
            table.add({"", shadow.text, "shadowed", catalogue::asText(shadow.origin)});
        }
    }
    return table.text(terminal, indent);
}

Json asJson(const Properties& properties) {
    Json list = Json::array();
    for (const Property& property : properties) {
        Json object{{"key", property.key}, {"values", property.values}, {"from", property.from}};
        object.update(catalogue::asJson(property.origin));
        if (!property.shadows.empty()) {
            object["shadows"] = catalogue::asJson(property.shadows);
        }
        list.push_back(std::move(object));
    }
    return list;
}

std::string asText(const PropertyAnswer& answer, const Terminal& terminal) {
    std::string text;
    for (const std::string& value : answer.values) {
        text += terminal.sanitised(value) + '\n';
    }
    return text;
}

Json asJson(const PropertyAnswer& answer) {
    return {{"device", answer.device}, {"property", answer.key}, {"values", answer.values}};
}

ExitCode showProperty(Tool& tool, const PropertyAnswer& answer, const Properties& all) {
    if (!answer.values.empty()) {
        return tool.answer(answer);
    }
    std::vector<std::string> keys;
    for (const Property& property : all) {
        keys.push_back(property.key);
    }
    throw CommandError(ExitCode::NO, fmt::format("\"{}\" has no property \"{}\"{}", answer.device, answer.key,
                                                 didYouMean(answer.key, keys)));
}
