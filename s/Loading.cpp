#include "Diagnostics.h"
#include "Implementation.h"
#include "RecordReader.h"
#include "StringViews.h"

#include <AcdReader.h>
#include <UT_STR.h>

// Loading on demand: what the first question about a device brings into memory. Each piece is loaded once. Its name is
// marked as loaded before it is read, so a load that fails is not repeated.

namespace {

/// Marks a name as loaded.
/// @return false when it is marked already
bool markLoaded(NameSequence& loaded, const StringBase& name) {
    if (loaded.contains(view(name))) {
        return false;
    }
    loaded.push_back(name);
    return true;
}

/// "PROPERTY": records of a name and a value.
void readSingleProperties(PM_DEVKEY& accessor, const PropertyValues::Owner& owner, const bool& exceptions,
                          std::vector<ParsedProperty>& parsed) {
    forEachRecord(accessor, "PROPERTY", [&](const Record& record, StringBase property) {
        const char* const value = record.field(1);
        if (value == nullptr) {
            diagnostics::raiseIf<DataMismatchException>(exceptions,
                                                        diagnostics::location::PROPERTY_WITHOUT_VALUE);
        }
        parsed.push_back({std::move(property), PropertyValues(value, owner)});
    });
}

/// "PROPERTIES": records of a name, a count and as many values.
void readMultipleProperties(PM_DEVKEY& accessor, const PropertyValues::Owner& owner, const bool& exceptions,
                            std::vector<ParsedProperty>& parsed) {
    forEachRecord(accessor, "PROPERTIES", [&](const Record& record, StringBase property) {
        const long count = UT_STR::AToL(record.field(1));
        PropertyValues::TextSet values;
        for (long index = 0; index < count; ++index) {
            const char* const value = record.field(index + 2);
            values.emplace_hint(values.end(), value);
            if (value == nullptr) {
                diagnostics::raiseIf<DataMismatchException>(exceptions,
                                                            diagnostics::location::PROPERTIES_WITHOUT_VALUE);
                // All fields after the first gap are missing too, and a set holds the empty text once.
                break;
            }
        }
        parsed.push_back({std::move(property), PropertyValues(std::move(values), owner)});
    });
}

} // namespace

/// Loads the data of a device and of its family.
void ConstraintsManager::Implementation::loadDeviceData(std::string_view device, std::string_view package) {
    // A copy: the text may be that of m_partFamily, which resolving overwrites.
    const StringBase name = toStringBase(device);
    const bool isFamily = m_supportedDevices.contains(baseName(view(name)));
    loadFamily(isFamily ? name : loadDevice(name, package));
}

/// Loads a device's own data.
/// @return the module that its database belongs to
StringBase ConstraintsManager::Implementation::loadDevice(const StringBase& device,
                                                          std::string_view package) {
    const AcdReader reader(device.c_str());
    loadProperties(reader.getDevkey(), device);
    StringBase owner = device;
    owner += toStringBase(package);
    if (!m_programOptionPackages.contains(view(owner))) {
        owner = getPartFamily(view(device));
    }
    if (markLoaded(m_programOptionsLoaded, owner)) {
        parseProgramOptionEntries(reader.getDevkey(), owner.c_str());
    }
    return reader.getPM();
}

void ConstraintsManager::Implementation::loadFamily(const StringBase& family) {
    const AcdReader reader(family.c_str());
    loadProperties(reader.getDevkey(), family);
    if (markLoaded(m_operationsLoaded, family)) {
        loadFamilyTables(reader.getDevkey(), family.c_str());
    }
    if (markLoaded(m_programOptionsLoaded, family)) {
        parseProgramOptionEntries(reader.getDevkey(), family.c_str());
    }
}

void ConstraintsManager::Implementation::loadFamilyTables(PM_DEVKEY* accessor, const char* family) {
    const unsigned index = familyIndex(view(family));
    parseOperationEntries(accessor, index, family);
    parseBsdlOperationEntries(accessor, index, family);
}

void ConstraintsManager::Implementation::loadProperties(PM_DEVKEY* accessor, const StringBase& owner) {
    if (!m_loadedFamilies.insert(owner).second) {
        return;
    }
    constexpr std::size_t USUAL_COUNT = 32;
    std::vector<ParsedProperty> parsed;
    parsed.reserve(USUAL_COUNT);
    const PropertyValues::Owner holder{static_cast<std::uint32_t>(owner.GetLength()), isSpiDevice(owner)};
    try {
        readSingleProperties(*accessor, holder, m_exceptions, parsed);
        readMultipleProperties(*accessor, holder, m_exceptions, parsed);
    } catch (...) {
        // The properties before the fault stay, whatever it is.
        m_deviceProperties.assign(view(owner), std::move(parsed));
        throw;
    }
    m_deviceProperties.assign(view(owner), std::move(parsed));
}
