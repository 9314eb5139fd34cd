#include "Diagnostics.h"
#include "FamilyNames.h"
#include "Implementation.h"
#include "JoinedText.h"
#include "StringViews.h"

// What a device offers, as masks. Which values each question rejects, with which message, and whether before or after the
// family's block is looked up, differs deliberately between them.

namespace {

constexpr const char* OUTPUT_OUT_OF_RANGE = "Outstream(Cable or file type) is out of range -- %d.\n";

} // namespace

/// The name whose operation tables answer for a device: its own when its base name is supported, otherwise that of
/// its family.
StringBase ConstraintsManager::Implementation::operationOwner(const StringBase& device) {
    return m_supportedDevices.contains(baseName(view(device))) ? device : getPartFamily(view(device));
}

/// Returns the cached look-up for this name and restores m_partFamily; null if there is none.
const CachedLookup* ConstraintsManager::Implementation::findCachedLookup(const LookupCache& cache,
                                                                         std::string_view device) {
    const CachedLookup* const found = cache.find(device);
    if (found != nullptr && found->family != nullptr) {
        m_partFamily.refer(*found->family); // one of m_supportedDevices
    }
    return found;
}

/// How many look-ups a cache may hold: enough for each device that was resolved, under two spellings. One device can be
/// asked for under any number of names, as in "KS50_lot1", "KS50_lot2", ...
std::size_t ConstraintsManager::Implementation::cacheLimit() const noexcept {
    constexpr std::size_t FEW_DEVICES = 1024;
    return FEW_DEVICES + 2 * m_deviceFamilyCache.size();
}

/// Caches device to block, only once all of the owner's data is loaded, as then every question about operations takes
/// the same way; and only if the owner has the block itself, as then nothing else is resolved.
void ConstraintsManager::Implementation::cacheOperationLookup(const StringBase& device,
                                                              const StringBase& owner, std::size_t block) {
    if (block >= m_supportedDevices.size() || m_supportedDevices[block] != owner ||
        m_loadedFamilies.find(view(owner)) == m_loadedFamilies.end() ||
        !m_operationsLoaded.contains(view(owner))) {
        return;
    }
    const bool isResolved = !m_supportedDevices.contains(baseName(view(device)));
    m_operationLookups.add(device, {isResolved ? &m_supportedDevices[block] : nullptr, block}, cacheLimit());
}

/// Caches device to block. The owner's options are loaded if they have a block at all, and the family is always resolved.
void ConstraintsManager::Implementation::cacheOptionLookup(const StringBase& device, std::size_t block) {
    if (block >= m_programOptionPackages.size()) {
        return;
    }
    StringBase key = toStringBase(baseName(view(device)));
    key.MakeLower();
    // The list of supported families has a copy of the name that never changes, unlike the family cache. Resolving the
    // device has left it in that cache, but what a message sink did since then may have changed it.
    const auto resolved = m_deviceFamilyCache.find(view(key));
    const std::size_t family = resolved == m_deviceFamilyCache.end()
                                   ? m_supportedDevices.size()
                                   : m_supportedDevices.position(view(resolved->second));
    if (family != m_supportedDevices.size()) {
        m_optionLookups.add(device, {&m_supportedDevices[family], block}, cacheLimit());
    }
}

int ConstraintsManager::Implementation::getDeviceOperations(const char* deviceName, MODE_TYPE mode,
                                                            OUTPUT_TYPE output) {
    const std::string_view device = view(deviceName);
    // Modes and outputs without a cell give 0 silently, after the look-up, which may raise.
    const auto answer = [&](std::size_t block) {
        return static_cast<int>(
            m_operationTable.mask(block, static_cast<int>(mode), static_cast<int>(output)));
    };

    if (mode == MODE_TYPE::SPI) {
        return answer(familyIndex(familyNames::SPI));
    }
    if (const CachedLookup* const known = findCachedLookup(m_operationLookups, device)) {
        return answer(known->block);
    }
    const StringBase name = toStringBase(device);
    const StringBase owner = operationOwner(name);
    if (m_loadedFamilies.find(view(owner)) == m_loadedFamilies.end()) {
        loadDeviceData(view(owner), {});
    }
    const std::size_t block = familyIndex(view(owner));
    cacheOperationLookup(name, owner, block);
    return answer(block);
}

