#include "FamilyNames.h"
#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <PicConfig.h>
#include <UT_STR.h>

// Which family a device belongs to: resolution with its cache, the seeding of that cache, and what follows
// from a family's name.

StringBase ConstraintsManager::getPartFamily(const char* device) {
    // A copy: the text may be that of m_partFamily itself.
    const StringBase name(device);
    const StringBase base = baseNameOf(view(name));
    m_partFamily = base;
    m_partFamily.MakeLower();
    const auto cached = m_deviceFamilyCache.find(view(m_partFamily));
    if (cached != m_deviceFamilyCache.end() && cached->second.GetLength() != 0) {
        m_partFamily = cached->second;
        return m_partFamily;
    }
    const StringBase key = m_partFamily;
    m_partFamily = "";
    m_partFamily = resolveFamily(name, base);
    m_deviceFamilyCache.insert_or_assign(key, m_partFamily);
    return m_partFamily;
}

/// The family of a device that the cache does not hold. SPI flash goes before what the database says; that
/// looks at the whole name, the database at the base name.
StringBase ConstraintsManager::resolveFamily(const StringBase& device, const StringBase& base) const {
    const PicConfig configuration(base.c_str(), 1, static_cast<PM_PARTNAME_BINDING>(1));
    const bool isSpi = isSpiDevice(device);
    const char* const module = configuration.get_pm();
    if (!isSpi && module != nullptr) {
        return module;
    }
    return isSpi || UT_STR::ICompare(device.c_str(), familyNames::SPI) == 0 ? familyNames::SPI
                                                                            : familyNames::BASE;
}

void ConstraintsManager::addCachedDeviceFamily(const char* device, const char* family) {
    // Looks up the latest resolution, not this device: hosts rely on a seed being refused while that one is
    // cached. Seeded names keep their case: callers look them up in lower case.
    const auto latest = m_deviceFamilyCache.find(view(m_partFamily));
    if (latest == m_deviceFamilyCache.end() || latest->second.GetLength() == 0) {
        m_deviceFamilyCache.insert_or_assign(baseNameOf(view(device)), family);
        m_operationShortcuts.clear();
        m_optionShortcuts.clear();
    }
}

bool ConstraintsManager::isKorvelDevice(const char* device) {
    return getPartFamily(device) != familyNames::BASE;
}

/// The position of a family, or of a device's family, among the supported ones; behind the last for a name
/// that is none.
unsigned ConstraintsManager::familyIndex(const char* name) {
    // The base name decides whether to resolve, the whole name is what is looked up: "fam_x" is not "fam".
    const bool isFamily = m_supportedDevices.contains(baseName(view(name)));
    const std::size_t position =
        m_supportedDevices.position(isFamily ? view(name) : view(getPartFamily(name)));
    if (position == m_supportedDevices.size()) {
        reporting::raiseIf<OutOfRangeException>(m_exceptions, reporting::location::SUPPORTED_DEVICE_UNKNOWN);
    }
    return static_cast<unsigned>(position);
}

bool ConstraintsManager::isFamilyName(const StringBase& name) { return getPartFamily(name.c_str()) == name; }

const ConstraintsManager::Texts& ConstraintsManager::getAllDeviceIdcodes() const noexcept {
    return m_deviceIdcodes;
}
