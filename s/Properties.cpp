#include "Diagnostics.h"
#include "Implementation.h"
#include "JoinedText.h"
#include "StringViews.h"
#include "WordTables.h"

// The named properties of a device: its own, or otherwise its family's.

/// The values of an owner's property if the owner itself is loaded and they came with its data. "a" + "b_c" collides with
/// "a_b" + "c", so they are accepted only if the owner's length matches.
const PropertyValues* ConstraintsManager::Implementation::findLoaded(std::string_view owner,
                                                                     std::string_view property) const {
    const PropertyValues* const values = m_deviceProperties.find(owner, property);
    return values != nullptr && values->owner().length == owner.size() ? values : nullptr;
}

/// The values of a device's property, or otherwise of its family's; null when neither has it.
const PropertyValues* ConstraintsManager::Implementation::findProperty(std::string_view device,
                                                                       std::string_view key) {
    if (const PropertyValues* const values = findLoaded(device, key)) {
        return values;
    }
    // A copy: the text may be that of m_partFamily, which resolving overwrites.
    const StringBase name = toStringBase(device);
    if (m_loadedFamilies.find(view(name)) == m_loadedFamilies.end()) {
        loadDeviceData(view(name), {});
    }
    if (const PropertyValues* const values = m_deviceProperties.find(view(name), key)) {
        return values;
    }
    const StringBase family = getPartFamily(view(name));
    if (family == name) {
        return nullptr;
    }
    if (m_loadedFamilies.find(view(family)) == m_loadedFamilies.end()) {
        loadDeviceData(view(family), {});
    }
    return m_deviceProperties.find(view(family), key);
}

const ConstraintsManager::TextSet&
ConstraintsManager::Implementation::getDeviceStringProperties(std::string_view device, std::string_view key) {
    const PropertyValues* const values = findProperty(device, key);
    return values == nullptr ? m_operationOptions : values->set();
}

const char* ConstraintsManager::Implementation::getDeviceStringProperty(const char* device, const char* key) {
    const PropertyValues* values = findLoaded(view(device), view(key));
    if (values != nullptr && !values->owner().isFlash && !values->empty()) {
        return values->first().c_str();
    }
    if (isSpiDevice(device)) {
        return getSpiDeviceStringProperty(device, view(key));
    }
    const StringBase name(device);
    values = findProperty(view(name), view(key));
    if (values == nullptr || values->empty()) {
        // The second pass also reaches the family's own family, if it has one.
        const StringBase family = getPartFamily(view(name));
        if (family != name) {
            m_partFamily = family;
            values = findProperty(view(family), view(key));
        }
    }
    if (values != nullptr && !values->empty()) {
        return values->first().c_str();
    }
    diagnostics::message(diagnostics::location::PROPERTY_NOT_FOUND)
        .issueInfo("ACD entry  %s not found for device family %s.\n", key,
                   device == nullptr ? nullptr : name.c_str());
    diagnostics::raiseIf<DataNotFoundException>(m_exceptions, diagnostics::location::PROPERTY_NOT_FOUND);
    return nullptr;
}

bool ConstraintsManager::Implementation::hasDevicePropertyValue(std::string_view device, std::string_view key,
                                                                std::string_view value) {
    const PropertyValues* const values = findProperty(device, key);
    return values != nullptr && values->contains(value);
}

const ConstraintsManager::TextSet&
ConstraintsManager::Implementation::getDeviceOperationOptions(std::string_view device,
                                                              std::string_view operation, MODE_TYPE mode) {
    const char* const modeName = wordTables::modeKey(mode);
    if (!hasDevicePropertyValue(device, operation, modeName)) {
        return m_operationOptions;
    }
    StringBase upperOperation = toStringBase(operation);
    upperOperation.MakeUpper();
    const TextSet& options =
        getDeviceStringProperties(device, JoinedText{"OP_", view(upperOperation)}.view());
    return !options.empty() ? options
                            : getDeviceStringProperties(
                                  device, JoinedText{"OP_", view(upperOperation), "_", modeName}.view());
}
