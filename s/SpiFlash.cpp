#include "Diagnostics.h"
#include "FamilyNames.h"
#include "Implementation.h"
#include "JoinedText.h"
#include "RecordReader.h"
#include "SpiClasses.h"
#include "StringViews.h"

#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <UT_STR.h>

#include <memory>
#include <utility>

// The SPI flash database: how the start-up reads it, and the questions about the flashes themselves.

namespace {

/// The accessor of the SPI database. It and its configuration live as long as the process, not as long as the
/// manager; the list keeps them reachable.
PM_DEVKEY* openSpiDatabase() {
    struct SpiDatabase {
        PicConfig configuration{"base", 1, static_cast<PM_PARTNAME_BINDING>(1)};
        PM_DEVKEY accessor{"spi.acd", configuration, 1, 1, 1};
    };
    static auto& opened = *new std::vector<std::unique_ptr<SpiDatabase>>;
    return &opened.emplace_back(std::make_unique<SpiDatabase>())->accessor;
}

StringBase upperCased(std::string_view text) {
    StringBase result = toStringBase(text);
    result.MakeUpper();
    return result;
}

} // namespace

/// The classes of flash, in the order in which they are tested.
const std::array<ConstraintsManager::Implementation::SpiClass, 6>&
ConstraintsManager::Implementation::spiClasses() {
    using M = Implementation;
    static constexpr std::array<SpiClass, 6> CLASSES{{
        {"AT1", "AT1_DEVICES", &M::m_at1Devices},
        {"ST1", "ST1_DEVICES", &M::m_st1Devices},
        {"ST2", "ST2_DEVICES", &M::m_st2Devices},
        {"BPI1", "BPI1_DEVICES", &M::m_bpi1Devices},
        {"BPI2", "BPI2_DEVICES", &M::m_bpi2Devices},
        {"BPI3", "BPI3_DEVICES", &M::m_bpi3Devices},
    }};
    return CLASSES;
}

void ConstraintsManager::Implementation::loadSpiCatalogue() {
    PM_DEVKEY* const accessor = openSpiDatabase();
    readSpiNames(accessor);
    readMultibootDeviceLists(accessor);
    readSpiProperties(accessor);

    // Here the names are marked as loaded after parsing; loading on demand marks them before.
    const unsigned index = familyIndex(familyNames::SPI);
    parseOperationEntries(accessor, index, familyNames::SPI);
    m_operationsLoaded.push_back(familyNames::SPI);
    parseBsdlOperationEntries(accessor, index, familyNames::SPI);
    parseProgramOptionEntries(accessor, familyNames::SPI);
    m_programOptionsLoaded.push_back(familyNames::SPI);

    readMultibootTypes(accessor);
}

void ConstraintsManager::Implementation::readSpiNames(PM_DEVKEY* accessor) {
    for (const StringBase& family : readList(*accessor, "DEVICE_FAMILY")) {
        m_spiNames.push_back(family);
        m_spiFamilies.push_back(family);
        StringBase key = family;
        key += "_DEVICES";
        const std::vector<StringBase> devices = readList(*accessor, key.c_str());
        if (!devices.empty()) {
            // Deliberate: the first device of every family is listed twice.
            m_spiNames.push_back(devices.front());
        }
        for (const StringBase& device : devices) {
            m_spiNames.push_back(device);
        }
    }
}

void ConstraintsManager::Implementation::readMultibootDeviceLists(PM_DEVKEY* accessor) {
    for (const SpiClass& flash : spiClasses()) {
        this->*flash.devices = readList(*accessor, flash.key);
    }
}

/// Stores properties under the name as written; they are looked up in upper case.
void ConstraintsManager::Implementation::readSpiProperties(PM_DEVKEY* accessor) {
    for (const StringBase& name : m_spiNames) {
        StringBase key = UT_STR::Upper(name.c_str());
        key += "_PROPERTY";
        forEachRecord(*accessor, key.c_str(), [&](const Record& record, const StringBase& property) {
            const char* const value = record.field(1);
            if (value == nullptr) {
                diagnostics::raiseIf<DataMismatchException>(
                    m_exceptions, diagnostics::location::SPI_PROPERTY_WITHOUT_VALUE);
            }
            m_spiProperties.set(view(name), view(property), view(value));
        });
    }
}

bool ConstraintsManager::Implementation::isSpiDevice(StringBase device) const {
    device.MakeUpper();
    return m_spiNames.contains(view(device));
}

/// The class of a flash; empty when it has none. Of several classes the last one wins.
StringBase ConstraintsManager::Implementation::spiDeviceClass(const char* device) const {
    StringBase result;
    for (const SpiClass& flash : spiClasses()) {
        if (containsIgnoreCase(this->*flash.devices, device)) {
            result = flash.name;
        }
    }
    return result;
}

const char* ConstraintsManager::Implementation::getSpiDeviceStringProperty(const char* device,
                                                                           std::string_view property) const {
    const StringBase key = upperCased(property);
    const auto& properties = m_spiProperties.get();
    const auto find = [&](std::string_view owner) {
        return properties.find(JoinedText{view(upperCased(owner)), view(key)}.view());
    };
    auto found = find(view(device));
    if (found == properties.end()) {
        found = find(view(spiDeviceClass(device)));
    }
    return found == properties.end() ? "" : found->second.c_str();
}
