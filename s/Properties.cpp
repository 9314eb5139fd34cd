#include "PropertyTable.h"
#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <UT_STR.h>

// The named properties of a device: its own, or else its family's.

/// The values that are stored for an owner's property, if they came with this owner's data, which then is loaded: "a" and
/// "b_c" are stored where "a_b" and "c" would be.
const PropertyValues* ConstraintsManager::findLoaded(std::string_view owner,
                                                     std::string_view property) const {
    const PropertyValues* const values = m_deviceProperties->find(owner, property);
    return values != nullptr && values->owner().length == owner.size() ? values : nullptr;
}

/// The values of a device's property, or else of its family's; null when neither has it.
const PropertyValues* ConstraintsManager::findProperty(const char* device, const char* key) {
    if (const PropertyValues* const values = findLoaded(view(device), view(key))) {
        return values;
    }
    const StringBase name(device);
    if (m_loadedFamilies.find(view(name)) == m_loadedFamilies.end()) {
        loadDeviceData(name.c_str(), nullptr);
    }
    if (const PropertyValues* const values = m_deviceProperties->find(view(name), view(key))) {
        return values;
    }
    const StringBase family = getPartFamily(name.c_str());
    if (family == name) {
        return nullptr;
    }
    if (m_loadedFamilies.find(view(family)) == m_loadedFamilies.end()) {
        loadDeviceData(family.c_str(), nullptr);
    }
    return m_deviceProperties->find(view(family), view(key));
}

const ConstraintsManager::TextSet& ConstraintsManager::getDeviceStringProperties(const char* device,
                                                                                 const char* key) {
    const PropertyValues* const values = findProperty(device, key);
    return values == nullptr ? m_operationOptions : values->set();
}

const char* ConstraintsManager::getDeviceStringProperty(const char* device, const char* key) {
    const PropertyValues* values = findLoaded(view(device), view(key));
    if (values != nullptr && !values->owner().isFlash && !values->empty()) {
        return values->first().c_str();
    }
    if (isSpiDevice(device)) {
        return getSpiDeviceStringProperty(device, key);
    }
    const StringBase name(device);
    values = findProperty(name.c_str(), key);
    if (values == nullptr || values->empty()) {
        // The second pass also reaches the family's own family, if it has one.
        const StringBase family = getPartFamily(name.c_str());
        if (family != name) {
            m_partFamily = family;
            values = findProperty(family.c_str(), key);
        }
    }
    if (values != nullptr && !values->empty()) {
        return values->first().c_str();
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
    const PropertyValues* const values = findProperty(device, key);
    return values != nullptr && values->contains(view(value));
}