int ConstraintsManager::Implementation::getProgramOptions(const char* deviceName, MODE_TYPE mode,
                                                          OUTPUT_TYPE output, std::string_view package) {
    const std::string_view device = view(deviceName);
    const auto isOutOfRange = [&] {
        return diagnostics::rejectOutOfRange(mode, tableDimensions::MODES, diagnostics::MODE_OUT_OF_RANGE) ||
               diagnostics::rejectOutOfRange(output, tableDimensions::OUTPUTS, OUTPUT_OUT_OF_RANGE);
    };
    const auto answer = [&](std::size_t block) {
        return static_cast<int>(
            m_programOptionTable.mask(block, static_cast<int>(mode), static_cast<int>(output)));
    };
    const auto blockOf = [&](std::string_view owner) {
        return static_cast<std::size_t>(programOptionTableIndex(owner));
    };

    if (mode == MODE_TYPE::SPI) {
        return isOutOfRange() ? 0 : answer(blockOf(familyNames::SPI));
    }
    // A package may have a block of its own.
    const bool isCacheable = package.empty();
    if (const CachedLookup* const known = isCacheable ? findCachedLookup(m_optionLookups, device) : nullptr) {
        const std::size_t block = known->block;
        return isOutOfRange() ? 0 : answer(block);
    }
    const StringBase name = toStringBase(device);
    StringBase buffer = name;
    const std::string_view owner = loadedOptionOwner(buffer, package);
    if (isOutOfRange()) {
        return 0;
    }
    const std::size_t block = blockOf(owner);
    if (isCacheable) {
        cacheOptionLookup(name, block);
    }
    return answer(block);
}

bool ConstraintsManager::Implementation::isProgramOptionTableLoaded(std::string_view name) const {
    return m_programOptionsLoaded.contains(name);
}

/// The name whose program options answer for a device in a package, with its options loaded: the two joined if they are
/// listed together; otherwise the device if it is listed or a family; otherwise its family.
/// @param name the device; becomes the family if that answers. The result may be a view of it
std::string_view ConstraintsManager::Implementation::loadedOptionOwner(StringBase& name,
                                                                       std::string_view package) {
    const StringBase family = getPartFamily(view(name));
    if (family != name) {
        const std::size_t listed = m_programOptionPackages.position(JoinedText{view(name), package}.view());
        if (listed != m_programOptionPackages.size()) {
            const std::string_view joined = view(m_programOptionPackages[listed]);
            if (!isProgramOptionTableLoaded(joined)) {
                loadDeviceData(view(name), package);
            }
            return joined;
        }
        if (!m_programOptionPackages.contains(view(name))) {
            name = family;
        }
    }
    if (!isProgramOptionTableLoaded(view(name))) {
        loadDeviceData(view(name), {});
    }
    return view(name);
}

int ConstraintsManager::Implementation::getBsdlOperations(const char* deviceName, OUTPUT_TYPE output) {
    const std::string_view device = view(deviceName);
    const auto answer = [&](std::size_t block) {
        // Negative outputs pass this test, have no cell and give 0 silently.
        if (static_cast<int>(output) >= tableDimensions::OUTPUTS) {
            Port_MsgManData::debugStub(OUTPUT_OUT_OF_RANGE, static_cast<int>(output));
            return 0;
        }
        return static_cast<int>(m_bsdlOperationTable.mask(block, 0, static_cast<int>(output)));
    };

    if (const CachedLookup* const known = findCachedLookup(m_operationLookups, device)) {
        return answer(known->block);
    }
    const StringBase name = toStringBase(device);
    const StringBase owner = operationOwner(name);
    if (!m_operationsLoaded.contains(view(owner))) {
        loadDeviceData(view(owner), {});
    }
    const std::size_t block = familyIndex(view(owner));
    cacheOperationLookup(name, owner, block);
    return answer(block);
}
