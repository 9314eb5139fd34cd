#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <UT_STR.h>

// The named properties of a device: its own, or else its family's.

std::size_t ConstraintsManager::PropertyKeyHash::operator()(const PropertyKey& key) const noexcept {
    const auto owner = StringBase::CRC32(key.owner.data(), key.owner.size());
    return StringBase::CRC32(key.property.data(), key.property.size(), StringBase::CRC32("_", 1, owner));
}

bool ConstraintsManager::PropertyKeyEqual::operator()(const PropertyKey& left,
                                                      const StringBase& right) const noexcept {
    const std::string_view joined = view(right);
    const std::size_t split = left.owner.size();
    return joined.size() == split + 1 + left.property.size() && joined.substr(0, split) == left.owner &&
           joined[split] == '_' && joined.substr(split + 1) == left.property;
}

/// The values that are stored for an owner's property; null when there are none.
const ConstraintsManager::TextSet* ConstraintsManager::findProperty(const StringBase& owner,
                                                                    const char* property) const {
    const auto found = m_deviceProperties.find(PropertyKey{view(owner), view(property)});
    return found == m_deviceProperties.end() ? nullptr : &found->second;
}

const ConstraintsManager::TextSet& ConstraintsManager::getDeviceStringProperties(const char* device,
                                                                                 const char* key) {
    const StringBase name(device);
    if (m_loadedFamilies.find(view(name)) == m_loadedFamilies.end()) {
        loadDeviceData(name.c_str(), nullptr);
    }
    if (const TextSet* const values = findProperty(name, key)) {
        return *values;
    }
    const StringBase family = getPartFamily(name.c_str());
    if (family == name) {
        return m_operationOptions;
    }
    if (m_loadedFamilies.find(view(family)) == m_loadedFamilies.end()) {
        loadDeviceData(family.c_str(), nullptr);
    }
    const TextSet* const values = findProperty(family, key);
    return values == nullptr ? m_operationOptions : *values;
}

const char* ConstraintsManager::getDeviceStringProperty(const char* device, const char* key) {
    if (isSpiDevice(device)) {
        return getSpiDeviceStringProperty(device, key);
    }
    const StringBase name(device);
    const TextSet* values = &getDeviceStringProperties(name.c_str(), key);
    if (values->empty()) {
        // The second pass also reaches the family's own family, if it has one.
        const StringBase family = getPartFamily(name.c_str());
        if (family != name) {
            m_partFamily = family;
            values = &getDeviceStringProperties(family.c_str(), key);
        }
    }
    if (!values->empty()) {
        return values->begin()->c_str();
    }
    reporting::message(reporting::location::PROPERTY_NOT_FOUND)
        .issueInfo("ACD entry  %s not found for device family %s.\n", key,
                   device == nullptr ? nullptr : name.c_str());
    reporting::raiseIf<DataNotFoundException>(m_exceptions, reporting::location::PROPERTY_NOT_FOUND);
    return nullptr;
}

bool ConstraintsManager::getDeviceBoolProperty(const char* device, const char* key) {
    return hasDevicePropertyValue(device, key, "TRUE");
}

long ConstraintsManager::getDeviceLongProperty(const char* device, const char* key) {
    const char* const text = getDeviceStringProperty(device, key);
    return text == nullptr ? -1 : UT_STR::AToL(text);
}

bool ConstraintsManager::hasDevicePropertyValue(const char* device, const char* key, const char* value) {
    const TextSet& values = getDeviceStringProperties(device, key);
    return values.find(view(value)) != values.end();
}
