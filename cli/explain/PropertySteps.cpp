// Properties: of the device itself or its family, and of flashes or their classes.
#include "explain/ExplanationBuilder.h"

#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

namespace explanation {

namespace {

/// The values that were read of a record, a missing one being the empty text.
std::set<std::string> valuesOf(const ReadLog::Item& record, int first) {
    std::set<std::string> values;
    for (const ReadLog::Field& field : record.fields) {
        if (field.number >= first) {
            values.insert(field.text ? field.text->text : "");
        }
    }
    return values;
}

} // namespace

bool ExplanationBuilder::operationInMode() {
    const std::string name = addNameStep();
    const std::string& key = vocabulary::key(m_question.operation);
    add("table", fmt::format("the property {} lists the modes for it", key));
    const std::optional<Property> found = findProperty(name, key);
    if (!found) {
        add("absent", fmt::format("neither \"{}\" nor its family has a property {}", name, key));
        return false;
    }
    return holds(*found, key, vocabulary::key(m_question.mode));
}

/// The options are those of the property OP_OPERATION or, if it is missing or empty, of OP_OPERATION_MODE; but only in
/// modes that the property of the operation lists.
bool ExplanationBuilder::operationOptions() {
    const std::string& device = m_question.device;
    const std::string& operation = vocabulary::key(m_question.operation);
    const std::string& mode = vocabulary::key(m_question.mode);
    const std::optional<Property> modes = findProperty(device, operation);
    if (!modes) {
        add("absent",
            fmt::format("neither \"{}\" nor its family has a property {}, which lists the modes of the "
                        "operation",
                        device, operation));
        return false;
    }
    if (!holds(*modes, operation, mode)) {
        return false;
    }
    const std::string forAllModes = std::string(schema::OPTIONS_PREFIX) + operation;
    for (const std::string& key : {forAllModes, forAllModes + '_' + mode}) {
        const std::optional<Property> options = storedOrInherited(device, key);
        if (options && !options->values.empty()) {
            return holds(*options, key, m_question.value);
        }
    }
    add("absent", fmt::format("neither \"{}\" nor its family has a property {} or {}_{} with a value", device,
                              forAllModes, forAllModes, mode));
    return false;
}

bool ExplanationBuilder::property() {
    const std::string& device = m_question.device;
    const std::string& key = m_question.property;
    if (m_asked.manager->isSpiDevice(device.c_str())) {
        addFamilyStep(device);
        return flashProperty();
    }
    const std::optional<Property> found = findProperty(device, key);
    if (found) {
        const bool isYes = holds(*found, key, m_question.value);
        const char* const single = m_asked.manager->getDeviceStringProperty(device.c_str(), key.c_str());
        if (single != nullptr && found->values.count(single) == 0) {
            add("note",
                fmt::format("getDeviceStringProperty answers \"{}\": it asks the family once more", single));
        }
        return isYes;
    }
    add("absent", fmt::format("neither \"{}\" nor its family has a value for {}", device, key));
    for (const char* const records : {schema::PROPERTY, schema::PROPERTIES}) {
        addShadowedRecords(device, records, key);
    }
    return false;
}

/// The values of the device itself, or else of its family.
std::optional<ExplanationBuilder::Property>
ExplanationBuilder::storedOrInherited(const std::string& device, const std::string& key) const {
    std::optional<Property> found = storedProperty(device, device, key);
    const std::string family = m_asked.familyOf(device);
    return found || family == device ? found : storedProperty(device, family, key);
}

/// The same, with a step that names the family.
std::optional<ExplanationBuilder::Property> ExplanationBuilder::findProperty(const std::string& device,
                                                                             const std::string& key) {
    std::optional<Property> found = storedOrInherited(device, key);
    if (found) {
        addFamilyStep(device);
    }
    return found;
}

/// What the reads for a device have left as the values of a property: each record of the same name replaces the former
/// one, and so does one whose owner and name are the same text when they are joined.
std::optional<ExplanationBuilder::Property> ExplanationBuilder::storedProperty(const std::string& device,
                                                                               const std::string& wanted,
                                                                               const std::string& key) const {
    std::optional<Property> stored;
    std::string owner;
    for (const ReadLog::Value& value : m_asked.reads.values()) {
        if (value.key == schema::PROPERTY) {
            // The device's own data comes first, then that of families.
            owner = owner.empty() ? device : value.device.empty() ? value.family : m_asked.familyOf(device);
        } else if (value.key != schema::PROPERTIES) {
            continue;
        }
        for (const ReadLog::Item& record : value.items) {
            const ReadLog::Text* const name = record.field(0);
            if (name == nullptr || owner + '_' + name->text != wanted + '_' + key) {
                continue;
            }
            Property next{
                valuesOf(record, value.key == schema::PROPERTY ? 1 : 2), {&value, &record.whole}, {}};
            if (stored && stored->record.text->location.layer != record.whole.location.layer) {
                next.shadows = std::move(stored->shadows);
                const SourceText replaced = stored->record.sourceText();
                next.shadows.insert(next.shadows.begin(), {replaced.origin, replaced.text});
            }
            stored = std::move(next);
        }
    }
    return stored;
}

/// Is the value among those found? Without a value: is there any?
bool ExplanationBuilder::holds(const Property& found, const std::string& key,
                               const std::optional<std::string>& value) {
    const bool isYes = value ? found.values.count(*value) != 0 : !found.values.empty();
    const std::string values = found.values.empty() ? "no value" : listed(found.values);
    add(isYes ? "record" : "absent",
        fmt::format("{} of the {} is {}{}", key, found.record.value->fromSection ? "device" : "family",
                    values, isYes || !value ? "" : fmt::format(", not {}", *value)),
        found.record);
    catalogue::Shadows& shadows = m_steps.back().shadows;
    shadows.insert(shadows.begin(), found.shadows.begin(), found.shadows.end());
    return isYes;
}

/// The latest record that gives a flash, or a class of them, the property. Name and property are joined without anything
/// between them, and looked up in upper case.
std::optional<ExplanationBuilder::Property>
ExplanationBuilder::storedFlashProperty(const std::string& wanted) const {
    const std::string joined = upperCase(wanted + m_question.property);
    std::optional<Property> stored;
    for (const ReadLog::Value& value : m_asked.startUp.values()) {
        if (!value.key.ends_with(schema::PROPERTY_SUFFIX)) {
            continue;
        }
        const std::string name = value.key.substr(0, value.key.size() - schema::PROPERTY_SUFFIX.size());
        for (const ReadLog::Item& record : value.items) {
            if (name + record.field(0)->text == joined && m_asked.manager->isSpiDevice(name.c_str())) {
                stored = Property{valuesOf(record, 1), {&value, &record.whole}, {}};
            }
        }
    }
    return stored;
}

bool ExplanationBuilder::flashProperty() {
    const std::string& key = m_question.property;
    std::string from = "flash";
    std::optional<Property> found = storedFlashProperty(m_question.device);
    if (!found) {
        std::string flashClass;
        Match listing;
        for (const char* const name : schema::FLASH_CLASSES) {
            if (const ReadLog::Value* const members = m_asked.startUp.find(schema::devicesKey(name))) {
                for (const ReadLog::Item& member : members->items) {
                    if (sameWithoutCase(member.whole.text, m_question.device)) {
                        flashClass = name;
                        listing = {members, &member.whole};
                    }
                }
            }
        }
        if (listing) {
            add("table", fmt::format("the flash itself has no {}; its class is {}", key, flashClass),
                listing);
        }
        from = "class " + flashClass;
        found = storedFlashProperty(flashClass);
    }
    if (!found) {
        add("absent", fmt::format("neither the flash nor its class has a property {}", key));
        return false;
    }
    const std::string& value = *found->values.begin();
    const bool isYes = !value.empty() && (!m_question.value || *m_question.value == value);
    const auto shown = [](const std::string& text) { return text.empty() ? "empty" : text; };
    const bool isOther = m_question.value && *m_question.value != value;
    add(isYes ? "record" : "absent",
        fmt::format("{} of the {} is {}{}", key, from, shown(value),
                    isOther ? ", not " + shown(*m_question.value) : ""),
        found->record);
    return isYes;
}

} // namespace explanation
