// The reference's device catalogue: families, what is loaded on demand, SPI flash and multiboot.
#include "Reference.h"

#include <algorithm>

namespace reference {

namespace {

const std::vector<std::string> CLASSES{"AT1", "ST1", "ST2", "BPI1", "BPI2", "BPI3"};

const std::vector<std::string> MULTIBOOT_TYPES{
    "TYPE_BPI_SERIAL_LEAD",       "TYPE_BPI_SERIAL_CHAIN",    "TYPE_BPI_PARALLEL_LEAD",
    "TYPE_BPI_PARALLEL_CHAIN",    "TYPE_MB_SPI_NONE_LEAD",    "TYPE_MB_SPI_NONE_CHAIN",
    "TYPE_MB_BPI_SERIAL_LEAD",    "TYPE_MB_BPI_SERIAL_CHAIN", "TYPE_MB_BPI_PARALLEL_LEAD",
    "TYPE_MB_BPI_PARALLEL_CHAIN", "TYPE_MB_QPRM_NONE_LEAD",   "TYPE_MB_QPRM_NONE_CHAIN"};

bool holds(const std::vector<std::string>& list, const std::string& text) {
    return std::find(list.begin(), list.end(), text) != list.end();
}

bool holdsWithoutCase(const std::vector<std::string>& list, const std::string& text) {
    return std::any_of(list.begin(), list.end(),
                       [&](const std::string& entry) { return lower(entry) == lower(text); });
}

} // namespace

void Reference::loadSpiCatalogue() {
    const Accessor spi = m_databases.file("spi.acd");
    readSpiNames(spi);
    readClassDevices(spi);
    readSpiProperties(spi);
    const Block block = operationBlock("spi");
    parseOperationEntries(spi, block, "spi");
    m_operationsLoaded.emplace_back("spi");
    parseBsdlOperationEntries(spi, block, "spi");
    parseProgramOptionEntries(spi, "spi");
    m_programOptionsLoaded.emplace_back("spi");
    readMultibootTypes(spi);
}

void Reference::readSpiNames(const Accessor& accessor) {
    for (const std::string& family : accessor.items("DEVICE_FAMILY")) {
        m_spiNames.push_back(family);
        m_spiFamilies.push_back(family);
        const std::vector<std::string> devices = accessor.items(family + "_DEVICES");
        if (!devices.empty()) {
            m_spiNames.push_back(devices.front());
        }
        m_spiNames.insert(m_spiNames.end(), devices.begin(), devices.end());
    }
}

void Reference::readSpiProperties(const Accessor& accessor) {
    for (const std::string& name : m_spiNames) {
        const std::string key = upper(name) + "_PROPERTY";
        for (const Record& record : accessor.records(key)) {
            if (record.size() < 2) {
                raiseIfOn("DataMismatchException", 2322);
            }
            m_spiProperties[name + record[0]] = fieldOf(record, 1).value_or("");
        }
    }
}

void Reference::readClassDevices(const Accessor& accessor) {
    for (std::size_t number = 0; number < CLASSES.size(); ++number) {
        m_classDevices[number] = accessor.items(CLASSES[number] + "_DEVICES");
    }
}

void Reference::readMultibootTypes(const Accessor& accessor) {
    for (const std::string& type : MULTIBOOT_TYPES) {
        m_multibootTypes[type] = accessor.items(type);
    }
}

std::string Reference::getPartFamily(const char* device) {
    const std::string whole = textOf(device);
    const std::string base = baseName(whole);
    const std::string cached =
        m_deviceFamilyCache.contains(lower(base)) ? m_deviceFamilyCache[lower(base)] : "";
    if (!cached.empty()) {
        m_partFamily = cached;
        return m_partFamily;
    }
    const std::optional<std::string> module = m_databases.open(base).module;
    if (!isSpiDevice(whole) && module) {
        m_partFamily = *module;
    } else if (lower(whole) == "spi" || isSpiDevice(whole)) {
        m_partFamily = "spi";
    } else {
        m_partFamily = "base";
    }
    m_deviceFamilyCache[lower(base)] = m_partFamily;
    return m_partFamily;
}

void Reference::addCachedDeviceFamily(const char* device, const char* family) {
    const bool latestIsCached =
        m_deviceFamilyCache.contains(m_partFamily) && !m_deviceFamilyCache[m_partFamily].empty();
    if (!latestIsCached) {
        m_deviceFamilyCache[baseName(textOf(device))] = textOf(family);
    }
}

bool Reference::isKorvelDevice(const char* device) { return getPartFamily(device) != "base"; }

bool Reference::isSupported(const std::string& device) {
    return m_supportedDevices.contains(baseName(device));
}

Reference::Block Reference::operationBlock(const std::string& name) {
    const std::string family = isSupported(name) ? name : getPartFamily(name.c_str());
    if (m_supportedDevices.contains(family)) {
        return family;
    }
    raiseIfOn("OutOfRangeException", 1999);
    return std::nullopt;
}

void Reference::loadDeviceData(const std::string& device, const char* package) {
    std::string family = device;
    if (!isSupported(device)) {
        const Opened opened = m_databases.open(device);
        family = opened.module.value_or("base");
        if (m_loadedFamilies.insert(device).second) {
            loadProperties(opened.accessor, device);
        }
        std::string owner = device + textOf(package);
        if (!m_programOptionPackages.contains(owner)) {
            owner = getPartFamily(device.c_str());
        }
        if (!holds(m_programOptionsLoaded, owner)) {
            m_programOptionsLoaded.push_back(owner);
            parseProgramOptionEntries(opened.accessor, owner);
        }
    }
    const Accessor accessor = m_databases.open(family).accessor;
    if (m_loadedFamilies.insert(family).second) {
        loadProperties(accessor, family);
    }
    if (!holds(m_operationsLoaded, family)) {
        m_operationsLoaded.push_back(family);
        const Block block = operationBlock(family);
        parseOperationEntries(accessor, block, family);
        parseBsdlOperationEntries(accessor, block, family);
    }
    if (!holds(m_programOptionsLoaded, family)) {
        m_programOptionsLoaded.push_back(family);
        parseProgramOptionEntries(accessor, family);
    }
}

void Reference::loadProperties(const Accessor& accessor, const std::string& owner) {
    for (const Record& record : accessor.records("PROPERTY")) {
        if (record.size() < 2) {
            raiseIfOn("DataMismatchException", 1011);
        }
        m_deviceProperties[owner + "_" + record[0]] = {fieldOf(record, 1).value_or("")};
    }
    for (const Record& record : accessor.records("PROPERTIES")) {
        TextSet values;
        const long long count = decimal(fieldOf(record, 1).value_or(""));
        for (long long number = 2; number <= count + 1; ++number) {
            const auto value = fieldOf(record, number);
            values.insert(value.value_or(""));
            if (!value) {
                raiseIfOn("DataMismatchException", 1051);
                break; // All further ones are missing too, and count as the same empty text.
            }
        }
        m_deviceProperties[owner + "_" + record[0]] = values;
    }
}

bool Reference::isSpiDevice(const std::string& device) { return holds(m_spiNames, upper(device)); }

std::string Reference::spiDeviceClass(const std::string& device) {
    std::string found;
    for (std::size_t number = 0; number < CLASSES.size(); ++number) {
        if (holdsWithoutCase(m_classDevices[number], device)) {
            found = CLASSES[number];
        }
    }
    return found;
}

std::string Reference::getSpiDeviceStringProperty(const char* device, const char* property) {
    for (const std::string& name : {textOf(device), spiDeviceClass(textOf(device))}) {
        const auto found = m_spiProperties.find(upper(name + textOf(property)));
        if (found != m_spiProperties.end()) {
            return found->second;
        }
    }
    return "";
}

bool Reference::getSpiDeviceBoolProperty(const char* device, const char* property) {
    return lower(getSpiDeviceStringProperty(device, property)) == "true";
}

long Reference::getSpiDeviceLongProperty(const char* device, const char* property) {
    return decimal(getSpiDeviceStringProperty(device, property));
}

bool Reference::isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width, bool lead) {
    const std::string type =
        upper(textOf(typePrefix) + "_" + textOf(width) + "_" + (lead ? "LEAD" : "CHAIN"));
    return m_multibootTypes.contains(type) && holdsWithoutCase(m_multibootTypes[type], textOf(device));
}

} // namespace reference
