#include "Lists.h"
#include "PropertyTable.h"
#include "Reporting.h"
#include "Text.h"

#include <tarvik/ConstraintsManager.h>

#include <AcdReader.h>
#include <UT_STR.h>

// Loading on demand: what the first question about a device brings into memory. Each piece is loaded once;
// its name is noted before it is read, so a load that fails is not tried again.

namespace {

/// Notes a name as loaded.
/// @return false when it was noted before
bool note(NameSequence& loaded, const StringBase& name) {
    if (loaded.contains(view(name))) {
        return false;
    }
    loaded.push_back(name);
    return true;
}

/// "PROPERTY": records of a name and a value.
void readSingleProperties(PM_DEVKEY& accessor, const PropertyValues::Owner& owner, bool exceptions,
                          std::vector<PropertyTable::Found>& found) {
    forEachRecord(accessor, "PROPERTY", [&](const Record& record, StringBase property) {
        const char* const value = record.field(1);
        if (value == nullptr) {
            reporting::raiseIf<DataMismatchException>(exceptions,
                                                      reporting::location::PROPERTY_WITHOUT_VALUE);
        }
        found.push_back({std::move(property), PropertyValues(value, owner)});
    });
}

/// "PROPERTIES": records of a name, a count and as many values.
void readMultipleProperties(PM_DEVKEY& accessor, const PropertyValues::Owner& owner, bool exceptions,
                            std::vector<PropertyTable::Found>& found) {
    forEachRecord(accessor, "PROPERTIES", [&](const Record& record, StringBase property) {
        const long count = UT_STR::AToL(record.field(1));
        PropertyValues::TextSet values;
        for (long index = 0; index < count; ++index) {
            const char* const value = record.field(index + 2);
            values.emplace_hint(values.end(), value);
            if (value == nullptr) {
                reporting::raiseIf<DataMismatchException>(exceptions,
                                                          reporting::location::PROPERTIES_WITHOUT_VALUE);
                // All fields behind the first gap are missing too, and a set holds the empty text once.
                break;
            }
        }
        found.push_back({std::move(property), PropertyValues(std::move(values), owner)});
    });
}

} // namespace

/// Brings a device's, and its family's, data into memory. `package` may be null.
void ConstraintsManager::loadDeviceData(const char* device, const char* package) {
    // A copy: the text may be that of m_partFamily, which resolving overwrites.
    const StringBase name(device);
    const bool isFamily = m_supportedDevices.contains(baseName(view(name)));
    loadFamily(isFamily ? name : loadDevice(name, package));
}

/// Brings a device's own data into memory.
/// @return the module that its database belongs to
StringBase ConstraintsManager::loadDevice(const StringBase& device, const char* package) {
    const AcdReader reader(device.c_str());
    loadProperties(reader.getDevkey(), device);
    StringBase owner = device;
    owner += package;
    if (!m_programOptionPackages.contains(view(owner))) {
        owner = getPartFamily(device.c_str());
    }
    if (note(m_programOptionsLoaded, owner)) {
        parseProgramOptionEntries(reader.getDevkey(), owner.c_str());
    }
    return reader.getPM();
}

void ConstraintsManager::loadFamily(const StringBase& family) {
    const AcdReader reader(family.c_str());
    loadProperties(reader.getDevkey(), family);
    if (note(m_operationsLoaded, family)) {
        loadFamilyTables(reader.getDevkey(), family.c_str());
    }
    if (note(m_programOptionsLoaded, family)) {
        parseProgramOptionEntries(reader.getDevkey(), family.c_str());
    }
}

void ConstraintsManager::loadFamilyTables(PM_DEVKEY* accessor, const char* family) {
    const unsigned index = familyIndex(family);
    parseOperationEntries(accessor, index, family);
    parseBsdlOperationEntries(accessor, index, family);
}

void ConstraintsManager::loadProperties(PM_DEVKEY* accessor, const StringBase& owner) {
    if (!m_loadedFamilies.insert(owner).second) {
        return;
    }
    constexpr std::size_t USUAL_COUNT = 32;
    std::vector<PropertyTable::Found> found;
    found.reserve(USUAL_COUNT);
    const PropertyValues::Owner holder{static_cast<std::uint32_t>(owner.GetLength()), isSpiDevice(owner)};
    try {
        readSingleProperties(*accessor, holder, m_exceptions, found);
        readMultipleProperties(*accessor, holder, m_exceptions, found);
    } catch (const TarvikException&) {
        // What stands before the fault counts.
        m_deviceProperties->assign(view(owner), std::move(found));
        throw;
    }
    m_deviceProperties->assign(view(owner), std::move(found));
}
