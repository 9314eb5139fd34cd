// Properties: of the device itself or its family, and of flashes or their classes.
#include "explain/Chain.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <fmt/format.h>

namespace why {

bool Chain::operationInMode() {
    const std::string name = withoutPackageNoted(m_question.device);
    const std::string& key = vocabulary::key(m_question.operation);
    add("table", fmt::format("the property {} lists the modes for it", key));
    const PropertyValues* const found = properties(name, key);
    if (found == nullptr) {
        add("absent", fmt::format("neither \"{}\" nor its family has a property {}", name, key));
        return false;
    }
    return holds(*found, key, vocabulary::key(m_question.mode));
}

bool Chain::property() {
    const std::string& device = m_question.device;
    const std::string& key = m_question.property;
    if (m_facts.isFlash(device)) {
        familyNoted(device);
        return flashProperty();
    }
    const PropertyValues* found = properties(device, key);
    if (found != nullptr && !found->values.empty()) {
        return holds(*found, key, m_question.value);
    }
    // A second pass asks for the family by its own name, and so reaches the family's own family if it has one.
    const std::string family = m_replay.resolve(device).family;
    if (family != device) {
        found = properties(family, key);
        if (found != nullptr && !found->values.empty()) {
            // Only the smallest value comes through.
            return holds({{*found->values.begin()}, found->record, found->ofDevice}, key, m_question.value);
        }
    }
    add("absent", fmt::format("neither \"{}\" nor its family has a value for {}", device, key));
    for (const char* const records : {"PROPERTY", "PROPERTIES"}) {
        noteShadowed(device, records, key);
    }
    return false;
}

/// The values of the device itself, or else of its family, noting where they stand; null when there are none.
const PropertyValues* Chain::properties(const std::string& device, const std::string& key) {
    m_replay.loadForProperties(device);
    if (const PropertyValues* const own = m_replay.property(device, key)) {
        familyNoted(device);
        return own;
    }
    const std::string family = m_replay.resolve(device).family;
    if (family == device) {
        return nullptr;
    }
    familyNoted(device);
    m_replay.loadForProperties(family);
    return m_replay.property(family, key);
}

/// Is the value among those found? Without a value: is there any?
bool Chain::holds(const PropertyValues& found, const std::string& key,
                  const std::optional<std::string>& value) {
    const bool yes = value ? found.values.count(*value) != 0 : !found.values.empty();
    const std::string values = found.values.empty() ? "no value" : listed(found.values);
    add(yes ? "record" : "absent",
        fmt::format("{} of the {} is {}{}", key, found.ofDevice ? "device" : "family", values,
                    yes || !value ? "" : fmt::format(", not {}", *value)),
        found.record);
    return yes;
}

bool Chain::flashProperty() {
    const std::string& key = m_question.property;
    auto found = m_facts.flashProperties.find(upperCase(m_question.device + key));
    std::string from = "flash";
    if (found == m_facts.flashProperties.end()) {
        std::string flashClass;
        const Piece* listing = nullptr;
        for (const auto& [name, members] : m_facts.flashClasses) {
            const auto member = members.find(lowerCase(m_question.device));
            if (member != members.end()) {
                flashClass = name;
                listing = &member->second;
            }
        }
        if (listing != nullptr) {
            add("table", fmt::format("the flash itself has no {}; its class is {}", key, flashClass),
                *listing);
        }
        from = "class " + flashClass;
        found = m_facts.flashProperties.find(upperCase(flashClass + key));
    }
    if (found == m_facts.flashProperties.end()) {
        add("absent", fmt::format("neither the flash nor its class has a property {}", key));
        return false;
    }
    const auto& [value, record] = found->second;
    const bool yes = !value.empty() && (!m_question.value || *m_question.value == value);
    add(yes ? "record" : "absent",
        fmt::format("{} of the {} is {}{}", key, from, value.empty() ? "empty" : value,
                    yes || !m_question.value ? "" : fmt::format(", not {}", *m_question.value)),
        record);
    return yes;
}

} // namespace why
