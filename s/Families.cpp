#include "Diagnostics.h"
#include "FamilyNames.h"
#include "Implementation.h"
#include "StringViews.h"

#include <PicConfig.h>
#include <UT_STR.h>

// Which family a device belongs to: resolution with its cache, and the seeding of that cache.

StringBase ConstraintsManager::Implementation::getPartFamily(std::string_view device) {
    // Copies: the text may be that of m_partFamily itself.
    const StringBase name = toStringBase(device);
    const StringBase base = toStringBase(baseName(device));
    StringBase key = base;
    key.MakeLower();
    const auto cached = m_deviceFamilyCache.find(view(key));
    if (cached != m_deviceFamilyCache.end() && cached->second.GetLength() != 0) {
        m_partFamily = cached->second;
        return cached->second;
    }
    m_partFamily = "";
    m_partFamily = resolveFamily(name, base);
    m_deviceFamilyCache.insert_or_assign(key, m_partFamily.get());
    return m_partFamily.get();
}

/// The family of a device that the cache does not hold. SPI flash takes precedence over the database, and is found by
/// the whole name, while the database is asked for the base name.
StringBase ConstraintsManager::Implementation::resolveFamily(const StringBase& device,
                                                             const StringBase& base) const {
    const PicConfig configuration(base.c_str(), 1, static_cast<PM_PARTNAME_BINDING>(1));
    const bool isSpi = isSpiDevice(device);
    const char* const module = configuration.get_pm();
    if (!isSpi && module != nullptr) {
        return module;
    }
    return isSpi || UT_STR::ICompare(device.c_str(), familyNames::SPI) == 0 ? familyNames::SPI
                                                                            : familyNames::BASE;
}

void ConstraintsManager::Implementation::addCachedDeviceFamily(std::string_view device, const char* family) {
    // Looks up the latest resolution, not this device: hosts rely on a seed being refused while that one is
    // cached. The name keeps its case, although devices are looked up in lower case.
    const auto latest = m_deviceFamilyCache.find(view(m_partFamily.get()));
    if (latest == m_deviceFamilyCache.end() || latest->second.GetLength() == 0) {
        m_deviceFamilyCache.insert_or_assign(toStringBase(baseName(device)), family);
        m_operationLookups.clear();
        m_optionLookups.clear();
    }
}

/// The position of a family, or of a device's family, among the supported ones; one past the last for a family that is
/// not supported.
unsigned ConstraintsManager::Implementation::familyIndex(std::string_view name) {
    // The base name decides whether to resolve, the whole name is what is looked up: "fam_x" is not "fam".
    const bool isFamily = m_supportedDevices.contains(baseName(name));
    const std::size_t position = m_supportedDevices.position(isFamily ? name : view(getPartFamily(name)));
    if (position == m_supportedDevices.size()) {
        diagnostics::raiseIf<OutOfRangeException>(m_exceptions,
                                                  diagnostics::location::SUPPORTED_DEVICE_UNKNOWN);
    }
    return static_cast<unsigned>(position);
}

/// No question needs it; it is part of what the manager can do.
bool ConstraintsManager::Implementation::isFamilyName(const StringBase& name) {
    return getPartFamily(view(name)) == name;
}
